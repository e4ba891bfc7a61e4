// Routines of the key probes, element searches, lists, totals and element sorts.
#include "host/routines.h"
#include "query/lists.h"
#include "query/search.h"
#include "query/sort.h"

namespace quorrel::host::expr {

// Key probes: the fetched parameter becomes a String or a Value operand.
Result indexOfKeyStr(ElementArray& a, const char* key) {
  return indexOfKey(a, ElementValue::ofText(key));
}
Result indexOfKeyVal(ElementArray& a, int32_t key) {
  return indexOfKey(a, ElementValue::ofValue(key));
}
Result keyStrText(ElementArray& a, const char* key) {
  return Borrowed{stringWithKey(a, ElementValue::ofText(key))};
}
Result keyStr(ElementArray& a, int32_t key) {
  return Borrowed{stringWithKey(a, ElementValue::ofValue(key))};
}
Result keyValText(ElementArray& a, const char* key) {
  return valueWithKey(a, ElementValue::ofText(key));
}
Result keyVal(ElementArray& a, int32_t key) {
  return valueWithKey(a, ElementValue::ofValue(key));
}

// Searches: the second parameter is fetched and handed on; it changes nothing.
Result findStr(ElementArray& a, const char* text, int32_t ignored) {
  return quorrel::findString(a, text, ignored);
}
Result findVal(ElementArray& a, int32_t number, int32_t ignored) {
  return quorrel::findValue(a, number, ignored);
}
Result containsStr(ElementArray& a, const char* text, int32_t ignored) {
  return findContainingString(a, text, ignored);
}
Result containsVal(ElementArray& a, int32_t number, int32_t ignored) {
  return findContainingValue(a, number, ignored);
}

// Lists are fresh texts: copied to the host, then released.
Result listText(ElementArray& a, const char* d) {
  return elementList(a, d);
}
Result quotedListText(ElementArray& a, const char* d) {
  return quotedElementList(a, d);
}
Result keyListText(ElementArray& a, const char* d) {
  return quorrel::keyList(a, d);
}
Result keyQuotedListText(ElementArray& a, const char* d) {
  return quotedKeyList(a, d);
}
Result pairListText(ElementArray& a, const char* separator, const char* d) {
  return quorrel::pairList(a, separator, d);
}
Result pairQuotedListText(ElementArray& a, const char* separator, const char* d) {
  return quotedPairList(a, separator, d);
}

Result max(ElementArray& a) {
  return maxValue(a);
}
Result min(ElementArray& a) {
  return minValue(a);
}
Result sum(ElementArray& a) {
  return sumValue(a);
}
Result avg(ElementArray& a) {
  return averageValue(a);
}

}  // namespace quorrel::host::expr

namespace quorrel::host::act {

void sortStringsAscending(Instance in) {
  sortElements(in.array, SortByText, 0);
}
void sortStringsDescending(Instance in) {
  sortElements(in.array, SortByText, 1);
}
void sortValuesAscending(Instance in) {
  sortElements(in.array, SortByValue, 0);
}
void sortValuesDescending(Instance in) {
  sortElements(in.array, SortByValue, 1);
}

}  // namespace quorrel::host::act
