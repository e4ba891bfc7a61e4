// The module's resources as constant tables, for the builds that have no Windows
// resource loader. The tables are generated from the resource script at build time
// (tools/rcgen); nothing here is written by hand.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

namespace quorrel::platform {

// Menu template item flags, as in a compiled menu resource.
inline constexpr uint16_t kMenuPopup = 0x0010;
inline constexpr uint16_t kMenuEnd = 0x0080;  // last item of its level

// One item of a menu template, in template order: a popup's items follow it, and
// the last item of every level carries kMenuEnd.
struct MenuTemplateItem {
  uint16_t flags;
  uint16_t id;  // 0 for popups and separators
  const char* text;
};

struct MenuResource {
  uint16_t id;
  std::span<const MenuTemplateItem> items;
};

struct StringResource {
  uint16_t id;
  const char* text;
};

struct DialogControlTemplate {
  uint32_t style;
  int16_t x, y, cx, cy;
  uint16_t id;            // 0xFFFF for controls without an id
  const char* className;  // "Button", "Edit", "Static", ...
  const char* text;
};

struct DialogResource {
  uint16_t id;
  uint32_t style;
  int16_t x, y, cx, cy;
  const char* caption;
  uint16_t fontSize;
  const char* fontName;
  std::span<const DialogControlTemplate> controls;
};

struct ResourceData {
  uint16_t language;
  std::span<const MenuResource> menus;
  std::span<const StringResource> strings;  // sorted by id
  std::span<const DialogResource> dialogs;
};

// The generated tables of this module.
const ResourceData& moduleResources();

}  // namespace quorrel::platform
