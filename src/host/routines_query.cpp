// Routines of the key probes, element searches, lists, totals and element sorts.
#include "host/routine_support.h"
#include "host/routines.h"
#include "query/lists.h"
#include "query/search.h"
#include "query/sort.h"

namespace quorrel::host::expr {

// Key probes: the fetched parameter becomes a String or a Value operand.
QUORREL_EXPRESSION_ROUTINE(indexOfKeyString) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* key) {
    return indexOfKey(a, ElementValue::ofText(key));
  });
}
QUORREL_EXPRESSION_ROUTINE(indexOfKeyValue) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t key) {
    return indexOfKey(a, ElementValue::ofValue(key));
  });
}
QUORREL_EXPRESSION_ROUTINE(stringWithStringKey) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* key) {
    return Borrowed{stringWithKey(a, ElementValue::ofText(key))};
  });
}
QUORREL_EXPRESSION_ROUTINE(stringWithValueKey) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t key) {
    return Borrowed{stringWithKey(a, ElementValue::ofValue(key))};
  });
}
QUORREL_EXPRESSION_ROUTINE(valueWithStringKey) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* key) {
    return valueWithKey(a, ElementValue::ofText(key));
  });
}
QUORREL_EXPRESSION_ROUTINE(valueWithValueKey) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t key) {
    return valueWithKey(a, ElementValue::ofValue(key));
  });
}

// Searches: the second parameter is fetched and handed on; it changes nothing.
QUORREL_EXPRESSION_ROUTINE(findString) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray& a, const char* text, int32_t ignored) {
                                    return quorrel::findString(a, text, ignored);
                                  });
}
QUORREL_EXPRESSION_ROUTINE(findValue) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray& a, int32_t number, int32_t ignored) {
                                   return quorrel::findValue(a, number, ignored);
                                 });
}
QUORREL_EXPRESSION_ROUTINE(containsString) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray& a, const char* text, int32_t ignored) {
                                    return findContainingString(a, text, ignored);
                                  });
}
QUORREL_EXPRESSION_ROUTINE(containsValue) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray& a, int32_t number, int32_t ignored) {
                                   return findContainingValue(a, number, ignored);
                                 });
}

// Lists are fresh texts: copied to the host, then released.
QUORREL_EXPRESSION_ROUTINE(list) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray& a, const char* d) { return elementList(a, d); });
}
QUORREL_EXPRESSION_ROUTINE(quotedList) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* d) {
    return quotedElementList(a, d);
  });
}
QUORREL_EXPRESSION_ROUTINE(keyList) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray& a, const char* d) { return quorrel::keyList(a, d); });
}
QUORREL_EXPRESSION_ROUTINE(keyQuotedList) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray& a, const char* d) { return quotedKeyList(a, d); });
}
QUORREL_EXPRESSION_ROUTINE(pairList) {
  return runExpression<Text, Text>(runRecord, parameterToken,
                                   [](ElementArray& a, const char* separator, const char* d) {
                                     return quorrel::pairList(a, separator, d);
                                   });
}
QUORREL_EXPRESSION_ROUTINE(pairQuotedList) {
  return runExpression<Text, Text>(runRecord, parameterToken,
                                   [](ElementArray& a, const char* separator, const char* d) {
                                     return quotedPairList(a, separator, d);
                                   });
}

QUORREL_EXPRESSION_ROUTINE(max) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return maxValue(a); });
}
QUORREL_EXPRESSION_ROUTINE(min) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return minValue(a); });
}
QUORREL_EXPRESSION_ROUTINE(sum) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return sumValue(a); });
}
QUORREL_EXPRESSION_ROUTINE(avg) {
  return runExpression<>(runRecord, parameterToken,
                         [](ElementArray& a) { return averageValue(a); });
}

}  // namespace quorrel::host::expr

namespace quorrel::host::act {

QUORREL_ACTION_ROUTINE(sortStringsAscending) {
  return runAction(runRecord, [](ElementArray& a) { sortElements(a, SortByText, 0); });
}
QUORREL_ACTION_ROUTINE(sortStringsDescending) {
  return runAction(runRecord, [](ElementArray& a) { sortElements(a, SortByText, 1); });
}
QUORREL_ACTION_ROUTINE(sortValuesAscending) {
  return runAction(runRecord, [](ElementArray& a) { sortElements(a, SortByValue, 0); });
}
QUORREL_ACTION_ROUTINE(sortValuesDescending) {
  return runAction(runRecord, [](ElementArray& a) { sortElements(a, SortByValue, 1); });
}

}  // namespace quorrel::host::act
