// INI text: a "[name]" line starts a section, each further line is key=value, lines end
// in CR LF. The save writes one section "ZUBArray" with one line per element; a load
// takes the entries of every section, in file order, as String elements with keys.
#pragma once

#include <cstdint>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

FileStatus saveIniFile(const ElementArray& array, const char* path, FileMode mode);
// Append 0 clears the array first; dimensions, boundaries and labels stay. Each entry
// appends its value (none for a line without "=") with its key as a String key.
FileStatus loadIniFile(ElementArray& array, const char* path, LoadMode mode);

}  // namespace quorrel
