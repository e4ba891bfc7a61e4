// The editor's menus, menu codes, titles and display strings, through the module's
// exported entry points and the platform menu services.
#include <gtest/gtest.h>

#include <cstring>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "expectations.h"
#include "host/entry_points.h"
#include "platform/windows_services.h"

namespace quorrel::editor_test {
namespace {

// One line per item: two spaces per level, ID "Text", "Text" for a submenu, - for a
// separator. Every command must be plain (no check, no grey).
std::string dump(HMENU menu, int depth = 0) {
  std::string out;
  std::string indent(static_cast<std::size_t>(depth) * 2, ' ');
  int count = GetMenuItemCount(menu);
  for (int position = 0; position < count; ++position) {
    UINT id = GetMenuItemID(menu, position);
    UINT state = GetMenuState(menu, static_cast<UINT>(position), MF_BYPOSITION);
    if (id == 0) {
      EXPECT_EQ(state & MF_SEPARATOR, static_cast<UINT>(MF_SEPARATOR));
      out += indent + "-\n";
      continue;
    }
    char text[128];
    GetMenuStringA(menu, static_cast<UINT>(position), text, sizeof text, MF_BYPOSITION);
    if (HMENU submenu = GetSubMenu(menu, position)) {
      EXPECT_EQ(id, 0xFFFFFFFFu);
      EXPECT_EQ(state & 0xFF, static_cast<UINT>(MF_POPUP)) << text;
      out += indent + "\"" + text + "\"\n" + dump(submenu, depth + 1);
    } else {
      EXPECT_EQ(state, 0u) << text;
      out += indent + std::to_string(id) + " \"" + text + "\"\n";
    }
  }
  return out;
}

// The documented tree's command texts by id.
std::map<int, std::string> commandTexts(const char* tree) {
  std::map<int, std::string> texts;
  std::istringstream lines(tree);
  std::string line;
  while (std::getline(lines, line)) {
    std::size_t start = line.find_first_not_of(' ');
    if (line[start] < '0' || line[start] > '9') continue;
    std::size_t quote = line.find('"');
    texts[std::stoi(line.substr(start))] = line.substr(quote + 1, line.size() - quote - 2);
  }
  return texts;
}

struct OwnedMenu {
  HMENU menu;
  explicit OwnedMenu(void* m) : menu(static_cast<HMENU>(m)) {}
  ~OwnedMenu() {
    if (menu) DestroyMenu(menu);
  }
};

HMENU submenuNamed(HMENU menu, const char* text) {
  for (int position = 0; position < GetMenuItemCount(menu); ++position) {
    char buffer[128];
    GetMenuStringA(menu, static_cast<UINT>(position), buffer, sizeof buffer, MF_BYPOSITION);
    if (std::strcmp(buffer, text) == 0) return GetSubMenu(menu, position);
  }
  return nullptr;
}

std::string textAt(HMENU menu, int position) {
  char buffer[128] = "";
  GetMenuStringA(menu, static_cast<UINT>(position), buffer, sizeof buffer, MF_BYPOSITION);
  return buffer;
}

TEST(EditorMenus, ActionMenuIsTheDocumentedTree) {
  OwnedMenu action(GetActionMenu(0, 0, 0));
  ASSERT_NE(action.menu, nullptr);
  EXPECT_EQ(dump(action.menu), kActionMenuTree);

  // First and last items: the submenus "File" and "Settings"; "Settings" ends with
  // the command 25057.
  int count = GetMenuItemCount(action.menu);
  ASSERT_EQ(count, 10);
  EXPECT_EQ(textAt(action.menu, 0), "File");
  EXPECT_NE(GetSubMenu(action.menu, 0), nullptr);
  EXPECT_EQ(textAt(action.menu, count - 1), "Settings");
  HMENU settings = GetSubMenu(action.menu, count - 1);
  ASSERT_NE(settings, nullptr);
  int last = GetMenuItemCount(settings) - 1;
  EXPECT_EQ(GetMenuItemID(settings, last), 25057u);
  EXPECT_EQ(textAt(settings, last), "Set list delimiter");

  // "Between": 25015, 25038, a separator, 25049, 25026.
  HMENU between = submenuNamed(
      submenuNamed(
          submenuNamed(submenuNamed(action.menu, "Recordset (2D Array)"), "Rows (Records)"),
          "Select"),
      "Between");
  ASSERT_NE(between, nullptr);
  std::vector<UINT> ids;
  for (int position = 0; position < GetMenuItemCount(between); ++position) {
    ids.push_back(GetMenuItemID(between, position));
  }
  EXPECT_EQ(ids, (std::vector<UINT>{25015, 25038, 0, 25049, 25026}));
}

TEST(EditorMenus, ExpressionMenuIsTheDocumentedTree) {
  OwnedMenu expression(GetExpressionMenu(0, 0, 0));
  ASSERT_NE(expression.menu, nullptr);
  EXPECT_EQ(dump(expression.menu), kExpressionMenuTree);

  EXPECT_EQ(GetMenuItemID(expression.menu, 0), 27000u);
  EXPECT_EQ(textAt(expression.menu, 0), "Get size");
  EXPECT_EQ(GetMenuItemID(expression.menu, 1), 27001u);
  EXPECT_EQ(textAt(expression.menu, 1), "Get capacity");
  int last = GetMenuItemCount(expression.menu) - 1;
  EXPECT_EQ(textAt(expression.menu, last), "Recordset (2D Array)");
}

TEST(EditorMenus, EveryCodeHasExactlyOneCommand) {
  for (auto [tree, base, count] :
       {std::tuple{kActionMenuTree, 25000, 79}, std::tuple{kExpressionMenuTree, 27000, 60}}) {
    std::multiset<int> ids;
    std::istringstream lines(tree);
    std::string line;
    while (std::getline(lines, line)) {
      std::size_t start = line.find_first_not_of(' ');
      if (line[start] >= '0' && line[start] <= '9') ids.insert(std::stoi(line.substr(start)));
    }
    ASSERT_EQ(ids.size(), static_cast<std::size_t>(count));
    for (int code = 0; code < count; ++code) EXPECT_EQ(ids.count(base + code), 1u) << code;
  }
}

TEST(EditorMenus, ConditionMenuIsNullAndEveryMenuIsFresh) {
  EXPECT_EQ(GetConditionMenu(0, 0, 0), nullptr);

  // Each call builds its own popup; the caller may destroy one and keep the other.
  OwnedMenu first(GetActionMenu(0, 0, 0));
  OwnedMenu second(GetActionMenu(0, 0, 0));
  ASSERT_NE(first.menu, nullptr);
  ASSERT_NE(second.menu, nullptr);
  ASSERT_NE(second.menu, first.menu);
  EXPECT_EQ(DestroyMenu(first.menu), TRUE);
  first.menu = nullptr;
  EXPECT_EQ(dump(second.menu), kActionMenuTree);
}

TEST(EditorMenus, CodesFromMenuCommands) {
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 24999), -1);
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 25000), 0);
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 25057), 57);
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 25078), 78);
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 25079), -1);
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 27000), -1);
  // Only the low 16 bits of the id count.
  EXPECT_EQ(GetActionCodeFromMenu(nullptr, 0x10000 + 25006), 6);

  EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, 26999), -1);
  EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, 27000), 0);
  EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, 27059), 59);
  EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, 27060), -1);
  EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, 25000), -1);

  for (int id : {0, 25000, 26000, 27000, -1}) EXPECT_EQ(GetConditionCodeFromMenu(nullptr, id), -1);
}

TEST(EditorTitles, ActionTitlesAreTheMenuTextsForBothParameters) {
  for (int code = 0; code < 79; ++code) {
    for (int param = 0; param < 2; ++param) {
      char buffer[256];
      std::memset(buffer, 'x', sizeof buffer);
      EXPECT_NE(GetActionTitle(nullptr, code, param, buffer, sizeof buffer), 0);
      EXPECT_STREQ(buffer, kActionMenuTexts[code]) << code << " " << param;
    }
  }
  char buffer[64];
  GetActionTitle(nullptr, 44, 1, buffer, sizeof buffer);
  EXPECT_STREQ(buffer, "Sort rows by label value ascending");
  GetActionTitle(nullptr, 6, 0, buffer, sizeof buffer);
  EXPECT_STREQ(buffer, "Insert string at");

  // Cut to the buffer, terminator included.
  GetActionTitle(nullptr, 44, 0, buffer, 5);
  EXPECT_STREQ(buffer, "Sort");
}

TEST(EditorTitles, ExpressionTitlesAreTheMenuTexts) {
  std::map<int, std::string> texts = commandTexts(kExpressionMenuTree);
  for (int code = 0; code < 60; ++code) {
    char buffer[256] = "";
    EXPECT_NE(GetExpressionTitle(nullptr, code, buffer, sizeof buffer), 0);
    EXPECT_EQ(buffer, texts[27000 + code]) << code;
  }
  char buffer[64];
  GetExpressionTitle(nullptr, 39, buffer, sizeof buffer);
  EXPECT_STREQ(buffer, "Get index from X,Y");
}

TEST(EditorTitles, ConditionTitleFindsNoTextButAnswers) {
  char buffer[16] = "untouched";
  EXPECT_NE(GetConditionTitle(nullptr, 0, 0, buffer, sizeof buffer), 0);
  EXPECT_STREQ(buffer, "untouched");
}

TEST(EditorStrings, EveryDisplayStringAndName) {
  for (int code = 0; code < 79; ++code) {
    char buffer[256];
    int copied = GetActionString(nullptr, code, buffer, sizeof buffer);
    EXPECT_STREQ(buffer, kActionStrings[code]) << code;
    EXPECT_EQ(copied, static_cast<int>(std::strlen(kActionStrings[code])));
    // "10" for the actions without parameters, "11" for the others.
    EXPECT_EQ(std::strncmp(buffer, "10%s: ", 6) == 0 || std::strncmp(buffer, "11%s: ", 6) == 0,
              true)
        << code;
  }
  for (int code = 0; code < 60; ++code) {
    char buffer[256];
    int copied = GetExpressionString(nullptr, code, buffer, sizeof buffer);
    EXPECT_STREQ(buffer, kExpressionNames[code]) << code;
    EXPECT_EQ(copied, static_cast<int>(std::strlen(kExpressionNames[code])));
  }

  char buffer[64];
  EXPECT_EQ(GetActionString(nullptr, 17, buffer, sizeof buffer), 16);
  EXPECT_STREQ(buffer, "10%s: Delete all");
  EXPECT_EQ(GetActionString(nullptr, 6, buffer, sizeof buffer), 28);
  EXPECT_STREQ(buffer, "11%s: Insert string %s at %s");
  EXPECT_EQ(GetExpressionString(nullptr, 0, buffer, sizeof buffer), 5);
  EXPECT_STREQ(buffer, "size(");

  // No conditions, so no condition strings; nor strings past the tables.
  EXPECT_EQ(GetConditionString(nullptr, 0, buffer, sizeof buffer), 0);
  EXPECT_EQ(GetActionString(nullptr, 79, buffer, sizeof buffer), 0);
  EXPECT_EQ(GetExpressionString(nullptr, 60, buffer, sizeof buffer), 0);
}

TEST(EditorStrings, SmallBuffersAndSixteenBitArguments) {
  char buffer[32];
  EXPECT_EQ(GetActionString(nullptr, 6, buffer, 10), 9);
  EXPECT_STREQ(buffer, "11%s: Ins");
  EXPECT_EQ(GetActionString(nullptr, 6, buffer, 1), 0);
  EXPECT_STREQ(buffer, "");
  EXPECT_EQ(GetExpressionString(nullptr, 39, buffer, 6), 5);
  EXPECT_STREQ(buffer, "index");

  // The size counts in 16 bits, the code in its low 16 bits.
  EXPECT_EQ(GetActionString(nullptr, 6, buffer, 0x1000A), 9);
  EXPECT_STREQ(buffer, "11%s: Ins");
  EXPECT_EQ(GetExpressionString(nullptr, 0x20000, buffer, sizeof buffer), 5);
  EXPECT_STREQ(buffer, "size(");
}

TEST(EditorStrings, ObjectInformation) {
  char name[255], author[255], copyright[255], comment[255], extra[255];
  std::memset(extra, 'x', sizeof extra);
  // The fifth string does not exist, so the last load answers 0.
  EXPECT_EQ(GetObjInfos(0, 0, name, author, copyright, comment, extra), 0);
  EXPECT_STREQ(name, "Quorrel object");
  EXPECT_STREQ(author, "Quorrel team");
  EXPECT_STREQ(copyright, "Copyright (C) 2026 the Quorrel authors");
  EXPECT_STREQ(comment,
               "Stores values, strings and files in an array of up to nine dimensions that is "
               "sized at run time, with simple database features.");
  EXPECT_STREQ(extra, "");
}

}  // namespace
}  // namespace quorrel::editor_test
