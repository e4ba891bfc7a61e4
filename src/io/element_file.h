// Raw element files: one element's bytes written to a file (a whole file is read into
// a block of bytes by readFile). No header, length or separator of their own.
#pragma once

#include <cstdint>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// Writes the bytes of the element at index: a String's text with its terminating zero,
// a File's bytes, a Value's 4 bytes little-endian, nothing for None. FileModeTruncate
// creates or truncates the file, FileModeAppend appends. An index outside the array
// touches no file.
FileStatus saveElementToFile(const ElementArray& array, int32_t index, const char* path,
                             FileMode mode);

}  // namespace quorrel
