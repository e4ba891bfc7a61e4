// Menus where Windows has none: loaded from the generated resource tables, built
// with CreatePopupMenu/AppendMenuA, read by position or by command id, released
// with DestroyMenu (which takes the submenus along, as on Windows).
#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/resource_data.h"
#include "platform/windows_services.h"

struct HMENU__ {
  struct Item {
    UINT flags = 0;  // MF_ state flags, MF_SEPARATOR, MF_POPUP
    UINT id = 0;
    std::string text;
    HMENU submenu = nullptr;
  };
  std::vector<Item> items;
  HMENU parent = nullptr;
};

namespace {

using Menu = HMENU__;
using MenuItem = HMENU__::Item;

constexpr UINT kKeptItemFlags =
    MF_GRAYED | MF_DISABLED | MF_CHECKED | MF_MENUBARBREAK | MF_MENUBREAK;
constexpr UINT kNotFound = 0xFFFFFFFF;

// Every live menu by handle. A handle is a serial number, never an address, and is
// never given out twice: a handle kept after DestroyMenu names nothing even once the
// menu's memory has been reused, and a foreign handle is refused instead of followed.
std::unordered_map<HMENU, std::unique_ptr<Menu>>& liveMenus() {
  static std::unordered_map<HMENU, std::unique_ptr<Menu>> menus;
  return menus;
}

HMENU newMenu() {
  static uintptr_t lastSerial = 0;
  auto menu = std::make_unique<Menu>();
  // Past the integer resource names, and aligned like a pointer.
  const auto handle = reinterpret_cast<HMENU>((lastSerial + 1 + 0x10000) * 16);
  liveMenus().emplace(handle, std::move(menu));
  ++lastSerial;
  return handle;
}

Menu* live(HMENU handle) {
  auto found = liveMenus().find(handle);
  return found == liveMenus().end() ? nullptr : found->second.get();
}

void forget(HMENU handle) {
  Menu* menu = live(handle);
  if (!menu) return;
  for (const MenuItem& item : menu->items) {
    if (item.submenu) forget(item.submenu);
  }
  liveMenus().erase(handle);
}

// Builds one level of a menu template; returns the position after the level. A submenu
// is linked in before it is filled, so that a failure part-way leaves every menu built
// so far reachable from the top one.
std::size_t buildLevel(HMENU handle, std::span<const quorrel::platform::MenuTemplateItem> source,
                       std::size_t position) {
  while (position < source.size()) {
    const auto& entry = source[position++];
    MenuItem item;
    item.text = entry.text;
    const bool popup = (entry.flags & quorrel::platform::kMenuPopup) != 0;
    if (popup) {
      item.flags = MF_POPUP;
    } else {
      item.flags = entry.flags & kKeptItemFlags;
      item.id = entry.id;
      // An item without text is a separator, as the Windows loader reads it.
      if (item.text.empty()) item.flags |= MF_SEPARATOR;
    }
    Menu& menu = *live(handle);
    menu.items.push_back(std::move(item));
    if (popup) {
      HMENU submenu = newMenu();
      live(submenu)->parent = handle;
      menu.items.back().submenu = submenu;
      position = buildLevel(submenu, source, position);
    }
    if (entry.flags & quorrel::platform::kMenuEnd) break;
  }
  return position;
}

MenuItem* itemAt(HMENU handle, int position) {
  Menu* menu = live(handle);
  if (!menu || position < 0 || static_cast<std::size_t>(position) >= menu->items.size()) {
    return nullptr;
  }
  return &menu->items[static_cast<std::size_t>(position)];
}

// Depth first through the submenus, in item order, as Windows searches.
MenuItem* itemWithCommand(Menu& menu, UINT id) {
  for (MenuItem& item : menu.items) {
    if (item.submenu) {
      if (Menu* sub = live(item.submenu)) {
        if (MenuItem* found = itemWithCommand(*sub, id)) return found;
      }
    } else if (item.id == id && !(item.flags & MF_SEPARATOR)) {
      return &item;
    }
  }
  return nullptr;
}

MenuItem* findItem(HMENU handle, UINT item, UINT flags) {
  if (flags & MF_BYPOSITION) return itemAt(handle, static_cast<int>(item));
  Menu* menu = live(handle);
  return menu ? itemWithCommand(*menu, item) : nullptr;
}

}  // namespace

extern "C" {

// Every function here answers failure rather than let an exception (only a failed
// allocation can throw) reach the caller.

HMENU LoadMenuA(HINSTANCE, LPCSTR name) {
  if (!IS_INTRESOURCE(name)) return nullptr;
  auto id = static_cast<uint16_t>(reinterpret_cast<uintptr_t>(name));
  for (const auto& resource : quorrel::platform::moduleResources().menus) {
    if (resource.id != id) continue;
    HMENU menu = nullptr;
    try {
      menu = newMenu();
      buildLevel(menu, resource.items, 0);
      return menu;
    } catch (...) {
      forget(menu);  // with the submenus built so far
      return nullptr;
    }
  }
  return nullptr;
}

HMENU CreatePopupMenu(void) {
  try {
    return newMenu();
  } catch (...) {
    return nullptr;
  }
}

BOOL DestroyMenu(HMENU handle) {
  Menu* menu = live(handle);
  if (!menu) return FALSE;
  // A submenu destroyed on its own leaves its parent without the item.
  if (Menu* parent = live(menu->parent)) {
    std::erase_if(parent->items, [handle](const MenuItem& item) { return item.submenu == handle; });
  }
  forget(handle);
  return TRUE;
}

HMENU GetSubMenu(HMENU menu, int position) {
  MenuItem* item = itemAt(menu, position);
  return item ? item->submenu : nullptr;
}

int GetMenuItemCount(HMENU handle) {
  Menu* menu = live(handle);
  return menu ? static_cast<int>(menu->items.size()) : -1;
}

UINT GetMenuItemID(HMENU menu, int position) {
  MenuItem* item = itemAt(menu, position);
  if (!item || item->submenu) return kNotFound;
  return item->id;
}

int GetMenuStringA(HMENU menu, UINT item, LPSTR buffer, int size, UINT flags) {
  MenuItem* found = findItem(menu, item, flags);
  if (!found) return 0;
  int length = static_cast<int>(found->text.size());
  if (!buffer || size <= 0) return length;
  int copied = std::min(length, size - 1);
  std::memcpy(buffer, found->text.data(), static_cast<std::size_t>(copied));
  buffer[copied] = '\0';
  return copied;
}

UINT GetMenuState(HMENU menu, UINT item, UINT flags) {
  MenuItem* found = findItem(menu, item, flags);
  if (!found) return kNotFound;
  if (found->submenu) {
    // A popup answers its item count in the high byte, as on Windows.
    auto count = static_cast<UINT>(GetMenuItemCount(found->submenu));
    return (count << 8) | (found->flags & 0xFF);
  }
  return found->flags;
}

BOOL AppendMenuA(HMENU handle, UINT flags, UINT_PTR idOrPopup, LPCSTR text) {
  Menu* menu = live(handle);
  if (!menu) return FALSE;
  try {
    MenuItem item;
    Menu* sub = nullptr;
    if (flags & MF_SEPARATOR) {
      item.flags = MF_SEPARATOR;
    } else if (flags & MF_POPUP) {
      auto submenu = reinterpret_cast<HMENU>(idOrPopup);
      sub = live(submenu);
      if (!sub || sub == menu || sub->parent) return FALSE;
      item.flags = MF_POPUP | (flags & kKeptItemFlags);
      item.submenu = submenu;
      item.text = text ? text : "";
    } else {
      item.flags = flags & kKeptItemFlags;
      item.id = static_cast<UINT>(idOrPopup);
      item.text = text ? text : "";
    }
    menu->items.push_back(std::move(item));
    if (sub) sub->parent = handle;  // only once the item is in
    return TRUE;
  } catch (...) {
    return FALSE;
  }
}

}  // extern "C"
