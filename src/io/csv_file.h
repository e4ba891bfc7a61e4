// CSV text: one line per table row, cells separated by a comma, every line ending in
// CR LF; no quoting or escaping, an empty cell written as two double quotes. Only
// element texts travel; every loaded cell is a String.
#pragma once

#include <cstdint>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// One line per row of the X boundary's width when the array has two or more
// dimensions and an X boundary of at least 1; otherwise the whole array on one line.
FileStatus saveCsvFile(const ElementArray& array, const char* path, FileMode mode);
// Append 0 clears the array first. Either way the array becomes two-dimensional with
// the widest line's cell count as X boundary, and every line adds that many String
// elements (short lines padded with empty texts).
FileStatus loadCsvFile(ElementArray& array, const char* path, LoadMode mode);

}  // namespace quorrel
