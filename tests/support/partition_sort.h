// The partition sort written out step by step, the reference both element and row sorts
// are checked against: recursion on the left part and a loop on the right one, so that
// the order of equal items shows exactly.
#pragma once

#include <cstdint>

namespace quorrel {

// `pivotOf(lo, hi)` takes the pivot of a range; `order(i, pivot)` compares position i
// with it (negative: i goes before it); `swap(i, j)` exchanges two positions.
template <typename PivotOf, typename Order, typename Swap>
void partitionSort(int32_t lo, int32_t hi, const PivotOf& pivotOf, const Order& order,
                   const Swap& swap) {
  while (hi > lo) {
    const auto pivot = pivotOf(lo, hi);
    int32_t i = lo;
    int32_t j = hi;
    for (;;) {
      while (order(i, pivot) < 0) ++i;
      while (order(j, pivot) > 0) --j;
      if (i > j) break;
      swap(i, j);
      ++i;
      --j;
      if (j < i) break;
    }
    partitionSort(lo, j, pivotOf, order, swap);
    lo = i;
  }
}

}  // namespace quorrel
