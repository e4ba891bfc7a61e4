// The setup dialog through the real dialog manager: loads the DLL, finds CreateObject
// and EditObject as a host does, and runs the scenarios shared with the headless test.
// The author acts from inside the modal loop (a CBT hook catches the dialog, a timer
// acts once it runs): texts set with WM_SETTEXT or typed with WM_CHAR, buttons pressed
// with BM_CLICK, Enter and Escape posted as keys. Run under Wine on a virtual display;
// prints one line per failed check and "N passed, N failed".
#include <windows.h>

#include <cstdio>
#include <cstring>
#include <string>

#include "host/abi.h"
#include "support/setup_dialog.h"

namespace abi = quorrel::abi;
using namespace quorrel::setup_dialog_test;

namespace {

// Catches the dialog as it is activated and acts once the modal loop runs.
const Driver::Act* currentAct = nullptr;
HWND currentDialog = nullptr;
bool acted = false;

void CALLBACK actNow(HWND, UINT, UINT_PTR timer, DWORD) {
  KillTimer(nullptr, timer);
  if (acted || !currentDialog) return;
  acted = true;
  (*currentAct)(currentDialog);
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

class WindowsDriver : public Driver {
 public:
  int passed = 0, failed = 0;

  int32_t withAuthor(const Act& act, const std::function<int32_t()>& call) override {
    currentAct = &act;
    currentDialog = nullptr;
    acted = false;
    HHOOK hook = SetWindowsHookExA(WH_CBT, watch, nullptr, GetCurrentThreadId());
    const int32_t answer = call();
    UnhookWindowsHookEx(hook);
    check(acted, "the dialog was shown (error " + std::to_string(GetLastError()) + ")");
    return answer;
  }
  void click(HWND dialog, int id) override { SendMessageA(GetDlgItem(dialog, id), BM_CLICK, 0, 0); }
  void type(HWND dialog, int id, const std::string& text) override {
    HWND field = GetDlgItem(dialog, id);
    SetWindowTextA(field, "");
    for (unsigned char c : text) SendMessageA(field, WM_CHAR, c, 1);
  }
  void setText(HWND dialog, int id, const std::string& text) override {
    SetDlgItemTextA(dialog, id, text.c_str());
  }
  void press(HWND dialog, int key) override {
    PostMessageA(dialog, WM_KEYDOWN, static_cast<WPARAM>(key), 1);
    PostMessageA(dialog, WM_KEYUP, static_cast<WPARAM>(key), 0xC0000001);
  }
  bool isOpen(HWND dialog) override { return IsWindow(dialog) && IsWindowVisible(dialog); }
  void check(bool ok, const std::string& what) override {
    ok ? ++passed : ++failed;
    if (!ok) std::printf("FAIL %s\n", what.c_str());
  }

  // By ordinal, as a host finds it, and the same code by name.
  template <typename Fn>
  Fn entryPoint(HMODULE dll, const char* name) {
    static constexpr struct {
      const char* name;
      WORD ordinal;
    } kOrdinals[] = {
#define QUORREL_ENTRY_POINT(name, ordinal, ...) {#name, ordinal},
#include "host/entry_points.inc"
#undef QUORREL_ENTRY_POINT
    };
    for (const auto& entry : kOrdinals) {
      if (std::strcmp(entry.name, name) != 0) continue;
      FARPROC byOrdinal = GetProcAddress(dll, MAKEINTRESOURCEA(entry.ordinal));
      check(byOrdinal && byOrdinal == GetProcAddress(dll, name),
            std::string(name) + " at ordinal " + std::to_string(entry.ordinal));
      return reinterpret_cast<Fn>(reinterpret_cast<void*>(byOrdinal));
    }
    check(false, std::string(name) + " is an entry point");
    return nullptr;
  }
};

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
  WindowsDriver driver;
  driver.createObject = driver.entryPoint<abi::CreateObjectFn>(module, "CreateObject");
  driver.editObject = driver.entryPoint<abi::EditObjectFn>(module, "EditObject");
  if (driver.createObject && driver.editObject) runAllScenarios(driver);
  std::printf("%d passed, %d failed\n", driver.passed, driver.failed);
  return driver.failed == 0 ? 0 : 1;
}
