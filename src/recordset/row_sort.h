// Sorting whole rows of the table by one column, ascending or descending, by text or
// by value. The order is that of a partition sort whose pivot is the first row of each
// range, held as a copy of its text; rows whose cells compare equal end in exactly the
// order that sort gives them. Keys travel with their cells; row states stay where they
// are. No recursion deeper than O(log N), so reversed columns are safe on small stacks.
#pragma once

#include <cstdint>

#include "array/element_array.h"
#include "query/sort.h"

namespace quorrel {

// Sorts the first numberOfRows table rows (all of them when every row is visible) when
// the array has two dimensions and 0 ≤ column < the column count.
// Any kind other than SortByValue compares as text.
void sortRows(ElementArray& array, int32_t column, int32_t kind, bool descending);

// Sorts table rows first..last (both included) by the column. The range is clipped to
// the table; a column outside the table changes nothing.
void sortRowRange(ElementArray& array, int32_t column, int32_t kind, bool descending, int32_t first,
                  int32_t last);

// The cell (row, column) against the pivot text: by text (literal, case mode) or by
// value (the pivot's leading number). A cell outside the array gives -1.
int32_t compareCell(const ElementArray& array, int32_t row, int32_t column, const char* pivot,
                    int32_t kind);

}  // namespace quorrel
