// Element sorting: an in-place partition sort over the array's slots, by text or by
// value, ascending or descending. Whole slots move, so keys travel with their
// elements. The sort is not stable; the final order of elements that compare equal is
// the one this particular partition scheme produces, and callers may rely on it.
#pragma once

#include <cstdint>

#include "array/element.h"
#include "array/element_array.h"

namespace quorrel {

// What is compared: the text form under caseMode (literal, never wildcard), or the
// numeric value. Any other code compares the stored byte counts, then the bytes.
enum SortKind : int32_t { SortByValue = 1, SortByText = 2 };

// Three-way comparison of two elements, either of which may be absent (null): an
// absent element orders first.
int32_t compareElements(const ElementArray& array, const Element* a, const Element* b,
                        SortKind kind);

// Exchanges two slots, content and key together; nothing unless both are in range.
void swapElements(ElementArray& array, int32_t i, int32_t j);

// Sorts the slots lo..hi (both included; clipped to the array). `descending` non-zero
// reverses the order.
void sortElementRange(ElementArray& array, SortKind kind, int16_t descending, int32_t lo,
                      int32_t hi);
void sortElements(ElementArray& array, SortKind kind, int16_t descending);

}  // namespace quorrel
