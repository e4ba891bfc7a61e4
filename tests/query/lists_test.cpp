#include "query/lists.h"

#include <gtest/gtest.h>

#include <array>
#include <climits>

namespace quorrel {
namespace {

const char kFileBytes[3] = {'f', '\0', 'g'};

TEST(Lists, ElementListsWithEveryType) {
  ElementArray array;
  array.appendValue(5);
  array.appendString("ab");
  array.appendValue(0);  // stored as None
  array.appendFile({kFileBytes, 3});
  array.appendString("c");
  EXPECT_EQ(elementList(array, ","), "5,ab,,,c");
  EXPECT_EQ(quotedElementList(array, ","), "5,'ab',,,'c'");
  EXPECT_EQ(elementList(array, ""), "5abc");
  EXPECT_EQ(elementList(array, "<->"), "5<->ab<-><-><->c");
  EXPECT_EQ(elementList(array, nullptr), "5abc");
  array.setValue(INT32_MIN, 0);
  array.setString("it's", 1);
  EXPECT_EQ(quotedElementList(array, ";"), "-2147483648;'it's';;;'c'");

  ElementArray two;
  two.appendString("a");
  two.appendString("");
  EXPECT_EQ(quotedElementList(two, ","), "'a',''");

  ElementArray empty;
  EXPECT_EQ(elementList(empty, ","), "");
  EXPECT_EQ(quotedKeyList(empty, ","), "");
  EXPECT_EQ(pairList(empty, "=", ";"), "");
}

TEST(Lists, KeyListsHaveOneFieldPerElement) {
  ElementArray array;
  for (int i = 0; i < 5; ++i) array.appendString("x");
  array.setKeyString("k0", 0);
  array.setKeyValue(7, 2);
  array.setKeyValue(0, 3);  // a None key lists as nothing
  array.setKeyFile({kFileBytes, 3}, 4);
  EXPECT_EQ(keyList(array, ","), "k0,,7,,");
  EXPECT_EQ(quotedKeyList(array, ","), "'k0',,7,,");
  array.setKeyValue(-3, 1);
  EXPECT_EQ(quotedKeyList(array, "|"), "'k0'|-3|7||");
}

TEST(Lists, PairListsSkipUnkeyedAndUnlistedElements) {
  ElementArray array;
  array.appendString("x");
  array.appendValue(3);
  array.appendString("y");
  array.appendFile({kFileBytes, 3});
  array.setKeyString("a", 0);
  array.setKeyString("b", 1);
  array.setKeyString("c", 3);
  EXPECT_EQ(pairList(array, "=", ";"), "a=x;b=3");
  EXPECT_EQ(quotedPairList(array, "=", ";"), "a='x';b=3");
  // A None element is skipped even with a key; a None key gives an empty key text.
  array.appendValue(0);
  array.setKeyString("d", 4);
  array.setKeyValue(0, 2);
  EXPECT_EQ(pairList(array, "=", ";"), "a=x;b=3;=y");
  EXPECT_EQ(quotedPairList(array, "", ""), "a'x'b3'y'");
  array.setKeyString("q'", 1);
  EXPECT_EQ(quotedPairList(array, " => ", ", "), "a => 'x', q' => 3,  => 'y'");
}

// Max, min, sum and average of an array.
std::array<int32_t, 4> totals(const ElementArray& array) {
  return {maxValue(array), minValue(array), sumValue(array), averageValue(array)};
}
using Totals = std::array<int32_t, 4>;

TEST(Totals, MixedTypesWrapAndTruncation) {
  ElementArray array;
  array.appendValue(-5);
  array.appendValue(7);
  array.appendString("abc");
  EXPECT_EQ(totals(array), (Totals{7, -5, 2, 0}));

  ElementArray wrap;
  wrap.appendValue(INT32_MAX);
  wrap.appendValue(1);
  EXPECT_EQ(sumValue(wrap), INT32_MIN);
  EXPECT_EQ(averageValue(wrap), INT32_MIN / 2);  // the wrapped sum is divided
  wrap.appendValue(INT32_MAX);
  wrap.appendString("2147483647");
  EXPECT_EQ(sumValue(wrap), 2147483646);  // -2^31 + 2*(2^31-1) wraps to 2^31-2

  ElementArray negatives;
  negatives.appendValue(-1);
  negatives.appendValue(-2);
  EXPECT_EQ(totals(negatives), (Totals{-1, -2, -3, -1}));  // -3 / 2 truncates to -1

  // None (a stored 0) and File elements count as 0.
  ElementArray zeros;
  zeros.appendValue(-4);
  zeros.appendValue(0);
  zeros.appendFile({kFileBytes, 3});
  zeros.appendString("12abc");
  EXPECT_EQ(totals(zeros), (Totals{12, -4, 8, 2}));
  zeros.setString("-9", 3);
  EXPECT_EQ(totals(zeros), (Totals{0, -9, -13, -3}));

  ElementArray one;
  one.appendString(" 42");
  EXPECT_EQ(totals(one), (Totals{42, 42, 42, 42}));
  EXPECT_EQ(totals(ElementArray{}), (Totals{0, 0, 0, 0}));
}

}  // namespace
}  // namespace quorrel
