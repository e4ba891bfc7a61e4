#include "query/lists.h"

#include <gtest/gtest.h>

#include "support/array_text.h"

namespace quorrel {
namespace {

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
