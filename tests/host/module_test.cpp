// The module as the host sees it before any instance exists: exports, object
// information, RunInfo, information entries and routine tables.
#include <fstream>
#include <set>
#include <sstream>

#include "param_types.h"
#include "test_host.h"

namespace testhost {
namespace {

struct ListedEntry {
  std::string name;
  int ordinal;
  int argBytes;
  std::string side;
};

std::vector<ListedEntry> listedEntryPoints() {
  std::ifstream file(QUORREL_ENTRY_POINTS_FILE);
  std::vector<ListedEntry> entries;
  std::string line;
  while (std::getline(file, line)) {
    if (line.empty() || line[0] == '#') continue;
    std::istringstream fields(line);
    ListedEntry entry;
    fields >> entry.name >> entry.ordinal >> entry.argBytes >> entry.side;
    entries.push_back(entry);
  }
  return entries;
}

TEST(ModuleTest, ExportsEveryListedEntryPointWithADistinctOrdinal) {
  Module& module = Module::get();
  ASSERT_TRUE(module.loaded()) << module.error();
  const std::vector<ListedEntry> entries = listedEntryPoints();
  ASSERT_EQ(entries.size(), 30u);
  std::set<int> ordinals;
  for (const ListedEntry& entry : entries) {
    EXPECT_TRUE(ordinals.insert(entry.ordinal).second) << entry.name;
    EXPECT_NE(module.symbol(entry.name.c_str()), nullptr) << entry.name;
  }
  const std::set<std::string> runSide = {
      "GetInfos",         "GetHelpFileName",    "GetObjectRect",       "CreateRunObject",
      "DestroyRunObject", "HandleRunObject",    "DisplayRunObject",    "ReInitRunObject",
      "PauseRunObject",   "ContinueRunObject",  "GetRunObjectInfos",   "GetConditionInfos",
      "GetActionInfos",   "GetExpressionInfos", "GetRunObjectDataSize"};
  for (const std::string& name : runSide) {
    EXPECT_NE(module.symbol(name.c_str()), nullptr) << name;
  }
  // Internal names stay hidden.
  EXPECT_EQ(module.symbol("_ZN7quorrel12ElementArrayC1Ev"), nullptr);
  EXPECT_EQ(module.symbol("ActionRoutineTable"), nullptr);
}

TEST(ModuleTest, ObjectInformation) {
  Module& module = Module::get();
  ASSERT_TRUE(module.loaded()) << module.error();
  auto getInfos = module.entry<GetInfosFn>("GetInfos");
  EXPECT_EQ(getInfos(0), 512);
  EXPECT_EQ(getInfos(1), 0);
  EXPECT_EQ(getInfos(6), 2);
  EXPECT_EQ(getInfos(7), 243);
  for (int code : {-1, 2, 3, 4, 5, 8, 512}) EXPECT_EQ(getInfos(code), 0) << code;

  EXPECT_STREQ(module.entry<GetHelpFileNameFn>("GetHelpFileName")(),
               "Help\\Quorrel\\quorrel2.html");
  EXPECT_EQ(module.entry<GetRunObjectDataSizeFn>("GetRunObjectDataSize")(7, 9),
            static_cast<int16_t>(kRunRecordSize));
  EXPECT_EQ(kRunRecordSize, sizeof(void*) == 4 ? 192u : 200u);

  Instance instance(SetupRecord(), false);
  void* record = instance.record();
  EXPECT_EQ(module.entry<RunObjectFn>("HandleRunObject")(record), 1);
  for (const char* name :
       {"DisplayRunObject", "ReInitRunObject", "PauseRunObject", "ContinueRunObject"}) {
    EXPECT_EQ(module.entry<RunObjectFn>(name)(record), 0) << name;
  }
}

TEST(ModuleTest, ObjectRectReadsSignedWidthAndHeight) {
  auto getObjectRect = Module::get().entry<GetObjectRectFn>("GetObjectRect");
  ASSERT_NE(getObjectRect, nullptr);
  SetupRecord setup;
  writeAt<uint16_t>(setup.data(), kSetupObjectWidth, 0xFFFF);
  writeAt<uint16_t>(setup.data(), kSetupObjectHeight, 40);
  int32_t rect[4] = {100, 200, 7, 8};
  getObjectRect(0, rect, 0, setup.data());
  EXPECT_EQ(rect[0], 100);
  EXPECT_EQ(rect[1], 200);
  EXPECT_EQ(rect[2], 99);
  EXPECT_EQ(rect[3], 240);

  int32_t defaults[4] = {-5, 3, 0, 0};
  getObjectRect(0, defaults, 0, SetupRecord().data());
  EXPECT_EQ(defaults[2], 27);
  EXPECT_EQ(defaults[3], 35);
}

TEST(ModuleTest, RunInfoFieldsAndUntouchedBytes) {
  Module& module = Module::get();
  ASSERT_TRUE(module.loaded()) << module.error();
  std::vector<unsigned char> info(64, 0xAB);
  EXPECT_EQ(module.entry<GetRunObjectInfosFn>("GetRunObjectInfos")(0, info.data()), 1);
  const unsigned char* p = info.data();
  EXPECT_EQ(readAt<uint16_t>(p, kInfoConditionCount), 0);
  EXPECT_EQ(readAt<uint16_t>(p, kInfoActionCount), 79);
  EXPECT_EQ(readAt<uint16_t>(p, kInfoExpressionCount), 60);
  EXPECT_EQ(readAt<uint16_t>(p, kInfoSetupSize), 1076);
  EXPECT_EQ(readAt<uint32_t>(p, kInfoHostWord1), 0u);
  EXPECT_EQ(p[kInfoHostByte], 10);
  EXPECT_EQ(p[kInfoHostByte + 1], 0xAB);  // the byte between is the host's
  EXPECT_EQ(readAt<uint16_t>(p, kInfoHostWord2), 0);
  EXPECT_EQ(std::string(reinterpret_cast<const char*>(p + kInfoIdentifier), 4), "RQUZ");
  EXPECT_EQ(readAt<uint16_t>(p, kInfoHostWord3), 0);
  for (std::size_t i = kRunInfoWrittenSize; i < info.size(); ++i) EXPECT_EQ(p[i], 0xAB) << i;

  auto conditions = readAt<const ConditionRoutine*>(p, kInfoConditionRoutines);
  auto actions = readAt<const ActionRoutine*>(p, kInfoActionRoutines);
  auto expressions = readAt<const ExpressionRoutine*>(p, kInfoExpressionRoutines);
  ASSERT_NE(conditions, nullptr);
  EXPECT_EQ(conditions[0], nullptr);
  for (int code = 0; code < 79; ++code) EXPECT_NE(actions[code], nullptr) << code;
  EXPECT_EQ(actions[79], nullptr);
  for (int code = 0; code < 60; ++code) EXPECT_NE(expressions[code], nullptr) << code;
  EXPECT_EQ(expressions[60], nullptr);

  // boundaryCol/Row/Page are other names of boundaryX/Y/Z; everything else differs.
  EXPECT_EQ(expressions[31], expressions[28]);
  EXPECT_EQ(expressions[32], expressions[29]);
  EXPECT_EQ(expressions[33], expressions[30]);
  std::set<ExpressionRoutine> distinct(expressions, expressions + 31);
  distinct.insert(expressions + 34, expressions + 60);
  EXPECT_EQ(distinct.size(), 57u);
  std::set<ActionRoutine> distinctActions(actions, actions + 79);
  EXPECT_EQ(distinctActions.size(), 79u);
}

TEST(ModuleTest, InformationEntriesCarryTheParameterTypesOfEveryCode) {
  Module& module = Module::get();
  ASSERT_TRUE(module.loaded()) << module.error();
  auto actionInfos = module.entry<GetInfoEntryFn>("GetActionInfos");
  auto expressionInfos = module.entry<GetInfoEntryFn>("GetExpressionInfos");
  auto conditionInfos = module.entry<GetInfoEntryFn>("GetConditionInfos");

  const InfoEntry* firstAction = actionInfos(nullptr, 0);
  for (int code = 0; code < 79; ++code) {
    const InfoEntry* entry = actionInfos(nullptr, code);
    EXPECT_EQ(reinterpret_cast<const char*>(entry) - reinterpret_cast<const char*>(firstAction),
              code * 12);
    EXPECT_EQ(entry->code, code);
    EXPECT_EQ(entry->flags, 0);
    EXPECT_EQ(entry->paramTypes[0], typeCode(kActionParams[code][0])) << "action " << code;
    EXPECT_EQ(entry->paramTypes[1], typeCode(kActionParams[code][1])) << "action " << code;
    EXPECT_EQ(entry->titleIds[0], 0);
    EXPECT_EQ(entry->titleIds[1], 0);
  }
  const InfoEntry* firstExpression = expressionInfos(nullptr, 0);
  for (int code = 0; code < 60; ++code) {
    const InfoEntry* entry = expressionInfos(nullptr, code);
    EXPECT_EQ(entry, firstExpression + code);
    EXPECT_EQ(entry->code, code);
    EXPECT_EQ(entry->flags, 0);
    EXPECT_EQ(entry->paramTypes[0], expressionTypeCode(kExpressionParams[code][0]))
        << "expression " << code;
    EXPECT_EQ(entry->paramTypes[1], expressionTypeCode(kExpressionParams[code][1]))
        << "expression " << code;
    EXPECT_EQ(entry->titleIds[0], 0);
    EXPECT_EQ(entry->titleIds[1], 0);
  }
  // The code's low 16 bits count, as the host passes it in a full word.
  EXPECT_EQ(actionInfos(nullptr, 0x10005), actionInfos(nullptr, 5));

  const InfoEntry* condition = conditionInfos(nullptr, 0);
  const unsigned char zeros[12] = {};
  EXPECT_EQ(std::memcmp(condition, zeros, 12), 0);
}

}  // namespace
}  // namespace testhost
