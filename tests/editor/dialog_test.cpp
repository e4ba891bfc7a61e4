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

namespace quorrel::editor_test {
namespace {

namespace abi = quorrel::abi;

using Record = std::array<unsigned char, abi::kSetupRecordSize>;

int32_t readInt(const Record& record, std::size_t offset) {
  int32_t value;
  std::memcpy(&value, record.data() + offset, sizeof value);
  return value;
}
int16_t readShort(const Record& record, std::size_t offset) {
  int16_t value;
  std::memcpy(&value, record.data() + offset, sizeof value);
  return value;
}
void writeInt(Record& record, std::size_t offset, int32_t value) {
  std::memcpy(record.data() + offset, &value, sizeof value);
}
std::string delimiterOf(const Record& record) {
  return reinterpret_cast<const char*>(record.data() + abi::kSetupListDelimiter);
}

// A record as the host keeps it: its header bytes are the host's.
Record storedRecord(int32_t dimensions, int32_t x, int32_t y, const char* delimiter = ";") {
  Record record;
  record.fill(0xEE);
  std::memset(record.data(), 0xAB, abi::kSetupHostHeaderSize);
  writeInt(record, abi::kSetupDimensionCount, dimensions);
  writeInt(record, abi::kSetupXBoundary, x);
  writeInt(record, abi::kSetupYBoundary, y);
  writeInt(record, abi::kSetupCaseSensitive, 0);
  writeInt(record, abi::kSetupWildcardSearch, 0);
  writeInt(record, abi::kSetupAutoSelectRows, 0);
  std::strcpy(reinterpret_cast<char*>(record.data() + abi::kSetupListDelimiter), delimiter);
  return record;
}

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
  Author(const Author&) = delete;
  Author& operator=(const Author&) = delete;

 private:
  static void play(HWND dialog, void* self) { static_cast<Author*>(self)->act_(dialog); }
  std::function<void(HWND)> act_;
};

std::string fieldText(HWND dialog, int id) {
  char text[2048];
  GetDlgItemTextA(dialog, id, text, sizeof text);
  return text;
}
bool enabled(HWND dialog, int id) {
  return IsWindowEnabled(GetDlgItem(dialog, id)) != FALSE;
}
bool checked(HWND dialog, int id) {
  return IsDlgButtonChecked(dialog, id) == BST_CHECKED;
}

constexpr int kOk = 1, kCancel = 2, kHelp = 20100;
constexpr int k1D = 1000, k2D = 1001, k3D = 1002, kX = 1003, kY = 1004;
constexpr int kCaseInsensitive = 1005, kCaseSensitive = 1006, kLiteral = 1007, kWildcard = 1008;
constexpr int kDelimiter = 1009, kOn = 1010, kOff = 1011;

TEST(SetupDialog, CreateObjectFillsDefaultsAndShowsThem) {
  Editor editor;
  Record record;
  record.fill(0x5A);
  bool shown = false;
  Author author([&](HWND dialog) {
    shown = true;
    EXPECT_TRUE(checked(dialog, k2D));
    EXPECT_FALSE(checked(dialog, k1D));
    EXPECT_FALSE(checked(dialog, k3D));
    EXPECT_EQ(fieldText(dialog, kX), "10");
    EXPECT_EQ(fieldText(dialog, kY), "10");
    EXPECT_TRUE(enabled(dialog, kX));
    EXPECT_FALSE(enabled(dialog, kY));
    EXPECT_EQ(fieldText(dialog, kDelimiter), ",");
    EXPECT_TRUE(checked(dialog, kCaseInsensitive));
    EXPECT_FALSE(checked(dialog, kCaseSensitive));
    EXPECT_TRUE(checked(dialog, kLiteral));
    EXPECT_FALSE(checked(dialog, kWildcard));
    EXPECT_TRUE(checked(dialog, kOff));
    EXPECT_FALSE(checked(dialog, kOn));
    EXPECT_TRUE(QuorrelDialogKey(dialog, VK_RETURN));  // Enter is OK
  });
  EXPECT_EQ(CreateObject(editor.get(), 0, record.data()), 0);
  EXPECT_TRUE(shown);

  EXPECT_EQ(readShort(record, abi::kSetupObjectWidth), 32);
  EXPECT_EQ(readShort(record, abi::kSetupObjectHeight), 32);
  EXPECT_EQ(readInt(record, abi::kSetupDimensionCount), 2);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 10);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 10);
  EXPECT_EQ(readInt(record, abi::kSetupCaseSensitive), 0);
  EXPECT_EQ(readInt(record, abi::kSetupWildcardSearch), 0);
  EXPECT_EQ(readInt(record, abi::kSetupAutoSelectRows), 0);
  EXPECT_EQ(delimiterOf(record), ",");
  for (std::size_t i = 0; i < abi::kSetupHostHeaderSize; ++i) EXPECT_EQ(record[i], 0x5A) << i;
}

TEST(SetupDialog, CreateObjectCancelledKeepsTheDefaults) {
  Editor editor;
  Record record;
  record.fill(0);
  Author author([](HWND dialog) {
    QuorrelDialogClick(dialog, k3D);
    QuorrelDialogType(dialog, kX, "77");
    QuorrelDialogClick(dialog, kCancel);
  });
  EXPECT_EQ(CreateObject(editor.get(), 0, record.data()), -1);
  EXPECT_EQ(readInt(record, abi::kSetupDimensionCount), 2);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 10);
  EXPECT_EQ(delimiterOf(record), ",");
}

TEST(SetupDialog, UnknownDimensionCountOpensAs1DAndStores1) {
  Editor editor;
  Record record = storedRecord(7, 4, 5);
  Author author([](HWND dialog) {
    EXPECT_TRUE(checked(dialog, k1D));
    EXPECT_FALSE(checked(dialog, k2D));
    EXPECT_FALSE(checked(dialog, k3D));
    EXPECT_FALSE(enabled(dialog, kX));
    EXPECT_FALSE(enabled(dialog, kY));
    EXPECT_FALSE(QuorrelDialogType(dialog, kX, "9"));  // a disabled field takes nothing
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(readInt(record, abi::kSetupDimensionCount), 1);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 4);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 5);
}

TEST(SetupDialog, DimensionButtonsEnableTheFields) {
  Editor editor;
  Record record = storedRecord(2, 10, 10);
  Author author([](HWND dialog) {
    EXPECT_TRUE(QuorrelDialogClick(dialog, k3D));
    EXPECT_TRUE(checked(dialog, k3D));
    EXPECT_FALSE(checked(dialog, k2D));  // the radio group moved the check
    EXPECT_TRUE(enabled(dialog, kX));
    EXPECT_TRUE(enabled(dialog, kY));
    EXPECT_TRUE(QuorrelDialogClick(dialog, k1D));
    EXPECT_TRUE(checked(dialog, k1D));
    EXPECT_FALSE(checked(dialog, k3D));
    EXPECT_FALSE(enabled(dialog, kX));
    EXPECT_FALSE(enabled(dialog, kY));
    EXPECT_TRUE(QuorrelDialogClick(dialog, k2D));
    EXPECT_TRUE(enabled(dialog, kX));
    EXPECT_FALSE(enabled(dialog, kY));
    // Other groups keep their own checks.
    EXPECT_TRUE(checked(dialog, kCaseInsensitive));
    EXPECT_TRUE(checked(dialog, kLiteral));
    EXPECT_TRUE(checked(dialog, kOff));
    QuorrelDialogKey(dialog, VK_ESCAPE);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 0);
}

TEST(SetupDialog, TwoDimensionsStoreXAndKeepY) {
  Editor editor;
  Record record = storedRecord(3, 4, 5);
  Author author([](HWND dialog) {
    EXPECT_TRUE(QuorrelDialogType(dialog, kX, "50"));
    EXPECT_TRUE(QuorrelDialogType(dialog, kY, "99"));
    QuorrelDialogClick(dialog, k2D);
    EXPECT_EQ(fieldText(dialog, kY), "99");
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(readInt(record, abi::kSetupDimensionCount), 2);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 50);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 5);
}

TEST(SetupDialog, ThreeDimensionsStoreBothAndOneKeepsBoth) {
  Editor editor;
  Record record = storedRecord(2, 4, 5);
  {
    Author author([](HWND dialog) {
      QuorrelDialogClick(dialog, k3D);
      QuorrelDialogType(dialog, kX, "6");
      QuorrelDialogType(dialog, kY, "7");
      QuorrelDialogKey(dialog, VK_RETURN);
    });
    EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  }
  EXPECT_EQ(readInt(record, abi::kSetupDimensionCount), 3);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 6);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 7);

  Author author([](HWND dialog) {
    QuorrelDialogType(dialog, kX, "60");
    QuorrelDialogType(dialog, kY, "70");
    QuorrelDialogClick(dialog, k1D);
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(readInt(record, abi::kSetupDimensionCount), 1);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 6);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 7);
}

TEST(SetupDialog, BoundaryFieldsReadAsSignedNumbers) {
  Editor editor;
  Record record = storedRecord(3, -5, 12);
  Author author([](HWND dialog) {
    EXPECT_EQ(fieldText(dialog, kX), "-5");   // only a stored record brings a minus sign
    QuorrelDialogType(dialog, kY, "-1a2 3");  // the field takes digits only
    EXPECT_EQ(fieldText(dialog, kY), "123");
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), -5);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 123);

  // An emptied field stores 0.
  Author emptying([](HWND dialog) {
    QuorrelDialogType(dialog, kX, "");
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(readInt(record, abi::kSetupXBoundary), 0);
  EXPECT_EQ(readInt(record, abi::kSetupYBoundary), 123);
}

TEST(SetupDialog, ModesAreShownByZeroOrNotAndStoredAsZeroOrOne) {
  Editor editor;
  Record record = storedRecord(2, 10, 10);
  writeInt(record, abi::kSetupCaseSensitive, 5);
  writeInt(record, abi::kSetupWildcardSearch, -3);
  writeInt(record, abi::kSetupAutoSelectRows, 2);
  {
    Author author([](HWND dialog) {
      EXPECT_TRUE(checked(dialog, kCaseSensitive));
      EXPECT_FALSE(checked(dialog, kCaseInsensitive));
      EXPECT_TRUE(checked(dialog, kWildcard));
      EXPECT_FALSE(checked(dialog, kLiteral));
      EXPECT_TRUE(checked(dialog, kOff));  // only exactly 1 is On
      EXPECT_FALSE(checked(dialog, kOn));
      QuorrelDialogClick(dialog, kOk);
    });
    EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  }
  EXPECT_EQ(readInt(record, abi::kSetupCaseSensitive), 1);
  EXPECT_EQ(readInt(record, abi::kSetupWildcardSearch), 1);
  EXPECT_EQ(readInt(record, abi::kSetupAutoSelectRows), 0);

  Author author([](HWND dialog) {
    QuorrelDialogClick(dialog, kCaseInsensitive);
    QuorrelDialogClick(dialog, kLiteral);
    QuorrelDialogClick(dialog, kOn);
    EXPECT_FALSE(checked(dialog, kCaseSensitive));
    EXPECT_FALSE(checked(dialog, kWildcard));
    EXPECT_FALSE(checked(dialog, kOff));
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(readInt(record, abi::kSetupCaseSensitive), 0);
  EXPECT_EQ(readInt(record, abi::kSetupWildcardSearch), 0);
  EXPECT_EQ(readInt(record, abi::kSetupAutoSelectRows), 1);
}

TEST(SetupDialog, DelimiterIsCutTo1023Characters) {
  Editor editor;
  Record record = storedRecord(2, 10, 10);
  writeInt(record, abi::kSetupAutoSelectRows, 1);
  std::string typed(1100, 'd');
  for (std::size_t i = 0; i < typed.size(); ++i) typed[i] = static_cast<char>('a' + i % 26);
  Author author([&](HWND dialog) {
    EXPECT_EQ(fieldText(dialog, kDelimiter), ";");
    QuorrelDialogType(dialog, kDelimiter, typed.c_str());
    EXPECT_EQ(fieldText(dialog, kDelimiter), typed);  // the field holds all of it
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(delimiterOf(record), typed.substr(0, 1023));
  // The four bytes past the 1024 written keep what they held.
  for (std::size_t i = abi::kSetupListDelimiter + 1024; i < abi::kSetupAutoSelectRows; ++i) {
    EXPECT_EQ(record[i], 0xEE) << i;
  }
  EXPECT_EQ(readInt(record, abi::kSetupAutoSelectRows), 1);

  // An emptied delimiter is stored empty.
  Author emptying([](HWND dialog) {
    QuorrelDialogType(dialog, kDelimiter, "");
    QuorrelDialogClick(dialog, kOk);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 1);
  EXPECT_EQ(delimiterOf(record), "");
}

TEST(SetupDialog, CancelAndEscapeLeaveTheRecord) {
  Editor editor;
  for (bool escape : {false, true}) {
    Record record = storedRecord(2, 10, 10);
    const Record before = record;
    Author author([&](HWND dialog) {
      QuorrelDialogClick(dialog, k3D);
      QuorrelDialogType(dialog, kX, "1");
      QuorrelDialogType(dialog, kY, "2");
      QuorrelDialogType(dialog, kDelimiter, "|");
      QuorrelDialogClick(dialog, kCaseSensitive);
      QuorrelDialogClick(dialog, kWildcard);
      QuorrelDialogClick(dialog, kOn);
      if (escape) {
        QuorrelDialogKey(dialog, VK_ESCAPE);
      } else {
        QuorrelDialogClick(dialog, kCancel);
      }
      EXPECT_FALSE(QuorrelDialogIsOpen(dialog));
    });
    EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 0);
    EXPECT_EQ(record, before);
  }
}

TEST(SetupDialog, HelpAnyNumberOfTimes) {
  Editor editor;
  Record record = storedRecord(2, 10, 10);
  const Record before = record;
  Author author([](HWND dialog) {
    for (int i = 0; i < 3; ++i) {
      EXPECT_TRUE(QuorrelDialogClick(dialog, kHelp));
      EXPECT_TRUE(QuorrelDialogIsOpen(dialog));
    }
    EXPECT_TRUE(checked(dialog, k2D));
    QuorrelDialogClick(dialog, kCancel);
  });
  EXPECT_EQ(EditObject(editor.get(), 0, 0, record.data()), 0);
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
  Record record = storedRecord(3, 1, 2);
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
