// The array's own binary file: magic "ZUBARRAY", version 1, the dimensions with
// their boundaries, the column labels and every element with its type, bytes and key.
#pragma once

#include <cstdint>

#include "array/element_array.h"

namespace quorrel {

// Writes the whole array; stores `mode` in fileMode (0 create or truncate, 1 append).
void saveNativeFile(ElementArray& array, const char* path, uint16_t mode);
// Append 0 clears the array and takes the file's dimensions and boundaries (a file
// that cannot be used still clears it and sets 0 dimensions); otherwise the file's
// elements are added at the end. Labels of the file replace column labels in both.
void loadNativeFile(ElementArray& array, const char* path, int32_t append);

}  // namespace quorrel
