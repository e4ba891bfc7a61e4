#include "recordset/table.h"

#include <algorithm>
#include <string_view>
#include <utility>
#include <vector>

#include "array/array_edit.h"
#include "array/text.h"
#include "query/compare.h"

namespace quorrel {

namespace {

bool isTable(const ElementArray& array) {
  return array.dimensions() == 2;
}

// Joins the texts of the given cells with the whole delimiter text between them, in
// one walk: the cells of a long column lie far apart, and a second walk to measure
// them first would cost more than the few reallocations of the growing text.
template <typename ForEachCell>
std::string joinCells(const ElementArray& array, ForEachCell&& forEachCell) {
  const std::string_view delimiter = array.listDelimiter();
  std::string out;
  NumberText scratch;
  bool first = true;
  forEachCell([&](const Element& cell) {
    if (!first) out.append(delimiter);
    first = false;
    out.append(cell.asString(scratch));
  });
  return out;
}

// The fields of a list, split at the characters of the delimiter; each field is kept
// zero-terminated for the element edits. Fields past `columns` are not needed.
std::vector<std::string> splitFields(const ElementArray& array, const char* list, int32_t columns) {
  std::vector<std::string> fields;
  if (list == nullptr) return fields;
  TokenSplitter tokens(list, array.listDelimiter());
  while (static_cast<int32_t>(fields.size()) < columns) {
    auto token = tokens.next();
    if (!token) break;
    fields.emplace_back(*token);
  }
  return fields;
}

// The field for column i, or null (stored as a None element) when the list ran out.
const char* fieldText(const std::vector<std::string>& fields, int32_t i) {
  return static_cast<std::size_t>(i) < fields.size() ? fields[static_cast<std::size_t>(i)].c_str()
                                                     : nullptr;
}

}  // namespace

// --- Geometry ----------------------------------------------------------------------------

int32_t numberOfRows(const ElementArray& array) {
  return static_cast<int32_t>(
      std::count(array.rowStates.begin(), array.rowStates.end(), RowSelected));
}

int32_t numberOfCols(const ElementArray& array) {
  return isTable(array) ? array.boundary(1) : 0;
}

int32_t visibleRowPosition(const ElementArray& array, int32_t n) {
  int32_t selected = 0;
  const auto count = static_cast<int32_t>(array.rowStates.size());
  for (int32_t r = 0; r < count; ++r) {
    if (array.rowStates[static_cast<std::size_t>(r)] != RowSelected) continue;
    if (selected == n) return r;
    ++selected;
  }
  // Not found: `selected` now counts every visible row.
  return selected;
}

int32_t visibleCellIndex(const ElementArray& array, int32_t n, int32_t column) {
  return cellIndex(array, visibleRowPosition(array, n), column);
}

// --- Lists -------------------------------------------------------------------------------

std::optional<std::string> rowList(const ElementArray& array, int32_t n) {
  if (!isTable(array) || n < 0 || n >= numberOfRows(array)) return std::nullopt;
  const int32_t base = visibleCellIndex(array, n, 0);
  const int32_t columns = numberOfCols(array);
  return joinCells(array, [&](auto&& emit) {
    for (int32_t j = 0; j < columns; ++j) emit(array.at(base + j));
  });
}

std::optional<std::string> columnList(const ElementArray& array, int32_t column) {
  if (!isTable(array) || column < 0 || column >= numberOfCols(array)) return std::nullopt;
  return joinCells(array, [&](auto&& emit) {
    forEachVisibleRow(array, [&](int32_t r) { emit(array.at(cellIndex(array, r, column))); });
  });
}

std::optional<std::string> labelList(const ElementArray& array) {
  if (!isTable(array) || !array.labels) return std::nullopt;
  const auto& labels = *array.labels;
  const std::string_view delimiter = array.listDelimiter();
  std::size_t length = labels.empty() ? 0 : (labels.size() - 1) * delimiter.size();
  for (const auto& label : labels) length += label ? label->size() : 0;
  std::string out;
  out.reserve(length);
  for (std::size_t i = 0; i < labels.size(); ++i) {
    if (i > 0) out.append(delimiter);
    if (labels[i]) out.append(*labels[i]);
  }
  return out;
}

// --- Row edits ---------------------------------------------------------------------------

void insertRowFromList(ElementArray& array, const char* list, int32_t n) {
  if (!isTable(array) || n > numberOfRows(array)) return;
  const int32_t columns = numberOfCols(array);
  // A row goes in whole or not at all: past the array's cap (a table 2147483647 wide)
  // the inserts would each be refused, after gigabytes of cells and billions of calls.
  if (int64_t{array.size()} + columns > ElementArray::kMaxSize) return;
  const std::vector<std::string> fields = splitFields(array, list, columns);
  const int32_t base = visibleCellIndex(array, n, 0);
  ArrayEdit edit(array, ArrayEdit::InsertingAt, base);
  for (int32_t i = 0; i < columns; ++i) array.insertString(fieldText(fields, i), base + i);
  edit.commit();
}

void appendRowFromList(ElementArray& array, const char* list) {
  insertRowFromList(array, list, numberOfRows(array));
}

void replaceRowWithList(ElementArray& array, const char* list, int32_t n) {
  if (!isTable(array) || n >= numberOfRows(array)) return;
  const int32_t columns = numberOfCols(array);
  const std::vector<std::string> fields = splitFields(array, list, columns);
  const int32_t base = visibleCellIndex(array, n, 0);
  if (int64_t{base} + columns > ElementArray::kMaxSize) return;  // as for inserts
  // Cells in range are made first (keys kept) and swapped in; only a row number out of
  // range also lands past the end, where setString grows the array. A failure swaps
  // the old cells back and takes any growth back.
  const int32_t first = std::max(base, 0);
  const int32_t inRange = std::max(0, std::min(base + columns, array.size()) - first);
  std::vector<Element> cells;
  cells.reserve(static_cast<std::size_t>(inRange));
  for (int32_t k = first; k < first + inRange; ++k) {
    const Element& old = array.at(k);
    const ElementValue value = ElementValue::ofText(fieldText(fields, k - base));
    cells.push_back(old.hasKey() ? Element::keyed(value, old.key()->view()) : Element::of(value));
  }
  ArrayEdit edit(array, ArrayEdit::InsertingAt, array.size());
  edit.swapIn(first, cells);
  for (int32_t i = first + inRange - base; i < columns; ++i) {
    array.setString(fieldText(fields, i), base + i);
  }
  edit.commit();
}

void deleteRow(ElementArray& array, int32_t n) {
  if (!isTable(array) || n >= numberOfRows(array)) return;
  const int32_t base = visibleCellIndex(array, n, 0);
  // Highest index first, so each delete leaves the lower cells of the row in place.
  // Cells past the end are not there to delete: a negative n falls back to the row
  // past the last one, which in a table 2147483647 wide means billions of no-ops.
  const int32_t last = std::min(numberOfCols(array), array.size() - base) - 1;
  for (int32_t i = last; i >= 0; --i) array.deleteAt(base + i);
}

void swapRows(ElementArray& array, int32_t a, int32_t b) {
  if (!isTable(array)) return;
  const int32_t visible = numberOfRows(array);
  if (a >= visible || b >= visible) return;
  const int32_t columns = numberOfCols(array);
  for (int32_t j = 0; j < columns; ++j) {
    const int32_t x = cellIndex(array, a, j);
    const int32_t y = cellIndex(array, b, j);
    if (array.inRange(x) && array.inRange(y)) std::swap(array.at(x), array.at(y));
  }
}

// --- Labels ------------------------------------------------------------------------------

const char* getLabel(const ElementArray& array, int32_t column) {
  if (!isTable(array) || column < 0 || !array.labels) return nullptr;
  if (static_cast<std::size_t>(column) >= array.labels->size()) return nullptr;
  const auto& label = (*array.labels)[static_cast<std::size_t>(column)];
  return label ? label->c_str() : nullptr;
}

void setLabel(ElementArray& array, const char* text, int32_t column) {
  if (!isTable(array) || numberOfCols(array) > kMaxLabelColumns) return;
  // The list follows the column count only here, so a change of the X boundary shows
  // in the labels at the next setLabel.
  // Whatever allocates comes before the first change.
  const auto columns = static_cast<std::size_t>(std::max(numberOfCols(array), 0));
  std::optional<std::string> label;
  if (text != nullptr && column >= 0 && static_cast<std::size_t>(column) < columns) {
    label.emplace(text);
  }
  if (!array.labels) {
    LabelList fresh(columns);
    array.labels = std::move(fresh);
  } else {
    array.labels->reserve(columns);
    array.labels->resize(columns);
  }
  if (label) (*array.labels)[static_cast<std::size_t>(column)] = std::move(label);
}

int32_t columnOfLabel(const ElementArray& array, const char* name) {
  if (!isTable(array)) return -1;
  if (!array.labels) return -1;
  for (std::size_t i = 0; i < array.labels->size(); ++i) {
    const auto& label = (*array.labels)[i];
    if (label && searchCompare(array, name, label->c_str()) == 0) {
      return static_cast<int32_t>(i);
    }
  }
  return -1;
}

}  // namespace quorrel
