// The DLL's resources, read back from its resource directory and compared with the
// resource script and with the host's expectations of ids, texts and language.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <map>
#include <set>
#include <sstream>

#include "editor/expectations.h"
#include "windows/dll_image.h"
#include "windows/rc_script.h"

namespace quorrel::pe {
namespace {

constexpr uint32_t kBitmap = 2, kMenu = 4, kDialog = 5, kString = 6, kRcData = 10;
constexpr uint32_t kUsEnglish = 1033;

const rc::Script& script() {
  static const rc::Script parsed = [] {
    std::ifstream in(QUORREL_RC_PREPROCESSED);
    std::stringstream text;
    text << in.rdbuf();
    std::string error = "cannot read " QUORREL_RC_PREPROCESSED;
    std::optional<rc::Script> result = in ? rc::parseScript(text.str(), error) : std::nullopt;
    if (!result) ADD_FAILURE() << "resource script: " << error;
    return result.value_or(rc::Script{});
  }();
  return parsed;
}

const Resource* findResource(uint32_t type, uint32_t id) {
  for (const Resource& r : dllImage().resources) {
    if (r.type == type && r.id == id && r.name.empty()) return &r;
  }
  return nullptr;
}

std::vector<MenuItem> dllMenu(uint32_t id) {
  const Resource* resource = findResource(kMenu, id);
  if (!resource) {
    ADD_FAILURE() << "no menu " << id;
    return {};
  }
  auto menu = decodeMenu(resource->bytes);
  if (!menu) ADD_FAILURE() << "menu " << id << " does not decode";
  return menu.value_or(std::vector<MenuItem>{});
}

std::map<uint32_t, std::string> dllStrings() {
  std::map<uint32_t, std::string> strings;
  for (const Resource& r : dllImage().resources) {
    if (r.type != kString) continue;
    const auto block = decodeStringBlock(r.bytes);
    for (uint32_t i = 0; i < 16; ++i) {
      if (block[i]) strings[(r.id - 1) * 16 + i] = *block[i];
    }
  }
  return strings;
}

void collectCommands(const std::vector<MenuItem>& items, std::vector<uint16_t>& ids) {
  for (const MenuItem& item : items) {
    if (item.popup) {
      collectCommands(item.children, ids);
    } else if (item.id != 0) {
      ids.push_back(item.id);
    }
  }
}

const MenuItem* findPopup(const std::vector<MenuItem>& items, const std::string& text) {
  for (const MenuItem& item : items) {
    if (!item.popup) continue;
    if (item.text == text) return &item;
    if (const MenuItem* found = findPopup(item.children, text)) return found;
  }
  return nullptr;
}

std::vector<uint16_t> range(uint16_t first, uint16_t count) {
  std::vector<uint16_t> ids;
  for (uint16_t i = 0; i < count; ++i) ids.push_back(static_cast<uint16_t>(first + i));
  return ids;
}

TEST(DllResources, SameResourcesAsTheScriptAllInUsEnglish) {
  std::vector<rc::Declared> inDll;
  for (const Resource& r : dllImage().resources) {
    EXPECT_TRUE(r.name.empty() && r.typeName.empty()) << "named resource " << r.name;
    EXPECT_EQ(r.language, kUsEnglish) << "type " << r.type << " id " << r.id;
    inDll.push_back({r.type, r.id, r.language});
  }
  std::vector<rc::Declared> declared = script().resources;
  std::sort(inDll.begin(), inDll.end());
  std::sort(declared.begin(), declared.end());
  EXPECT_EQ(inDll, declared);

  // Menus 20000 to 20002, dialog 20003, bitmaps 400 and 401, data 200, and the string
  // blocks of entries 1-2 and 128-131 (block 1, 9), the action strings 28200-28278
  // (blocks 1763-1768) and the expression names 28400-28459 (blocks 1776-1779).
  std::set<std::pair<uint32_t, uint32_t>> kinds;
  for (const rc::Declared& d : inDll) kinds.insert({d.type, d.id});
  const std::set<std::pair<uint32_t, uint32_t>> expected = {
      {kBitmap, 400},   {kBitmap, 401},  {kMenu, 20000},  {kMenu, 20001},  {kMenu, 20002},
      {kDialog, 20003}, {kRcData, 200},  {kString, 1},    {kString, 9},    {kString, 1763},
      {kString, 1764},  {kString, 1765}, {kString, 1766}, {kString, 1767}, {kString, 1768},
      {kString, 1776},  {kString, 1777}, {kString, 1778}, {kString, 1779}};
  EXPECT_EQ(kinds, expected);
}

TEST(DllResources, MenusEqualTheScriptTrees) {
  for (uint32_t id : {20000u, 20001u, 20002u}) {
    ASSERT_TRUE(script().menus.count(id)) << "script lacks menu " << id;
    EXPECT_EQ(dllMenu(id), script().menus.at(id)) << "menu " << id;
  }
}

TEST(DllResources, ConditionMenuIsOneEmptyCommand) {
  const std::vector<MenuItem> menu = dllMenu(20001);
  ASSERT_EQ(menu.size(), 1u);
  EXPECT_FALSE(menu[0].popup);
  EXPECT_EQ(menu[0].id, 0);
  EXPECT_EQ(menu[0].text, "");
}

TEST(DllResources, ActionMenuHoldsEveryActionOnceUnderOneEmptyPopup) {
  const std::vector<MenuItem> menu = dllMenu(20000);
  ASSERT_EQ(menu.size(), 1u);
  ASSERT_TRUE(menu[0].popup);
  EXPECT_EQ(menu[0].text, "");
  const std::vector<MenuItem>& top = menu[0].children;
  ASSERT_FALSE(top.empty());
  EXPECT_EQ(top.front().text, "File");
  EXPECT_TRUE(top.front().popup);
  EXPECT_EQ(top.back().text, "Settings");
  ASSERT_FALSE(top.back().children.empty());
  EXPECT_EQ(top.back().children.back().id, 25057);
  EXPECT_EQ(top.back().children.back().text, "Set list delimiter");

  const MenuItem* between = findPopup(top, "Between");
  ASSERT_NE(between, nullptr);
  std::vector<uint16_t> betweenIds;
  for (const MenuItem& item : between->children) betweenIds.push_back(item.id);
  EXPECT_EQ(betweenIds, (std::vector<uint16_t>{25015, 25038, 0, 25049, 25026}));
  EXPECT_EQ(between->children[2].text, "");

  std::vector<uint16_t> ids;
  collectCommands(top, ids);
  std::sort(ids.begin(), ids.end());
  EXPECT_EQ(ids, range(25000, 79));
}

TEST(DllResources, ExpressionMenuHoldsEveryExpressionOnce) {
  const std::vector<MenuItem> menu = dllMenu(20002);
  ASSERT_EQ(menu.size(), 1u);
  ASSERT_TRUE(menu[0].popup);
  const std::vector<MenuItem>& top = menu[0].children;
  ASSERT_GE(top.size(), 2u);
  EXPECT_EQ(top[0].id, 27000);
  EXPECT_EQ(top[0].text, "Get size");
  EXPECT_EQ(top[1].id, 27001);
  EXPECT_EQ(top[1].text, "Get capacity");
  std::vector<uint16_t> ids;
  collectCommands(top, ids);
  std::sort(ids.begin(), ids.end());
  EXPECT_EQ(ids, range(27000, 60));
}

// Every command is enabled and unchecked: no state flags anywhere in the trees.
TEST(DllResources, MenuItemsCarryNoState) {
  std::vector<const MenuItem*> pending;
  std::vector<MenuItem> menus[] = {dllMenu(20000), dllMenu(20001), dllMenu(20002)};
  for (const auto& menu : menus) {
    for (const MenuItem& item : menu) pending.push_back(&item);
  }
  while (!pending.empty()) {
    const MenuItem* item = pending.back();
    pending.pop_back();
    EXPECT_EQ(item->flags, 0) << item->text;
    for (const MenuItem& child : item->children) pending.push_back(&child);
  }
}

TEST(DllResources, StringTableEqualsTheScript) {
  EXPECT_EQ(dllStrings(), script().strings);
}

TEST(DllResources, ObjectStringsAndNoEntry132) {
  const auto strings = dllStrings();
  EXPECT_EQ(strings.at(1), "MF2");
  EXPECT_EQ(strings.at(2), "Quorrel");
  EXPECT_EQ(strings.at(128), "Quorrel object");
  for (uint32_t id : {129u, 130u, 131u}) {
    ASSERT_TRUE(strings.count(id)) << id;
    EXPECT_FALSE(strings.at(id).empty()) << id;
  }
  EXPECT_EQ(strings.count(132), 0u);
  for (uint32_t id = 28000; id < 28200; ++id) EXPECT_EQ(strings.count(id), 0u) << id;
}

// Actions without parameters (their strings start "10"); all others have one or two.
const std::set<int> kActionsWithoutParameters = {17, 22, 23, 24, 25, 28, 29, 50,
                                                 51, 55, 56, 61, 62, 63, 64, 78};
const std::set<int> kActionsWithOneParameter = {0,  1,  2,  3,  4,  5,  8,  9,  10, 11,
                                                12, 15, 16, 27, 34, 38, 39, 40, 41, 42,
                                                43, 44, 45, 46, 47, 54, 57, 58, 59, 60};

int placeholdersAfterColon(const std::string& text) {
  const auto colon = text.find(':');
  int count = 0;
  for (auto at = text.find("%s", colon); at != std::string::npos; at = text.find("%s", at + 2)) {
    ++count;
  }
  return count;
}

TEST(DllResources, ActionDisplayStrings) {
  const auto strings = dllStrings();
  for (int code = 0; code < 79; ++code) {
    const uint32_t id = 28200 + static_cast<uint32_t>(code);
    ASSERT_TRUE(strings.count(id)) << id;
    const std::string& text = strings.at(id);
    const bool none = kActionsWithoutParameters.count(code) > 0;
    const int params = none ? 0 : kActionsWithOneParameter.count(code) ? 1 : 2;
    EXPECT_EQ(text.substr(0, 6), none ? "10%s: " : "11%s: ") << code;
    EXPECT_EQ(placeholdersAfterColon(text), params) << code << " " << text;
  }
  EXPECT_EQ(strings.count(28279), 0u);
  EXPECT_EQ(strings.at(28217), "10%s: Delete all");
  EXPECT_EQ(strings.at(28206), "11%s: Insert string %s at %s");
  EXPECT_EQ(strings.at(28226), "11%s: SELECT BETWEEN %s AND %s");
  EXPECT_EQ(strings.at(28278), "10%s: Start new WHERE (reset selected rows)");
}

TEST(DllResources, ExpressionNames) {
  const auto& names = editor_test::kExpressionNames;
  const auto strings = dllStrings();
  for (uint32_t code = 0; code < 60; ++code) {
    ASSERT_TRUE(strings.count(28400 + code)) << code;
    EXPECT_EQ(strings.at(28400 + code), names[code]) << code;
  }
  EXPECT_EQ(strings.count(28460), 0u);
}

constexpr uint16_t kButton = 0x80, kEdit = 0x81, kStatic = 0x82;

struct ExpectedControl {
  int32_t id;
  uint16_t classAtom;
  uint32_t kindBits;  // the low style bits that pick the kind of button or alignment
  const char* text;
  int16_t x, y, cx, cy;
  uint32_t styleBits;  // WS_TABSTOP, WS_GROUP, edit styles, border
};

constexpr uint32_t kTabStop = 0x00010000, kGroup = 0x00020000, kBorder = 0x00800000;
constexpr uint32_t kEditRight = 0x2, kEditAutoScroll = 0x80, kEditNumber = 0x2000;
constexpr uint32_t kDefPush = 1, kPush = 0, kGroupBox = 7, kAutoRadio = 9;

const ExpectedControl kControls[22] = {
    {1, kButton, kDefPush, "OK", 5, 210, 50, 14, kTabStop},
    {2, kButton, kPush, "Cancel", 71, 210, 50, 14, kTabStop},
    {20100, kButton, kPush, "Help", 135, 210, 50, 14, kTabStop},
    {-1, kButton, kGroupBox, "Dimensioning", 5, 5, 180, 75, 0},
    {1000, kButton, kAutoRadio, "1D", 15, 20, 30, 10, kGroup},
    {1001, kButton, kAutoRadio, "2D", 61, 20, 30, 10, 0},
    {1002, kButton, kAutoRadio, "3D", 105, 20, 30, 10, 0},
    {-1, kStatic, 0, "X:", 19, 39, 10, 10, kGroup},
    {1003, kEdit, kEditRight, "", 35, 37, 36, 12,
     kTabStop | kEditNumber | kEditAutoScroll | kBorder},
    {-1, kStatic, 0, "Y:", 91, 39, 10, 10, kGroup},
    {1004, kEdit, kEditRight, "", 105, 37, 35, 12,
     kTabStop | kEditNumber | kEditAutoScroll | kBorder},
    {-1, kButton, kGroupBox, "String Comparisons", 5, 85, 180, 35, 0},
    {1005, kButton, kAutoRadio, "Case insensitive", 15, 100, 75, 10, kGroup},
    {1006, kButton, kAutoRadio, "Case sensitive", 101, 100, 75, 10, 0},
    {-1, kButton, kGroupBox, "Search Mode", 5, 125, 180, 35, 0},
    {1007, kButton, kAutoRadio, "Literal", 15, 140, 75, 10, kGroup},
    {1008, kButton, kAutoRadio, "Wildcard", 101, 140, 75, 10, 0},
    {-1, kStatic, 0, "List delimiter:", 15, 60, 45, 10, kGroup},
    {1009, kEdit, 0, "", 65, 58, 75, 12, kTabStop | kEditAutoScroll | kBorder},
    {-1, kButton, kGroupBox, "Select New Rows (Automatically)", 5, 165, 180, 35, 0},
    {1010, kButton, kAutoRadio, "On", 15, 180, 75, 10, kGroup},
    {1011, kButton, kAutoRadio, "Off", 101, 180, 75, 10, 0},
};

uint16_t atomOfClass(const std::string& name) {
  const std::string upperName = [&] {
    std::string text = name;
    for (char& c : text) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return text;
  }();
  if (upperName == "BUTTON") return kButton;
  if (upperName == "EDIT") return kEdit;
  if (upperName == "STATIC") return kStatic;
  return 0;
}

// The class as an atom, whether the template names it or gives its atom.
uint16_t classOf(const DialogItem& item) {
  return item.classAtom ? item.classAtom : atomOfClass(item.className);
}

std::optional<Dialog> dllDialog() {
  const Resource* resource = findResource(kDialog, 20003);
  if (!resource) return std::nullopt;
  return decodeDialog(resource->bytes);
}

TEST(DllResources, SetupDialogTemplate) {
  const std::optional<Dialog> dialog = dllDialog();
  ASSERT_TRUE(dialog) << "dialog 20003 missing or not decodable";
  EXPECT_EQ(dialog->title, "Setup Quorrel");
  EXPECT_EQ(dialog->font, "Helv");
  EXPECT_EQ(dialog->pointSize, 8);
  EXPECT_EQ(dialog->x, 0);
  EXPECT_EQ(dialog->y, 4);
  EXPECT_EQ(dialog->cx, 192);
  EXPECT_EQ(dialog->cy, 231);
  // A visible popup with a caption and a modal frame, without a system menu.
  constexpr uint32_t kPopup = 0x80000000, kVisible = 0x10000000, kCaption = 0x00C00000;
  constexpr uint32_t kModalFrame = 0x80, kSysMenu = 0x00080000;
  const uint32_t required = kPopup | kVisible | kCaption | kModalFrame;
  EXPECT_EQ(dialog->style & required, required);
  EXPECT_EQ(dialog->style & kSysMenu, 0u);

  ASSERT_EQ(dialog->items.size(), 22u);
  for (std::size_t i = 0; i < 22; ++i) {
    const ExpectedControl& want = kControls[i];
    const DialogItem& item = dialog->items[i];
    SCOPED_TRACE("control " + std::to_string(i) + " \"" + want.text + "\"");
    EXPECT_EQ(item.id, want.id);
    EXPECT_EQ(classOf(item), want.classAtom);
    EXPECT_EQ(item.text, want.text);
    EXPECT_EQ(item.x, want.x);
    EXPECT_EQ(item.y, want.y);
    EXPECT_EQ(item.cx, want.cx);
    EXPECT_EQ(item.cy, want.cy);
    if (want.classAtom == kButton) {
      EXPECT_EQ(item.style & 0xF, want.kindBits);
    } else if (want.classAtom == kEdit) {
      EXPECT_EQ(item.style & 0x3, want.kindBits);
    }
    const uint32_t checked = kTabStop | kGroup | kBorder | kEditNumber | kEditAutoScroll;
    const uint32_t mask = want.classAtom == kEdit ? checked : kTabStop | kGroup;
    EXPECT_EQ(item.style & mask, want.styleBits);
    EXPECT_EQ(item.style & 0x50000000, 0x50000000u) << "a visible child control";
  }
}

TEST(DllResources, SetupDialogEqualsTheScript) {
  const std::optional<Dialog> dialog = dllDialog();
  ASSERT_TRUE(dialog);
  ASSERT_TRUE(script().dialogs.count(20003));
  const Dialog& declared = script().dialogs.at(20003);
  EXPECT_EQ(dialog->title, declared.title);
  EXPECT_EQ(dialog->font, declared.font);
  constexpr uint32_t kSetFont = 0x40;  // added by the compiler with a FONT statement
  EXPECT_EQ(dialog->style, declared.style | (declared.font.empty() ? 0 : kSetFont));
  ASSERT_EQ(dialog->items.size(), declared.items.size());
  for (std::size_t i = 0; i < declared.items.size(); ++i) {
    const DialogItem& want = declared.items[i];
    const DialogItem& item = dialog->items[i];
    EXPECT_EQ(item.id, want.id) << i;
    EXPECT_EQ(item.text, want.text) << i;
    EXPECT_EQ(classOf(item), classOf(want)) << i;
    EXPECT_EQ(std::tie(item.x, item.y, item.cx, item.cy),
              std::tie(want.x, want.y, want.cx, want.cy))
        << i;
  }
}

std::vector<uint8_t> fileBytes(const std::string& name) {
  return readFileBytes(std::string(QUORREL_RESOURCE_DIR) + "/" + name);
}

TEST(DllResources, BitmapsAre32By32In16ColoursFromTheScriptsFiles) {
  for (uint32_t id : {400u, 401u}) {
    const Resource* resource = findResource(kBitmap, id);
    ASSERT_NE(resource, nullptr) << id;
    const auto header = decodeBitmap(resource->bytes);
    ASSERT_TRUE(header) << id;
    EXPECT_EQ(header->headerSize, 40u);
    EXPECT_EQ(header->width, 32);
    EXPECT_EQ(header->height, 32);
    EXPECT_EQ(header->planes, 1);
    EXPECT_EQ(header->bitCount, 4);
    EXPECT_EQ(header->compression, 0u);  // uncompressed
    // 40-byte header, 16 palette entries, 32 rows of 16 bytes.
    EXPECT_EQ(resource->bytes.size(), 40u + 16 * 4 + 32 * 16) << id;
    ASSERT_TRUE(script().bitmapFiles.count(id));
    const std::vector<uint8_t> file = fileBytes(script().bitmapFiles.at(id));
    ASSERT_GT(file.size(), 14u);
    // The resource is the file without its 14-byte file header.
    EXPECT_EQ(resource->bytes, std::vector<uint8_t>(file.begin() + 14, file.end())) << id;
  }
}

TEST(DllResources, DataResourceIsFourBytes) {
  const Resource* resource = findResource(kRcData, 200);
  ASSERT_NE(resource, nullptr);
  EXPECT_EQ(resource->bytes.size(), 4u);
  if (script().inlineData.count(200)) {
    EXPECT_EQ(resource->bytes, script().inlineData.at(200));
  } else {
    ASSERT_TRUE(script().dataFiles.count(200));
    EXPECT_EQ(resource->bytes, fileBytes(script().dataFiles.at(200)));
  }
}

}  // namespace
}  // namespace quorrel::pe
