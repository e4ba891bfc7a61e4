// The setup record, and texts handed over by the element and key routines.
#include "test_host.h"

namespace testhost {
namespace {

// dim(, boundaryX(, boundaryY( of a new instance.
std::vector<int32_t> shape(SetupRecord setup) {
  Instance instance(std::move(setup));
  return {instance.number(26), instance.number(28), instance.number(29)};
}
using V = std::vector<int32_t>;

TEST(SetupRecordTest, DimensionsAndBoundaries) {
  // Counts other than 2 and 3 make a one-dimensional array.
  for (int32_t count : {0, 4, -1, 7, 1}) {
    EXPECT_EQ(shape(SetupRecord().set(kSetupDimensionCount, count).set(kSetupYBoundary, 6)),
              (V{1, 0, 0}))
        << count;
  }
  EXPECT_EQ(shape(SetupRecord().set(kSetupXBoundary, 0)), (V{2, 0, 0}));
  // The last dimension has no boundary.
  EXPECT_EQ(shape(SetupRecord().set(kSetupXBoundary, 6).set(kSetupYBoundary, 9)), (V{2, 6, 0}));
  SetupRecord threeD = SetupRecord().set(kSetupDimensionCount, 3);
  EXPECT_EQ(shape(threeD.set(kSetupXBoundary, 4).set(kSetupYBoundary, 5)), (V{3, 4, 5}));
  EXPECT_EQ(Instance(threeD).number(27, {2}), 5);
  EXPECT_EQ(shape(threeD.set(kSetupXBoundary, -2).set(kSetupYBoundary, 0)), (V{3, 0, 0}));
}

TEST(SetupRecordTest, DelimiterModesAndBetweenColumn) {
  EXPECT_EQ(Instance(SetupRecord().delimiter("")).text(51), ",");  // delimiter$(
  EXPECT_EQ(Instance(SetupRecord().delimiter(";;")).text(51), ";;");
  SetupRecord unterminated;
  std::memset(unterminated.data() + kSetupListDelimiter, 'x', kSetupListDelimiterSize);
  EXPECT_EQ(Instance(unterminated).text(51), std::string(kSetupListDelimiterSize, 'x'));

  // findStr( of "abc" / "a*" / "Abc" in {"Abc"}: any nonzero mode turns the mode on.
  auto find = [](SetupRecord setup, const char* pattern) {
    Instance instance(std::move(setup));
    instance.action(8, "Abc");
    return instance.number(12, {pattern, 0});
  };
  EXPECT_EQ(find(SetupRecord().set(kSetupCaseSensitive, 7), "abc"), -1);
  EXPECT_EQ(find(SetupRecord().set(kSetupCaseSensitive, 7), "Abc"), 0);
  EXPECT_EQ(find(SetupRecord(), "abc"), 0);
  EXPECT_EQ(find(SetupRecord().set(kSetupWildcardSearch, -3), "a*"), 0);
  EXPECT_EQ(find(SetupRecord(), "a*"), -1);

  Instance between(SetupRecord(), false);
  writeField<int32_t>(between.record(), kRunBetweenColumn, 77);
  between.create();
  EXPECT_EQ(between.betweenColumn(), 0);
  EXPECT_NE(between.elementArray(), nullptr);
}

TEST(ArrayRoutinesTest, EditsAndTextHandover) {
  Instance t;
  EXPECT_EQ(t.number(1), 25);  // capacity( of a new instance
  EXPECT_EQ(t.number(0), 0);
  EXPECT_TRUE(t.noText(2, {0}));  // get$( at size

  EXPECT_EQ(t.action(9, 12), 0);  // Append value
  EXPECT_EQ(t.text(2, {0}), "12");
  EXPECT_EQ(t.number(3, {0}), 12);
  t.action(9, 0);  // stored as None: the empty text, the number 0
  EXPECT_EQ(t.text(2, {1}), "");
  EXPECT_EQ(t.number(3, {1}), 0);
  t.action(8, "hello");  // Append string
  EXPECT_EQ(t.number(0), 3);
  EXPECT_EQ(t.text(2, {2}), "hello");
  EXPECT_TRUE(t.noText(2, {3}));
  EXPECT_TRUE(t.noText(2, {-1}));

  t.action(6, "first", 0);  // Insert string at
  t.action(7, 5, 1);        // Insert value at
  t.action(8, "sixth");     // on five elements it becomes element 5
  EXPECT_EQ(t.number(0), 6);
  EXPECT_EQ(t.text(2, {0}), "first");
  EXPECT_EQ(t.number(3, {1}), 5);
  EXPECT_EQ(t.text(2, {2}), "12");
  EXPECT_EQ(t.text(2, {5}), "sixth");

  t.action(13, "set", 2);  // Set string at
  t.action(14, -7, 3);     // Set value at
  EXPECT_EQ(t.text(2, {2}), "set");
  EXPECT_EQ(t.number(3, {3}), -7);
  EXPECT_EQ(t.text(2, {3}), "-7");

  t.action(20, "key", 0);  // Set key string at
  t.action(21, 42, 1);     // Set key value at
  EXPECT_EQ(t.text(4, {0}), "key");
  EXPECT_EQ(t.number(5, {1}), 42);
  EXPECT_EQ(t.text(4, {1}), "42");
  EXPECT_EQ(t.text(2, {0}), "first");  // the key read left the element alone

  EXPECT_EQ(t.text(8, {"key"}), "first");  // keyStr$(: borrowed, so unchanged after
  EXPECT_EQ(t.text(8, {"key"}), "first");
  EXPECT_TRUE(t.noText(8, {"zz"}));
  EXPECT_TRUE(t.noText(9, {123}));  // keyStr(

  t.action(16, 0);  // Delete at
  EXPECT_EQ(t.number(0), 5);
  EXPECT_EQ(t.number(3, {0}), 5);
  t.action(17);  // Delete all
  EXPECT_EQ(t.number(0), 0);
  EXPECT_TRUE(t.noText(2, {0}));
  EXPECT_EQ(t.text(16, {","}), "");  // an empty list is still a text
}

}  // namespace
}  // namespace testhost
