// Drives the module through records laid out byte by byte as the 32-bit host lays them
// out: every offset here is a literal, not a constant of the module, so a layout that
// drifts fails here even if it drifts consistently.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "host/entry_points.h"

namespace {

static_assert(sizeof(void*) == 4, "this test runs in the 32-bit build");

using quorrel::abi::HostWord;

using quorrel::abi::readField;
using quorrel::abi::writeField;

// The host side of one expression call: its parameters, the services' record of what
// was fetched, and result buffers.
struct FakeHost {
  std::vector<HostWord> parameters;
  std::vector<std::pair<int, int32_t>> fetches;  // service (1 first, 2 next), type flag
  std::vector<std::vector<char>> buffers;
  std::size_t nextParameter = 0;
};
FakeHost* host = nullptr;

HostWord QUORREL_CALL fetchFirst(void*, int32_t typeFlag, HostWord) {
  host->fetches.emplace_back(1, typeFlag);
  host->nextParameter = 1;
  return host->parameters.at(0);
}
HostWord QUORREL_CALL fetchNext(void*, int32_t typeFlag, HostWord) {
  host->fetches.emplace_back(2, typeFlag);
  return host->parameters.at(host->nextParameter++);
}
char* QUORREL_CALL allocateResult(void*, int32_t size, int32_t) {
  host->buffers.emplace_back(static_cast<std::size_t>(size), '\x7F');
  return host->buffers.back().data();
}

class Abi32 : public ::testing::Test {
 protected:
  void SetUp() override {
    host = &fake;
    // The run-time header: the services at bytes 876, 880 and 916.
    writeField(runHeader.data(), 876, &fetchFirst);
    writeField(runHeader.data(), 880, &fetchNext);
    writeField(runHeader.data(), 916, &allocateResult);
    writeField(runRecord.data(), 8, runHeader.data());
    GetRunObjectInfos(0, runInfo.data());
    std::memcpy(&actions, runInfo.data() + 4, 4);
    std::memcpy(&expressions, runInfo.data() + 8, 4);
  }
  void TearDown() override { host = nullptr; }

  HostWord expression(int code, std::vector<HostWord> parameters) {
    fake.parameters = std::move(parameters);
    fake.fetches.clear();
    return expressions[code](runRecord.data(), 0x1234);
  }

  FakeHost fake;
  std::vector<uint8_t> runHeader = std::vector<uint8_t>(920, 0);
  std::vector<uint8_t> runRecord = std::vector<uint8_t>(192, 0xCD);
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
  std::vector<uint8_t> setup(1076, 0);
  put<int16_t>(setup, 20, 32);
  put<int32_t>(setup, 24, 2);  // two dimensions
  put<int32_t>(setup, 28, 3);  // X boundary 3
  put<int32_t>(setup, 32, 9);  // Y boundary, not used in 2D
  std::memcpy(setup.data() + 44, ";", 2);
  put<int32_t>(setup, 1072, 1);
  const std::vector<uint8_t> hostPart(runRecord.begin(), runRecord.begin() + 184);

  ASSERT_EQ(CreateRunObject(runRecord.data(), setup.data(), 0), 0);
  EXPECT_NE(readField<void*>(runRecord.data(), 184), nullptr);
  EXPECT_EQ(readField<int32_t>(runRecord.data(), 188), 0);
  EXPECT_EQ(std::vector<uint8_t>(runRecord.begin(), runRecord.begin() + 184), hostPart)
      << "the host's 184 bytes are not the extension's to write";

  EXPECT_EQ(actions[8](runRecord.data(), reinterpret_cast<HostWord>("abc"), 0), 0);
  EXPECT_EQ(actions[9](runRecord.data(), 12, 0), 0);
  EXPECT_EQ(expression(0, {}), 2);    // size(
  EXPECT_EQ(expression(26, {}), 2);   // dim(
  EXPECT_EQ(expression(28, {}), 3);   // boundaryX(
  EXPECT_EQ(expression(3, {1}), 12);  // get( 1
  EXPECT_EQ(fake.fetches, (std::vector<std::pair<int, int32_t>>{{1, 0}}));

  // indexOfXY(1, 1) with X boundary 3: integers through the first, then the next service.
  EXPECT_EQ(expression(39, {1, 1}), 4);
  EXPECT_EQ(fake.fetches, (std::vector<std::pair<int, int32_t>>{{1, 0}, {2, 0}}));

  // A text result: a host buffer of length + 1 bytes and bit 0x8000 of the word at 124.
  put<uint16_t>(runRecord, 124, 0x0001);
  const HostWord text = expression(2, {0});  // get$( 0
  ASSERT_EQ(fake.buffers.size(), 1u);
  EXPECT_EQ(fake.buffers[0].size(), 4u);
  EXPECT_EQ(reinterpret_cast<const char*>(text), fake.buffers[0].data());
  EXPECT_EQ(std::string(fake.buffers[0].data()), "abc");
  EXPECT_EQ(readField<uint16_t>(runRecord.data(), 124), 0x8001);

  EXPECT_EQ(DestroyRunObject(runRecord.data(), 0), 0);
}

}  // namespace
