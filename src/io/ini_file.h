// INI text: a "[name]" line starts a section, each further line is key=value, lines end
// in CR LF. The save writes one section "ZUBArray" with one line per element; a load
// takes the entries of every section, in file order, as String elements with keys.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// Zero-terminated texts; a null value is an entry line without "=".
struct IniEntry {
  const char* key = nullptr;
  const char* value = nullptr;
};

struct IniSection {
  const char* name = nullptr;
  std::vector<IniEntry> entries;
  int32_t entryCount() const { return static_cast<int32_t>(entries.size()); }
};

// A document read from a file points into its own `text`.
struct IniDocument {
  std::vector<IniSection> sections;
  ByteBuffer text;
  int32_t sectionCount() const { return static_cast<int32_t>(sections.size()); }
};

void saveIniFile(ElementArray& array, const char* path, uint16_t mode);
// Append 0 clears the array first; dimensions, boundaries and labels stay. Each entry
// appends its value (none for a line without "=") with its key as a String key.
void loadIniFile(ElementArray& array, const char* path, int32_t append);

void writeIniFile(const char* path, const IniDocument& document, uint16_t fileMode);
// Nothing only when the file cannot be opened.
std::optional<IniDocument> readIniFile(const char* path);

}  // namespace quorrel
