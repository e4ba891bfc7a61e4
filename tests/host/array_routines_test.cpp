// The setup record as the routines read it: dimensions, boundaries, delimiter and modes.
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

}  // namespace
}  // namespace testhost
