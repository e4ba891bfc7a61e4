// The editor's menus, menu codes, titles and display strings, through the module's
// exported entry points and the platform menu services.
#include <gtest/gtest.h>

#include <cstring>
#include <map>
#include <sstream>
#include <string>
#include <tuple>
#include <utility>

#include "expectations.h"
#include "host/entry_points.h"
#include "platform/windows_services.h"

namespace quorrel::editor_test {
namespace {

// One line per item: two spaces per level, ID "Text", "Text" for a submenu, - for a
// separator. Every command must be plain (no check, no grey).
std::string dump(HMENU menu, int depth = 0) {
  std::string out, indent(static_cast<std::size_t>(depth) * 2, ' ');
  for (int position = 0; position < GetMenuItemCount(menu); ++position) {
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

// The written-out tree's commands: id and text.
std::multimap<int, std::string> commands(const char* tree) {
  std::multimap<int, std::string> texts;
  std::istringstream lines(tree);
  for (std::string line; std::getline(lines, line);) {
    std::size_t start = line.find_first_not_of(' ');
    if (line[start] < '0' || line[start] > '9') continue;
    std::size_t quote = line.find('"');
    texts.emplace(std::stoi(line.substr(start)), line.substr(quote + 1, line.size() - quote - 2));
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

TEST(EditorMenus, MenusAreTheWrittenOutTreesAndEveryCallIsFresh) {
  OwnedMenu expression(GetExpressionMenu(0, 0, 0));
  ASSERT_NE(expression.menu, nullptr);
  EXPECT_EQ(dump(expression.menu), kExpressionMenuTree);
  EXPECT_EQ(GetConditionMenu(0, 0, 0), nullptr);

  // Each call builds its own popup; the caller may destroy one and keep the other.
  OwnedMenu first(GetActionMenu(0, 0, 0));
  OwnedMenu second(GetActionMenu(0, 0, 0));
  ASSERT_NE(first.menu, nullptr);
  ASSERT_NE(second.menu, nullptr);
  ASSERT_NE(second.menu, first.menu);
  EXPECT_EQ(dump(first.menu), kActionMenuTree);
  EXPECT_EQ(DestroyMenu(first.menu), TRUE);
  first.menu = nullptr;
  EXPECT_EQ(dump(second.menu), kActionMenuTree);

  // The written-out trees hold every code exactly once.
  for (auto [tree, base, count] :
       {std::tuple{kActionMenuTree, 25000, 79}, std::tuple{kExpressionMenuTree, 27000, 60}}) {
    const auto ids = commands(tree);
    ASSERT_EQ(ids.size(), static_cast<std::size_t>(count));
    for (int code = 0; code < count; ++code) EXPECT_EQ(ids.count(base + code), 1u) << code;
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

TEST(EditorTitles, TitlesAreTheMenuTexts) {
  for (int code = 0; code < 79; ++code) {
    for (int param = 0; param < 2; ++param) {
      char buffer[256];
      std::memset(buffer, 'x', sizeof buffer);
      EXPECT_NE(GetActionTitle(nullptr, code, param, buffer, sizeof buffer), 0);
      EXPECT_STREQ(buffer, kActionMenuTexts[code]) << code << " " << param;
    }
  }
  const auto texts = commands(kExpressionMenuTree);
  for (int code = 0; code < 60; ++code) {
    char buffer[256] = "";
    EXPECT_NE(GetExpressionTitle(nullptr, code, buffer, sizeof buffer), 0);
    EXPECT_EQ(buffer, texts.find(27000 + code)->second) << code;
  }
  char buffer[16] = "untouched";
  EXPECT_NE(GetConditionTitle(nullptr, 0, 0, buffer, sizeof buffer), 0);  // no text, answers
  EXPECT_STREQ(buffer, "untouched");
  GetActionTitle(nullptr, 44, 0, buffer, 5);  // cut to the buffer, terminator included
  EXPECT_STREQ(buffer, "Sort");
}

TEST(EditorStrings, EveryDisplayStringAndName) {
  char buffer[256];
  for (int code = 0; code < 79; ++code) {
    EXPECT_EQ(GetActionString(nullptr, code, buffer, sizeof buffer),
              static_cast<int>(std::strlen(kActionStrings[code])));
    EXPECT_STREQ(buffer, kActionStrings[code]) << code;
  }
  for (int code = 0; code < 60; ++code) {
    EXPECT_EQ(GetExpressionString(nullptr, code, buffer, sizeof buffer),
              static_cast<int>(std::strlen(kExpressionNames[code])));
    EXPECT_STREQ(buffer, kExpressionNames[code]) << code;
  }
  // No conditions, so no condition strings; nor strings past the tables.
  EXPECT_EQ(GetConditionString(nullptr, 0, buffer, sizeof buffer), 0);
  EXPECT_EQ(GetActionString(nullptr, 79, buffer, sizeof buffer), 0);
  EXPECT_EQ(GetExpressionString(nullptr, 60, buffer, sizeof buffer), 0);

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
