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

using quorrel::abi::HostWord;
using quorrel::abi::readField;
using quorrel::abi::writeField;
using quorrel::hostsim::Instance;
using quorrel::hostsim::SetupRecord;

const quorrel::hostsim::Module& module() {
  static const auto loaded = quorrel::hostsim::Module::open(QUORREL_MODULE_PATH);
  return *loaded;
}

// The routine tables and a RunInfo read by hand, next to the host simulator's instance.
class Abi32 : public ::testing::Test {
 protected:
  void SetUp() override {
    GetRunObjectInfos(0, runInfo.data());
    std::memcpy(&actions, runInfo.data() + 4, 4);
    std::memcpy(&expressions, runInfo.data() + 8, 4);
  }

  std::vector<uint8_t> runInfo = std::vector<uint8_t>(64, 0xEE);
  const quorrel::abi::ActionRoutine* actions = nullptr;
  const quorrel::abi::ExpressionRoutine* expressions = nullptr;
};

TEST_F(Abi32, RunInfoBytes) {
  EXPECT_EQ(GetRunObjectDataSize(0, 0), 192);
  const void* conditions = readField<const void*>(runInfo.data(), 0);
  ASSERT_NE(conditions, nullptr);
  EXPECT_EQ(*static_cast<const void* const*>(conditions), nullptr);
  for (int code = 0; code < 79; ++code) EXPECT_NE(actions[code], nullptr) << code;
  EXPECT_EQ(actions[79], nullptr);
  for (int code = 0; code < 60; ++code) EXPECT_NE(expressions[code], nullptr) << code;
  EXPECT_EQ(expressions[60], nullptr);
  // 0 conditions, 79 actions, 60 expressions, setup record of 1076 (0x434) bytes.
  const std::vector<uint8_t> written(runInfo.begin() + 12, runInfo.begin() + 36);
  const std::vector<uint8_t> expected = {0,  0,    79, 0, 60,  0,   0x34, 0x04, 0, 0, 0,    0,
                                         10, 0xEE, 0,  0, 'R', 'Q', 'U',  'Z',  0, 0, 0xEE, 0xEE};
  EXPECT_EQ(written, expected);
}

TEST_F(Abi32, InfoEntriesAreTwelveBytesApart) {
  const auto* actionBase = reinterpret_cast<const uint8_t*>(GetActionInfos(nullptr, 0));
  const auto* insertString = reinterpret_cast<const uint8_t*>(GetActionInfos(nullptr, 6));
  ASSERT_EQ(insertString - actionBase, 72);
  // Code 6, flags 0, a text (45) and a number (22), no title ids.
  const uint8_t action6[12] = {6, 0, 0, 0, 45, 0, 22, 0, 0, 0, 0, 0};
  EXPECT_EQ(std::memcmp(insertString, action6, 12), 0);
  const auto* expressionBase = reinterpret_cast<const uint8_t*>(GetExpressionInfos(nullptr, 0));
  const auto* indexOfXY = reinterpret_cast<const uint8_t*>(GetExpressionInfos(nullptr, 39));
  ASSERT_EQ(indexOfXY - expressionBase, 39 * 12);
  const uint8_t expression39[12] = {39, 0, 0, 0, 1, 0, 1, 0, 0, 0, 0, 0};
  EXPECT_EQ(std::memcmp(indexOfXY, expression39, 12), 0);
}

TEST_F(Abi32, InstanceLivesInTheLastEightBytes) {
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

  EXPECT_EQ(actions[8](runRecord, reinterpret_cast<HostWord>("abc"), 0), 0);
  EXPECT_EQ(actions[9](runRecord, 12, 0), 0);
  const auto expression = [&](int code, std::vector<quorrel::hostsim::Argument> args) {
    HostWord answer = instance.callExpressionRaw(code, std::move(args), 0x1234);
    for (const auto& fetch : instance.fetches) EXPECT_EQ(fetch.token, 0x1234);
    return answer;
  };
  EXPECT_EQ(expression(0, {}), 2);    // size(
  EXPECT_EQ(expression(26, {}), 2);   // dim(
  EXPECT_EQ(expression(28, {}), 3);   // boundaryX(
  EXPECT_EQ(expression(3, {1}), 12);  // get( 1, an integer through the first service
  ASSERT_EQ(instance.fetches.size(), 1u);
  EXPECT_TRUE(instance.fetches[0].first);
  EXPECT_EQ(instance.fetches[0].typeFlag, 0);

  // indexOfXY(1, 1) with X boundary 3: integers through the first, then the next service.
  EXPECT_EQ(expression(39, {1, 1}), 4);
  ASSERT_EQ(instance.fetches.size(), 2u);
  EXPECT_FALSE(instance.fetches[1].first);
  EXPECT_EQ(instance.fetches[1].typeFlag, 0);

  // A text result: a host buffer of length + 1 bytes and bit 0x8000 of the word at 124.
  writeField<uint16_t>(runRecord, 124, 0x0001);
  const HostWord text = expression(2, {0});  // get$( 0
  ASSERT_EQ(instance.allocations.size(), 1u);
  EXPECT_EQ(instance.allocations[0].first, 4);
  EXPECT_EQ(std::string(reinterpret_cast<const char*>(text)), "abc");
  EXPECT_EQ(readField<uint16_t>(runRecord, 124), 0x8001);
}

}  // namespace
