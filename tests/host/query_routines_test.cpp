// Routines of key probes, searches, lists, totals and element sorts.
#include "test_host.h"

namespace testhost {
namespace {

TEST(QueryRoutinesTest, ListsAreHandedOverAsText) {
  Instance instance;
  instance.action(9, 5);
  instance.action(8, "ab");
  instance.action(9, 0);  // None: an empty field
  instance.action(8, "c");
  EXPECT_EQ(instance.text(16, {","}), "5,ab,,c");      // list$(
  EXPECT_EQ(instance.text(17, {","}), "5,'ab',,'c'");  // quotedList$(
  EXPECT_EQ(instance.text(16, {""}), "5abc");
  instance.action(20, "k0", 0);
  instance.action(21, 7, 2);
  EXPECT_EQ(instance.text(18, {","}), "k0,,7,");    // keyList$(
  EXPECT_EQ(instance.text(19, {","}), "'k0',,7,");  // keyQuotedList$(
  instance.action(20, "b", 1);
  EXPECT_EQ(instance.text(20, {"=", ";"}), "k0=5;b=ab");  // pairList$(
  EXPECT_EQ(instance.text(21, {"=", ";"}), "k0=5;b='ab'");

  Instance empty;
  EXPECT_EQ(empty.text(16, {","}), "");  // an empty list is still a text
}

TEST(QueryRoutinesTest, KeyProbesAndSearches) {
  Instance instance;
  instance.action(9, 5);
  instance.action(8, "ab");
  instance.action(8, "c");
  instance.action(20, "k0", 0);
  instance.action(20, "b", 1);
  instance.action(21, 9, 2);

  EXPECT_EQ(instance.number(6, {"K0"}), 0);  // indexOfKeyStr(, case insensitive
  EXPECT_EQ(instance.number(6, {"none"}), -1);
  EXPECT_EQ(instance.number(7, {9}), 2);  // indexOfKeyVal(
  EXPECT_EQ(instance.number(7, {8}), -1);
  EXPECT_EQ(instance.text(8, {"b"}), "ab");  // keyStr$(: borrowed, so unchanged after
  EXPECT_EQ(instance.text(8, {"b"}), "ab");
  EXPECT_EQ(instance.text(2, {1}), "ab");
  EXPECT_TRUE(instance.noText(8, {"zz"}));
  EXPECT_EQ(instance.text(9, {9}), "c");     // keyStr(
  EXPECT_EQ(instance.text(9, {"k0"}), "5");  // a value element read as text
  EXPECT_TRUE(instance.noText(9, {123}));
  EXPECT_EQ(instance.number(10, {"k0"}), 5);  // keyVal$(
  EXPECT_EQ(instance.number(10, {"zz"}), 0);
  EXPECT_EQ(instance.number(11, {9}), 0);  // keyVal( of a text element

  EXPECT_EQ(instance.number(12, {"AB", 99}), 1);  // findStr(: the integer changes nothing
  EXPECT_EQ(instance.number(12, {"AB", 0}), 1);
  EXPECT_EQ(instance.number(13, {5, 3}), 0);  // findVal(
  EXPECT_EQ(instance.number(13, {6, 0}), -1);
  EXPECT_EQ(instance.number(14, {"b", 0}), 1);  // containsStr(
  EXPECT_EQ(instance.number(15, {5, 0}), 0);    // containsVal(
}

TEST(QueryRoutinesTest, TotalsAndSorts) {
  Instance totals;
  totals.action(9, -5);
  totals.action(9, 7);
  totals.action(8, "abc");
  EXPECT_EQ(totals.number(22), 7);   // max(
  EXPECT_EQ(totals.number(23), -5);  // min(
  EXPECT_EQ(totals.number(24), 2);   // sum(
  EXPECT_EQ(totals.number(25), 0);   // avg(

  Instance texts;
  texts.action(8, "b");
  texts.action(8, "C");
  texts.action(8, "a");
  texts.action(20, "key of C", 1);
  texts.action(22);  // Sort strings ascending
  EXPECT_EQ(texts.text(16, {" "}), "a b C");
  EXPECT_EQ(texts.text(4, {2}), "key of C");  // keys travel with their elements
  texts.action(23);                           // Sort strings descending
  EXPECT_EQ(texts.text(16, {" "}), "C b a");

  Instance values;
  for (int32_t v : {3, -1, 2}) values.action(9, v);
  values.action(24);  // Sort values ascending
  EXPECT_EQ(values.text(16, {","}), "-1,2,3");
  values.action(25);  // Sort values descending
  EXPECT_EQ(values.text(16, {","}), "3,2,-1");
}

}  // namespace
}  // namespace testhost
