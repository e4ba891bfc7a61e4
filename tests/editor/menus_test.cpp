// The editor's menus, menu codes, titles and display strings, through the module's
// exported entry points and the platform menu services. The menu trees (ids, texts and
// item states) and every code's texts are pinned by the editor script case
// (tests/tools/cases/editor.out); these pin what that output does not show: ownership,
// lengths, cuts.
#include <gtest/gtest.h>

#include <cstring>
#include <utility>

#include "host/entry_points.h"
#include "platform/windows_services.h"

namespace quorrel::editor_test {
namespace {

// Each call builds a new popup, which the caller owns: destroying one leaves the other.
TEST(EditorMenus, EveryCallIsFresh) {
  EXPECT_EQ(GetConditionMenu(0, 0, 0), nullptr);
  for (auto build : {GetActionMenu, GetExpressionMenu}) {
    HMENU first = static_cast<HMENU>(build(0, 0, 0));
    HMENU second = static_cast<HMENU>(build(0, 0, 0));
    ASSERT_TRUE(first && second);
    ASSERT_NE(first, second);
    const int items = GetMenuItemCount(first);
    EXPECT_TRUE(DestroyMenu(first));
    EXPECT_EQ(GetMenuItemCount(second), items);
    EXPECT_TRUE(DestroyMenu(second));
  }
}

TEST(EditorMenus, CodesFromMenuCommands) {
  // Only the low 16 bits of the id count.
  for (auto [id, code] : {std::pair{24999, -1},
                          {25000, 0},
                          {25057, 57},
                          {25078, 78},
                          {25079, -1},
                          {27000, -1},
                          {0x10000 + 25006, 6}}) {
    EXPECT_EQ(GetActionCodeFromMenu(nullptr, id), code) << id;
  }
  for (auto [id, code] :
       {std::pair{26999, -1}, {27000, 0}, {27059, 59}, {27060, -1}, {25000, -1}}) {
    EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, id), code) << id;
  }
  for (int id : {0, 25000, 26000, 27000, -1}) EXPECT_EQ(GetConditionCodeFromMenu(nullptr, id), -1);
}

TEST(EditorStrings, LengthsCutsAndTablesEnds) {
  char buffer[256];
  char second[256];
  // Both parameters of an action share its title.
  for (int code = 0; code < 79; ++code) {
    EXPECT_NE(GetActionTitle(nullptr, code, 0, buffer, sizeof buffer), 0);
    GetActionTitle(nullptr, code, 1, second, sizeof second);
    EXPECT_STREQ(second, buffer) << code;
  }
  char small[16] = "untouched";
  EXPECT_NE(GetConditionTitle(nullptr, 0, 0, small, sizeof small), 0);  // no text, answers
  EXPECT_STREQ(small, "untouched");
  GetActionTitle(nullptr, 44, 0, small, 5);  // cut to the buffer, terminator included
  EXPECT_STREQ(small, "Sort");

  // A string's answer is its length as written: cut to the buffer, terminator included;
  // the size counts in 16 bits and the code in its low 16 bits. No conditions, so no
  // condition strings, nor strings past the tables.
  const struct {
    abi::GetStringFn get;
    int32_t code, size, answer;
    const char* text;
  } strings[] = {{GetActionString, 6, 256, 28, nullptr},
                 {GetActionString, 6, 10, 9, "11%s: Ins"},
                 {GetActionString, 6, 1, 0, ""},
                 {GetExpressionString, 39, 6, 5, "index"},
                 {GetActionString, 6, 0x1000A, 9, "11%s: Ins"},
                 {GetExpressionString, 0x20000, 256, 5, "size("},
                 {GetConditionString, 0, 256, 0, ""},
                 {GetActionString, 79, 256, 0, ""},
                 {GetExpressionString, 60, 256, 0, ""}};
  for (const auto& s : strings) {
    EXPECT_EQ(s.get(nullptr, s.code, buffer, s.size), s.answer) << s.code << " " << s.size;
    EXPECT_STREQ(s.text == nullptr ? buffer : s.text, buffer) << s.code << " " << s.size;
  }

  // Object information: four strings; the fifth does not exist, so the answer is 0.
  char name[255], author[255], copyright[255], comment[255], extra[255];
  std::memset(extra, 'x', sizeof extra);
  EXPECT_EQ(GetObjInfos(0, 0, name, author, copyright, comment, extra), 0);
  EXPECT_STREQ(name, "Quorrel object");
  EXPECT_STREQ(author, "Quorrel team");
  EXPECT_STREQ(extra, "");
}

}  // namespace
}  // namespace quorrel::editor_test
