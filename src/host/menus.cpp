// The editor's menus, menu codes, parameter titles and display strings, answered
// from the module's menu and string resources. Every call loads what it needs
// afresh and keeps nothing.
#include <cstdint>

#include "host/editor_module.h"
#include "host/entry_points.h"
#include "host/tables.h"
#include "platform/windows_services.h"

using quorrel::abi::HostWord;
using quorrel::abi::InfoEntry;
namespace abi = quorrel::abi;
namespace host = quorrel::host;

namespace {

using abi::kActionCommandBase;
using abi::kActionMenuId;
using abi::kConditionCommandBase;
using abi::kConditionMenuId;
using abi::kExpressionCommandBase;
using abi::kExpressionMenuId;
constexpr UINT kConditionStringBase = abi::kConditionStringBase;
constexpr UINT kActionStringBase = abi::kActionStringBase;
constexpr UINT kExpressionStringBase = abi::kExpressionStringBase;

// One text buffer per menu level while copying.
constexpr int kItemTextSize = 80;

// Codes and menu ids arrive in a full word; the host means its low 16 bits, signed.
int16_t lowSigned(int32_t value) {
  return static_cast<int16_t>(value);
}
// Buffer sizes likewise arrive in a full word of which 16 bits count.
int bufferSize(int32_t size) {
  return static_cast<uint16_t>(size);
}

// A menu loaded from the resources, released when the call is done.
class LoadedMenu {
 public:
  explicit LoadedMenu(int resourceId)
      : menu_(LoadMenuA(host::moduleInstance(), MAKEINTRESOURCEA(resourceId))) {}
  ~LoadedMenu() {
    if (menu_) DestroyMenu(menu_);
  }
  LoadedMenu(const LoadedMenu&) = delete;
  LoadedMenu& operator=(const LoadedMenu&) = delete;

  HMENU get() const { return menu_; }
  // Releases now and answers whether the release succeeded.
  BOOL release() {
    BOOL released = DestroyMenu(menu_);
    menu_ = nullptr;
    return released;
  }

 private:
  HMENU menu_;
};

// The zero-filled text buffer of one copy level.
class LevelBuffer {
 public:
  LevelBuffer() : memory_(LocalAlloc(LPTR, kItemTextSize)) {}
  ~LevelBuffer() {
    if (memory_) LocalFree(memory_);
  }
  LevelBuffer(const LevelBuffer&) = delete;
  LevelBuffer& operator=(const LevelBuffer&) = delete;

  char* text() const { return static_cast<char*>(memory_); }

 private:
  HLOCAL memory_;
};

void copyMenu(HMENU source, HMENU destination);

void copySubmenu(HMENU source, HMENU destination, const char* text) {
  HMENU popup = CreatePopupMenu();
  if (!popup) return;
  if (!AppendMenuA(destination, MF_POPUP, reinterpret_cast<UINT_PTR>(popup), text)) {
    DestroyMenu(popup);
    return;
  }
  copyMenu(source, popup);
}

// Copies a menu level by level into a popup the caller owns: separators, submenus
// with their texts, commands with their ids, texts and states.
void copyMenu(HMENU source, HMENU destination) {
  int count = GetMenuItemCount(source);
  if (count <= 0) return;
  LevelBuffer buffer;
  if (!buffer.text()) return;
  for (int position = 0; position < count; ++position) {
    UINT id = GetMenuItemID(source, position);
    if (id == 0) {
      AppendMenuA(destination, MF_SEPARATOR, 0, nullptr);
      continue;
    }
    GetMenuStringA(source, static_cast<UINT>(position), buffer.text(), kItemTextSize,
                   MF_BYPOSITION);
    if (HMENU submenu = GetSubMenu(source, position)) {
      copySubmenu(submenu, destination, buffer.text());
    } else {
      UINT state = GetMenuState(source, static_cast<UINT>(position), MF_BYPOSITION);
      AppendMenuA(destination, state, id, buffer.text());
    }
  }
}

// The popup under the resource's first top-level item, copied; null when the
// resource is missing or has no popup (the condition menu).
void* buildMenu(int resourceId) {
  try {
    LoadedMenu loaded(resourceId);
    if (!loaded.get()) return nullptr;
    HMENU source = GetSubMenu(loaded.get(), 0);
    if (!source) return nullptr;
    HMENU popup = CreatePopupMenu();
    if (popup) copyMenu(source, popup);
    return popup;
  } catch (...) {
    return nullptr;
  }
}

// A parameter's title: its title string when the information entry names one,
// otherwise the text of the menu command that stands for the code.
int32_t title(uint16_t titleId, int menuId, int commandId, char* buffer, int32_t size) {
  if (!buffer) return 0;
  try {
    if (titleId != 0) {
      return LoadStringA(host::moduleInstance(), titleId, buffer, bufferSize(size));
    }
    LoadedMenu menu(menuId);
    if (!menu.get()) return 0;
    GetMenuStringA(menu.get(), static_cast<UINT>(commandId), buffer, bufferSize(size),
                   MF_BYCOMMAND);
    return menu.release();
  } catch (...) {
    return 0;
  }
}

// The title id of an entry; codes the host never declares fall back to the menu.
template <std::size_t N>
uint16_t titleIdOf(const std::array<InfoEntry, N>& table, int16_t code, int32_t param) {
  if (code < 0 || static_cast<std::size_t>(code) >= N || param < 0 || param > 1) return 0;
  return table[static_cast<std::size_t>(code)].titleIds[param];
}

int32_t loadString(UINT id, char* buffer, int32_t size) {
  int limit = bufferSize(size);
  if (!buffer || limit == 0) return 0;
  try {
    return LoadStringA(host::moduleInstance(), id, buffer, limit);
  } catch (...) {
    return 0;
  }
}

// A code the information tables do not have names no title and no string: without
// this check it would reach the command or string of another family (action 200 is
// string 28400, expression 0's). The buffer then holds the empty text. The condition
// table has its one empty entry, code 0.
bool knownCode(int16_t code, int count, char* buffer, int32_t size) {
  if (code >= 0 && code < count) return true;
  if (buffer != nullptr && bufferSize(size) > 0) buffer[0] = '\0';
  return false;
}

int16_t codeFromMenu(int32_t menuId, int base, int count) {
  int id = lowSigned(menuId);
  return id >= base && id < base + count ? static_cast<int16_t>(id - base) : int16_t{-1};
}

}  // namespace

extern "C" {

QUORREL_EXPORT void* QUORREL_CALL GetConditionMenu(HostWord, HostWord, HostWord) {
  return buildMenu(kConditionMenuId);
}
QUORREL_EXPORT void* QUORREL_CALL GetActionMenu(HostWord, HostWord, HostWord) {
  return buildMenu(kActionMenuId);
}
QUORREL_EXPORT void* QUORREL_CALL GetExpressionMenu(HostWord, HostWord, HostWord) {
  return buildMenu(kExpressionMenuId);
}

QUORREL_EXPORT int16_t QUORREL_CALL GetConditionCodeFromMenu(void*, int32_t) {
  return -1;
}
QUORREL_EXPORT int16_t QUORREL_CALL GetActionCodeFromMenu(void*, int32_t menuId) {
  return codeFromMenu(menuId, kActionCommandBase, abi::kActionCount);
}
QUORREL_EXPORT int16_t QUORREL_CALL GetExpressionCodeFromMenu(void*, int32_t menuId) {
  return codeFromMenu(menuId, kExpressionCommandBase, abi::kExpressionCount);
}

QUORREL_EXPORT int32_t QUORREL_CALL GetConditionTitle(void*, int32_t code, int32_t param,
                                                      char* buffer, int32_t size) {
  int16_t c = lowSigned(code);
  if (!knownCode(c, static_cast<int>(host::ConditionInfoTable.size()), buffer, size)) return 0;
  return title(titleIdOf(host::ConditionInfoTable, c, param), kConditionMenuId,
               kConditionCommandBase + c, buffer, size);
}
QUORREL_EXPORT int32_t QUORREL_CALL GetActionTitle(void*, int32_t code, int32_t param, char* buffer,
                                                   int32_t size) {
  int16_t c = lowSigned(code);
  if (!knownCode(c, abi::kActionCount, buffer, size)) return 0;
  return title(titleIdOf(host::ActionInfoTable, c, param), kActionMenuId, kActionCommandBase + c,
               buffer, size);
}
QUORREL_EXPORT int32_t QUORREL_CALL GetExpressionTitle(void*, int32_t code, char* buffer,
                                                       int32_t size) {
  int16_t c = lowSigned(code);
  if (!knownCode(c, abi::kExpressionCount, buffer, size)) return 0;
  return title(titleIdOf(host::ExpressionInfoTable, c, 0), kExpressionMenuId,
               kExpressionCommandBase + c, buffer, size);
}

QUORREL_EXPORT int32_t QUORREL_CALL GetConditionString(void*, int32_t code, char* buffer,
                                                       int32_t size) {
  const int16_t c = lowSigned(code);
  if (!knownCode(c, static_cast<int>(host::ConditionInfoTable.size()), buffer, size)) return 0;
  return loadString(kConditionStringBase + static_cast<UINT>(c), buffer, size);
}
QUORREL_EXPORT int32_t QUORREL_CALL GetActionString(void*, int32_t code, char* buffer,
                                                    int32_t size) {
  const int16_t c = lowSigned(code);
  if (!knownCode(c, abi::kActionCount, buffer, size)) return 0;
  return loadString(kActionStringBase + static_cast<UINT>(c), buffer, size);
}
QUORREL_EXPORT int32_t QUORREL_CALL GetExpressionString(void*, int32_t code, char* buffer,
                                                        int32_t size) {
  const int16_t c = lowSigned(code);
  if (!knownCode(c, abi::kExpressionCount, buffer, size)) return 0;
  return loadString(kExpressionStringBase + static_cast<UINT>(c), buffer, size);
}

}  // extern "C"
