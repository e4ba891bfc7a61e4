// The setup dialog through the real dialog manager: loads the DLL, calls CreateObject
// and EditObject, and plays the author with window messages from inside the modal
// loop (a CBT hook catches the dialog, a timer acts once it runs): edit texts set
// with WM_SETTEXT or typed with WM_CHAR, buttons pressed with BM_CLICK, Enter and
// Escape posted as keys. Then checks the setup record's bytes. Run under Wine on a
// virtual display; prints one line per failed check and "N passed, N failed".
#include <windows.h>

#include <array>
#include <cstdio>
#include <cstring>
#include <functional>
#include <string>
#include <vector>

#include "host/abi.h"
#include "support/setup_dialog.h"

namespace abi = quorrel::abi;
using namespace quorrel::setup_dialog_test;

namespace {

int passed = 0, failed = 0;

void check(bool ok, const std::string& what) {
  if (ok) {
    ++passed;
  } else {
    ++failed;
    std::printf("FAIL %s\n", what.c_str());
  }
}

template <typename T>
void checkEqual(const T& actual, const T& expected, const std::string& what) {
  check(actual == expected, what);
}

// The editor context: no owner window, and the host's help service.
std::vector<std::string> helpCalls;
void QUORREL_CALL recordHelp(const char* path, abi::HostWord first, abi::HostWord second) {
  helpCalls.push_back(std::string(path) + (first == 0 && second == 0 ? "" : " (arguments)"));
}
struct Editor {
  std::array<unsigned char, 2048> context{};
  Editor() {
    abi::HelpService help = recordHelp;
    std::memcpy(context.data() + abi::kEditorHelpService, &help, sizeof help);
  }
};

// --- The author: real messages to the real controls ------------------------------
void click(HWND dialog, int id) {
  SendMessageA(GetDlgItem(dialog, id), BM_CLICK, 0, 0);
}
void setText(HWND dialog, int id, const std::string& text) {
  SetDlgItemTextA(dialog, id, text.c_str());
}
// Typed key by key, so the edit control's own filters apply.
void type(HWND dialog, int id, const std::string& text) {
  HWND field = GetDlgItem(dialog, id);
  SetWindowTextA(field, "");
  for (unsigned char c : text) SendMessageA(field, WM_CHAR, c, 1);
}
void press(HWND dialog, WPARAM key) {
  PostMessageA(dialog, WM_KEYDOWN, key, 1);
  PostMessageA(dialog, WM_KEYUP, key, 0xC0000001);
}
std::string fieldText(HWND dialog, int id) {
  char text[2048] = {};
  GetDlgItemTextA(dialog, id, text, sizeof text);
  return text;
}
// Catches the dialog as it is activated and acts once the modal loop runs.
std::function<void(HWND)> currentAct;
HWND currentDialog = nullptr;
bool acted = false;

void CALLBACK actNow(HWND, UINT, UINT_PTR timer, DWORD) {
  KillTimer(nullptr, timer);
  if (acted || !currentDialog) return;
  acted = true;
  currentAct(currentDialog);
}

LRESULT CALLBACK watch(int code, WPARAM wParam, LPARAM lParam) {
  if (code == HCBT_ACTIVATE && !currentDialog) {
    char title[64] = {};
    GetWindowTextA(reinterpret_cast<HWND>(wParam), title, sizeof title);
    if (std::strcmp(title, "Setup Quorrel") == 0) {
      currentDialog = reinterpret_cast<HWND>(wParam);
      SetTimer(nullptr, 0, 10, actNow);
    }
  }
  return CallNextHookEx(nullptr, code, wParam, lParam);
}

struct Entry {
  abi::CreateObjectFn create;
  abi::EditObjectFn edit;
};

// Runs one entry point with the author acting in the dialog it shows.
template <typename Call>
auto withAuthor(const std::string& what, std::function<void(HWND)> act, Call call) {
  currentAct = std::move(act);
  currentDialog = nullptr;
  acted = false;
  HHOOK hook = SetWindowsHookExA(WH_CBT, watch, nullptr, GetCurrentThreadId());
  const auto answer = call();
  UnhookWindowsHookEx(hook);
  check(acted, what + ": the dialog was shown (error " + std::to_string(GetLastError()) + ")");
  return answer;
}

void edit(const Entry& dll, const std::string& what, Record& record, int32_t answer,
          std::function<void(HWND)> act) {
  Editor editor;
  const int32_t got = withAuthor(
      what, std::move(act), [&] { return dll.edit(editor.context.data(), 0, 0, record.data()); });
  checkEqual(got, answer, what + ": EditObject answers " + std::to_string(answer));
}

std::string show(const Ints& values) {
  std::string out;
  for (int32_t v : values) out += std::to_string(v) + " ";
  return out;
}
void checkFields(const Record& record, const Ints& expected, const std::string& what) {
  check(fieldsOf(record) == expected,
        what + ": fields " + show(fieldsOf(record)) + "expected " + show(expected));
}

// --- The cases: those of the headless dialog, through the real controls -----------
void createObject(const Entry& dll) {
  Editor editor;
  Record record;
  record.fill(0x5A);
  const int32_t answer = withAuthor(
      "create",
      [](HWND dialog) {
        checkEqual(state(dialog), std::string("2D insensitive literal off | X"), "create: shown");
        checkEqual(fieldText(dialog, kX) + fieldText(dialog, kY) + fieldText(dialog, kDelimiter),
                   std::string("1010,"), "create: X, Y, delimiter shown");
        press(dialog, VK_RETURN);  // Enter is OK
      },
      [&] { return dll.create(editor.context.data(), 0, record.data()); });
  checkEqual(answer, 0, "create: CreateObject answers 0 after OK");
  int16_t size[2];
  std::memcpy(size, record.data() + abi::kSetupObjectWidth, sizeof size);
  check(size[0] == 32 && size[1] == 32, "create: object size 32x32");
  checkFields(record, {2, 10, 10, 0, 0, 0}, "create");
  checkEqual(delimiterOf(record), std::string(","), "create: delimiter");
  bool header = true;
  for (std::size_t i = 0; i < abi::kSetupHostHeaderSize; ++i) header &= record[i] == 0x5A;
  check(header, "create: the host's header bytes are kept");

  Record cancelled{};
  const int32_t cancelAnswer = withAuthor(
      "create cancelled",
      [](HWND dialog) {
        click(dialog, k3D);
        type(dialog, kX, "77");
        click(dialog, kCancel);
      },
      [&] { return dll.create(editor.context.data(), 0, cancelled.data()); });
  checkEqual(cancelAnswer, -1, "create cancelled: CreateObject answers -1");
  checkFields(cancelled, {2, 10, 10, 0, 0, 0}, "create cancelled keeps the defaults");
  checkEqual(delimiterOf(cancelled), std::string(","), "create cancelled: delimiter");
}

void dimensionButtons(const Entry& dll) {
  Record record = storedRecord({2, 10, 10, 0, 0, 0});
  edit(dll, "dimension buttons", record, 0, [](HWND dialog) {
    click(dialog, k3D);
    checkEqual(state(dialog), std::string("3D insensitive literal off | X Y"), "3D enables X, Y");
    click(dialog, k1D);
    checkEqual(state(dialog), std::string("1D insensitive literal off |"), "1D enables none");
    click(dialog, k2D);
    checkEqual(state(dialog), std::string("2D insensitive literal off | X"), "2D enables X");
    press(dialog, VK_ESCAPE);
  });
}

void okStoresWhatTheDialogShows(const Entry& dll) {
  for (const OkCase& c : okCases()) {
    const std::string what = "OK on " + show(c.stored);
    Record record = storedRecord(c.stored);
    edit(dll, what, record, 1, [&](HWND dialog) {
      if (c.shown != nullptr) {
        checkEqual(state(dialog) + " " + fieldText(dialog, kX) + " " + fieldText(dialog, kY),
                   std::string(c.shown), what + ": shown");
      }
      for (const Step& step : c.steps) {
        step.text != nullptr ? type(dialog, step.id, step.text) : click(dialog, step.id);
      }
      click(dialog, kOk);
    });
    checkFields(record, c.after, what);
  }
}

void delimiter(const Entry& dll) {
  Record record = storedRecord({2, 10, 10, 0, 0, 1});
  static std::string typed(1100, 'd');
  for (std::size_t i = 0; i < typed.size(); ++i) typed[i] = static_cast<char>('a' + i % 26);
  edit(dll, "delimiter", record, 1, [](HWND dialog) {
    checkEqual(fieldText(dialog, kDelimiter), std::string(";"), "delimiter: shown");
    setText(dialog, kDelimiter, typed);
    checkEqual(fieldText(dialog, kDelimiter), typed, "delimiter: the field holds all");
    click(dialog, kOk);
  });
  checkEqual(delimiterOf(record), typed.substr(0, 1023), "delimiter cut to 1023 characters");
  bool kept = true;
  for (std::size_t i = abi::kSetupListDelimiter + 1024; i < abi::kSetupAutoSelectRows; ++i) {
    kept &= record[i] == 0xEE;
  }
  check(kept, "delimiter: the bytes past the 1024 written are kept");
  checkEqual(readInt(record, abi::kSetupAutoSelectRows), 1, "delimiter: auto-select kept");
  edit(dll, "empty delimiter", record, 1, [](HWND dialog) {
    setText(dialog, kDelimiter, "");
    click(dialog, kOk);
  });
  checkEqual(delimiterOf(record), std::string(), "an emptied delimiter is stored empty");
}

void cancelAndHelp(const Entry& dll) {
  for (bool escape : {false, true}) {
    const std::string what = escape ? "escape" : "cancel";
    Record record = storedRecord({2, 10, 10, 0, 0, 0});
    const Record before = record;
    edit(dll, what, record, 0, [escape](HWND dialog) {
      click(dialog, k3D);
      type(dialog, kX, "1");
      type(dialog, kY, "2");
      setText(dialog, kDelimiter, "|");
      for (int id : {kCaseSensitive, kWildcard, kOn}) click(dialog, id);
      escape ? press(dialog, VK_ESCAPE) : click(dialog, kCancel);
    });
    check(record == before, what + " leaves the record");
  }

  helpCalls.clear();
  Record record = storedRecord({2, 10, 10, 0, 0, 0});
  const Record before = record;
  edit(dll, "help", record, 0, [](HWND dialog) {
    for (int i = 0; i < 3; ++i) click(dialog, kHelp);
    check(IsWindow(dialog) && IsWindowVisible(dialog), "help keeps the dialog open");
    checkEqual(state(dialog), std::string("2D insensitive literal off | X"), "help: state");
    click(dialog, kCancel);
  });
  check(record == before, "help leaves the record");
  checkEqual(helpCalls, std::vector<std::string>(3, "Help\\Quorrel\\quorrel2.html"),
             "help calls the host's help service with the page, three times");
}

// By ordinal, as a host finds it, and the same code by name.
template <typename Fn>
Fn entryPoint(HMODULE dll, const char* name) {
  struct Ordinal {
    const char* name;
    WORD ordinal;
  };
  static constexpr Ordinal kOrdinals[] = {
#define QUORREL_ENTRY_POINT(name, ordinal) {#name, ordinal},
#include "entry_point_ordinals.inc"
#undef QUORREL_ENTRY_POINT
  };
  for (const Ordinal& entry : kOrdinals) {
    if (std::strcmp(entry.name, name) != 0) continue;
    FARPROC byOrdinal = GetProcAddress(dll, MAKEINTRESOURCEA(entry.ordinal));
    check(byOrdinal && byOrdinal == GetProcAddress(dll, name),
          std::string(name) + " at ordinal " + std::to_string(entry.ordinal));
    return reinterpret_cast<Fn>(reinterpret_cast<void*>(byOrdinal));
  }
  check(false, std::string(name) + " is an entry point");
  return nullptr;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: quorrel_dialog_test DLL\n");
    return 2;
  }
  HMODULE module = LoadLibraryA(argv[1]);
  if (!module) {
    std::printf("cannot load %s: error %lu\n", argv[1], GetLastError());
    return 1;
  }
  const Entry dll{entryPoint<abi::CreateObjectFn>(module, "CreateObject"),
                  entryPoint<abi::EditObjectFn>(module, "EditObject")};
  if (dll.create && dll.edit) {
    createObject(dll);
    dimensionButtons(dll);
    okStoresWhatTheDialogShows(dll);
    delimiter(dll);
    cancelAndHelp(dll);
  }
  std::printf("%d passed, %d failed\n", passed, failed);
  return failed == 0 ? 0 : 1;
}
