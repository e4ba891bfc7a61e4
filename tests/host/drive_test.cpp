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
    EXPECT_EQ(t.callAction(code, argsFor(module().actionSignature(code), 1, text)), 0)
        << "action " << code;
  }
}

TEST(DriveTest, EveryActionAndExpressionOnALiveInstance) {
  const std::string path = ::testing::TempDir() + "quorrel_host_drive.dat";
  Instance t(SetupRecord().set(kSetupXBoundary, 3).set(kSetupAutoSelectRows, 1));
  for (int round = 0; round < 2; ++round) {
    t.callAction(34, {"a,1,x"});
    t.callAction(34, {"b,2,y"});
    t.callAction(48, {"name", 0});
    callEveryAction(t, path);
    for (int code = 0; code < 60; ++code) {
      t.setFlags(0x0101);
      EXPECT_NO_THROW(
          t.callExpression(code, argsFor(module().expressionSignature(code), 0, "name")));
    }
  }
  std::remove(path.c_str());
}

TEST(DriveTest, WithoutAnArrayActionsDoNothingAndExpressionsAnswerZero) {
  Instance instance(SetupRecord(), false);
  ASSERT_EQ(readField<void*>(instance.record(), kRunElementArray), nullptr);
  callEveryAction(instance, "nothing");
  for (int code = 0; code < 60; ++code) {
    instance.setFlags(0x0101);
    const auto result =
        instance.callExpression(code, argsFor(module().expressionSignature(code), 1, "x"));
    EXPECT_TRUE(!result.isText && result.number == 0) << code;
  }
}

// A delimiter that fills its field has no terminator; the between column starts at 0
// whatever the host left in the record.
TEST(DriveTest, CreateTakesAFullDelimiterFieldAndZeroesTheBetweenColumn) {
  SetupRecord setup;
  std::memset(setup.data() + kSetupListDelimiter, 'x', kSetupListDelimiterSize);
  Instance instance(setup, false);
  writeField<int32_t>(instance.record(), kRunBetweenColumn, 77);
  instance.create();
  EXPECT_EQ(readField<int32_t>(instance.record(), kRunBetweenColumn), 0);
  EXPECT_EQ(instance.callExpression(51, {}).text, std::string(kSetupListDelimiterSize, 'x'));
}

}  // namespace
}  // namespace testhost
