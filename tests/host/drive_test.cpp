// Every action and every expression through the routine tables, on a live table
// (twice) and on an instance whose array was never created. The simulator checks each
// expression against the host's rules: parameters fetched as declared, flags, and the
// text buffer.
#include <cstdio>
#include <cstring>
#include <functional>

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

// The simulator's own checks: each rule broken on purpose after a real call.
TEST(HostRules, EachBrokenRuleIsCaught) {
  Instance t;
  t.callAction(8, {"abc"});
  using Tamper = std::function<void(HostWord & answer, uint16_t & flagsBefore)>;
  const auto verdict = [&](int code, std::vector<Arg> args, const Tamper& tamper) {
    t.setFlags(0x0101);
    HostWord answer = t.callExpressionRaw(code, std::move(args), 7);
    uint16_t before = 0x0101;
    tamper(answer, before);
    try {
      t.checkExpression(code, answer, before, 7);
    } catch (const quorrel::hostsim::ContractError& error) {
      return std::string(error.what());
    }
    return std::string("kept");
  };
  const std::string outOfOrder = " out of order, as the wrong type or without the host's token";
  EXPECT_EQ(verdict(2, {0}, [](HostWord&, uint16_t&) {}), "kept");
  EXPECT_EQ(verdict(2, {0}, [&](HostWord&, uint16_t&) { t.fetches.clear(); }),
            "expression 2 fetched 0 parameters and declares 1");
  EXPECT_EQ(verdict(39, {1, 1}, [&](HostWord&, uint16_t&) { t.fetches[1].first = true; }),
            "expression 39 fetched parameter 2" + outOfOrder);
  EXPECT_EQ(verdict(3, {0}, [&](HostWord&, uint16_t&) { t.fetches[0].token = 8; }),
            "expression 3 fetched parameter 1" + outOfOrder);
  EXPECT_EQ(verdict(0, {}, [](HostWord&, uint16_t& before) { before = 0x0100; }),
            "expression 0 changed a host flag other than setting the string bit");
  EXPECT_EQ(verdict(0, {}, [&](HostWord&, uint16_t&) { t.setFlags(0x8101); }),
            "expression 0 answered a text with 0 buffers");
  EXPECT_EQ(verdict(2, {0}, [&](HostWord&, uint16_t&) { t.setFlags(0x0101); }),
            "expression 2 asked for a text buffer and answered a number");
  EXPECT_EQ(
      verdict(2, {0}, [&](HostWord&, uint16_t&) { t.allocations[0].first = 3; }),
      "expression 2 did not answer its text in one buffer of the text's size (3 bytes for 3)");
  // The host allocates exactly the record size the module asks for: a byte written
  // after it (here by hand) is caught at the next call.
  static_cast<unsigned char*>(t.record())[kRunRecordSize] ^= 1;
  try {
    t.callAction(8, {"abc"});
    ADD_FAILURE() << "a write past the run record went unnoticed";
  } catch (const quorrel::hostsim::ContractError& error) {
    EXPECT_EQ(std::string(error.what()), "the module wrote past its run record of " +
                                             std::to_string(kRunRecordSize) + " bytes");
  }
  static_cast<unsigned char*>(t.record())[kRunRecordSize] ^= 1;
}

}  // namespace
}  // namespace testhost
