#include "recordset/aggregates.h"

#include "array/int32.h"
#include "array/notes.h"
#include "recordset/table.h"

namespace quorrel {

namespace {

// Folds the visible rows' values in order: the first value starts the result and every
// later one is combined into it. No visible row gives 0. One tight walk over the states
// with the cell index stepped a row at a time (the same 32-bit wrap as cellIndex); a
// cell outside the array reads 0.
template <typename Result = int32_t, typename Combine>
Result foldColumn(const ElementArray& array, int32_t column, Combine&& combine) {
  const auto rows = static_cast<int32_t>(array.rowStates.size());
  const uint8_t* states = array.rowStates.data();
  const Element* cells = array.slots().data();
  const int32_t columns = array.boundaryEntry(1);
  auto valueAt = [&](int32_t index) {
    return array.inRange(index) ? cells[static_cast<std::size_t>(index)].asValue() : 0;
  };
  int32_t r = 0;
  int32_t index = column;
  while (r < rows && states[r] != RowSelected) {
    ++r;
    index = addWrap(index, columns);
  }
  if (r == rows) return 0;
  Result result = valueAt(index);
  for (++r, index = addWrap(index, columns); r < rows; ++r, index = addWrap(index, columns)) {
    if (states[r] == RowSelected) result = combine(result, valueAt(index));
  }
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
  const int32_t sum =
      foldColumn(array, column, [](int32_t sum, int32_t v) { return addWrap(sum, v); });
  if (notesWanted()) {
    noteTotal(foldColumn<int64_t>(array, column, [](int64_t sum, int32_t v) { return sum + v; }));
  }
  return sum;
}

int32_t columnAverage(const ElementArray& array, int32_t column) {
  return divTrunc(columnSum(array, column), numberOfRows(array));
}

}  // namespace quorrel
