#include "array/element_array.h"

#include <algorithm>
#include <iterator>

#include "array/int32.h"
#include "array/text.h"

namespace quorrel {

ElementArray::ElementArray() {
  refreshAppendRange();
}

// --- Capacity policy ---------------------------------------------------------------

// Grow to 150 % while the size passes half the capacity; shrink to 75 % while it is
// under a quarter (only once more than 25 elements were in use). The products are
// taken in 64 bits so that capacities past 14 million do not wrap.
int32_t ElementArray::rebalancedCapacity(int32_t capacity, int32_t sizeBefore,
                                         int64_t newSize) const {
  int64_t cap = capacity;
  for (;;) {
    if (newSize > cap * 50 / 100) {
      cap = cap * 150 / 100;
    } else if (newSize < cap * 25 / 100 && sizeBefore > 25) {
      cap = cap * 75 / 100;
    } else {
      break;
    }
  }
  return static_cast<int32_t>(std::min<int64_t>(cap, INT32_MAX));
}

// --- Reading ---------------------------------------------------------------------------

bool ElementArray::getBytes(ByteBlock& out, int32_t index) const {
  if (!inRange(index)) return false;
  const Element& e = at(index);
  out.bytes = e.bytes();
  out.length = e.size();
  return true;
}

const char* ElementArray::getKeyString(int32_t index) {
  if (!inRange(index) || !at(index).hasKey()) return nullptr;
  return at(index).key()->asString(scratch_);
}

int32_t ElementArray::getKeyValue(int32_t index) const {
  if (!inRange(index) || !at(index).hasKey()) return 0;
  return at(index).key()->asValue();
}

// --- Edits -------------------------------------------------------------------------------

void ElementArray::setAt(const ElementValue& value, int32_t index) {
  if (index < 0 || index == INT32_MAX) return;
  if (index < size()) {
    at(index).assign(value);
    capacity_ = rebalancedCapacity(capacity_, size(), size());
  } else {
    if (index >= kMaxSize) return;
    // Build the value before growing so that a failed allocation changes nothing.
    Element fresh;
    fresh.assign(value);
    int32_t newCapacity = rebalancedCapacity(capacity_, size(), int64_t{index} + 1);
    reserveRowStates(int64_t{index} + 1, dimensions_, boundaries_[1]);
    elements_.reserve(static_cast<std::size_t>(index) + 1);
    elements_.growTo(static_cast<std::size_t>(index));
    elements_.pushBack(std::move(fresh));
    capacity_ = newCapacity;
  }
  syncRowStates();
}

void ElementArray::insertAt(const ElementValue& value, int32_t index) {
  if (index < 0) return;
  if (index >= size()) {
    setAt(value, index);
    return;
  }
  if (size() >= kMaxSize) return;
  Element fresh;
  fresh.assign(value);
  int32_t newCapacity = rebalancedCapacity(capacity_, size(), size());
  reserveRowStates(int64_t{size()} + 1, dimensions_, boundaries_[1]);
  elements_.insertAt(static_cast<std::size_t>(index), std::move(fresh));
  capacity_ = newCapacity;
  syncRowStates();
}

void ElementArray::setKeyString(const char* text, int32_t index) {
  setKey(ElementValue::ofText(text), index);
}

void ElementArray::setKeyValue(int32_t value, int32_t index) {
  setKey(ElementValue::ofValue(value), index);
}

void ElementArray::setKeyFile(ByteBlock block, int32_t index) {
  setKey(fileOperand(block), index);
}

void ElementArray::setKey(const ElementValue& key, int32_t index) {
  if (!inRange(index)) return;
  at(index).setKey(key);
}

void ElementArray::deleteAt(int32_t index) {
  if (!inRange(index)) return;
  capacity_ = rebalancedCapacity(capacity_, size(), size());
  elements_.eraseAt(static_cast<std::size_t>(index));
  syncRowStates();
}

void ElementArray::clear() {
  elements_.clear();
  blocks_.clear();
  capacity_ = kInitialCapacity;
  syncRowStates();
}

// --- Settings ------------------------------------------------------------------------

// Out of line: inlined into callers that pass a literal, the assignment trips a false
// -Wrestrict warning of GCC 12 at -O3.
void ElementArray::setListDelimiter(const char* text) {
  delimiterText_ = text == nullptr ? "" : text;
}

// --- Dimensions ----------------------------------------------------------------------

void ElementArray::setDimensions(int32_t n) {
  if (n >= kBoundaryCount) return;
  reserveRowStates(size(), n, boundaries_[1]);
  dimensions_ = n;
  syncRowStates();
}

int32_t ElementArray::boundary(int32_t d) const {
  if (d < 0 || d >= dimensions_) return 0;
  return boundaries_[d];
}

void ElementArray::setBoundary(int32_t d, int32_t n) {
  if (n < 1 || d < 0 || d >= dimensions_) return;
  reserveRowStates(size(), dimensions_, d == 1 ? n : boundaries_[1]);
  boundaries_[d] = n;
  syncRowStates();
}

int32_t ElementArray::stride(int32_t d) const {
  int32_t product = 1;
  for (int32_t i = 1; i <= std::min(d, kBoundaryCount - 1); ++i) {
    product = mulWrap(product, boundaries_[i]);
  }
  return product;
}

// Resizing keeps every element of every complete old block at its coordinates: each
// complete block of dimension d gains or loses `count` empty positions at its end. The
// result is built in one pass, in a store and row states sized before the first element
// moves, so a failed allocation changes nothing and no ArrayEdit is needed; the
// capacity is replayed insert by insert (or delete by delete) because the growth policy
// makes it depend on the whole sequence.
void ElementArray::resizeBoundary(int32_t d, int32_t n) {
  if (n < 1 || d < 0 || d >= dimensions_) return;
  const int32_t old = boundaries_[d];
  const int32_t block = stride(d);
  const int32_t unit = stride(d - 1);
  const int32_t sizeBefore = size();
  const bool growing = n > old;
  // Counts are 32-bit like every other product here; one that wraps to 0 or below
  // inserts or deletes nothing. Removing more than a block (only entry 0, whose block
  // is one element, can ask for it) would delete at negative indexes: nothing moves.
  const int32_t count = mulWrap(unit, growing ? subWrap(n, old) : subWrap(old, n));
  if (n == old || block <= 0 || block >= sizeBefore || count <= 0 || (!growing && count > block)) {
    reserveRowStates(sizeBefore, dimensions_, d == 1 ? n : boundaries_[1]);
    boundaries_[d] = n;
    syncRowStates();
    return;
  }
  const int32_t blocks = sizeBefore / block;
  const int64_t change = int64_t{blocks} * count;
  const int64_t finalSize = growing ? sizeBefore + change : sizeBefore - change;
  if (finalSize > kMaxSize) return;

  ElementStore result;
  result.reserve(static_cast<std::size_t>(finalSize));
  reserveRowStates(finalSize, dimensions_, d == 1 ? n : boundaries_[1]);
  int64_t cap = capacity_;
  int64_t current = sizeBefore;
  const int64_t kept = growing ? block : block - count;
  for (int32_t k = 0; k < blocks; ++k) {
    const auto first = static_cast<std::size_t>(int64_t{k} * block);
    for (std::size_t i = 0; i < static_cast<std::size_t>(kept); ++i) {
      result.pushBack(std::move(elements_[first + i]));
    }
    if (growing) {
      result.growTo(result.size() + static_cast<std::size_t>(count));
      // Insert positions: the end of the (k+1)-th old block after the earlier inserts.
      const int64_t position = int64_t{k + 1} * block + int64_t{k} * count;
      for (int64_t i = 0; i < count; ++i) {
        const int64_t newSize = position >= current ? position + 1 : current;
        cap = rebalancedCapacity(static_cast<int32_t>(cap), static_cast<int32_t>(current), newSize);
        current = std::max(current + 1, position + 1);
      }
    } else {
      for (int64_t i = 0; i < block - kept; ++i) {
        cap = rebalancedCapacity(static_cast<int32_t>(cap), static_cast<int32_t>(current), current);
        --current;
      }
    }
  }
  for (auto i = static_cast<std::size_t>(int64_t{blocks} * block); i < elements_.size(); ++i) {
    result.pushBack(std::move(elements_[i]));
  }
  // Rows stay selected where the table never lost them during the edits; positions the
  // edits dropped come back with the starting state.
  const int32_t lowestRows =
      tableRowCount() == 0
          ? 0
          : static_cast<int32_t>(std::min<int64_t>(sizeBefore, finalSize) / boundaries_[1]);
  elements_ = std::move(result);
  capacity_ = static_cast<int32_t>(cap);
  boundaries_[d] = n;
  resizeRowStates(lowestRows);
  refreshAppendRange();
}

int32_t ElementArray::capacityAfterAppends(int64_t count) const {
  int32_t cap = capacity_;
  int64_t current = size();
  const int64_t target = current + count;
  while (current < target) {
    // Appends that can neither grow nor shrink the capacity are skipped in one go: up to
    // half the capacity nothing grows, and no shrink starts while 25 or fewer are in use.
    const bool shrinks = current > 25 && current + 1 < int64_t{cap} * 25 / 100;
    const int64_t half = int64_t{cap} * 50 / 100;
    if (!shrinks && current + 1 <= half) {
      current = std::min(target, current <= 25 ? std::min<int64_t>(half, 26) : half);
      continue;
    }
    cap = rebalancedCapacity(cap, static_cast<int32_t>(current), current + 1);
    ++current;
  }
  return cap;
}

void ElementArray::appendNone(int64_t count) {
  // Appends past kMaxSize are refused one by one, so only the room below it is used.
  const int64_t n = std::min<int64_t>(count, int64_t{kMaxSize} - size());
  if (n <= 0) return;
  const int32_t cap = capacityAfterAppends(n);
  reserveRowStates(size() + n, dimensions_, boundaries_[1]);
  elements_.growTo(static_cast<std::size_t>(size() + n));
  capacity_ = cap;
  syncRowStates();
}

void ElementArray::reserveAppends(int64_t count) {
  const int64_t n = std::min<int64_t>(count, int64_t{kMaxSize} - size());
  if (n > 0) elements_.reserve(static_cast<std::size_t>(size() + n));
}

void ElementArray::appendElements(std::span<Element> run) {
  const int64_t n = std::min<int64_t>(static_cast<int64_t>(run.size()), int64_t{kMaxSize} - size());
  if (n <= 0) return;
  const int32_t cap = capacityAfterAppends(n);
  reserveRowStates(size() + n, dimensions_, boundaries_[1]);
  elements_.appendMoved(run.data(), static_cast<std::size_t>(n));
  capacity_ = cap;
  syncRowStates();
}

int32_t ElementArray::dimIndexOfIndex(int32_t d, int32_t index) const {
  if (d < 1 || d > dimensions_) return 0;
  if (d == dimensions_) return divTrunc(index, stride(dimensions_ - 1));
  return modTrunc(divTrunc(index, stride(d - 1)), boundaries_[d]);
}

int32_t ElementArray::indexOfDimIndex(const char* list) const {
  if (list == nullptr) return 0;
  TokenSplitter tokens(list, delimiterText_);
  int32_t sum = 0;
  for (int32_t k = 0; k < kBoundaryCount; ++k) {
    auto token = tokens.next();
    if (!token) break;
    sum = addWrap(sum, mulWrap(readDecimal(*token), stride(k)));
  }
  return sum;
}

int32_t ElementArray::indexOfXY(int32_t x, int32_t y) const {
  return addWrap(x, mulWrap(y, boundaries_[1]));
}

// --- Row states ----------------------------------------------------------------------

int32_t ElementArray::tableRowCount() const {
  if (dimensions_ != 2 || boundaries_[1] <= 0) return 0;
  return size() / boundaries_[1];
}

void ElementArray::syncRowStates() {
  const auto target = static_cast<std::size_t>(tableRowCount());
  rowStates.resize(target, settings.autoSelectNewRows ? RowSelected : RowUnselected);
  refreshAppendRange();
}

// An append grows the size to size + 1: it leaves the capacity alone while that is at
// most half the capacity and at least a quarter, and it touches no row state outside
// two dimensions.
void ElementArray::refreshAppendRange() {
  if (dimensions_ == 2 || !rowStates.empty()) {
    plainAppendFloor_ = plainAppendLimit_ = 0;
    return;
  }
  plainAppendFloor_ = std::max(0, capacity_ / 4 - 1);
  plainAppendLimit_ = std::min(capacity_ / 2, kMaxSize - 1);
}

void ElementArray::reserveRowStates(int64_t size, int32_t dimensions, int32_t columns) {
  if (dimensions != 2 || columns <= 0) return;
  const auto rows = static_cast<std::size_t>(size / columns);
  // Geometric, as resize would grow it: a reserve of the exact count on every append
  // would copy the states every time.
  if (rows > rowStates.capacity()) rowStates.reserve(std::max(rows, rowStates.capacity() * 2));
}

void ElementArray::resizeRowStates(int32_t keep) {
  if (static_cast<std::size_t>(keep) < rowStates.size()) {
    rowStates.resize(static_cast<std::size_t>(keep));
  }
  syncRowStates();
}

}  // namespace quorrel
