// The setup dialog's scenarios, run by two tests: the headless one on the portable
// dialog services and the Windows one on the real dialog manager. Each gives a Driver:
// the author's hands in the dialog and a sink for the checks. Include it after the
// dialog services' declarations (windows.h or platform/headless_dialog.h).
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <functional>
#include <string>
#include <vector>

#include "host/abi.h"

namespace quorrel::setup_dialog_test {

namespace abi = quorrel::abi;

using Record = std::array<unsigned char, abi::kSetupRecordSize>;
using Ints = std::vector<int32_t>;

inline int32_t readInt(const Record& record, std::size_t offset) {
  return abi::readField<int32_t>(record.data(), offset);
}
inline std::string delimiterOf(const Record& record) {
  return reinterpret_cast<const char*>(record.data() + abi::kSetupListDelimiter);
}
// The number fields: dimension count, X and Y boundaries, case sensitive, wildcard
// search, automatic row selection.
inline constexpr std::size_t kFields[] = {abi::kSetupDimensionCount, abi::kSetupXBoundary,
                                          abi::kSetupYBoundary,      abi::kSetupCaseSensitive,
                                          abi::kSetupWildcardSearch, abi::kSetupAutoSelectRows};
inline Ints fieldsOf(const Record& record) {
  Ints values;
  for (std::size_t offset : kFields) values.push_back(readInt(record, offset));
  return values;
}
// A record as the host keeps it: its header bytes are the host's.
inline Record storedRecord(const Ints& fields, const char* delimiter = ";") {
  Record record;
  record.fill(0xEE);
  std::memset(record.data(), 0xAB, abi::kSetupHostHeaderSize);
  for (std::size_t i = 0; i < fields.size(); ++i) {
    abi::writeField(record.data(), kFields[i], fields[i]);
  }
  std::strcpy(reinterpret_cast<char*>(record.data() + abi::kSetupListDelimiter), delimiter);
  return record;
}

// The controls of dialog 20003.
inline constexpr int kOk = 1, kCancel = 2, kHelp = 20100;
inline constexpr int k1D = 1000, k2D = 1001, k3D = 1002, kX = 1003, kY = 1004;
inline constexpr int kCaseInsensitive = 1005, kCaseSensitive = 1006, kLiteral = 1007,
                     kWildcard = 1008;
inline constexpr int kDelimiter = 1009, kOn = 1010, kOff = 1011;

// What the dialog shows for a stored record and what OK stores after the author's steps
// (a step with text types it into the field, one without clicks the button). The
// dimension picks the boundaries stored: 2D stores X and keeps Y, 3D both, 1D neither.
// Boundaries read as signed numbers; modes show as zero or not and store as 0 or 1.
struct Step {
  int id;
  const char* text;
};
struct OkCase {
  Ints stored;
  const char* shown;  // state(), then the X and Y fields; null: not checked
  std::vector<Step> steps;
  Ints after;
};
inline const std::vector<OkCase>& okCases() {
  static const std::vector<OkCase> cases = {
      {{7, 4, 5, 0, 0, 0}, "1D insensitive literal off | 4 5", {}, {1, 4, 5, 0, 0, 0}},
      {{3, 4, 5, 0, 0, 0}, nullptr, {{kX, "50"}, {kY, "99"}, {k2D, nullptr}}, {2, 50, 5, 0, 0, 0}},
      {{2, 4, 5, 0, 0, 0}, nullptr, {{k3D, nullptr}, {kX, "6"}, {kY, "7"}}, {3, 6, 7, 0, 0, 0}},
      {{3, 6, 7, 0, 0, 0}, nullptr, {{kX, "60"}, {kY, "70"}, {k1D, nullptr}}, {1, 6, 7, 0, 0, 0}},
      // Only a stored record brings a minus sign; the field takes digits only.
      {{3, -5, 12, 0, 0, 0},
       "3D insensitive literal off | X Y -5 12",
       {{kY, "-1a2 3"}},
       {3, -5, 123, 0, 0, 0}},
      {{3, -5, 12, 0, 0, 0}, nullptr, {{kX, ""}}, {3, 0, 12, 0, 0, 0}},
      {{2, 10, 10, 5, -3, 2}, "2D sensitive wildcard off | X 10 10", {}, {2, 10, 10, 1, 1, 0}},
      {{2, 10, 10, 1, 1, 0},
       nullptr,
       {{kCaseInsensitive, nullptr}, {kLiteral, nullptr}, {kOn, nullptr}},
       {2, 10, 10, 0, 0, 1}},
  };
  return cases;
}

// The checked radio buttons of all four groups and the enabled boundary fields, e.g.
// "2D insensitive literal off | X".
inline std::string state(HWND dialog) {
  const char* names[] = {"1D",        "2D",      "3D",       nullptr, nullptr, "insensitive",
                         "sensitive", "literal", "wildcard", nullptr, "on",    "off"};
  std::string out;
  for (int id = k1D; id <= kOff; ++id) {
    if (names[id - k1D] && IsDlgButtonChecked(dialog, id) == BST_CHECKED) {
      out += std::string(out.empty() ? "" : " ") + names[id - k1D];
    }
  }
  out += " |";
  if (IsWindowEnabled(GetDlgItem(dialog, kX))) out += " X";
  if (IsWindowEnabled(GetDlgItem(dialog, kY))) out += " Y";
  return out;
}

inline std::string fieldText(HWND dialog, int id) {
  char text[2048] = {};
  GetDlgItemTextA(dialog, id, text, sizeof text);
  return text;
}
inline std::string show(const Ints& values) {
  std::string out;
  for (int32_t v : values) out += std::to_string(v) + " ";
  return out;
}

class Driver {
 public:
  using Act = std::function<void(HWND)>;
  virtual ~Driver() = default;
  // The entry points, as each test finds them.
  abi::CreateObjectFn createObject = nullptr;
  abi::EditObjectFn editObject = nullptr;
  // CreateObject or EditObject on the record, with `act` playing the author in the
  // dialog shown; answers what the entry point answers.
  int32_t create(Record& record, const Act& act);
  int32_t edit(Record& record, const Act& act);
  // Runs `call` with `act` playing the author in the dialog it shows.
  virtual int32_t withAuthor(const Act& act, const std::function<int32_t()>& call) = 0;
  virtual void click(HWND dialog, int id) = 0;
  // Key by key, so that the field's own filters apply.
  virtual void type(HWND dialog, int id, const std::string& text) = 0;
  virtual void setText(HWND dialog, int id, const std::string& text) = 0;
  virtual void press(HWND dialog, int key) = 0;
  virtual bool isOpen(HWND dialog) = 0;
  virtual void check(bool ok, const std::string& what) = 0;
  // The pages the host's help service was asked for.
  std::vector<std::string> helpCalls;

  void checkEqual(const std::string& actual, const std::string& expected, const std::string& what) {
    check(actual == expected, what + ": \"" + actual + "\", expected \"" + expected + "\"");
  }
  void checkFields(const Record& record, const Ints& expected, const std::string& what) {
    check(fieldsOf(record) == expected,
          what + ": fields " + show(fieldsOf(record)) + "expected " + show(expected));
  }
};

// The host's help service in the editor context: records each page asked for in the
// driver of the context made last.
inline Driver* helpDriver = nullptr;
inline void QUORREL_CALL recordHelp(const char* page, abi::HostWord first, abi::HostWord second) {
  helpDriver->helpCalls.push_back(page +
                                  std::string(first == 0 && second == 0 ? "" : " (arguments)"));
}
// An editor context without an owner window.
struct EditorContext {
  std::array<unsigned char, 2048> bytes{};
  explicit EditorContext(Driver& driver) {
    helpDriver = &driver;
    const abi::HelpService help = recordHelp;
    std::memcpy(bytes.data() + abi::kEditorHelpService, &help, sizeof help);
  }
  void* get() { return bytes.data(); }
};

inline int32_t Driver::create(Record& record, const Act& act) {
  EditorContext editor(*this);
  return withAuthor(act, [&] { return createObject(editor.get(), 0, record.data()); });
}
inline int32_t Driver::edit(Record& record, const Act& act) {
  EditorContext editor(*this);
  return withAuthor(act, [&] { return editObject(editor.get(), 0, 0, record.data()); });
}

// CreateObject fills the defaults and shows them; cancelled, it keeps them.
inline void createObject(Driver& d) {
  Record record;
  record.fill(0x5A);
  const int32_t answer = d.create(record, [&](HWND dialog) {
    d.checkEqual(state(dialog), "2D insensitive literal off | X", "create: shown");
    d.checkEqual(
        fieldText(dialog, kX) + " " + fieldText(dialog, kY) + " " + fieldText(dialog, kDelimiter),
        "10 10 ,", "create: X, Y, delimiter shown");
    d.press(dialog, VK_RETURN);  // Enter is OK
  });
  d.check(answer == 0, "create: CreateObject answers 0 after OK");
  int16_t size[2];
  std::memcpy(size, record.data() + abi::kSetupObjectWidth, sizeof size);
  d.check(size[0] == 32 && size[1] == 32, "create: object size 32x32");
  d.checkFields(record, {2, 10, 10, 0, 0, 0}, "create");
  d.checkEqual(delimiterOf(record), ",", "create: delimiter");
  d.check(std::all_of(record.begin(), record.begin() + abi::kSetupHostHeaderSize,
                      [](unsigned char b) { return b == 0x5A; }),
          "create: the host's header bytes are kept");

  Record cancelled{};
  const int32_t cancelAnswer = d.create(cancelled, [&](HWND dialog) {
    d.click(dialog, k3D);
    d.type(dialog, kX, "77");
    d.click(dialog, kCancel);
  });
  d.check(cancelAnswer == -1, "create cancelled: CreateObject answers -1");
  d.checkFields(cancelled, {2, 10, 10, 0, 0, 0}, "create cancelled keeps the defaults");
  d.checkEqual(delimiterOf(cancelled), ",", "create cancelled: delimiter");
}

inline void dimensionButtons(Driver& d) {
  Record record = storedRecord({2, 10, 10, 0, 0, 0});
  d.check(d.edit(record,
                 [&](HWND dialog) {
                   d.click(dialog, k3D);
                   d.checkEqual(state(dialog), "3D insensitive literal off | X Y", "3D: X, Y");
                   d.click(dialog, k1D);
                   d.checkEqual(state(dialog), "1D insensitive literal off |", "1D: neither");
                   d.click(dialog, k2D);
                   d.checkEqual(state(dialog), "2D insensitive literal off | X", "2D: X");
                   d.press(dialog, VK_ESCAPE);
                 }) == 0,
          "dimension buttons: EditObject answers 0 after Escape");
}

inline void okStoresWhatTheDialogShows(Driver& d) {
  for (const OkCase& c : okCases()) {
    const std::string what = "OK on " + show(c.stored);
    Record record = storedRecord(c.stored);
    const int32_t answer = d.edit(record, [&](HWND dialog) {
      if (c.shown != nullptr) {
        d.checkEqual(state(dialog) + " " + fieldText(dialog, kX) + " " + fieldText(dialog, kY),
                     c.shown, what + ": shown");
      }
      for (const Step& step : c.steps) {
        step.text != nullptr ? d.type(dialog, step.id, step.text) : d.click(dialog, step.id);
      }
      d.click(dialog, kOk);
    });
    d.check(answer == 1, what + ": EditObject answers 1");
    d.checkFields(record, c.after, what);
  }
}

// The field holds all that is typed; OK stores the first 1023 characters.
inline void delimiterIsCut(Driver& d) {
  Record record = storedRecord({2, 10, 10, 0, 0, 1});
  std::string typed(1100, 'd');
  for (std::size_t i = 0; i < typed.size(); ++i) typed[i] = static_cast<char>('a' + i % 26);
  d.edit(record, [&](HWND dialog) {
    d.checkEqual(fieldText(dialog, kDelimiter), ";", "delimiter: shown");
    d.setText(dialog, kDelimiter, typed);
    d.check(fieldText(dialog, kDelimiter) == typed, "delimiter: the field holds all");
    d.click(dialog, kOk);
  });
  d.check(delimiterOf(record) == typed.substr(0, 1023), "delimiter cut to 1023 characters");
  d.check(std::all_of(record.begin() + abi::kSetupListDelimiter + 1024,
                      record.begin() + abi::kSetupAutoSelectRows,
                      [](unsigned char b) { return b == 0xEE; }),
          "delimiter: the bytes past the 1024 written are kept");
  d.check(readInt(record, abi::kSetupAutoSelectRows) == 1, "delimiter: auto-select kept");
  d.edit(record, [&](HWND dialog) {
    d.setText(dialog, kDelimiter, "");
    d.click(dialog, kOk);
  });
  d.checkEqual(delimiterOf(record), "", "an emptied delimiter is stored empty");
}

// Cancel and Escape write nothing; Help calls the host's help service and keeps the
// dialog open, any number of times.
inline void cancelEscapeAndHelp(Driver& d) {
  for (bool escape : {false, true}) {
    const std::string what = escape ? "escape" : "cancel";
    Record record = storedRecord({2, 10, 10, 0, 0, 0});
    const Record before = record;
    const int32_t answer = d.edit(record, [&](HWND dialog) {
      d.click(dialog, k3D);
      d.type(dialog, kX, "1");
      d.type(dialog, kY, "2");
      d.setText(dialog, kDelimiter, "|");
      for (int id : {kCaseSensitive, kWildcard, kOn}) d.click(dialog, id);
      escape ? d.press(dialog, VK_ESCAPE) : d.click(dialog, kCancel);
    });
    d.check(answer == 0 && record == before, what + " answers 0 and leaves the record");
  }
  d.helpCalls.clear();
  Record record = storedRecord({2, 10, 10, 0, 0, 0});
  const Record before = record;
  d.edit(record, [&](HWND dialog) {
    for (int i = 0; i < 3; ++i) d.click(dialog, kHelp);
    d.check(d.isOpen(dialog), "help keeps the dialog open");
    d.checkEqual(state(dialog), "2D insensitive literal off | X", "help: state");
    d.click(dialog, kCancel);
  });
  d.check(record == before, "help leaves the record");
  d.check(d.helpCalls == std::vector<std::string>(3, "Help\\Quorrel\\quorrel2.html"),
          "help calls the host's help service with the page, three times");
}

inline void runAllScenarios(Driver& d) {
  createObject(d);
  dimensionButtons(d);
  okStoresWhatTheDialogShows(d);
  delimiterIsCut(d);
  cancelEscapeAndHelp(d);
}

}  // namespace quorrel::setup_dialog_test
