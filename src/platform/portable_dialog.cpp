// A modal dialog without a window system: built from the generated dialog template,
// driven by the dialog procedure and by a script that plays the author
// (headless_dialog.h). Controls keep their texts, check marks and enabled flags;
// automatic radio buttons uncheck the others of their group; digits-only fields
// refuse other characters; Enter presses the default button, Escape Cancel.
#include <algorithm>
#include <charconv>
#include <cstdio>
#include <cstring>
#include <limits>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/headless_dialog.h"
#include "platform/resource_data.h"
#include "platform/windows_services.h"

// A dialog or one of its controls.
struct HWND__ {
  HWND__* dialog = nullptr;  // the owning dialog; null for a dialog
  HWND handle = nullptr;     // what callers hold: a serial number, not this address
  uint16_t id = 0;
  std::string className;
  std::string text;
  uint32_t style = 0;
  bool enabled = true;
  UINT checked = BST_UNCHECKED;

  // Dialog only.
  std::vector<std::unique_ptr<HWND__>> controls;
  DLGPROC procedure = nullptr;
  LONG_PTR userData = 0;
  bool ended = false;
  INT_PTR result = -1;
};

namespace {

using Window = HWND__;

constexpr std::size_t kTypingLimit = 32767;
constexpr WORD kEditChanged = 0x0300;

struct Script {
  QuorrelDialogScript run = nullptr;
  void* user = nullptr;
};

Script& installedScript() {
  static Script script;
  return script;
}

// Every live window by handle. A handle is a serial number, never an address, and is
// never given out twice: a handle kept after its dialog closed names nothing, even
// once the memory has been reused.
std::unordered_map<HWND, Window*>& liveWindows() {
  static std::unordered_map<HWND, Window*> windows;
  return windows;
}

void enlist(Window& window) {
  static uintptr_t lastSerial = 0;
  // Past the integer resource names, and aligned like a pointer.
  const auto handle = reinterpret_cast<HWND>((lastSerial + 1 + 0x20000) * 16);
  liveWindows().emplace(handle, &window);
  ++lastSerial;
  window.handle = handle;
}

Window* live(HWND handle) {
  auto found = liveWindows().find(handle);
  return found == liveWindows().end() ? nullptr : found->second;
}

Window* openDialog(HWND handle) {
  Window* dialog = live(handle);
  return dialog && !dialog->dialog && !dialog->ended ? dialog : nullptr;
}

Window* control(HWND dialogHandle, int id) {
  Window* dialog = live(dialogHandle);
  if (!dialog || dialog->dialog) return nullptr;
  for (auto& child : dialog->controls) {
    if (child->id == static_cast<uint16_t>(id)) return child.get();
  }
  return nullptr;
}

bool isButton(const Window& w) {
  return w.className == "Button";
}
bool isEdit(const Window& w) {
  return w.className == "Edit";
}
uint32_t buttonType(const Window& w) {
  return w.style & BS_TYPEMASK;
}

// Owns a dialog built from its template and registered while it lives.
class DialogInstance {
 public:
  DialogInstance(const quorrel::platform::DialogResource& resource, DLGPROC procedure) {
    window_.procedure = procedure;
    window_.id = resource.id;
    window_.text = resource.caption;
    window_.style = resource.style;
    try {
      build(resource);
    } catch (...) {
      unlist();
      throw;
    }
  }
  ~DialogInstance() { unlist(); }
  DialogInstance(const DialogInstance&) = delete;
  DialogInstance& operator=(const DialogInstance&) = delete;

  Window& window() { return window_; }

  HWND firstTabStop() {
    for (auto& child : window_.controls) {
      if ((child->style & WS_TABSTOP) && child->enabled) return child->handle;
    }
    return nullptr;
  }

 private:
  void build(const quorrel::platform::DialogResource& resource) {
    for (const auto& item : resource.controls) {
      auto child = std::make_unique<Window>();
      child->dialog = &window_;
      child->id = item.id;
      child->className = item.className;
      child->text = item.text;
      child->style = item.style;
      child->enabled = (item.style & WS_DISABLED) == 0;
      window_.controls.push_back(std::move(child));
      enlist(*window_.controls.back());
    }
    enlist(window_);
  }
  void unlist() noexcept {
    for (auto& child : window_.controls) liveWindows().erase(child->handle);
    liveWindows().erase(window_.handle);
  }

  Window window_;
};

INT_PTR send(Window& dialog, UINT message, WPARAM wParam, LPARAM lParam) {
  return dialog.procedure ? dialog.procedure(dialog.handle, message, wParam, lParam) : 0;
}

void sendCommand(Window& dialog, uint16_t id, WORD notification, Window* from) {
  auto wParam = static_cast<WPARAM>((static_cast<uint32_t>(notification) << 16) | id);
  send(dialog, WM_COMMAND, wParam, reinterpret_cast<LPARAM>(from ? from->handle : nullptr));
}

// The group of a control runs from the nearest WS_GROUP control at or before it up
// to the next WS_GROUP control.
void uncheckGroupMates(Window& dialog, const Window& pressed) {
  auto& controls = dialog.controls;
  auto at = std::find_if(controls.begin(), controls.end(),
                         [&](const auto& child) { return child.get() == &pressed; });
  auto first = at;
  while (first != controls.begin() && !((*first)->style & WS_GROUP)) --first;
  for (auto it = first; it != controls.end(); ++it) {
    if (it != first && ((*it)->style & WS_GROUP)) break;
    Window& mate = **it;
    if (&mate != &pressed && isButton(mate) && buttonType(mate) == BS_AUTORADIOBUTTON) {
      mate.checked = BST_UNCHECKED;
    }
  }
}

const quorrel::platform::DialogResource* findDialog(LPCSTR name) {
  if (!IS_INTRESOURCE(name)) return nullptr;
  auto id = static_cast<uint16_t>(reinterpret_cast<uintptr_t>(name));
  for (const auto& resource : quorrel::platform::moduleResources().dialogs) {
    if (resource.id == id) return &resource;
  }
  return nullptr;
}

// GetDlgItemInt's reading: blanks, an optional minus sign when signed, digits,
// blanks; anything else, or a number out of range, is no number.
bool readInteger(const std::string& text, bool isSigned, UINT& value) {
  std::size_t begin = text.find_first_not_of(' ');
  std::size_t end = text.find_last_not_of(' ');
  if (begin == std::string::npos) return false;
  const char* first = text.data() + begin;
  const char* last = text.data() + end + 1;
  if (isSigned) {
    int32_t number = 0;
    auto [ptr, error] = std::from_chars(first, last, number);
    if (error != std::errc() || ptr != last || *first == '+') return false;
    value = static_cast<UINT>(number);
    return true;
  }
  uint32_t number = 0;
  auto [ptr, error] = std::from_chars(first, last, number);
  if (error != std::errc() || ptr != last || *first == '-' || *first == '+') return false;
  value = number;
  return true;
}

}  // namespace

extern "C" {

// Every function here answers failure rather than let an exception (only a failed
// allocation can throw) reach the caller.

INT_PTR DialogBoxParamA(HINSTANCE, LPCSTR name, HWND, DLGPROC procedure, LPARAM parameter) {
  const auto* resource = findDialog(name);
  if (!resource || !procedure) return -1;
  try {
    DialogInstance instance(*resource, procedure);
    Window& dialog = instance.window();
    send(dialog, WM_INITDIALOG, reinterpret_cast<WPARAM>(instance.firstTabStop()), parameter);
    Script script = installedScript();
    if (!dialog.ended && script.run) script.run(dialog.handle, script.user);
    if (!dialog.ended) QuorrelDialogKey(dialog.handle, VK_ESCAPE);
    return dialog.ended ? dialog.result : -1;
  } catch (...) {
    return -1;
  }
}

BOOL EndDialog(HWND handle, INT_PTR result) {
  Window* dialog = openDialog(handle);
  if (!dialog) return FALSE;
  dialog->ended = true;
  dialog->result = result;
  return TRUE;
}

LONG_PTR SetWindowLongA(HWND handle, int index, LONG_PTR value) {
  Window* window = live(handle);
  if (!window || window->dialog || index != DWL_USER) return 0;
  LONG_PTR previous = window->userData;
  window->userData = value;
  return previous;
}

LONG_PTR GetWindowLongA(HWND handle, int index) {
  Window* window = live(handle);
  if (!window || window->dialog || index != DWL_USER) return 0;
  return window->userData;
}

HWND GetDlgItem(HWND dialog, int id) {
  Window* found = control(dialog, id);
  return found ? found->handle : nullptr;
}

BOOL SetDlgItemTextA(HWND dialog, int id, LPCSTR text) {
  Window* target = control(dialog, id);
  if (!target) return FALSE;
  try {
    target->text = text ? text : "";
    return TRUE;
  } catch (...) {
    return FALSE;
  }
}

UINT GetDlgItemTextA(HWND dialog, int id, LPSTR buffer, int size) {
  if (!buffer || size <= 0) return 0;
  Window* target = control(dialog, id);
  std::size_t copied = 0;
  if (target) {
    copied = std::min(target->text.size(), static_cast<std::size_t>(size - 1));
    std::memcpy(buffer, target->text.data(), copied);
  }
  buffer[copied] = '\0';
  return static_cast<UINT>(copied);
}

BOOL SetDlgItemInt(HWND dialog, int id, UINT value, BOOL isSigned) {
  char text[16];
  if (isSigned) {
    std::snprintf(text, sizeof text, "%d", static_cast<int>(static_cast<int32_t>(value)));
  } else {
    std::snprintf(text, sizeof text, "%u", value);
  }
  return SetDlgItemTextA(dialog, id, text);
}

UINT GetDlgItemInt(HWND dialog, int id, BOOL* translated, BOOL isSigned) {
  Window* target = control(dialog, id);
  UINT value = 0;
  bool ok = target && readInteger(target->text, isSigned != FALSE, value);
  if (translated) *translated = ok ? TRUE : FALSE;
  return ok ? value : 0;
}

BOOL CheckDlgButton(HWND dialog, int id, UINT state) {
  Window* target = control(dialog, id);
  if (!target || !isButton(*target)) return FALSE;
  target->checked = state;
  return TRUE;
}

UINT IsDlgButtonChecked(HWND dialog, int id) {
  Window* target = control(dialog, id);
  return target && isButton(*target) ? target->checked : BST_UNCHECKED;
}

BOOL EnableWindow(HWND handle, BOOL enable) {
  Window* window = live(handle);
  if (!window) return FALSE;
  bool wasDisabled = !window->enabled;
  window->enabled = enable != FALSE;
  return wasDisabled ? TRUE : FALSE;
}

BOOL IsWindowEnabled(HWND handle) {
  Window* window = live(handle);
  return window && window->enabled ? TRUE : FALSE;
}

void QuorrelSetDialogScript(QuorrelDialogScript script, void* user) {
  installedScript() = Script{script, user};
}

BOOL QuorrelDialogClick(HWND dialogHandle, int id) {
  Window* dialog = openDialog(dialogHandle);
  Window* target = control(dialogHandle, id);
  if (!dialog || !target || !target->enabled || !isButton(*target)) return FALSE;
  if (buttonType(*target) == 0x7) return FALSE;  // a group box is only a frame
  if (buttonType(*target) == BS_AUTORADIOBUTTON) {
    target->checked = BST_CHECKED;
    uncheckGroupMates(*dialog, *target);
  }
  sendCommand(*dialog, target->id, BN_CLICKED, target);
  return TRUE;
}

BOOL QuorrelDialogType(HWND dialogHandle, int id, LPCSTR text) {
  Window* dialog = openDialog(dialogHandle);
  Window* target = control(dialogHandle, id);
  if (!dialog || !target || !target->enabled || !isEdit(*target)) return FALSE;
  bool digitsOnly = (target->style & ES_NUMBER) != 0;
  try {
    std::string typed;
    for (const char* c = text ? text : ""; *c; ++c) {
      auto ch = static_cast<unsigned char>(*c);
      if (ch < 0x20 || (digitsOnly && (ch < '0' || ch > '9'))) continue;
      if (typed.size() == kTypingLimit) break;
      typed += static_cast<char>(ch);
    }
    target->text = std::move(typed);
  } catch (...) {
    return FALSE;
  }
  sendCommand(*dialog, target->id, kEditChanged, target);
  return TRUE;
}

BOOL QuorrelDialogKey(HWND dialogHandle, UINT key) {
  Window* dialog = openDialog(dialogHandle);
  if (!dialog) return FALSE;
  uint16_t id = 0;
  if (key == VK_RETURN) {
    id = IDOK;
    for (auto& child : dialog->controls) {
      if (isButton(*child) && buttonType(*child) == BS_DEFPUSHBUTTON) {
        id = child->id;
        break;
      }
    }
  } else if (key == VK_ESCAPE) {
    id = IDCANCEL;
  } else {
    return FALSE;
  }
  Window* button = control(dialogHandle, id);
  if (button && !button->enabled) return FALSE;
  sendCommand(*dialog, id, BN_CLICKED, button);
  return TRUE;
}

BOOL QuorrelDialogIsOpen(HWND dialog) {
  return openDialog(dialog) ? TRUE : FALSE;
}

}  // extern "C"
