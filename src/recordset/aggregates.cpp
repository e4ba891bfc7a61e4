#include "recordset/aggregates.h"

#include "array/int32.h"
#include "recordset/table.h"

namespace quorrel {

namespace {

int32_t cellValue(const ElementArray& array, int32_t row, int32_t column) {
  const int32_t index = cellIndex(array, row, column);
  return array.inRange(index) ? cellNumber(array.at(index)) : 0;
}

// Folds the visible rows' values in order: the first value starts the result and every
// later one is combined into it. No visible row gives 0.
template <typename Combine>
int32_t foldColumn(const ElementArray& array, int32_t column, Combine&& combine) {
  bool first = true;
  int32_t result = 0;
  forEachVisibleRow(array, [&](int32_t r) {
    const int32_t v = cellValue(array, r, column);
    result = first ? v : combine(result, v);
    first = false;
  });
  return result;
}

}  // namespace

int32_t columnMax(const ElementArray& array, int32_t column) {
  return foldColumn(array, column, [](int32_t best, int32_t v) { return v > best ? v : best; });
}

int32_t columnMin(const ElementArray& array, int32_t column) {
  return foldColumn(array, column, [](int32_t best, int32_t v) { return v < best ? v : best; });
}

int32_t columnSum(const ElementArray& array, int32_t column) {
  return foldColumn(array, column, [](int32_t sum, int32_t v) { return addWrap(sum, v); });
}

int32_t columnAverage(const ElementArray& array, int32_t column) {
  return divTrunc(columnSum(array, column), numberOfRows(array));
}

}  // namespace quorrel
