// Comparisons of texts, patterns and elements, the element sorts built on them against
// the partition steps written out, and the element, key and pair lists.
#include <gtest/gtest.h>

#include <cstdint>
#include <numeric>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "models.h"
#include "query/compare.h"
#include "query/lists.h"
#include "query/sort.h"
#include "query/sort_detail.h"
#include "support/array_text.h"
#include "support/partition_sort.h"

namespace quorrel {
namespace {

// '_' (0x5F) orders before the letters when folded, between the cases when not. Bytes
// above 0x7F order after ASCII and never fold. A missing text orders before every
// present one, the empty one included; a text that ends first is smaller. The largest
// byte against the smallest must not overflow a signed difference.
TEST(CompareText, FoldingMissingTextsAndUnsignedBytes) {
  const ElementArray modes[] = {settings(false, false), settings(false, true)};
  const struct {
    int caseSensitive;
    const char *a, *b;
    int order;
  } cases[] = {{0, "abc", "ABC", 0}, {1, "abc", "ABC", 1},     {0, "A", "_", 1},
               {1, "A", "_", -1},    {1, "_", "a", -1},        {1, "\xC9", "z", 1},
               {0, "\xC9", "z", 1},  {0, "\xC9", "\xE9", -1},  {0, nullptr, "", -1},
               {0, "", nullptr, 1},  {0, nullptr, nullptr, 0}, {0, "ab", "abc", -1},
               {1, "abc", "ab", 1},  {0, "\xFF", "\x01", 1},   {1, "a", "z", -1}};
  for (const auto& c : cases) {
    const int32_t result = compareText(modes[c.caseSensitive], c.a, c.b);
    EXPECT_EQ(sign(result), c.order) << (c.a ? c.a : "null") << " " << (c.b ? c.b : "null");
    EXPECT_TRUE(!c.caseSensitive || result == c.order) << "case sensitive: exactly -1, 0, 1";
  }

  // Prefixes: n below 1 compares nothing; equal texts shorter than n are equal.
  const struct {
    const char *a, *b;
    int32_t n, order;
  } prefixes[] = {// clang-format off
      {"ABcd", "abXY", 2, 0}, {"abcd", "abXY", 3, -1}, {nullptr, "x", 0, 0}, {"x", nullptr, -3, 0},
      {nullptr, nullptr, 5, 0}, {nullptr, "x", 1, -1}, {"x", nullptr, 1, 1}, {"ab", "AB", 10, 0},
      {"ab", "abc", 10, -1}};
  // clang-format on
  for (const auto& c : prefixes) {
    EXPECT_EQ(sign(compareTextPrefix(modes[0], c.a, c.b, c.n)), c.order) << c.n;
  }
}

// TextProbe's random texts (search_test) cover the wildcard rules over their alphabet,
// through searchCompare; these pin what lies outside it: no escape character, folding
// only A-Z, and long runs that defeat naive greedy matching.
TEST(WildcardMatch, ByHand) {
  EXPECT_TRUE(wildcardMatch("a\\*", "a\\bc", false));  // a backslash escapes nothing
  EXPECT_TRUE(wildcardMatch("HELLO_world", "hello_WORLD", false));
  EXPECT_FALSE(wildcardMatch("_", "\x7F", false));
  EXPECT_FALSE(wildcardMatch("[", "{", false));
  EXPECT_FALSE(wildcardMatch("\xC9*", "\xE9t\xE9", false));
  std::string text(2000, 'a');
  EXPECT_FALSE(wildcardMatch("*a*a*a*a*a*a*a*b", text.c_str(), true));
  EXPECT_TRUE(wildcardMatch("*a*a*a*a*a*a*a*", text.c_str(), true));
}

// The probe is the pattern, never the candidate. Spans never read past their length or
// a zero byte: the candidates below are not terminated ("xyz" is cut at 2) or hold a
// zero inside the span.
TEST(SearchCompare, ModesArgumentOrderAndSpans) {
  const ElementArray modes[] = {settings(false, false), settings(true, false)};
  const struct {
    bool wildcard;
    const char *probe, *candidate;
    int32_t n, result;  // n < 0: the whole candidate
  } cases[] = {         // clang-format off
      {1, "b*", "abc", -1, 1},   {1, "*b*", "abc", -1, 0},  {1, "abc", "*", -1, 1},
      {1, nullptr, "x", -1, -1}, {1, "x", nullptr, -1, 1},  {1, nullptr, nullptr, -1, 0},
      {0, "*b*", "abc", -1, -1},  {0, "ABC", "abc", -1, 0},  {1, "b?", "abcd", 2, 1},
      {1, "b?", "bcd", 2, 0},    {1, "b?", "b", 2, 1},      {1, "*", "", 0, 0},
      {0, "bc", "BCD", 2, 0},    {0, "bc", "bXd", 2, -1},    {1, "x?", "xyz", 2, 0},
      {0, "xy", "xyz", 2, 0},    {1, "x*", "x\0", 2, 1},    {0, "xy", "x\0", 2, 1}};
  // clang-format on
  for (const auto& c : cases) {
    const ElementArray& a = modes[c.wildcard];
    const int32_t result = c.n < 0 ? searchCompare(a, c.probe, c.candidate)
                                   : searchCompareSpan(a, c.probe, c.candidate, c.n);
    EXPECT_EQ(c.wildcard ? result : sign(result), c.result)
        << (c.probe ? c.probe : "null") << " " << (c.candidate ? c.candidate : "null");
  }
}

// Numbers against texts by leading number, texts against patterns in wildcard mode, a
// missing operand as None; byte operands by count first, then unsigned bytes.
TEST(CompareWithElement, ByOperandType) {
  using V = ElementValue;
  const ElementArray modes[] = {settings(false, false), settings(true, false)};
  const char bytes[3] = {'a', '\x80', 'c'};
  const char lower[3] = {'a', '\x7F', 'z'};
  const struct {
    bool wildcard;
    V operand, element;
    int32_t result;
  } cases[] = {// clang-format off
      {0, V::ofValue(7), V::ofText("7abc"), 0}, {0, V::ofValue(6), V::ofText("7abc"), -1},
      {0, V::ofValue(8), V::ofText("7abc"), 1}, {0, V::ofText("7"), V::ofValue(7), 0},
      {1, V::ofText("abc"), V::ofText("ab*"), 0}, {1, V::ofText("ab*"), V::ofText("abc"), 1},
      {0, V::ofValue(0), V::ofValue(0), 0}, {0, V::ofText(""), V::ofValue(0), 0},
      {0, V{}, V::ofValue(0), 0}, {0, V{}, V::ofText("abc"), -1},
      {0, V::ofBytes(bytes, 3), V::ofBytes(bytes, 3), 0},
      {0, V::ofBytes(lower, 3), V::ofBytes(bytes, 3), -1},
      {0, V::ofBytes(bytes, 2), V::ofBytes(bytes, 3), -1},
      {0, V::ofBytes("abcd", 4), V::ofBytes(bytes, 3), 1}};
  // clang-format on
  for (const auto& c : cases) {
    Element e;
    e.assign(c.element);
    EXPECT_EQ(compareWithElement(modes[c.wildcard], c.operand, e), c.result)
        << (c.operand.bytes ? c.operand.bytes : "") << " " << c.operand.number;
  }
  Element none;
  EXPECT_NE(compareWithElement(modes[0], V::ofText("0"), none), 0);
}

std::vector<int32_t> keyIds(const ElementArray& array) {
  std::vector<int32_t> out;
  for (int32_t i = 0; i < array.size(); ++i) out.push_back(array.getKeyValue(i));
  return out;
}

// Ranges are clipped to the array; swaps outside it change nothing and keys travel.
TEST(SortElements, RangesAndSwaps) {
  ElementArray array = with({}, {"e", "d", "c", "b", "a"});
  sortElementRange(array, SortByText, 0, 1, 3);
  EXPECT_EQ(contents(array), "e|b|c|d|a");
  sortElementRange(array, SortByText, 0, -5, 99);  // clipped to the array
  EXPECT_EQ(contents(array), "a|b|c|d|e");
  array.setKeyValue(7, 0);
  swapElements(array, 0, 4);
  swapElements(array, 0, 5);
  swapElements(array, -1, 0);
  EXPECT_EQ(contents(array), "e|b|c|d|a");
  EXPECT_EQ(array.getKeyValue(4), 7);
}

TEST(CompareElements, AbsentElementsKindsAndBytes) {
  ElementArray array = with({}, {"#10", "#9"});
  const char low[2] = {'a', '\x01'};
  const char high[2] = {'a', '\x80'};
  array.appendFile({low, 2});
  array.appendFile({high, 2});
  array.appendString("a");
  // Files read as the empty text and 0. Other kinds: byte count first («a» is 2 bytes
  // with its terminator, a Value 4), then unsigned bytes. -1 stands for no element.
  const auto bytes = static_cast<SortKind>(0);
  const struct {
    int a, b;
    SortKind kind;
    int order;
  } cases[] = {{-1, -1, SortByText, 0}, {-1, 0, SortByText, -1}, {0, -1, SortByValue, 1},
               {0, 0, SortByValue, 0},  {0, 1, SortByText, -1},  {0, 1, SortByValue, 1},
               {2, 3, SortByText, 0},   {2, 3, SortByValue, 0},  {2, 3, bytes, -1},
               {3, 2, bytes, 1},        {4, 0, bytes, -1},       {4, 2, bytes, -1},
               {4, 3, bytes, -1}};
  const Element* e = array.slots().data();
  for (const auto& c : cases) {
    const int32_t result =
        compareElements(array, c.a < 0 ? nullptr : &e[c.a], c.b < 0 ? nullptr : &e[c.b], c.kind);
    // Folded texts may answer any negative or positive number; the rest exactly -1, 0, 1.
    EXPECT_EQ(c.kind == SortByText ? sign(result) : result, c.order)
        << c.a << " " << c.b << " kind " << c.kind;
  }
}

// The element sort step by step: slots modelled as element ids, the middle one the pivot.
void referenceSort(const ElementArray& original, std::vector<int32_t>& slots, SortKind kind,
                   bool descending, int32_t lo, int32_t hi) {
  const auto at = [&](int32_t i) { return &original.at(slots[static_cast<std::size_t>(i)]); };
  partitionSort(
      lo, hi, [&](int32_t l, int32_t h) { return at((l + h) / 2); },
      [&](int32_t i, const Element* pivot) {
        const int32_t order = compareElements(original, at(i), pivot, kind);
        return descending ? (order < 0) - (order > 0) : order;
      },
      [&](int32_t i, int32_t j) {
        std::swap(slots[static_cast<std::size_t>(i)], slots[static_cast<std::size_t>(j)]);
      });
}

void fillRandom(ElementArray& array, std::mt19937& rng, int count) {
  static const char* const kTexts[] = {"a",  "A",  "b",  "B",  "_",    "10", "9", "",
                                       "5x", " 5", "ab", "Ab", "\xE9", "-1", "0"};
  static const int32_t kValues[] = {0, 1, -1, 5, 9, 10, 2147483647};
  static const char kBytes[] = {'a', '\0', '\x80', 'A'};
  for (int i = 0; i < count; ++i) {
    const auto pick = rng() % 3;
    if (pick == 0) array.appendString(kTexts[rng() % std::size(kTexts)]);
    if (pick == 1) array.appendValue(kValues[rng() % std::size(kValues)]);
    if (pick == 2) array.appendFile({kBytes + rng() % 2, static_cast<int32_t>(1 + rng() % 2)});
    array.setKeyValue(i + 1, i);  // identity that travels with the element
  }
}

void checkAgainstReference(std::mt19937& rng, int count, int round, bool allowTables) {
  ElementArray original;
  original.settings.caseMode = static_cast<CaseMode>(round % 2);
  fillRandom(original, rng, count);
  static const SortKind kKinds[] = {SortByText, SortByValue, static_cast<SortKind>(3)};
  const SortKind kind = kKinds[(round / 2) % 3];
  const bool descending = (round / 6) % 2 != 0;

  std::vector<int32_t> expected(static_cast<std::size_t>(count));
  std::iota(expected.begin(), expected.end(), 0);
  referenceSort(original, expected, kind, descending, 0, count - 1);
  for (auto& id : expected) id += 1;

  ElementArray fast;
  fast.settings.caseMode = original.settings.caseMode;
  for (int32_t i = 0; i < original.size(); ++i) {
    const Element& e = original.at(i);
    fast.insertElement({e.type(), e.number(), e.bytes(), e.size()}, i);
    fast.setKeyValue(i + 1, i);
  }
  sortdetail::sortRange(fast, kind, static_cast<int16_t>(descending), 0, count - 1, allowTables);
  ASSERT_EQ(keyIds(fast), expected)
      << "kind " << kind << " descending " << descending << " case " << original.settings.caseMode;
}

// With a table of keys and, as when no memory can be had for one, in place.
TEST(SortElements, MatchesTheStepByStepSortOnRandomInputsWithTies) {
  for (const bool allowTables : {true, false}) {
    std::mt19937 rng(allowTables ? 2024 : 99);
    for (int round = 0; round < (allowTables ? 6000 : 3000); ++round) {
      checkAgainstReference(rng, static_cast<int>(rng() % 14), round, allowTables);
    }
    for (int round = 0; round < (allowTables ? 24 : 12); ++round) {
      checkAgainstReference(rng, allowTables ? 3000 : 2000, round, allowTables);
    }
  }
}

// Keyless numbers: only the sequence of values is observable.
TEST(SortElements, KeylessNumbersMatchTheStepByStepSort) {
  std::mt19937 rng(5);
  for (int round = 0; round < 2000; ++round) {
    const int count = static_cast<int>(rng() % 40);
    const bool descending = round % 2 != 0;
    ElementArray array;
    for (int i = 0; i < count; ++i) {
      const int32_t small = static_cast<int32_t>(rng() % 7) - 3;
      array.appendValue(rng() % 9 == 0 ? INT32_MIN : small);
    }
    std::vector<int32_t> expected(static_cast<std::size_t>(count));
    std::iota(expected.begin(), expected.end(), 0);
    referenceSort(array, expected, SortByValue, descending, 0, count - 1);
    for (int32_t& id : expected) id = array.getValue(id);
    sortElements(array, SortByValue, static_cast<int16_t>(descending));
    for (int32_t i = 0; i < count; ++i) {
      const int32_t value = expected[static_cast<std::size_t>(i)];
      ASSERT_EQ(array.getValue(i), value) << "round " << round << " index " << i;
      ASSERT_EQ(array.at(i).type(), value == 0 ? ElementType::None : ElementType::Value);
    }
  }
}

const char kFileBytes[3] = {'f', '\0', 'g'};

// The lists script case covers texts, values, None and quoting; these add file bytes
// (listed as nothing, element or key), None keys, a missing delimiter and a delimiter
// between every pair even when empty.
TEST(Lists, FileBytesNoneKeysAndDelimiters) {
  ElementArray array = with({}, {"#-2147483648", "x"});
  array.appendFile({kFileBytes, 3});
  array.appendString("");
  array.setKeyFile({kFileBytes, 3}, 0);
  array.setKeyValue(0, 1);  // a None key lists as nothing and pairs as the empty key
  array.setKeyString("q'", 3);
  EXPECT_EQ(elementList(array, "<->"), "-2147483648<->x<-><->");
  EXPECT_EQ(elementList(array, nullptr), "-2147483648x");
  EXPECT_EQ(quotedElementList(array, ";"), "-2147483648;'x';;''");
  EXPECT_EQ(keyList(array, ","), ",,,q'");
  EXPECT_EQ(quotedKeyList(array, "|"), "|||'q''");
  // Every keyed Value or String pairs, its key read as text (None and File as nothing).
  EXPECT_EQ(pairList(array, "=", ";"), "=-2147483648;=x;q'=");
  EXPECT_EQ(quotedPairList(array, " => ", ", "), " => -2147483648,  => 'x', q' => ''");
  EXPECT_EQ(quotedPairList(array, "", ""), "-2147483648'x'q'''");

  ElementArray empty;
  EXPECT_EQ(elementList(empty, ","), "");
  EXPECT_EQ(quotedKeyList(empty, ","), "");
  EXPECT_EQ(pairList(empty, "=", ";"), "");
}

}  // namespace
}  // namespace quorrel
