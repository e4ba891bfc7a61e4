// Shared helpers of the table tests: building small tables and reading them back.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "array/element_array.h"
#include "recordset/table.h"
#include "support/array_text.h"

namespace quorrel {

using Texts = std::vector<std::string>;

// A two-dimensional table of the given width, filled from delimited lists.
inline ElementArray makeTable(int32_t columns, std::initializer_list<const char*> rows = {},
                              int32_t autoSelect = 1) {
  ElementArray a = shaped(2, columns);
  a.settings.autoSelectNewRows = autoSelect;
  for (const char* row : rows) appendRowFromList(a, row);
  return a;
}

// The texts of column j, one per table row.
inline Texts columnTexts(ElementArray& a, int32_t j) {
  Texts out;
  for (int32_t r = 0; r < a.tableRowCount(); ++r) out.emplace_back(a.getString(cellIndex(a, r, j)));
  return out;
}

}  // namespace quorrel
