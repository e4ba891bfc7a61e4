#include "query/sort.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "query/compare.h"
#include "query/sort_detail.h"

namespace quorrel {
namespace {

std::vector<std::string> texts(ElementArray& array) {
  std::vector<std::string> out;
  for (int32_t i = 0; i < array.size(); ++i) out.emplace_back(array.getString(i));
  return out;
}

std::vector<int32_t> keyIds(const ElementArray& array) {
  std::vector<int32_t> out;
  for (int32_t i = 0; i < array.size(); ++i) out.push_back(array.getKeyValue(i));
  return out;
}

using Texts = std::vector<std::string>;

TEST(SortElements, PinnedOrdersWithTies) {
  ElementArray values;
  values.appendValue(3);
  values.appendValue(1);
  values.appendValue(2);
  sortElements(values, SortByValue, 0);
  EXPECT_EQ(texts(values), (Texts{"1", "2", "3"}));
  sortElements(values, SortByValue, 1);
  EXPECT_EQ(texts(values), (Texts{"3", "2", "1"}));

  ElementArray letters;
  letters.appendString("b");
  letters.appendString("A");
  letters.appendString("a");
  letters.setKeyValue(1, 0);
  letters.setKeyValue(2, 1);
  letters.setKeyValue(3, 2);
  sortElements(letters, SortByText, 0);
  // The equal «A» and «a» end in the reverse of their order before the sort.
  EXPECT_EQ(texts(letters), (Texts{"a", "A", "b"}));
  EXPECT_EQ(keyIds(letters), (std::vector<int32_t>{3, 2, 1}));

  ElementArray sensitive;
  sensitive.caseMode = CaseSensitive;
  sensitive.appendString("b");
  sensitive.appendString("A");
  sensitive.appendString("a");
  sortElements(sensitive, SortByText, 0);
  EXPECT_EQ(texts(sensitive), (Texts{"A", "a", "b"}));
  sortElements(sensitive, SortByText, 1);
  EXPECT_EQ(texts(sensitive), (Texts{"b", "a", "A"}));

  // Values take part in text sorts through their decimal text.
  ElementArray numbers;
  numbers.appendValue(9);
  numbers.appendValue(10);
  sortElements(numbers, SortByText, 0);
  EXPECT_EQ(texts(numbers), (Texts{"10", "9"}));
  sortElements(numbers, SortByValue, 0);
  EXPECT_EQ(texts(numbers), (Texts{"9", "10"}));
  numbers.appendString("10");
  numbers.setKeyValue(1, 0);
  numbers.setKeyValue(2, 1);
  numbers.setKeyValue(3, 2);
  // 9, 10, «10» by text: pivot 10 (slot 1); 9 swaps with «10», then the left part
  // [«10», 10] is already in place.
  sortElements(numbers, SortByText, 0);
  EXPECT_EQ(texts(numbers), (Texts{"10", "10", "9"}));
  EXPECT_EQ(keyIds(numbers), (std::vector<int32_t>{3, 2, 1}));

  // Leading numbers of strings; None (a stored 0) sorts as 0 by value, as "" by text.
  ElementArray mixed;
  mixed.appendString("12");
  mixed.appendString("5x");
  mixed.appendValue(0);
  mixed.appendValue(-1);
  sortElements(mixed, SortByValue, 0);
  EXPECT_EQ(texts(mixed), (Texts{"-1", "", "5x", "12"}));
  sortElements(mixed, SortByText, 0);
  EXPECT_EQ(texts(mixed), (Texts{"", "-1", "12", "5x"}));

  // '_' sorts before letters when folded, between the cases when not.
  ElementArray underscore;
  underscore.appendString("a");
  underscore.appendString("_");
  underscore.appendString("B");
  sortElements(underscore, SortByText, 0);
  EXPECT_EQ(texts(underscore), (Texts{"_", "a", "B"}));
  underscore.caseMode = CaseSensitive;
  sortElements(underscore, SortByText, 0);
  EXPECT_EQ(texts(underscore), (Texts{"B", "_", "a"}));
}

TEST(SortElements, KeysTravelAndTablesSortAcrossRows) {
  ElementArray array;
  array.setDimensions(2);
  array.setBoundary(0, 2);
  const char* cells[] = {"d", "c", "b", "a"};
  for (int i = 0; i < 4; ++i) {
    array.appendString(cells[i]);
    array.setKeyString(std::string(1, static_cast<char>('0' + i)).c_str(), i);
  }
  sortElements(array, SortByText, 0);
  EXPECT_EQ(texts(array), (Texts{"a", "b", "c", "d"}));
  EXPECT_EQ(std::string(array.getKeyString(0)), "3");
  EXPECT_EQ(std::string(array.getKeyString(3)), "0");
}

TEST(SortElements, SmallArraysRangesAndSwaps) {
  ElementArray empty;
  sortElements(empty, SortByText, 0);
  EXPECT_EQ(empty.size(), 0);
  ElementArray one;
  one.appendString("x");
  sortElements(one, SortByValue, 1);
  EXPECT_EQ(texts(one), (Texts{"x"}));

  ElementArray array;
  for (const char* t : {"e", "d", "c", "b", "a"}) array.appendString(t);
  sortElementRange(array, SortByText, 0, 1, 3);
  EXPECT_EQ(texts(array), (Texts{"e", "b", "c", "d", "a"}));
  sortElementRange(array, SortByText, 0, -5, 99);  // clipped to the array
  EXPECT_EQ(texts(array), (Texts{"a", "b", "c", "d", "e"}));

  array.setKeyValue(7, 0);
  swapElements(array, 0, 4);
  EXPECT_EQ(texts(array), (Texts{"e", "b", "c", "d", "a"}));
  EXPECT_EQ(array.getKeyValue(4), 7);
  swapElements(array, 0, 5);
  swapElements(array, -1, 0);
  EXPECT_EQ(texts(array), (Texts{"e", "b", "c", "d", "a"}));
}

TEST(CompareElements, AbsentElementsKindsAndBytes) {
  ElementArray array;
  array.appendValue(10);
  array.appendValue(9);
  const char low[2] = {'a', '\x01'};
  const char high[2] = {'a', '\x80'};
  array.appendFile({low, 2});
  array.appendFile({high, 2});
  array.appendString("a");
  const Element* e = array.slots().data();
  EXPECT_EQ(compareElements(array, nullptr, nullptr, SortByText), 0);
  EXPECT_EQ(compareElements(array, nullptr, &e[0], SortByText), -1);
  EXPECT_EQ(compareElements(array, &e[0], nullptr, SortByValue), 1);
  EXPECT_EQ(compareElements(array, &e[0], &e[0], SortByValue), 0);
  EXPECT_LT(compareElements(array, &e[0], &e[1], SortByText), 0);
  EXPECT_EQ(compareElements(array, &e[0], &e[1], SortByValue), 1);
  // Files read as the empty text and 0.
  EXPECT_EQ(compareElements(array, &e[2], &e[3], SortByText), 0);
  EXPECT_EQ(compareElements(array, &e[2], &e[3], SortByValue), 0);
  // Other kinds: byte count first («a» is 2 bytes with its terminator; a Value 4).
  const auto bytes = static_cast<SortKind>(0);
  EXPECT_EQ(compareElements(array, &e[2], &e[3], bytes), -1);
  EXPECT_EQ(compareElements(array, &e[3], &e[2], bytes), 1);
  EXPECT_EQ(compareElements(array, &e[4], &e[0], bytes), -1);
  EXPECT_EQ(compareElements(array, &e[4], &e[2], bytes), -1);  // «a»,0 against «a»,1
  EXPECT_EQ(compareElements(array, &e[4], &e[3], bytes), -1);  // 0x00 before 0x80
}

// The sort steps exactly as specified: slots modelled as element ids, the pivot held
// as an element, recursion on the left part and a loop on the right part.
void referenceSort(const ElementArray& original, std::vector<int32_t>& slots, SortKind kind,
                   bool descending, int32_t lo, int32_t hi) {
  while (hi > lo) {
    const int32_t pivot = slots[static_cast<std::size_t>((lo + hi) / 2)];
    auto compare = [&](int32_t slot) {
      return compareElements(original, &original.at(slots[static_cast<std::size_t>(slot)]),
                             &original.at(pivot), kind);
    };
    int32_t i = lo;
    int32_t j = hi;
    for (;;) {
      while (descending ? compare(i) > 0 : compare(i) < 0) ++i;
      while (descending ? compare(j) < 0 : compare(j) > 0) --j;
      if (i > j) break;
      std::swap(slots[static_cast<std::size_t>(i)], slots[static_cast<std::size_t>(j)]);
      ++i;
      --j;
      if (j < i) break;
    }
    referenceSort(original, slots, kind, descending, lo, j);
    lo = i;
  }
}

void fillRandom(ElementArray& array, std::mt19937& rng, int count) {
  static const char* const kTexts[] = {"a",  "A",  "b",  "B",  "_",    "10", "9", "",
                                       "5x", " 5", "ab", "Ab", "\xE9", "-1", "0"};
  static const int32_t kValues[] = {0, 1, -1, 5, 9, 10, 2147483647};
  static const char kBytes[] = {'a', '\0', '\x80', 'A'};
  for (int i = 0; i < count; ++i) {
    switch (rng() % 3) {
      case 0:
        array.appendString(kTexts[rng() % std::size(kTexts)]);
        break;
      case 1:
        array.appendValue(kValues[rng() % std::size(kValues)]);
        break;
      default:
        array.appendFile({kBytes + rng() % 2, static_cast<int32_t>(1 + rng() % 2)});
    }
    array.setKeyValue(i + 1, i);  // identity that travels with the element
  }
}

void checkAgainstReference(std::mt19937& rng, int count, int round, bool allowTables = true) {
  ElementArray original;
  original.caseMode = static_cast<int16_t>(round % 2);
  fillRandom(original, rng, count);
  static const SortKind kKinds[] = {SortByText, SortByValue, static_cast<SortKind>(3)};
  const SortKind kind = kKinds[(round / 2) % 3];
  const bool descending = (round / 6) % 2 != 0;

  std::vector<int32_t> expected(static_cast<std::size_t>(count));
  for (int i = 0; i < count; ++i) expected[static_cast<std::size_t>(i)] = i;
  referenceSort(original, expected, kind, descending, 0, count - 1);
  for (auto& id : expected) id += 1;

  ElementArray sorted;
  sorted.caseMode = original.caseMode;
  for (int32_t i = 0; i < original.size(); ++i) {
    const Element& e = original.at(i);
    ElementValue v{e.type(), e.number(), e.bytes(), e.size()};
    sorted.insertElement(v, sorted.size());
    sorted.setKeyValue(i + 1, i);
  }
  sortdetail::sortRange(sorted, kind, static_cast<int16_t>(descending), 0, sorted.size() - 1,
                        allowTables);
  ASSERT_EQ(keyIds(sorted), expected)
      << "kind " << kind << " descending " << descending << " case " << original.caseMode;
}

TEST(SortElements, MatchesTheSpecifiedStepsOnRandomInputsWithTies) {
  std::mt19937 rng(2024);
  for (int round = 0; round < 6000; ++round) {
    checkAgainstReference(rng, static_cast<int>(rng() % 14), round);
  }
  for (int round = 0; round < 24; ++round) checkAgainstReference(rng, 3000, round);
}

TEST(SortElements, InPlaceMethodGivesTheSameOrder) {
  std::mt19937 rng(99);
  for (int round = 0; round < 3000; ++round) {
    checkAgainstReference(rng, static_cast<int>(rng() % 14), round, false);
  }
  for (int round = 0; round < 12; ++round) checkAgainstReference(rng, 2000, round, false);
}

// Keyless numbers: only the sequence of values is observable.
TEST(SortElements, KeylessNumbersMatchTheSpecifiedSteps) {
  std::mt19937 rng(5);
  for (int round = 0; round < 2000; ++round) {
    const int count = static_cast<int>(rng() % 40);
    const bool descending = round % 2 != 0;
    ElementArray array;
    for (int i = 0; i < count; ++i) {
      const int32_t small = static_cast<int32_t>(rng() % 7) - 3;
      array.appendValue(rng() % 9 == 0 ? INT32_MIN : small);
    }
    std::vector<int32_t> ids(static_cast<std::size_t>(count));
    for (int i = 0; i < count; ++i) ids[static_cast<std::size_t>(i)] = i;
    referenceSort(array, ids, SortByValue, descending, 0, count - 1);
    std::vector<int32_t> expected;
    for (int32_t id : ids) expected.push_back(array.getValue(id));
    sortElements(array, SortByValue, static_cast<int16_t>(descending));
    std::vector<int32_t> actual;
    for (int32_t i = 0; i < array.size(); ++i) actual.push_back(array.getValue(i));
    ASSERT_EQ(actual, expected);
    for (int32_t i = 0; i < array.size(); ++i) {
      ASSERT_EQ(array.at(i).type(),
                array.getValue(i) == 0 ? ElementType::None : ElementType::Value);
    }
  }
}

}  // namespace
}  // namespace quorrel
