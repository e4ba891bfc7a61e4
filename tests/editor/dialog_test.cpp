// The setup dialog through CreateObject and EditObject, with the headless dialog
// playing the author: what the dialog shows, how the dimension buttons enable the
// fields, what OK writes, and that Cancel and Help write nothing.
#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <functional>
#include <string>
#include <vector>

#include "host/abi.h"
#include "host/entry_points.h"
#include "platform/headless_dialog.h"
#include "support/setup_dialog.h"

namespace quorrel::editor_test {
namespace {

namespace abi = quorrel::abi;
using namespace quorrel::setup_dialog_test;

// The editor context: the editor's window and the host's help service.
struct HelpCall {
  std::string path;
  abi::HostWord first, second;
};
std::vector<HelpCall> helpCalls;
void QUORREL_CALL recordHelp(const char* path, abi::HostWord first, abi::HostWord second) {
  helpCalls.push_back({path, first, second});
}
struct Editor {
  std::array<unsigned char, 1024> context{};
  Editor() {
    abi::HelpService help = recordHelp;
    std::memcpy(context.data() + abi::kEditorHelpService, &help, sizeof help);
    helpCalls.clear();
  }
  void* get() { return context.data(); }
};

// Plays the author in every dialog opened while it lives.
class Author {
 public:
  explicit Author(std::function<void(HWND)> act) : act_(std::move(act)) {
    QuorrelSetDialogScript(&Author::play, this);
  }
  ~Author() { QuorrelSetDialogScript(nullptr, nullptr); }

 private:
  static void play(HWND dialog, void* self) { static_cast<Author*>(self)->act_(dialog); }
  std::function<void(HWND)> act_;
};

// EditObject with an author acting in the dialog, and what it answers.
void edit(Record& record, int32_t answer, std::function<void(HWND)> act) {
  Editor editor;
  Author author(std::move(act));
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), answer);
}

std::string fieldText(HWND dialog, int id) {
  char text[2048];
  GetDlgItemTextA(dialog, id, text, sizeof text);
  return text;
}

TEST(SetupDialog, CreateObjectFillsDefaultsAndShowsThem) {
  Editor editor;
  Record record;
  record.fill(0x5A);
  bool shown = false;
  {
    Author author([&](HWND dialog) {
      shown = true;
      EXPECT_EQ(state(dialog), "2D insensitive literal off | X");
      EXPECT_EQ(fieldText(dialog, kX), "10");
      EXPECT_EQ(fieldText(dialog, kY), "10");
      EXPECT_EQ(fieldText(dialog, kDelimiter), ",");
      EXPECT_TRUE(QuorrelDialogKey(dialog, VK_RETURN));  // Enter is OK
    });
    EXPECT_EQ(CreateObject(editor.get(), 0, record.data()), 0);
  }
  EXPECT_TRUE(shown);
  int16_t size[2];
  std::memcpy(size, record.data() + abi::kSetupObjectWidth, sizeof size);
  EXPECT_EQ(size[0], 32);
  EXPECT_EQ(size[1], 32);
  EXPECT_EQ(fieldsOf(record), (Ints{2, 10, 10, 0, 0, 0}));
  EXPECT_EQ(delimiterOf(record), ",");
  for (std::size_t i = 0; i < abi::kSetupHostHeaderSize; ++i) EXPECT_EQ(record[i], 0x5A) << i;

  // Cancelled, CreateObject keeps the defaults it filled in.
  Record cancelled{};
  Author author([](HWND dialog) {
    QuorrelDialogClick(dialog, k3D);
    QuorrelDialogType(dialog, kX, "77");
    QuorrelDialogClick(dialog, kCancel);
  });
  EXPECT_EQ(CreateObject(editor.get(), 0, cancelled.data()), -1);
  EXPECT_EQ(fieldsOf(cancelled), (Ints{2, 10, 10, 0, 0, 0}));
  EXPECT_EQ(delimiterOf(cancelled), ",");
}

TEST(SetupDialog, DimensionButtonsEnableTheFields) {
  Record record = storedRecord({2, 10, 10, 0, 0, 0});
  edit(record, 0, [](HWND dialog) {
    EXPECT_TRUE(QuorrelDialogClick(dialog, k3D));
    EXPECT_EQ(state(dialog), "3D insensitive literal off | X Y");
    EXPECT_TRUE(QuorrelDialogClick(dialog, k1D));
    EXPECT_EQ(state(dialog), "1D insensitive literal off |");
    EXPECT_FALSE(QuorrelDialogType(dialog, kX, "9"));  // disabled: takes nothing
    EXPECT_TRUE(QuorrelDialogClick(dialog, k2D));
    EXPECT_EQ(state(dialog), "2D insensitive literal off | X");
    QuorrelDialogKey(dialog, VK_ESCAPE);
  });
}

// The OK cases shared with the Windows dialog test (support/setup_dialog.h).
TEST(SetupDialog, OkStoresWhatTheDialogShows) {
  for (const OkCase& c : okCases()) {
    Record record = storedRecord(c.stored);
    edit(record, 1, [&](HWND dialog) {
      if (c.shown != nullptr) {
        EXPECT_EQ(state(dialog) + " " + fieldText(dialog, kX) + " " + fieldText(dialog, kY),
                  c.shown);
      }
      for (auto [id, text] : c.steps) {
        EXPECT_TRUE(text != nullptr ? QuorrelDialogType(dialog, id, text)
                                    : QuorrelDialogClick(dialog, id));
      }
      QuorrelDialogClick(dialog, kOk);
    });
    EXPECT_EQ(fieldsOf(record), c.after) << ::testing::PrintToString(c.stored);
  }
}

TEST(SetupDialog, DelimiterIsCutTo1023Characters) {
  Record record = storedRecord({2, 10, 10, 0, 0, 1});
  std::string typed(1100, 'd');
  for (std::size_t i = 0; i < typed.size(); ++i) typed[i] = static_cast<char>('a' + i % 26);
  edit(record, 1, [&](HWND dialog) {
    EXPECT_EQ(fieldText(dialog, kDelimiter), ";");
    QuorrelDialogType(dialog, kDelimiter, typed.c_str());
    EXPECT_EQ(fieldText(dialog, kDelimiter), typed);  // the field holds all
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(delimiterOf(record), typed.substr(0, 1023));
  // The four bytes past the 1024 written keep what they held.
  for (std::size_t i = abi::kSetupListDelimiter + 1024; i < abi::kSetupAutoSelectRows; ++i) {
    EXPECT_EQ(record[i], 0xEE) << i;
  }
  EXPECT_EQ(readInt(record, abi::kSetupAutoSelectRows), 1);
  edit(record, 1, [](HWND dialog) {  // an emptied delimiter is stored empty
    QuorrelDialogType(dialog, kDelimiter, "");
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(delimiterOf(record), "");
}

TEST(SetupDialog, CancelEscapeAndHelpLeaveTheRecord) {
  for (bool escape : {false, true}) {
    Record record = storedRecord({2, 10, 10, 0, 0, 0});
    const Record before = record;
    edit(record, 0, [&](HWND dialog) {
      QuorrelDialogClick(dialog, k3D);
      QuorrelDialogType(dialog, kX, "1");
      QuorrelDialogType(dialog, kY, "2");
      QuorrelDialogType(dialog, kDelimiter, "|");
      for (int id : {kCaseSensitive, kWildcard, kOn}) QuorrelDialogClick(dialog, id);
      escape ? QuorrelDialogKey(dialog, VK_ESCAPE) : QuorrelDialogClick(dialog, kCancel);
      EXPECT_FALSE(QuorrelDialogIsOpen(dialog));
    });
    EXPECT_EQ(record, before);
  }

  // Help, any number of times, calls the host's help service and keeps the dialog open.
  Record record = storedRecord({2, 10, 10, 0, 0, 0});
  const Record before = record;
  edit(record, 0, [](HWND dialog) {
    for (int i = 0; i < 3; ++i) {
      EXPECT_TRUE(QuorrelDialogClick(dialog, kHelp));
      EXPECT_TRUE(QuorrelDialogIsOpen(dialog));
    }
    EXPECT_EQ(state(dialog), "2D insensitive literal off | X");
    QuorrelDialogClick(dialog, kCancel);
  });
  EXPECT_EQ(record, before);
  ASSERT_EQ(helpCalls.size(), 3u);
  for (const HelpCall& call : helpCalls) {
    EXPECT_EQ(call.path, "Help\\Quorrel\\quorrel2.html");
    EXPECT_EQ(call.first, 0);
    EXPECT_EQ(call.second, 0);
  }
}

TEST(SetupDialog, AnUnansweredDialogIsCancelled) {
  Editor editor;
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
