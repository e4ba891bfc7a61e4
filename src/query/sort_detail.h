// The element sort with its choice of method exposed, so that the in-place method
// (used when no memory can be had for a table of keys) can be checked directly.
#pragma once

#include <cstdint>

#include "query/sort.h"

namespace quorrel::sortdetail {

// sortElementRange; `allowTables` false exchanges the elements in place throughout.
void sortRange(ElementArray& array, SortKind kind, int16_t descending, int32_t lo, int32_t hi,
               bool allowTables);

}  // namespace quorrel::sortdetail
