// The editor's menus, menu codes, titles and display strings, through the module's
// exported entry points and the platform menu services.
#include <gtest/gtest.h>

#include <cstring>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "host/entry_points.h"
#include "platform/windows_services.h"

namespace quorrel::editor_test {
namespace {

// The expectations are the golden output of `quorrel menu` and `quorrel strings`
// (QUORREL_EDITOR_GOLDEN), so the menus and strings are written down once: each
// "== menu KIND" section is a tree as dump() prints it, each "== strings KIND" line
// CODE "display string or name" "title". A backslash takes the next character as it
// is: the editor's texts need no other escape.
struct Golden {
  std::map<std::string, std::string> trees;
  std::map<std::string, std::vector<std::pair<std::string, std::string>>> strings;
};

std::vector<std::string> quotedTexts(const std::string& line) {
  std::vector<std::string> out;
  for (std::size_t i = line.find('"'); i != std::string::npos; i = line.find('"', i + 1)) {
    std::string text;
    for (++i; i < line.size() && line[i] != '"'; ++i) text += line[i] == '\\' ? line[++i] : line[i];
    out.push_back(text);
  }
  return out;
}

const Golden& golden() {
  static const Golden g = [] {
    Golden out;
    std::ifstream file(QUORREL_EDITOR_GOLDEN);
    std::string section;
    for (std::string line; std::getline(file, line);) {
      if (line.rfind("== ", 0) == 0) {
        section = line.substr(3);
        if (section.rfind("menu ", 0) == 0) out.trees[section.substr(5)];  // may stay empty
      } else if (line.rfind("status ", 0) == 0) {
        section.clear();
      } else if (section.rfind("menu ", 0) == 0) {
        out.trees[section.substr(5)] += line + "\n";
      } else if (section.rfind("strings ", 0) == 0) {
        const auto texts = quotedTexts(line);
        if (texts.size() == 2) out.strings[section.substr(8)].emplace_back(texts[0], texts[1]);
      }
    }
    return out;
  }();
  return g;
}

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

struct OwnedMenu {
  HMENU menu;
  explicit OwnedMenu(void* m) : menu(static_cast<HMENU>(m)) {}
  ~OwnedMenu() {
    if (menu) DestroyMenu(menu);
  }
};

TEST(EditorMenus, MenusAreTheGoldenTreesAndEveryCallIsFresh) {
  const std::string& kActionMenuTree = golden().trees.at("actions");
  ASSERT_EQ(golden().trees.at("conditions"), "");
  OwnedMenu expression(GetExpressionMenu(0, 0, 0));
  ASSERT_NE(expression.menu, nullptr);
  EXPECT_EQ(dump(expression.menu), golden().trees.at("expressions"));
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

  // The trees hold every code exactly once.
  for (auto [kind, base, count] : {std::tuple{"actions", 25000, 79}, {"expressions", 27000, 60}}) {
    std::multiset<int> ids;
    std::istringstream lines(golden().trees.at(kind));
    for (std::string line; std::getline(lines, line);) {
      const std::size_t start = line.find_first_not_of(' ');
      if (line[start] >= '0' && line[start] <= '9') ids.insert(std::stoi(line.substr(start)));
    }
    ASSERT_EQ(ids.size(), static_cast<std::size_t>(count)) << kind;
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

// Every code's title and display string or name; the golden strings hold exactly one
// line per code.
TEST(EditorStrings, EveryTitleDisplayStringAndName) {
  const auto& actions = golden().strings.at("actions");
  const auto& expressions = golden().strings.at("expressions");
  ASSERT_EQ(actions.size(), 79u);
  ASSERT_EQ(expressions.size(), 60u);
  char buffer[256];
  for (int code = 0; code < 79; ++code) {
    const auto& [display, title] = actions[static_cast<std::size_t>(code)];
    EXPECT_EQ(GetActionString(nullptr, code, buffer, sizeof buffer),
              static_cast<int>(display.size()));
    EXPECT_EQ(buffer, display) << code;
    for (int param = 0; param < 2; ++param) {
      std::memset(buffer, 'x', sizeof buffer);
      EXPECT_NE(GetActionTitle(nullptr, code, param, buffer, sizeof buffer), 0);
      EXPECT_EQ(buffer, title) << code << " " << param;
    }
  }
  for (int code = 0; code < 60; ++code) {
    const auto& [name, title] = expressions[static_cast<std::size_t>(code)];
    EXPECT_EQ(GetExpressionString(nullptr, code, buffer, sizeof buffer),
              static_cast<int>(name.size()));
    EXPECT_EQ(buffer, name) << code;
    EXPECT_NE(GetExpressionTitle(nullptr, code, buffer, sizeof buffer), 0);
    EXPECT_EQ(buffer, title) << code;
  }
  char small[16] = "untouched";
  EXPECT_NE(GetConditionTitle(nullptr, 0, 0, small, sizeof small), 0);  // no text, answers
  EXPECT_STREQ(small, "untouched");
  GetActionTitle(nullptr, 44, 0, small, 5);  // cut to the buffer, terminator included
  EXPECT_STREQ(small, "Sort");
}

TEST(EditorStrings, NoStringsPastTheTablesAndCutsToTheBuffer) {
  char buffer[256];
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
