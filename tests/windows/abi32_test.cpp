// Drives the module through records laid out byte by byte as the 32-bit host lays them
// out: every offset here is a literal, not a constant of the module, so a layout that
// drifts fails here even if it drifts consistently.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "host/entry_points.h"
#include "hostsim/host_simulator.h"

namespace {

static_assert(sizeof(void*) == 4, "this test runs in the 32-bit build");

using quorrel::abi::readField;
using quorrel::abi::writeField;
using quorrel::hostsim::Instance;
using quorrel::hostsim::SetupRecord;

const quorrel::hostsim::Module& module() {
  static const auto loaded = quorrel::hostsim::Module::open(QUORREL_MODULE_PATH);
  return *loaded;
}

// RunInfo read at its literal offsets: the routine tables at 4 and 8; 0 conditions,
// 79 actions, 60 expressions, a setup record of 1076 (0x434) bytes, the host's byte 10
// and "RQUZ"; the bytes between and after stay the host's (0xEE).
TEST(Abi32, RunInfoAndInformationEntryBytes) {
  std::vector<uint8_t> runInfo(64, 0xEE);
  GetRunObjectInfos(0, runInfo.data());
  EXPECT_EQ(readField<const void*>(runInfo.data(), 4), module().routines().actions);
  EXPECT_EQ(readField<const void*>(runInfo.data(), 8), module().routines().expressions);
  const std::vector<uint8_t> written(runInfo.begin() + 12, runInfo.begin() + 36);
  const std::vector<uint8_t> expected = {0,  0,    79, 0, 60,  0,   0x34, 0x04, 0, 0, 0,    0,
                                         10, 0xEE, 0,  0, 'R', 'Q', 'U',  'Z',  0, 0, 0xEE, 0xEE};
  EXPECT_EQ(written, expected);

  // Twelve-byte entries: action 6 is code 6, flags 0, a text (45) and a number (22), no
  // title ids; expression 39 takes two integers (1).
  const auto* actionBase = reinterpret_cast<const uint8_t*>(GetActionInfos(nullptr, 0));
  const uint8_t action6[12] = {6, 0, 0, 0, 45, 0, 22, 0, 0, 0, 0, 0};
  EXPECT_EQ(std::memcmp(actionBase + 6 * 12, action6, 12), 0);
  EXPECT_EQ(GetActionInfos(nullptr, 6), static_cast<const void*>(actionBase + 6 * 12));
  const auto* expressionBase = reinterpret_cast<const uint8_t*>(GetExpressionInfos(nullptr, 0));
  const uint8_t expression39[12] = {39, 0, 0, 0, 1, 0, 1, 0, 0, 0, 0, 0};
  EXPECT_EQ(std::memcmp(expressionBase + 39 * 12, expression39, 12), 0);
  EXPECT_EQ(GetExpressionInfos(nullptr, 39), static_cast<const void*>(expressionBase + 39 * 12));
}

TEST(Abi32, InstanceLivesInTheLastEightBytes) {
  SetupRecord setup;
  setup.set(24, 2).set(28, 3).set(32, 9);  // two dimensions, X boundary 3, Y not used in 2D
  setup.delimiter(";").set(1072, 1);       // automatic selection
  Instance instance(module(), setup, false);
  auto* runRecord = static_cast<uint8_t*>(instance.record());
  std::memset(runRecord + 12, 0xCD, 172);  // host bytes the simulator leaves to the test
  // The services sit at bytes 876, 880 and 916 of the run-time header at byte 8.
  const auto* runHeader = readField<const uint8_t*>(runRecord, 8);
  ASSERT_NE(readField<void*>(runHeader, 876), nullptr);
  ASSERT_NE(readField<void*>(runHeader, 880), nullptr);
  ASSERT_NE(readField<void*>(runHeader, 916), nullptr);
  const std::vector<uint8_t> hostPart(runRecord, runRecord + 184);

  instance.create();
  EXPECT_NE(readField<void*>(runRecord, 184), nullptr);
  EXPECT_EQ(readField<int32_t>(runRecord, 188), 0);
  EXPECT_EQ(std::vector<uint8_t>(runRecord, runRecord + 184), hostPart)
      << "the host's 184 bytes are not the extension's to write";

  // Parameters through both fetch services (the simulator checks how they are fetched).
  instance.callAction(8, {"abc"});
  instance.callAction(9, {12});
  const auto number = [&](int code, std::vector<quorrel::hostsim::Argument> args) {
    return instance.callExpression(code, args).number;
  };
  EXPECT_EQ(number(0, {}), 2);       // size(
  EXPECT_EQ(number(26, {}), 2);      // dim(
  EXPECT_EQ(number(28, {}), 3);      // boundaryX(
  EXPECT_EQ(number(3, {1}), 12);     // get( 1
  EXPECT_EQ(number(39, {1, 1}), 4);  // indexOfXY( 1 1 with X boundary 3

  // A text result sets bit 0x8000 of the word at 124 and leaves the host's bits.
  writeField<uint16_t>(runRecord, 124, 0x0001);
  EXPECT_EQ(instance.callExpression(2, {0}).text, "abc");  // get$( 0
  EXPECT_EQ(readField<uint16_t>(runRecord, 124), 0x8001);
}

}  // namespace
