// Reads a preprocessed resource script far enough to list what it declares: the
// resources with their types, ids and languages, the menu trees, the string table, the
// dialog templates and the bytes of inline data. The DLL checks compare this with what
// the linked DLL actually holds.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <tuple>
#include <vector>

#include "windows/pe_image.h"

namespace quorrel::rc {

struct Declared {
  uint32_t type = 0;  // RT_BITMAP 2, RT_MENU 4, RT_DIALOG 5, RT_STRING 6, RT_RCDATA 10, ...
  uint32_t id = 0;    // for strings: the block number (id / 16 + 1)
  uint32_t language = 0;
  bool operator<(const Declared& other) const {
    return std::tie(type, id, language) < std::tie(other.type, other.id, other.language);
  }
  bool operator==(const Declared&) const = default;
};

struct Script {
  std::vector<Declared> resources;  // one entry per resource the linker will emit
  std::map<uint32_t, std::vector<pe::MenuItem>> menus;
  std::map<uint32_t, std::string> strings;  // by string id
  std::map<uint32_t, pe::Dialog> dialogs;   // style bits are not evaluated
  std::map<uint32_t, std::string> bitmapFiles;
  std::map<uint32_t, std::vector<uint8_t>> inlineData;  // RCDATA written out in the script
  std::map<uint32_t, std::string> dataFiles;            // RCDATA read from a file
};

// Parses preprocessed script text; an error text names the first statement not understood.
std::optional<Script> parseScript(const std::string& text, std::string& error);

}  // namespace quorrel::rc
