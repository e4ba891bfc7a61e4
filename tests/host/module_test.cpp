// The module as the host sees it before any instance exists: exports, object
// information, RunInfo, information entries and routine tables.
#include <fstream>
#include <set>
#include <sstream>

#include "test_host.h"

namespace testhost {
namespace {

TEST(ModuleTest, ExportsEveryListedEntryPointWithADistinctOrdinal) {
  std::ifstream file(QUORREL_ENTRY_POINTS_FILE);
  std::set<int> ordinals;
  std::set<std::string> hostNames;
  for (std::string line; std::getline(file, line);) {
    if (line.empty() || line[0] == '#') continue;
    std::string name, side;
    int ordinal = 0, argumentBytes = 0;
    std::istringstream(line) >> name >> ordinal >> argumentBytes >> side;
    EXPECT_TRUE(ordinals.insert(ordinal).second) << name;
    EXPECT_NE(symbol(name.c_str()), nullptr) << name;
    if (side != "tool") hostNames.insert(name);
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

}  // namespace
}  // namespace testhost
