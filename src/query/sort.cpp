#include "query/sort.h"

#include <algorithm>
#include <cstring>
#include <new>
#include <span>
#include <utility>
#include <vector>

#include "array/text.h"
#include "query/compare.h"
#include "query/text_ops.h"

namespace quorrel {

namespace {

int32_t threeWay(int32_t a, int32_t b) {
  return (a > b) - (a < b);
}

// The stored data of an element as its byte count and bytes; a Value's number is its
// four bytes in memory order.
struct StoredBytes {
  int32_t size = 0;
  const char* bytes = nullptr;
  char number[4] = {};

  explicit StoredBytes(const Element& e) : size(e.size()), bytes(e.bytes()) {
    if (e.type() == ElementType::Value) {
      int32_t value = e.number();
      std::memcpy(number, &value, sizeof number);
      bytes = number;
    }
  }
  StoredBytes(const StoredBytes&) = delete;
  StoredBytes& operator=(const StoredBytes&) = delete;
};

int32_t compareStored(const StoredBytes& a, const StoredBytes& b) {
  if (a.size != b.size) return a.size < b.size ? -1 : 1;
  if (a.size <= 0 || a.bytes == nullptr || b.bytes == nullptr) return 0;
  return textops::sign(std::memcmp(a.bytes, b.bytes, static_cast<std::size_t>(a.size)));
}

const char* textForm(const Element& e, NumberText& scratch) {
  if (e.type() == ElementType::String) return e.bytes();
  return e.asString(scratch);
}

// --- Sort keys ---------------------------------------------------------------------------
// Each policy holds the pivot's comparison key for one pass (the pivot is the element,
// not its slot: its key does not change when exchanges move it) and compares slots
// against it.

class ValueKeys {
 public:
  ValueKeys(std::span<Element> elements, std::vector<int32_t>& values)
      : elements_(elements), values_(values) {
    for (std::size_t i = 0; i < elements.size(); ++i) values_[i] = elements[i].asValue();
  }
  void takePivot(int32_t slot) { pivot_ = values_[static_cast<std::size_t>(slot)]; }
  int32_t compareToPivot(int32_t slot) const {
    return threeWay(values_[static_cast<std::size_t>(slot)], pivot_);
  }
  void swap(int32_t i, int32_t j) {
    std::swap(elements_[static_cast<std::size_t>(i)], elements_[static_cast<std::size_t>(j)]);
    std::swap(values_[static_cast<std::size_t>(i)], values_[static_cast<std::size_t>(j)]);
  }

 private:
  std::span<Element> elements_;
  std::vector<int32_t>& values_;
  int32_t pivot_ = 0;
};

// Reads each value on every comparison: used when there is no string to parse, or no
// memory for the table of values.
class DirectValueKeys {
 public:
  explicit DirectValueKeys(std::span<Element> elements) : elements_(elements) {}
  void takePivot(int32_t slot) { pivot_ = at(slot).asValue(); }
  int32_t compareToPivot(int32_t slot) const { return threeWay(at(slot).asValue(), pivot_); }
  void swap(int32_t i, int32_t j) { std::swap(at(i), at(j)); }

 private:
  Element& at(int32_t slot) const { return elements_[static_cast<std::size_t>(slot)]; }
  std::span<Element> elements_;
  int32_t pivot_ = 0;
};

template <bool kCaseSensitive>
class TextKeys {
 public:
  explicit TextKeys(std::span<Element> elements) : elements_(elements) {}
  // A String's bytes stay put when its element moves between slots, so the pointer
  // stays valid for the pass; a number's text is formatted once into pivotText_.
  void takePivot(int32_t slot) { pivot_ = textForm(at(slot), pivotText_); }
  int32_t compareToPivot(int32_t slot) {
    const char* text = textForm(at(slot), scratch_);
    return kCaseSensitive ? textops::compareExact(text, pivot_)
                          : textops::compareFolded(text, pivot_);
  }
  void swap(int32_t i, int32_t j) { std::swap(at(i), at(j)); }

 private:
  Element& at(int32_t slot) const { return elements_[static_cast<std::size_t>(slot)]; }
  std::span<Element> elements_;
  const char* pivot_ = "";
  NumberText pivotText_;
  NumberText scratch_;
};

class ByteKeys {
 public:
  explicit ByteKeys(std::span<Element> elements) : elements_(elements) {}
  void takePivot(int32_t slot) { pivot_ = &at(slot); }
  int32_t compareToPivot(int32_t slot) const {
    return compareStored(StoredBytes(at(slot)), StoredBytes(*pivot_));
  }
  // The pivot is tracked as an element, so it follows its content across a swap.
  void swap(int32_t i, int32_t j) {
    Element* a = &at(i);
    Element* b = &at(j);
    std::swap(*a, *b);
    if (pivot_ == a) {
      pivot_ = b;
    } else if (pivot_ == b) {
      pivot_ = a;
    }
  }

 private:
  Element& at(int32_t slot) const { return elements_[static_cast<std::size_t>(slot)]; }
  std::span<Element> elements_;
  const Element* pivot_ = nullptr;
};

// --- The partition sort --------------------------------------------------------------
// Middle pivot, two scans towards each other, then the two disjoint parts. Which part
// goes first does not change the result, so the smaller one is sorted by recursion
// and the larger one by the loop: the depth stays below log2 of the length.

template <bool kDescending>
bool belongsLeft(int32_t comparison) {
  return kDescending ? comparison > 0 : comparison < 0;
}

template <bool kDescending, class Keys>
void partitionSort(Keys& keys, int32_t lo, int32_t hi) {
  while (hi > lo) {
    keys.takePivot(lo + (hi - lo) / 2);
    int32_t i = lo;
    int32_t j = hi;
    for (;;) {
      while (belongsLeft<kDescending>(keys.compareToPivot(i))) ++i;
      while (belongsLeft<!kDescending>(keys.compareToPivot(j))) --j;
      if (i > j) break;
      keys.swap(i, j);
      ++i;
      --j;
      if (j < i) break;
    }
    if (j - lo < hi - i) {
      partitionSort<kDescending>(keys, lo, j);
      lo = i;
    } else {
      partitionSort<kDescending>(keys, i, hi);
      hi = j;
    }
  }
}

template <class Keys>
void runSort(Keys& keys, bool descending, int32_t lo, int32_t hi) {
  if (descending) {
    partitionSort<true>(keys, lo, hi);
  } else {
    partitionSort<false>(keys, lo, hi);
  }
}

bool holdsStrings(std::span<const Element> elements) {
  return std::any_of(elements.begin(), elements.end(),
                     [](const Element& e) { return e.type() == ElementType::String; });
}

void sortByValue(std::span<Element> range, bool descending) {
  const auto hi = static_cast<int32_t>(range.size()) - 1;
  // Strings are parsed once into a table of values when memory allows; otherwise every
  // comparison reads the value again (same order, only slower).
  if (holdsStrings(range)) {
    std::vector<int32_t> values;
    bool haveTable = true;
    try {
      values.resize(range.size());
    } catch (const std::bad_alloc&) {
      haveTable = false;
    }
    if (haveTable) {
      ValueKeys keys(range, values);
      runSort(keys, descending, 0, hi);
      return;
    }
  }
  DirectValueKeys keys(range);
  runSort(keys, descending, 0, hi);
}

}  // namespace

int32_t compareElements(const ElementArray& array, const Element* a, const Element* b,
                        SortKind kind) {
  if (a == nullptr) return b == nullptr ? 0 : -1;
  if (b == nullptr) return 1;
  if (a == b) return 0;
  if (kind == SortByText) {
    NumberText scratchA, scratchB;
    return compareText(array, textForm(*a, scratchA), textForm(*b, scratchB));
  }
  if (kind == SortByValue) return threeWay(a->asValue(), b->asValue());
  return compareStored(StoredBytes(*a), StoredBytes(*b));
}

void swapElements(ElementArray& array, int32_t i, int32_t j) {
  if (!array.inRange(i) || !array.inRange(j) || i == j) return;
  std::swap(array.at(i), array.at(j));
}

void sortElementRange(ElementArray& array, SortKind kind, int16_t descending, int32_t lo,
                      int32_t hi) {
  lo = std::max(lo, 0);
  hi = std::min(hi, array.size() - 1);
  if (hi <= lo) return;
  const auto range =
      array.slots().subspan(static_cast<std::size_t>(lo), static_cast<std::size_t>(hi - lo + 1));
  const bool down = descending != 0;
  const int32_t last = hi - lo;
  if (kind == SortByValue) {
    sortByValue(range, down);
  } else if (kind == SortByText && isCaseSensitive(array)) {
    TextKeys<true> keys(range);
    runSort(keys, down, 0, last);
  } else if (kind == SortByText) {
    TextKeys<false> keys(range);
    runSort(keys, down, 0, last);
  } else {
    ByteKeys keys(range);
    runSort(keys, down, 0, last);
  }
}

void sortElements(ElementArray& array, SortKind kind, int16_t descending) {
  sortElementRange(array, kind, descending, 0, array.size() - 1);
}

}  // namespace quorrel
