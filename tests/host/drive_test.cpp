// Every action and every expression through the routine tables, on a live table
// (twice) and on an instance whose array was never created. The simulator checks each
// expression against the host's rules: parameters fetched as declared, flags, and the
// text buffer.
#include <cstdio>
#include <cstring>

#include "test_host.h"

namespace testhost {
namespace {

// Each action answers 0; text parameters get `text`, number parameters 1.
void callEveryAction(Instance& t, const std::string& text) {
  for (int code = 0; code < 79; ++code) {
    const std::string types = actionParams(code);
    EXPECT_EQ(
        t.action(code, types[0] == 'T' ? Arg(text) : Arg(1), types[1] == 'T' ? Arg(text) : Arg(1)),
        0)
        << "action " << code;
  }
}

TEST(DriveTest, EveryActionAndExpressionOnALiveInstance) {
  ASSERT_MODULE_LOADED();
  const std::string path = ::testing::TempDir() + "quorrel_host_drive.dat";
  Instance t(SetupRecord().set(kSetupXBoundary, 3).set(kSetupAutoSelectRows, 1));
  for (int round = 0; round < 2; ++round) {
    t.action(34, "a,1,x");
    t.action(34, "b,2,y");
    t.action(48, "name", 0);
    callEveryAction(t, path);
    for (int code = 0; code < 60; ++code) {
      t.setFlags(0x0101);
      EXPECT_NO_THROW(t.callExpression(code, argsFor(expressionParams(code), 0, "name")));
    }
  }
  std::remove(path.c_str());
}

TEST(DriveTest, WithoutAnArrayActionsDoNothingAndExpressionsAnswerZero) {
  ASSERT_MODULE_LOADED();
  Instance instance(SetupRecord(), false);
  ASSERT_EQ(instance.elementArray(), nullptr);
  callEveryAction(instance, "nothing");
  for (int code = 0; code < 60; ++code) {
    EXPECT_EQ(instance.number(code, argsFor(expressionParams(code), 1, "x")), 0) << code;
  }
}

// A delimiter that fills its field has no terminator; the between column starts at 0
// whatever the host left in the record.
TEST(DriveTest, CreateTakesAFullDelimiterFieldAndZeroesTheBetweenColumn) {
  ASSERT_MODULE_LOADED();
  SetupRecord setup;
  std::memset(setup.data() + kSetupListDelimiter, 'x', kSetupListDelimiterSize);
  Instance instance(setup, false);
  writeField<int32_t>(instance.record(), kRunBetweenColumn, 77);
  instance.create();
  EXPECT_EQ(instance.betweenColumn(), 0);
  EXPECT_EQ(instance.text(51), std::string(kSetupListDelimiterSize, 'x'));
}

}  // namespace
}  // namespace testhost
