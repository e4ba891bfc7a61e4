#include "recordset/row_sort.h"

#include <algorithm>
#include <bit>
#include <utility>
#include <vector>

#include "array/text.h"
#include "query/compare.h"
#include "recordset/table.h"

namespace quorrel {

// The sort works on a copy of the sort column's keys paired with row numbers, runs the
// partition steps there, and moves the rows once at the end. The partition decisions
// depend only on the keys, so the rows end exactly where exchanging them pass by pass
// would have put them. A key is the cell's number (by value: the pivot's text reads back
// as that same number) or a pointer to the cell's text, which stays unchanged during
// the sort and so stands for the pivot's copy.

namespace {

int32_t compareNumbers(int32_t a, int32_t b) {
  return a < b ? -1 : (a > b ? 1 : 0);
}

// A function object, so the comparison inlines into the partition loop.
struct NumberOrder {
  int32_t operator()(int32_t a, int32_t b) const { return compareNumbers(a, b); }
};

template <typename Key, typename Compare>
class RowKeySort {
 public:
  RowKeySort(std::vector<Key> keys, Compare compare, bool descending)
      : keys_(std::move(keys)), compare_(compare), descending_(descending) {
    rows_.resize(keys_.size());
    for (std::size_t k = 0; k < rows_.size(); ++k) rows_[k] = static_cast<int32_t>(k);
  }

  // The new order: position k receives the row that was at position order()[k].
  const std::vector<int32_t>& order() const { return rows_; }

  void run() {
    const auto count = static_cast<int32_t>(keys_.size());
    if (count < 2) return;
    if (inOrder()) {
      sortEqualRuns();
      return;
    }
    // Strictly the wrong way round: the keys are distinct, so the sorted order is
    // unique, and it is the reverse.
    if (strictlyReversed()) {
      std::reverse(keys_.begin(), keys_.end());
      std::reverse(rows_.begin(), rows_.end());
      return;
    }
    // A first-row pivot is quadratic on some orders. When the work runs far past
    // n log n, distinct keys allow any sort: their order is unique.
    budget_ = int64_t{4} * count * (std::bit_width(static_cast<uint32_t>(count)) + 1);
    partitionSteps(0, count - 1);
  }

 private:
  // Descending reverses both scans of a pass, which is the ascending steps on the
  // reversed comparison.
  int32_t directed(const Key& a, const Key& b) const {
    return descending_ ? compare_(b, a) : compare_(a, b);
  }

  void exchange(int32_t i, int32_t j) {
    std::swap(keys_[static_cast<std::size_t>(i)], keys_[static_cast<std::size_t>(j)]);
    std::swap(rows_[static_cast<std::size_t>(i)], rows_[static_cast<std::size_t>(j)]);
  }

  const Key& key(int32_t i) const { return keys_[static_cast<std::size_t>(i)]; }

  bool inOrder() const {
    for (std::size_t k = 1; k < keys_.size(); ++k) {
      if (directed(keys_[k - 1], keys_[k]) > 0) return false;
    }
    return true;
  }

  bool strictlyReversed() const {
    for (std::size_t k = 1; k < keys_.size(); ++k) {
      if (directed(keys_[k - 1], keys_[k]) <= 0) return false;
    }
    return true;
  }

  // In a range already in order the pivot is always the smallest key, so each pass
  // stays inside the leading run of keys equal to it: the steps rearrange every run of
  // equal keys on its own, exactly as they would sort that run alone.
  void sortEqualRuns() {
    const auto count = static_cast<int32_t>(keys_.size());
    int32_t start = 0;
    for (int32_t k = 1; k <= count; ++k) {
      if (k < count && directed(key(start), key(k)) == 0) continue;
      if (k - 1 > start) rearrangeEqualRun(start, k);
      start = k;
    }
  }

  // The steps on a range of equal keys: each pass stops both scans at once on every
  // row, so it reverses the range; its parts are the two halves on either side of the
  // middle (which stays put when the length is odd). Only the rows move; the keys are
  // all the same.
  void rearrangeEqualRun(int32_t begin, int32_t end) {
    auto rows = rows_.begin();
    std::vector<std::pair<int32_t, int32_t>>& pending = pending_;
    pending.assign(1, {begin, end});
    while (!pending.empty()) {
      auto [b, e] = pending.back();
      pending.pop_back();
      if (e - b < 2) continue;
      std::reverse(rows + b, rows + e);
      const int32_t half = (e - b) / 2;
      pending.emplace_back(b, b + half);
      pending.emplace_back(e - half, e);
    }
  }

  // One pass: partitions lo..hi around a copy of the key at lo; the two parts are
  // lo..j and i..hi.
  std::pair<int32_t, int32_t> partitionPass(int32_t lo, int32_t hi) {
    const Key pivot = key(lo);
    int32_t i = lo;
    int32_t j = hi;
    for (;;) {
      while (directed(key(i), pivot) < 0) ++i;
      while (directed(key(j), pivot) > 0) --j;
      if (i > j) break;
      exchange(i, j);
      ++i;
      --j;
      if (j < i) break;
    }
    compares_ += hi - lo + 2;
    return {i, j};
  }

  // The first-row-pivot partition steps, with the smaller part handled first and the
  // larger one kept on an explicit stack: the parts are disjoint, so the order of work
  // changes nothing and the stack stays O(log n).
  void partitionSteps(int32_t lo, int32_t hi) {
    std::vector<std::pair<int32_t, int32_t>>& pending = pending_;
    pending.clear();
    for (;;) {
      while (hi > lo) {
        auto [i, j] = partitionPass(lo, hi);
        if (overBudget() && sortIfDistinct()) return;
        if (j - lo < hi - i) {
          pending.emplace_back(i, hi);
          hi = j;
        } else {
          pending.emplace_back(lo, j);
          lo = i;
        }
      }
      if (pending.empty()) return;
      std::tie(lo, hi) = pending.back();
      pending.pop_back();
    }
  }

  bool overBudget() const { return budget_ > 0 && compares_ > budget_; }

  // Sorts a copy; adopts it only when no two keys compare equal. Tried once.
  bool sortIfDistinct() {
    budget_ = 0;
    std::vector<std::pair<Key, int32_t>> pairs(keys_.size());
    for (std::size_t k = 0; k < keys_.size(); ++k) pairs[k] = {keys_[k], rows_[k]};
    std::sort(pairs.begin(), pairs.end(),
              [this](const auto& a, const auto& b) { return directed(a.first, b.first) < 0; });
    for (std::size_t k = 1; k < pairs.size(); ++k) {
      if (directed(pairs[k - 1].first, pairs[k].first) == 0) return false;
    }
    for (std::size_t k = 0; k < pairs.size(); ++k) {
      keys_[k] = pairs[k].first;
      rows_[k] = pairs[k].second;
    }
    return true;
  }

  std::vector<Key> keys_;
  std::vector<int32_t> rows_;
  std::vector<std::pair<int32_t, int32_t>> pending_;
  Compare compare_;
  bool descending_;
  int64_t compares_ = 0;
  int64_t budget_ = 0;
};

template <typename Key, typename Compare>
std::vector<int32_t> sortedOrder(std::vector<Key> keys, Compare compare, bool descending) {
  RowKeySort<Key, Compare> sort(std::move(keys), compare, descending);
  sort.run();
  return sort.order();
}

constexpr int kPrefetchDistance = 8;

void prefetchRow(const Element* row, std::size_t width) {
  const char* bytes = reinterpret_cast<const char*>(row);
  const std::size_t length = width * sizeof(Element);
  for (std::size_t offset = 0; offset < length; offset += 64) __builtin_prefetch(bytes + offset, 1);
  __builtin_prefetch(bytes + length - 1, 1);
}

// Moves whole rows so that table row first + k receives the row that was at
// first + order[k], following each cycle of the permutation with one spare row.
void moveRows(ElementArray& array, int32_t first, const std::vector<int32_t>& order) {
  const auto width = static_cast<std::size_t>(numberOfCols(array));
  Element* table = array.slots().data() + static_cast<std::size_t>(first) * width;
  auto row = [&](std::size_t r) { return table + r * width; };
  std::vector<Element> spare(width);
  std::vector<uint8_t> placed(order.size(), 0);
  for (std::size_t start = 0; start < order.size(); ++start) {
    if (placed[start] != 0 || order[start] == static_cast<int32_t>(start)) continue;
    std::move(row(start), row(start) + width, spare.begin());
    // The rows of a cycle lie anywhere in the table: fetch a few steps ahead so the
    // cache misses overlap instead of queueing one after another.
    // Short cycles (most of them when runs of ties are rearranged) stop fetching as
    // soon as the look-ahead comes round to the start.
    std::size_t ahead = start;
    bool fetching = true;
    auto fetchNext = [&] {
      if (!fetching) return;
      ahead = static_cast<std::size_t>(order[ahead]);
      fetching = ahead != start;
      if (fetching) prefetchRow(row(ahead), width);
    };
    for (int step = 0; step < kPrefetchDistance; ++step) fetchNext();
    std::size_t k = start;
    for (;;) {
      const auto from = static_cast<std::size_t>(order[k]);
      placed[k] = 1;
      if (from == start) break;
      fetchNext();
      std::move(row(from), row(from) + width, row(k));
      k = from;
    }
    std::move(spare.begin(), spare.end(), row(k));
  }
}

std::vector<int32_t> orderByValue(const ElementArray& array, int32_t column, bool descending,
                                  int32_t first, int32_t count) {
  std::vector<int32_t> keys(static_cast<std::size_t>(count));
  for (int32_t k = 0; k < count; ++k) {
    const Element& cell = array.at(cellIndex(array, first + k, column));
    keys[static_cast<std::size_t>(k)] = cellNumber(cell);
  }
  return sortedOrder(std::move(keys), NumberOrder{}, descending);
}

std::vector<int32_t> orderByText(const ElementArray& array, int32_t column, bool descending,
                                 int32_t first, int32_t count) {
  // Value cells need their decimal text somewhere that outlives the sort.
  int32_t valueCells = 0;
  for (int32_t k = 0; k < count; ++k) {
    valueCells += array.at(cellIndex(array, first + k, column)).type() == ElementType::Value;
  }
  std::vector<NumberText> numbers(static_cast<std::size_t>(valueCells));
  std::vector<const char*> keys(static_cast<std::size_t>(count));
  std::size_t nextNumber = 0;
  for (int32_t k = 0; k < count; ++k) {
    const Element& cell = array.at(cellIndex(array, first + k, column));
    const char* text = "";
    if (cell.type() == ElementType::String) text = cell.bytes();
    if (cell.type() == ElementType::Value) text = cell.asString(numbers[nextNumber++]);
    keys[static_cast<std::size_t>(k)] = text;
  }
  auto compare = [&array](const char* a, const char* b) { return compareText(array, a, b); };
  return sortedOrder(std::move(keys), compare, descending);
}

}  // namespace

int32_t compareCell(const ElementArray& array, int32_t row, int32_t column, const char* pivot,
                    int32_t kind) {
  const int32_t index = cellIndex(array, row, column);
  if (!array.inRange(index)) return -1;
  const Element& cell = array.at(index);
  if (kind == SortByValue) return compareNumbers(cell.asValue(), readDecimal(pivot));
  NumberText scratch;
  return compareText(array, cell.asString(scratch), pivot);
}

void sortRowRange(ElementArray& array, int32_t column, int32_t kind, bool descending, int32_t first,
                  int32_t last) {
  if (array.dimensions() != 2 || column < 0 || column >= numberOfCols(array)) return;
  first = std::max(first, 0);
  last = std::min(last, array.tableRowCount() - 1);
  if (last <= first) return;
  const int32_t count = last - first + 1;
  const std::vector<int32_t> order = kind == SortByValue
                                         ? orderByValue(array, column, descending, first, count)
                                         : orderByText(array, column, descending, first, count);
  moveRows(array, first, order);
}

void sortRows(ElementArray& array, int32_t column, int32_t kind, bool descending) {
  if (array.dimensions() != 2 || column < 0 || column >= numberOfCols(array)) return;
  sortRowRange(array, column, kind, descending, 0, numberOfRows(array) - 1);
}

}  // namespace quorrel
