// Maximum, minimum, sum and average of the numeric values of one column over the
// visible rows. The column is not checked against the column count: past it the cells
// of the next row are read, and -1 reads the previous row's last cell; a cell outside
// the array reads 0. No visible row gives 0. Sums wrap at 32 bits.
#pragma once

#include <cstdint>

#include "array/element_array.h"

namespace quorrel {

int32_t columnMax(const ElementArray& array, int32_t column);
int32_t columnMin(const ElementArray& array, int32_t column);
int32_t columnSum(const ElementArray& array, int32_t column);
// columnSum divided by the number of visible rows, truncated toward zero.
int32_t columnAverage(const ElementArray& array, int32_t column);

}  // namespace quorrel
