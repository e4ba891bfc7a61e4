#include "query/lists.h"

#include <gtest/gtest.h>

#include <array>
#include <climits>

namespace quorrel {
namespace {

const char kFileBytes[3] = {'f', '\0', 'g'};

// The lists script case covers texts, values, None and quoting; these add file bytes
// (listed as nothing, element or key), None keys, a missing delimiter and a delimiter
// between every pair even when empty.
TEST(Lists, FileBytesNoneKeysAndDelimiters) {
  ElementArray array;
  array.appendValue(INT32_MIN);
  array.appendString("x");
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

// Max, min, sum and average of an array.
std::array<int32_t, 4> totals(const ElementArray& array) {
  return {maxValue(array), minValue(array), sumValue(array), averageValue(array)};
}
using Totals = std::array<int32_t, 4>;

// Sums wrap and the average divides the wrapped sum, truncating; None and File elements
// count as 0 and texts by their leading number.
TEST(Totals, MixedTypesWrapAndTruncation) {
  ElementArray wrap;
  wrap.appendValue(INT32_MAX);
  wrap.appendValue(1);
  EXPECT_EQ(totals(wrap), (Totals{INT32_MAX, 1, INT32_MIN, INT32_MIN / 2}));
  wrap.appendValue(INT32_MAX);
  wrap.appendString("2147483647");
  EXPECT_EQ(sumValue(wrap), 2147483646);  // -2^31 + 2*(2^31-1) wraps to 2^31-2

  ElementArray zeros;
  zeros.appendValue(-4);
  zeros.appendValue(0);
  zeros.appendFile({kFileBytes, 3});
  zeros.appendString("12abc");
  EXPECT_EQ(totals(zeros), (Totals{12, -4, 8, 2}));
  zeros.setString("-9", 3);
  EXPECT_EQ(totals(zeros), (Totals{0, -9, -13, -3}));  // -13 / 4 truncates to -3
  EXPECT_EQ(totals(ElementArray{}), (Totals{0, 0, 0, 0}));
}

}  // namespace
}  // namespace quorrel
