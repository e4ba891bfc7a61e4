// The module as the host sees it: the host simulator loads the built module once, at
// run time, and drives it only through its exported entry points and the records of
// host/abi.h. First what the host reads before any instance exists (exports, object
// information, RunInfo, information entries and routine tables), then every action and
// expression on a live table (twice) and on an instance whose array was never created;
// the simulator checks each expression against the host's rules: parameters fetched
// as declared, flags, and the text buffer.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <cstring>
#include <functional>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "hostsim/host_simulator.h"

namespace testhost {
namespace {

using namespace quorrel::abi;
using quorrel::hostsim::SetupRecord;
using Arg = quorrel::hostsim::Argument;

// Opened on first use; a module that cannot be opened fails each test with the reason.
const quorrel::hostsim::Module& module() {
  static const auto loaded = quorrel::hostsim::Module::open(QUORREL_MODULE_PATH);
  return *loaded;
}

void* symbol(const char* name) {
  return module().symbol(name);
}
template <typename Fn>
Fn entry(const char* name) {
  return module().entry<Fn>(name);
}

// An instance of the loaded module.
class Instance : public quorrel::hostsim::Instance {
 public:
  explicit Instance(SetupRecord setup = SetupRecord(), bool createNow = true)
      : quorrel::hostsim::Instance(module(), std::move(setup), createNow) {}
};

// Arguments of a code's declared types: `text` for each text, `number` for the others.
std::vector<Arg> argsFor(const quorrel::hostsim::Signature& signature, int32_t number,
                         const std::string& text) {
  std::vector<Arg> args;
  for (int i = 0; i < signature.paramCount; ++i) {
    const uint16_t type = signature.paramTypes[i];
    args.push_back(type == kActionParamText || type == kExpressionParamText ? Arg(text)
                                                                            : Arg(number));
  }
  return args;
}

TEST(ModuleTest, ExportsEveryListedEntryPointWithADistinctOrdinal) {
  struct Row {
    const char* name;
    int ordinal;
    std::string side;
  };
  const Row rows[] = {
#define QUORREL_ENTRY_POINT(name, ordinal, bytes, side, Type) {#name, ordinal, #side},
#include "host/entry_points.inc"
#undef QUORREL_ENTRY_POINT
  };
  std::set<int> ordinals;
  std::set<std::string> hostNames;
  for (const Row& row : rows) {
    EXPECT_TRUE(ordinals.insert(row.ordinal).second) << row.name;
    EXPECT_NE(symbol(row.name), nullptr) << row.name;
    if (row.side != "tool") hostNames.insert(row.name);
  }
  // The host's 30, and the one the quorrel command asks for file statuses.
  EXPECT_EQ(hostNames.size(), 30u);
  EXPECT_EQ(ordinals.size(), 31u);
  // Internal names stay hidden.
  EXPECT_EQ(symbol("_ZN7quorrel12ElementArrayC1Ev"), nullptr);
  EXPECT_EQ(symbol("ActionRoutineTable"), nullptr);
}

TEST(ModuleTest, ObjectInformationAndRect) {
  auto getInfos = entry<GetInfosFn>("GetInfos");
  EXPECT_EQ(getInfos(0), 512);
  EXPECT_EQ(getInfos(6), 2);
  EXPECT_EQ(getInfos(7), 243);
  for (int code : {-1, 1, 2, 3, 4, 5, 8, 512}) EXPECT_EQ(getInfos(code), 0) << code;
  EXPECT_STREQ(entry<GetHelpFileNameFn>("GetHelpFileName")(), "Help\\Quorrel\\quorrel2.html");
  EXPECT_EQ(entry<GetRunObjectDataSizeFn>("GetRunObjectDataSize")(7, 9),
            static_cast<int16_t>(kRunRecordSize));
  EXPECT_EQ(kRunRecordSize, sizeof(void*) == 4 ? 192u : 200u);

  Instance instance(SetupRecord(), false);
  EXPECT_EQ(entry<RunObjectFn>("HandleRunObject")(instance.record()), 1);
  for (const char* name :
       {"DisplayRunObject", "ReInitRunObject", "PauseRunObject", "ContinueRunObject"}) {
    EXPECT_EQ(entry<RunObjectFn>(name)(instance.record()), 0) << name;
  }

  // Width and height are signed: 0xFFFF is -1.
  auto getObjectRect = entry<GetObjectRectFn>("GetObjectRect");
  SetupRecord setup;
  writeField<uint16_t>(setup.data(), kSetupObjectWidth, 0xFFFF);
  writeField<uint16_t>(setup.data(), kSetupObjectHeight, 40);
  int32_t rect[4] = {100, 200, 7, 8};
  getObjectRect(0, rect, 0, setup.data());
  EXPECT_EQ(std::vector<int32_t>(rect, rect + 4), (std::vector<int32_t>{100, 200, 99, 240}));
  int32_t defaults[4] = {-5, 3, 0, 0};
  getObjectRect(0, defaults, 0, SetupRecord().data());
  EXPECT_EQ(defaults[2], 27);
  EXPECT_EQ(defaults[3], 35);
}

TEST(ModuleTest, RunInfoFieldsAndUntouchedBytes) {
  std::vector<unsigned char> info(64, 0xAB);
  EXPECT_EQ(entry<GetRunObjectInfosFn>("GetRunObjectInfos")(0, info.data()), 1);
  const unsigned char* p = info.data();
  EXPECT_EQ(readField<uint16_t>(p, kInfoConditionCount), 0);
  EXPECT_EQ(readField<uint16_t>(p, kInfoActionCount), 79);
  EXPECT_EQ(readField<uint16_t>(p, kInfoExpressionCount), 60);
  EXPECT_EQ(readField<uint16_t>(p, kInfoSetupSize), 1076);
  EXPECT_EQ(readField<uint32_t>(p, kInfoHostWord1), 0u);
  EXPECT_EQ(p[kInfoHostByte], 10);
  EXPECT_EQ(p[kInfoHostByte + 1], 0xAB);  // the byte between is the host's
  EXPECT_EQ(readField<uint16_t>(p, kInfoHostWord2), 0);
  EXPECT_EQ(std::string(reinterpret_cast<const char*>(p + kInfoIdentifier), 4), "RQUZ");
  EXPECT_EQ(readField<uint16_t>(p, kInfoHostWord3), 0);
  for (std::size_t i = kRunInfoWrittenSize; i < info.size(); ++i) EXPECT_EQ(p[i], 0xAB) << i;

  auto conditions = readField<const ConditionRoutine*>(p, kInfoConditionRoutines);
  auto actions = readField<const ActionRoutine*>(p, kInfoActionRoutines);
  auto expressions = readField<const ExpressionRoutine*>(p, kInfoExpressionRoutines);
  ASSERT_NE(conditions, nullptr);
  EXPECT_EQ(conditions[0], nullptr);
  EXPECT_EQ(actions[79], nullptr);
  EXPECT_EQ(expressions[60], nullptr);
  // Every routine differs, except that boundaryCol/Row/Page are boundaryX/Y/Z.
  EXPECT_EQ(expressions[31], expressions[28]);
  EXPECT_EQ(expressions[32], expressions[29]);
  EXPECT_EQ(expressions[33], expressions[30]);
  std::set<ExpressionRoutine> distinct(expressions, expressions + 31);
  distinct.insert(expressions + 34, expressions + 60);
  distinct.insert(nullptr);
  EXPECT_EQ(distinct.size(), 58u);  // 57 routines, none of them null
  std::set<ActionRoutine> distinctActions(actions, actions + 79);
  distinctActions.insert(nullptr);
  EXPECT_EQ(distinctActions.size(), 80u);
}

// Twelve-byte entries: the code, no flags, the parameter types (which the names_list
// case pins code by code) and no title ids.
TEST(ModuleTest, InformationEntriesAreTheCodesInOrder) {
  auto check = [](const char* entryName, int count, std::set<uint16_t> types) {
    auto infos = entry<GetInfoEntryFn>(entryName);
    for (int c = 0; c < count; ++c) {
      const InfoEntry* entry = infos(nullptr, c);
      EXPECT_EQ(entry, infos(nullptr, 0) + c) << entryName << " " << c;
      EXPECT_EQ(entry->code, c);
      EXPECT_EQ(entry->flags, 0);
      EXPECT_TRUE(types.count(entry->paramTypes[0]) && types.count(entry->paramTypes[1]));
      EXPECT_TRUE(entry->paramTypes[0] != 0 || entry->paramTypes[1] == 0) << entryName << c;
      EXPECT_EQ(entry->titleIds[0] | entry->titleIds[1], 0);
    }
    // The code's low 16 bits count, as the host passes it in a full word.
    EXPECT_EQ(infos(nullptr, 0x10005), infos(nullptr, 5));
  };
  check("GetActionInfos", 79, {0, 22, 45});
  check("GetExpressionInfos", 60, {0, 1, 3});
  const unsigned char zeros[12] = {};
  EXPECT_EQ(std::memcmp(entry<GetInfoEntryFn>("GetConditionInfos")(nullptr, 0), zeros, 12), 0);
}

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
