#include "recordset/selection.h"

#include <algorithm>
#include <cstring>

#include "query/compare.h"
#include "recordset/table.h"

namespace quorrel {

namespace {

// One pass over the row states: the cell of each row is tested, a pass marks the row
// and a failure unmarks it, and the mode decides which of the two can change anything.
template <typename Test>
void applyWhere(ElementArray& array, int32_t column, Test&& passes) {
  const int32_t mode = array.selectionMode;
  if (mode != SelectOr && mode != SelectAnd) return;
  const auto rows = static_cast<int32_t>(array.rowStates.size());
  uint8_t* states = array.rowStates.data();
  for (int32_t r = 0; r < rows; ++r) {
    const int32_t index = cellIndex(array, r, column);
    const bool pass = array.inRange(index) && passes(array.at(index));
    if (mode == SelectOr) {
      if (pass) states[r] = RowSelected;
    } else if (!pass) {
      states[r] = RowUnselected;
    }
  }
}

template <typename Test>
void applyValueWhere(ElementArray& array, int32_t column, Test&& passes) {
  applyWhere(array, column, [&](const Element& cell) { return passes(cellNumber(cell)); });
}

bool containsProbe(const ElementArray& array, const char* text, const char* probe) {
  const auto probeLength = static_cast<int32_t>(std::strlen(probe));
  const auto textLength = static_cast<int32_t>(std::strlen(text));
  // Literal mode: a span can only match where its first character does, so most
  // positions are passed over without a call.
  const bool literal = !isWildcardSearch(array) && probeLength > 0;
  const bool folded = !isCaseSensitive(array);
  const auto head = static_cast<unsigned char>(probe[0]);
  const unsigned char wanted = folded ? foldByte(head) : head;
  for (int32_t o = 0; o <= textLength - probeLength; ++o) {
    if (literal) {
      const auto c = static_cast<unsigned char>(text[o]);
      if ((folded ? foldByte(c) : c) != wanted) continue;
    }
    if (searchCompareSpan(array, probe, text + o, probeLength) == 0) return true;
  }
  return false;
}

}  // namespace

void markRow(ElementArray& array, int32_t r) {
  if (r < 0 || static_cast<std::size_t>(r) >= array.rowStates.size()) return;
  if (array.selectionMode == SelectOr) array.rowStates[static_cast<std::size_t>(r)] = RowSelected;
}

void unmarkRow(ElementArray& array, int32_t r) {
  if (r < 0 || static_cast<std::size_t>(r) >= array.rowStates.size()) return;
  if (array.selectionMode == SelectAnd) {
    array.rowStates[static_cast<std::size_t>(r)] = RowUnselected;
  }
}

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
  array.selectionMode = SelectOr;
  clearSelection(array);
}

void selectWhereMatching(ElementArray& array, int32_t column, const char* probe) {
  NumberText scratch;
  applyWhere(array, column, [&](const Element& cell) {
    return searchCompare(array, probe, cell.asString(scratch)) == 0;
  });
}

void selectWhereContaining(ElementArray& array, int32_t column, const char* probe) {
  const char* pattern = probe == nullptr ? "" : probe;
  NumberText scratch;
  applyWhere(array, column, [&](const Element& cell) {
    return containsProbe(array, cell.asString(scratch), pattern);
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
  NumberText scratch;
  applyWhere(array, column, [&](const Element& cell) {
    const char* text = cell.asString(scratch);
    return compareText(array, low, text) <= 0 && compareText(array, high, text) >= 0;
  });
}

void selectBetweenValues(ElementArray& array, int32_t column, int32_t low, int32_t high) {
  applyValueWhere(array, column, [low, high](int32_t v) { return low <= v && v <= high; });
}

}  // namespace quorrel
