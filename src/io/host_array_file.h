// The host's own array file: header "CNC ARRAY" and a zero byte, version 2, the X, Y
// and Z sizes, the cell kind, then X x Y x Z number or text cells (X fastest). Only
// the sizes and cell contents travel; keys and labels do not.
#pragma once

#include <cstdint>
#include <optional>

#include "array/element_array.h"
#include "io/native_file.h"

namespace quorrel {

// Writes every element's text form as a text cell. X and Y are the boundaries of
// dimensions 1 and 2 (0 counts as 1); Z is size / (X x Y) + 1.
void saveHostArrayFile(ElementArray& array, const char* path, uint16_t mode);
// Append 0 clears the array and makes it three-dimensional with the file's X and Y as
// boundaries 1 and 2 (a file that cannot be used still clears it and sets 0
// dimensions); otherwise the cells are added at the end and dimensions stay.
void loadHostArrayFile(ElementArray& array, const char* path, int32_t append);

// The image's boundaries[0..2] are X, Y and Z; its elements are the cells in order
// (a Value record is written as its decimal text).
void writeHostArrayFile(const char* path, const ArrayImage& image, uint16_t fileMode);
// Nothing when the file cannot be opened or does not start with the header. Negative
// sizes, more than 2147483647 cells, an unknown cell kind, or more than 16,777,216
// byteless text cells (version other than 2) give no cells.
std::optional<ArrayImage> readHostArrayFile(const char* path);

}  // namespace quorrel
