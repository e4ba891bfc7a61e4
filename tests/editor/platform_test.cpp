// The portable menu, string, dialog and resource services the module exports, with the
// answers the Windows functions of the same names give; the pictures the resource script
// names (the editor shows them beside the object); and the setup dialog through
// CreateObject and EditObject with the headless dialog playing the author.
#include <gtest/gtest.h>

#include <cstring>
#include <fstream>
#include <functional>
#include <iterator>
#include <string>
#include <vector>

#include "host/entry_points.h"
#include "platform/headless_dialog.h"
#include "platform/windows_services.h"
#include "support/setup_dialog.h"

namespace quorrel::editor_test {
namespace {

TEST(PortableMenus, BuildReadAndRelease) {
  HMENU top = CreatePopupMenu(), sub = CreatePopupMenu();
  ASSERT_TRUE(top && sub);
  EXPECT_TRUE(AppendMenuA(top, MF_CHECKED | MF_GRAYED, 501, "First"));
  EXPECT_TRUE(AppendMenuA(top, MF_SEPARATOR, 0, nullptr));
  EXPECT_TRUE(AppendMenuA(sub, MF_STRING, 601, "Inner"));
  EXPECT_TRUE(AppendMenuA(sub, MF_STRING, 602, "Second inner"));
  EXPECT_TRUE(AppendMenuA(top, MF_POPUP, reinterpret_cast<UINT_PTR>(sub), "Sub"));
  EXPECT_TRUE(AppendMenuA(top, MF_STRING, 503, "Last"));
  // A popup belongs to one parent only.
  EXPECT_FALSE(AppendMenuA(top, MF_POPUP, reinterpret_cast<UINT_PTR>(sub), "Again"));

  // Reading the editor's menus by position is checked against their golden trees; these
  // pin what those menus never hold: flags, missing positions and commands.
  EXPECT_EQ(GetMenuItemCount(top), 4);
  EXPECT_EQ(GetMenuItemID(top, 4), 0xFFFFFFFFu);  // no such position
  EXPECT_EQ(GetMenuState(top, 0, MF_BYPOSITION), static_cast<UINT>(MF_CHECKED | MF_GRAYED));
  EXPECT_EQ(GetMenuState(top, 2, MF_BYPOSITION), static_cast<UINT>(2 << 8 | MF_POPUP));
  EXPECT_EQ(GetMenuState(top, 602, MF_BYCOMMAND), 0u);
  EXPECT_EQ(GetMenuState(top, 999, MF_BYCOMMAND), 0xFFFFFFFFu);

  // By command the search goes into the submenus; the text is cut to the buffer.
  char text[16] = "untouched";
  EXPECT_EQ(GetMenuStringA(top, 999, text, sizeof text, MF_BYCOMMAND), 0);
  EXPECT_STREQ(text, "untouched");
  EXPECT_EQ(GetMenuStringA(top, 602, text, sizeof text, MF_BYCOMMAND), 12);
  EXPECT_STREQ(text, "Second inner");
  EXPECT_EQ(GetMenuStringA(top, 602, text, 7, MF_BYCOMMAND), 6);
  EXPECT_STREQ(text, "Second");
  EXPECT_EQ(GetMenuStringA(top, 2, text, sizeof text, MF_BYPOSITION), 3);
  EXPECT_STREQ(text, "Sub");
  EXPECT_EQ(GetMenuStringA(top, 3, nullptr, 0, MF_BYPOSITION), 4);  // the length

  // Destroying the top takes the submenu along (a destroyed menu's handle is refused as
  // EntryLayer.StaleMenuHandlesNameNothing checks).
  EXPECT_TRUE(DestroyMenu(top));
  EXPECT_FALSE(DestroyMenu(sub));
  EXPECT_EQ(GetMenuItemCount(sub), -1);
}

TEST(PortableMenus, ResourceMenus) {
  EXPECT_EQ(LoadMenuA(nullptr, MAKEINTRESOURCEA(20004)), nullptr);
  EXPECT_EQ(LoadMenuA(nullptr, "20000"), nullptr);  // only numeric ids exist

  // The condition menu: one item without text, read as a separator.
  HMENU conditions = LoadMenuA(nullptr, MAKEINTRESOURCEA(20001));
  ASSERT_NE(conditions, nullptr);
  EXPECT_EQ(GetMenuItemCount(conditions), 1);
  EXPECT_EQ(GetMenuItemID(conditions, 0), 0u);
  EXPECT_EQ(GetSubMenu(conditions, 0), nullptr);
  EXPECT_TRUE(DestroyMenu(conditions));

  // The action menu's tree is the editor case's (quorrel menu actions): one popup.
  HMENU actions = LoadMenuA(nullptr, MAKEINTRESOURCEA(20000));
  ASSERT_NE(actions, nullptr);
  EXPECT_EQ(GetMenuItemCount(actions), 1);
  EXPECT_TRUE(DestroyMenu(actions));
}

TEST(PortableStrings, LoadStringCountsAndCuts) {
  char text[32];
  EXPECT_EQ(LoadStringA(nullptr, 1, text, sizeof text), 3);
  EXPECT_STREQ(text, "MF2");
  EXPECT_EQ(LoadStringA(nullptr, 2, text, 5), 4);
  EXPECT_STREQ(text, "Quor");
  EXPECT_EQ(LoadStringA(nullptr, 132, text, sizeof text), 0);
  EXPECT_STREQ(text, "");
  std::strcpy(text, "kept");
  EXPECT_EQ(LoadStringA(nullptr, 128, text, 0), 0);
  EXPECT_STREQ(text, "kept");

  auto* block = static_cast<unsigned char*>(LocalAlloc(LPTR, 80));
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(std::vector<unsigned char>(block, block + 80), std::vector<unsigned char>(80, 0));
  EXPECT_EQ(LocalFree(block), nullptr);
}

// A dialog procedure that keeps what it was told, over the setup template.
struct Recorder {
  std::vector<std::pair<UINT, WPARAM>> messages;
  LPARAM initParameter = 0;
  bool endOnCancel = true;
};
Recorder* recorder = nullptr;

INT_PTR recordingProcedure(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_INITDIALOG) recorder->initParameter = lParam;
  recorder->messages.emplace_back(message, wParam);
  if (message == WM_COMMAND && LOWORD(wParam) == IDCANCEL && recorder->endOnCancel) {
    EndDialog(dialog, 7);
  }
  return message == WM_INITDIALOG || message == WM_COMMAND;
}

INT_PTR runRecorded(Recorder& r, const std::function<void(HWND)>& act) {
  recorder = &r;
  QuorrelSetDialogScript(
      [](HWND dialog, void* user) {
        (*static_cast<const std::function<void(HWND)>*>(user))(dialog);
      },
      const_cast<std::function<void(HWND)>*>(&act));
  INT_PTR result =
      DialogBoxParamA(nullptr, MAKEINTRESOURCEA(20003), nullptr, recordingProcedure, 1234);
  QuorrelSetDialogScript(nullptr, nullptr);
  return result;
}

TEST(HeadlessDialog, MessagesClicksAndKeys) {
  EXPECT_EQ(DialogBoxParamA(nullptr, MAKEINTRESOURCEA(20004), nullptr, recordingProcedure, 0), -1);

  Recorder r;
  INT_PTR result = runRecorded(r, [](HWND dialog) {
    // Initialisation came first, with the parameter and the first tab stop (OK).
    ASSERT_FALSE(recorder->messages.empty());
    EXPECT_EQ(recorder->messages[0].first, static_cast<UINT>(WM_INITDIALOG));
    EXPECT_EQ(recorder->messages[0].second, reinterpret_cast<WPARAM>(GetDlgItem(dialog, IDOK)));
    EXPECT_EQ(recorder->initParameter, 1234);
    recorder->messages.clear();

    EXPECT_FALSE(QuorrelDialogClick(dialog, 0xFFFF));  // group boxes and labels
    EXPECT_FALSE(QuorrelDialogClick(dialog, 1003));    // an edit field is no button
    EXPECT_FALSE(QuorrelDialogClick(dialog, 4242));    // no such control
    EnableWindow(GetDlgItem(dialog, 20100), FALSE);
    EXPECT_FALSE(QuorrelDialogClick(dialog, 20100));  // disabled
    EXPECT_TRUE(QuorrelDialogKey(dialog, VK_RETURN));
    EXPECT_TRUE(QuorrelDialogClick(dialog, 1006));
    EXPECT_TRUE(QuorrelDialogType(dialog, 1009, "a\tb"));
    EXPECT_EQ(recorder->messages.size(), 3u);
    EXPECT_EQ(LOWORD(recorder->messages[0].second), IDOK);
    EXPECT_EQ(LOWORD(recorder->messages[1].second), 1006);
    EXPECT_EQ(HIWORD(recorder->messages[1].second), BN_CLICKED);
    EXPECT_EQ(LOWORD(recorder->messages[2].second), 1009);
    char text[8];
    GetDlgItemTextA(dialog, 1009, text, sizeof text);
    EXPECT_STREQ(text, "ab");  // control characters are not typed
    EXPECT_TRUE(QuorrelDialogKey(dialog, VK_ESCAPE));
    EXPECT_FALSE(QuorrelDialogIsOpen(dialog));
    EXPECT_FALSE(QuorrelDialogKey(dialog, VK_RETURN));  // nothing reaches an ended dialog
  });
  EXPECT_EQ(result, 7);

  // A procedure that never ends its dialog: the headless dialog gives up with -1.
  Recorder stubborn;
  stubborn.endOnCancel = false;
  EXPECT_EQ(runRecorded(stubborn, [](HWND) {}), -1);
}

TEST(HeadlessDialog, FieldsNumbersAndUserSlot) {
  Recorder r;
  runRecorded(r, [](HWND dialog) {
    auto number = [&](const char* text, BOOL isSigned, BOOL expectedOk, UINT expected) {
      SetDlgItemTextA(dialog, 1009, text);
      BOOL ok = 99;
      EXPECT_EQ(GetDlgItemInt(dialog, 1009, &ok, isSigned), expected) << text;
      EXPECT_EQ(ok, expectedOk) << text;
    };
    number("  42 ", TRUE, TRUE, 42);
    number("-7", TRUE, TRUE, static_cast<UINT>(-7));
    number("-7", FALSE, FALSE, 0);
    number("4 2", TRUE, FALSE, 0);
    number("12a", TRUE, FALSE, 0);
    number("", TRUE, FALSE, 0);
    number("2147483647", TRUE, TRUE, 2147483647u);
    number("2147483648", TRUE, FALSE, 0);
    number("4294967295", FALSE, TRUE, 4294967295u);

    EXPECT_TRUE(SetDlgItemInt(dialog, 1003, static_cast<UINT>(-12), TRUE));
    char text[16];
    EXPECT_EQ(GetDlgItemTextA(dialog, 1003, text, sizeof text), 3u);
    EXPECT_STREQ(text, "-12");
    EXPECT_EQ(GetDlgItemTextA(dialog, 1003, text, 3), 2u);
    EXPECT_STREQ(text, "-1");

    // Typing into a digits-only field keeps the digits, up to the typing limit.
    std::string many(40000, '5');
    EXPECT_TRUE(QuorrelDialogType(dialog, 1004, ("x-" + many).c_str()));
    std::vector<char> big(50000);
    EXPECT_EQ(GetDlgItemTextA(dialog, 1004, big.data(), static_cast<int>(big.size())), 32767u);

    // Enabling answers whether the window was disabled before.
    HWND x = GetDlgItem(dialog, 1003);
    EXPECT_FALSE(EnableWindow(x, FALSE));
    EXPECT_TRUE(EnableWindow(x, TRUE));
    EXPECT_TRUE(IsWindowEnabled(x));

    int value = 5;
    EXPECT_EQ(SetWindowLongA(dialog, DWL_USER, reinterpret_cast<LONG_PTR>(&value)), 0);
    EXPECT_EQ(GetWindowLongA(dialog, DWL_USER), reinterpret_cast<LONG_PTR>(&value));
    EXPECT_EQ(GetWindowLongA(dialog, 0), 0);

    EXPECT_TRUE(CheckDlgButton(dialog, 1010, BST_CHECKED));
    EXPECT_EQ(IsDlgButtonChecked(dialog, 1010), static_cast<UINT>(BST_CHECKED));
    EXPECT_FALSE(CheckDlgButton(dialog, 1009, BST_CHECKED));  // not a button
  });
}

// 32 x 32 pixels, 16 colours (4 bits per pixel), uncompressed: a 14-byte file header
// ("BM", 630 bytes, pixels at 118), then a 40-byte information header (width, height,
// one plane, bit count, compression 0), a 16-entry palette and 16 bytes per row.
TEST(ResourceScript, BitmapsAreSmallSixteenColourPictures) {
  const std::string head(
      "BM\x76\x02\0\0\0\0\0\0\x76\0\0\0"
      "\x28\0\0\0\x20\0\0\0\x20\0\0\0\x01\0\x04\0\0\0\0\0",
      34);
  for (const char* name : {"quorrel400.bmp", "quorrel401.bmp"}) {
    std::ifstream in(std::string(QUORREL_RESOURCE_DIR) + "/" + name, std::ios::binary);
    const std::string picture{std::istreambuf_iterator<char>(in), {}};
    EXPECT_EQ(picture.size(), 14u + 40u + 16u * 4u + 32u * 16u) << name;
    EXPECT_EQ(picture.substr(0, head.size()), head) << name;
  }
}

// The setup dialog through CreateObject and EditObject, with the headless dialog
// playing the author: the scenarios shared with the Windows test, and what only the
// headless services can tell (a disabled field refuses typing, a dialog nobody answers).
using namespace quorrel::setup_dialog_test;

class HeadlessDriver : public Driver {
 public:
  HeadlessDriver() {
    createObject = CreateObject;
    editObject = EditObject;
  }
  // Plays `act` in every dialog opened during `call`.
  int32_t withAuthor(const Act& act, const std::function<int32_t()>& call) override {
    QuorrelSetDialogScript([](HWND dialog, void* a) { (*static_cast<const Act*>(a))(dialog); },
                           const_cast<Act*>(&act));
    const int32_t answer = call();
    QuorrelSetDialogScript(nullptr, nullptr);
    return answer;
  }
  void click(HWND dialog, int id) override {
    EXPECT_TRUE(QuorrelDialogClick(dialog, id)) << "click " << id;
  }
  void type(HWND dialog, int id, const std::string& text) override {
    EXPECT_TRUE(QuorrelDialogType(dialog, id, text.c_str())) << "type into " << id;
  }
  void setText(HWND dialog, int id, const std::string& text) override {
    SetDlgItemTextA(dialog, id, text.c_str());
  }
  void press(HWND dialog, int key) override { EXPECT_TRUE(QuorrelDialogKey(dialog, key)); }
  bool isOpen(HWND dialog) override { return QuorrelDialogIsOpen(dialog); }
  void check(bool ok, const std::string& what) override { EXPECT_TRUE(ok) << what; }
};

TEST(SetupDialog, SharedScenarios) {
  HeadlessDriver driver;
  runAllScenarios(driver);
}

TEST(SetupDialog, DisabledFieldsTakeNoTyping) {
  HeadlessDriver driver;
  Record record = storedRecord({1, 10, 10, 0, 0, 0});
  driver.edit(record, [](HWND dialog) {
    EXPECT_FALSE(QuorrelDialogType(dialog, kX, "9"));
    EXPECT_FALSE(QuorrelDialogType(dialog, kY, "9"));
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(fieldsOf(record), (Ints{1, 10, 10, 0, 0, 0}));
}

TEST(SetupDialog, AnUnansweredDialogIsCancelled) {
  HeadlessDriver driver;
  EditorContext editor(driver);
  Record record = storedRecord({3, 1, 2, 0, 0, 0});
  const Record before = record;
  // No author: the dialog is left with Escape.
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 0);
  EXPECT_EQ(record, before);
  Record fresh{};
  EXPECT_EQ(CreateObject(editor.get(), 0, fresh.data()), -1);
  EXPECT_EQ(readInt(fresh, abi::kSetupDimensionCount), 2);
  // Without a record there is nothing to edit.
  EXPECT_EQ(EditObject(editor.get(), 0, 0, nullptr), 0);
  EXPECT_EQ(CreateObject(editor.get(), 0, nullptr), -1);
}

}  // namespace
}  // namespace quorrel::editor_test
