// The setup dialog through CreateObject and EditObject, with the headless dialog
// playing the author: the scenarios shared with the Windows test, and what only the
// headless services can tell (a disabled field refuses typing, a dialog nobody answers).
#include <gtest/gtest.h>

#include "host/entry_points.h"
#include "platform/headless_dialog.h"
#include "support/setup_dialog.h"

namespace quorrel::editor_test {
namespace {

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
