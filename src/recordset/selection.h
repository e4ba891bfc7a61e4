// Row selection: the selected table rows are the visible rows of the table. In OR mode
// (selectionMode 1) a where-test only adds the rows that pass; in AND mode (0) it only
// removes the rows that fail. A state belongs to a row position, not to the row's data.
//
// The where-operations test the cell at cellIndex(r, column) of every table row r. The
// column is deliberately not checked against the column count: a column past it tests
// the next row's cells, and -1 the previous row's last cell. A row whose cell lies
// outside the array fails.
#pragma once

#include <cstdint>

#include "array/element_array.h"

namespace quorrel {

void clearSelection(ElementArray& array);
void selectAllRows(ElementArray& array);
void invertSelection(ElementArray& array);
// OR mode and nothing selected: the next where-operation selects exactly its passes.
void startNewWhere(ElementArray& array);

// The probe is a pattern for the whole cell text in wildcard mode, else equal text.
void selectWhereMatching(ElementArray& array, int32_t column, const char* probe);
// The probe occurs somewhere in the cell text (as a pattern over spans of its length in
// wildcard mode). The empty probe passes every row that has a cell.
void selectWhereContaining(ElementArray& array, int32_t column, const char* probe);

void selectWhereEqual(ElementArray& array, int32_t column, int32_t x);
void selectWhereNotEqual(ElementArray& array, int32_t column, int32_t x);
void selectWhereGreater(ElementArray& array, int32_t column, int32_t x);
void selectWhereGreaterOrEqual(ElementArray& array, int32_t column, int32_t x);
void selectWhereLess(ElementArray& array, int32_t column, int32_t x);
void selectWhereLessOrEqual(ElementArray& array, int32_t column, int32_t x);

// low ≤ cell ≤ high, both ends included: texts literally under the case mode, whatever
// the search mode; values as signed 32-bit numbers.
void selectBetweenStrings(ElementArray& array, int32_t column, const char* low, const char* high);
void selectBetweenValues(ElementArray& array, int32_t column, int32_t low, int32_t high);

}  // namespace quorrel
