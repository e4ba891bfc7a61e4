// Every action and every expression through the routine tables, on a live table
// (twice) and on an instance whose array was never created.
#include <cstdio>

#include "test_host.h"

namespace testhost {
namespace {

// Each expression fetches its declared parameters, in order, with the host's token.
void expectFetchesDeclared(Instance& instance, int code) {
  const std::string types = expressionParams(code);
  const std::size_t declared = (types[0] != '-') + (types[1] != '-');
  ASSERT_EQ(instance.fetches.size(), declared) << "expression " << code;
  for (std::size_t i = 0; i < declared; ++i) {
    EXPECT_EQ(instance.fetches[i].first, i == 0) << "expression " << code;
    EXPECT_EQ(instance.fetches[i].typeFlag, types[i] == 'T' ? kFetchText : kFetchInteger)
        << "expression " << code << " parameter " << i;
    EXPECT_EQ(instance.fetches[i].token, kToken);
  }
}

void callEveryAction(Instance& t, const std::string& text) {
  for (int code = 0; code < 79; ++code) {
    const std::string types = actionParams(code);
    EXPECT_EQ(
        t.action(code, types[0] == 'T' ? Arg(text) : Arg(1), types[1] == 'T' ? Arg(text) : Arg(1)),
        0)
        << "action " << code;
  }
}

// Each action answers 0, and every text result is a complete copy in its buffer.
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
      t.setFlags(0);
      const HostWord result = t.expression(code, argsFor(expressionParams(code), 0, "name"));
      expectFetchesDeclared(t, code);
      if (t.flags() == kResultIsString) {
        ASSERT_EQ(t.allocations.size(), 1u) << "expression " << code;
        EXPECT_EQ(std::strlen(reinterpret_cast<const char*>(result)) + 1,
                  static_cast<std::size_t>(t.allocationSizes()[0]));
      } else {
        EXPECT_TRUE(t.allocations.empty()) << "expression " << code;
      }
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
    instance.setFlags(0x0101);
    EXPECT_EQ(instance.expression(code, argsFor(expressionParams(code), 1, "x")), 0) << code;
    EXPECT_EQ(instance.flags(), 0x0101);
    EXPECT_TRUE(instance.allocations.empty());
    expectFetchesDeclared(instance, code);
  }
}

}  // namespace
}  // namespace testhost
