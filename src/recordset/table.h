// The two-dimensional array read as a table: columns are X, rows are Y. Rows are
// addressed either as table rows (position in the array) or as visible rows (counted
// among the selected table rows only), and each operation says which it takes.
//
// Every operation here does nothing, or gives no text, 0 or -1, unless the array has
// two dimensions - except cellIndex, visibleCellIndex, numberOfRows and listDelimiter.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "array/element_array.h"
#include "array/int32.h"

namespace quorrel {

// row × columns + column with 32-bit wrap; neither argument is checked.
// Inline (the same sum as indexOfXY) because every row walk computes it per row.
inline int32_t cellIndex(const ElementArray& array, int32_t row, int32_t column) {
  return addWrap(column, mulWrap(row, array.boundaryEntry(1)));
}

// A cell's numeric value (asValue), without a call for the common Value cell.
inline int32_t cellNumber(const Element& cell) {
  return cell.type() == ElementType::Value ? cell.number() : cell.asValue();
}

// Calls visit(r) for each selected table row r, in position order. Row states always
// have one entry per table row, so every r is a complete row of the array.
template <typename Visit>
void forEachVisibleRow(const ElementArray& array, Visit&& visit) {
  const auto count = static_cast<int32_t>(array.rowStates.size());
  const uint8_t* states = array.rowStates.data();
  for (int32_t r = 0; r < count; ++r) {
    if (states[r] == RowSelected) visit(r);
  }
}

// The element index of column j in visible row n. Past the visible rows (or for a
// negative n) it is the cell of the table row whose position equals the number of
// visible rows: with every row visible, the first cell after the table.
int32_t visibleCellIndex(const ElementArray& array, int32_t n, int32_t column);
// The table row of visible row n, with the same fallback.
int32_t visibleRowPosition(const ElementArray& array, int32_t n);

int32_t numberOfRows(const ElementArray& array);
int32_t numberOfCols(const ElementArray& array);

// Delimited lists in fresh texts; nullopt is "no text".
std::optional<std::string> rowList(const ElementArray& array, int32_t n);
std::optional<std::string> columnList(const ElementArray& array, int32_t column);
std::optional<std::string> labelList(const ElementArray& array);

// Row edits from a list split at the characters of the list delimiter; missing fields
// become None elements, surplus fields are ignored, every field is stored as a String.
// A row that would take the array past ElementArray::kMaxSize is not inserted.
void insertRowFromList(ElementArray& array, const char* list, int32_t n);
void appendRowFromList(ElementArray& array, const char* list);
void replaceRowWithList(ElementArray& array, const char* list, int32_t n);
void deleteRow(ElementArray& array, int32_t n);
// Exchanges table rows a and b cell by cell (keys travel with their cells) when both
// are below numberOfRows. Row states stay where they are.
void swapRows(ElementArray& array, int32_t a, int32_t b);

// The stored label of column j, owned by the array; null when there is none.
const char* getLabel(const ElementArray& array, int32_t column);
// A table wider than this keeps its labels as they are: a list of one entry per column
// would take gigabytes for the widest boundaries, which cost nothing while empty.
inline constexpr int32_t kMaxLabelColumns = 1 << 20;
// Resizes the label list to the current column count, then stores the label; does
// nothing on a table wider than kMaxLabelColumns.
void setLabel(ElementArray& array, const char* text, int32_t column);
// The first column whose label the name matches (under the case and search modes), or -1.
int32_t columnOfLabel(const ElementArray& array, const char* name);

inline const char* listDelimiter(const ElementArray& array) {
  return array.listDelimiter();
}

}  // namespace quorrel
