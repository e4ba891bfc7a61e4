// The host's own array file: header "CNC ARRAY" and a zero byte, version 2, the X, Y
// and Z sizes, the cell kind, then X x Y x Z number or text cells (X fastest). Only
// the sizes and cell contents travel; keys and labels do not.
#pragma once

#include <cstdint>
#include <string_view>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// The first bytes of every host array file.
inline constexpr std::string_view kHostFileHeader{"CNC ARRAY\0", 10};

// Writes every element's text form as a text cell. X and Y are the boundaries of
// dimensions 1 and 2 (0 counts as 1); Z is size / (X x Y) + 1.
FileStatus saveHostArrayFile(const ElementArray& array, const char* path, FileMode mode);
// Append 0 clears the array and makes it three-dimensional with the file's X and Y as
// boundaries 1 and 2 (a file that cannot be used still clears it and sets 0
// dimensions); otherwise the cells are added at the end and dimensions stay.
FileStatus loadHostArrayFile(ElementArray& array, const char* path, LoadMode mode);

// How far the loader's own reader gets through a host array file's cells.
FileExtent measureHostFile(std::string_view file);

}  // namespace quorrel
