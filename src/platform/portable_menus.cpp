// Menus where Windows has none: loaded from the generated resource tables, built
// with CreatePopupMenu/AppendMenuA, read by position or by command id, released
// with DestroyMenu (which takes the submenus along, as on Windows).
#ifndef _WIN32

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

// Every live menu, so that a stale or foreign handle is refused instead of followed.
std::unordered_map<HMENU, std::unique_ptr<Menu>>& liveMenus() {
  static std::unordered_map<HMENU, std::unique_ptr<Menu>> menus;
  return menus;
}

HMENU newMenu() {
  auto menu = std::make_unique<Menu>();
  HMENU handle = menu.get();
  liveMenus().emplace(handle, std::move(menu));
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

// Builds one level of a menu template; returns the position after the level.
std::size_t buildLevel(Menu& menu, std::span<const quorrel::platform::MenuTemplateItem> source,
                       std::size_t position) {
  while (position < source.size()) {
    const auto& entry = source[position++];
    MenuItem item;
    item.text = entry.text;
    if (entry.flags & quorrel::platform::kMenuPopup) {
      item.flags = MF_POPUP;
      item.submenu = newMenu();
      live(item.submenu)->parent = &menu;
      position = buildLevel(*live(item.submenu), source, position);
    } else {
      item.flags = entry.flags & kKeptItemFlags;
      item.id = entry.id;
      // An item without text is a separator, as the Windows loader reads it.
      if (item.text.empty()) item.flags |= MF_SEPARATOR;
    }
    menu.items.push_back(std::move(item));
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

HMENU LoadMenuA(HINSTANCE, LPCSTR name) {
  if (!IS_INTRESOURCE(name)) return nullptr;
  auto id = static_cast<uint16_t>(reinterpret_cast<uintptr_t>(name));
  for (const auto& resource : quorrel::platform::moduleResources().menus) {
    if (resource.id != id) continue;
    HMENU menu = newMenu();
    buildLevel(*live(menu), resource.items, 0);
    return menu;
  }
  return nullptr;
}

HMENU CreatePopupMenu(void) {
  return newMenu();
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
  MenuItem item;
  if (flags & MF_SEPARATOR) {
    item.flags = MF_SEPARATOR;
  } else if (flags & MF_POPUP) {
    auto submenu = reinterpret_cast<HMENU>(idOrPopup);
    Menu* sub = live(submenu);
    if (!sub || sub == menu || sub->parent) return FALSE;
    sub->parent = handle;
    item.flags = MF_POPUP | (flags & kKeptItemFlags);
    item.submenu = submenu;
    item.text = text ? text : "";
  } else {
    item.flags = flags & kKeptItemFlags;
    item.id = static_cast<UINT>(idOrPopup);
    item.text = text ? text : "";
  }
  menu->items.push_back(std::move(item));
  return TRUE;
}

}  // extern "C"

#endif
