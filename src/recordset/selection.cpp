#include "recordset/selection.h"

#include <algorithm>
#include <cstring>

#include "array/int32.h"
#include "query/compare.h"
#include "query/text_probe.h"
#include "recordset/table.h"

namespace quorrel {

namespace {

// One pass over the row states: the cell of each row is tested, a pass marks the row
// and a failure unmarks it, and the mode decides which of the two can change anything.
// Each state is rewritten without a branch (to itself when the mode leaves it alone).
template <bool kOr, typename Test>
void walkWhere(ElementArray& array, int32_t column, Test& passes) {
  const auto rows = static_cast<int32_t>(array.rowStates.size());
  uint8_t* states = array.rowStates.data();
  const Element* cells = array.slots().data();
  const int32_t columns = array.boundaryEntry(1);
  // cellIndex(r, column), stepped one row at a time with the same 32-bit wrap.
  int32_t index = column;
  for (int32_t r = 0; r < rows; ++r, index = addWrap(index, columns)) {
    const bool pass = array.inRange(index) && passes(cells[static_cast<std::size_t>(index)]);
    if constexpr (kOr) {
      states[r] = pass ? uint8_t{RowSelected} : states[r];
    } else {
      states[r] = pass ? states[r] : uint8_t{RowUnselected};
    }
  }
}

template <typename Test>
void applyWhere(ElementArray& array, int32_t column, Test&& passes) {
  if (array.settings.selectionMode == SelectOr) {
    walkWhere<true>(array, column, passes);
  } else if (array.settings.selectionMode == SelectAnd) {
    walkWhere<false>(array, column, passes);
  }
}

template <typename Test>
void applyValueWhere(ElementArray& array, int32_t column, Test&& passes) {
  applyWhere(array, column, [&](const Element& cell) { return passes(cell.asValue()); });
}

// A cell's text with a bound on its length: a String's stored size (its bytes are
// readable up to and including that index), else the length of the decimal or empty
// text.
struct CellText {
  const char* text;
  std::size_t bound;
};

CellText textOf(const Element& cell, NumberText& scratch) {
  if (cell.type() == ElementType::String) {
    return {cell.bytes(), static_cast<std::size_t>(cell.size())};
  }
  const char* text = cell.asString(scratch);
  return {text, std::strlen(text)};
}

}  // namespace

void clearSelection(ElementArray& array) {
  std::fill(array.rowStates.begin(), array.rowStates.end(), RowUnselected);
}

void selectAllRows(ElementArray& array) {
  std::fill(array.rowStates.begin(), array.rowStates.end(), RowSelected);
}

void invertSelection(ElementArray& array) {
  for (uint8_t& state : array.rowStates) {
    state = state == RowUnselected ? RowSelected : RowUnselected;
  }
}

void startNewWhere(ElementArray& array) {
  array.settings.selectionMode = SelectOr;
  clearSelection(array);
}

void selectWhereMatching(ElementArray& array, int32_t column, const char* probe) {
  const TextProbe prepared(array, probe);
  NumberText scratch;
  applyWhere(array, column, [&](const Element& cell) {
    const CellText cellText = textOf(cell, scratch);
    return prepared.matchesWhole(cellText.text, cellText.bound);
  });
}

void selectWhereContaining(ElementArray& array, int32_t column, const char* probe) {
  const TextProbe prepared(array, probe);
  NumberText scratch;
  applyWhere(array, column, [&](const Element& cell) {
    const char* text = cell.asString(scratch);
    return prepared.occursIn(text, std::strlen(text));
  });
}

void selectWhereEqual(ElementArray& array, int32_t column, int32_t x) {
  applyValueWhere(array, column, [x](int32_t v) { return v == x; });
}

void selectWhereNotEqual(ElementArray& array, int32_t column, int32_t x) {
  applyValueWhere(array, column, [x](int32_t v) { return v != x; });
}

void selectWhereGreater(ElementArray& array, int32_t column, int32_t x) {
  applyValueWhere(array, column, [x](int32_t v) { return v > x; });
}

void selectWhereGreaterOrEqual(ElementArray& array, int32_t column, int32_t x) {
  applyValueWhere(array, column, [x](int32_t v) { return v >= x; });
}

void selectWhereLess(ElementArray& array, int32_t column, int32_t x) {
  applyValueWhere(array, column, [x](int32_t v) { return v < x; });
}

void selectWhereLessOrEqual(ElementArray& array, int32_t column, int32_t x) {
  applyValueWhere(array, column, [x](int32_t v) { return v <= x; });
}

void selectBetweenStrings(ElementArray& array, int32_t column, const char* low, const char* high) {
  const TextProbe lowest(array, low);
  const TextProbe highest(array, high);
  NumberText scratch;
  applyWhere(array, column, [&](const Element& cell) {
    const CellText cellText = textOf(cell, scratch);
    return lowest.compareTo(cellText.text, cellText.bound) <= 0 &&
           highest.compareTo(cellText.text, cellText.bound) >= 0;
  });
}

void selectBetweenValues(ElementArray& array, int32_t column, int32_t low, int32_t high) {
  applyValueWhere(array, column, [low, high](int32_t v) { return low <= v && v <= high; });
}

}  // namespace quorrel
