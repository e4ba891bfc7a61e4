// Raw element files: one element's bytes written to a file, a whole file read into a
// block of bytes. No header, length or separator of their own.
#pragma once

#include <cstdint>
#include <optional>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// Writes the bytes of the element at index: a String's text with its terminating zero,
// a File's bytes, a Value's 4 bytes little-endian, nothing for None. FileModeTruncate
// creates or truncates the file, FileModeAppend appends. An index outside the array
// touches no file.
void saveElementToFile(const ElementArray& array, int32_t index, const char* path, FileMode mode);

// Exactly the file's bytes (no terminator added); nothing when it cannot be opened,
// std::bad_alloc when memory runs out.
// A read error ends the reading with what was read so far.
std::optional<ByteBuffer> readWholeFile(const char* path);

}  // namespace quorrel
