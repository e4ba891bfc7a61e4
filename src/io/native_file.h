// The array's own binary file: magic "ZUBARRAY", version 1, the dimensions with
// their boundaries, the column labels and every element with its type, bytes and key.
#pragma once

#include <cstdint>
#include <string_view>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// The first bytes of every native array file.
inline constexpr std::string_view kNativeFileMagic{"ZUBARRAY", 8};

// Writes the whole array; stores `mode` in the settings' fileMode.
FileStatus saveNativeFile(ElementArray& array, const char* path, FileMode mode);
// Append 0 clears the array and takes the file's dimensions and boundaries (a file
// that cannot be used still clears it and sets 0 dimensions); otherwise the file's
// elements are added at the end. Labels of the file replace column labels in both.
FileStatus loadNativeFile(ElementArray& array, const char* path, LoadMode mode);

}  // namespace quorrel
