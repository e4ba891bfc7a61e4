#include "query/sort.h"

#include <algorithm>
#include <cstring>
#include <functional>
#include <new>
#include <span>
#include <utility>
#include <vector>

#include "array/text.h"
#include "query/compare.h"
#include "query/sort_detail.h"
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

// Sorting a compact table of {key, original slot} instead of the elements themselves
// runs the very same comparisons and exchanges, and so yields the same permutation,
// which is then applied to the slots once. Each key is read once per sort.
template <class Key>
struct Proxy {
  Key key;
  uint32_t slot;
};

template <class Key, class Compare>
class ProxyKeys {
 public:
  ProxyKeys(std::vector<Proxy<Key>>& proxies, Compare compare)
      : proxies_(proxies), compare_(compare) {}
  void takePivot(int32_t slot) { pivot_ = at(slot).key; }
  int32_t compareToPivot(int32_t slot) { return compare_(at(slot).key, pivot_); }
  void swap(int32_t i, int32_t j) { std::swap(at(i), at(j)); }

 private:
  Proxy<Key>& at(int32_t slot) { return proxies_[static_cast<std::size_t>(slot)]; }
  std::vector<Proxy<Key>>& proxies_;
  Compare compare_;
  Key pivot_{};
};

// Moves the elements so that slot k receives the element that was in slot
// proxies[k].slot, following each cycle of the permutation once.
template <class Key>
void applyPermutation(std::span<Element> elements, std::vector<Proxy<Key>>& proxies) {
  const auto count = static_cast<uint32_t>(elements.size());
  for (uint32_t start = 0; start < count; ++start) {
    if (proxies[start].slot == start) continue;
    Element held = std::move(elements[start]);
    uint32_t current = start;
    for (;;) {
      uint32_t source = proxies[current].slot;
      proxies[current].slot = current;  // done
      if (source == start) {
        elements[current] = std::move(held);
        break;
      }
      elements[current] = std::move(elements[source]);
      current = source;
    }
  }
}

// Reads each value on every comparison, exchanging the elements in place: the way to
// sort when there is no memory for a table of keys (same order, only slower).
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

template <class Keys>
void runAll(Keys& keys, std::size_t count, bool descending) {
  runSort(keys, descending, 0, static_cast<int32_t>(count) - 1);
}

bool sortValuesByTable(std::span<Element> range, bool descending) {
  std::vector<Proxy<int32_t>> proxies;
  try {
    proxies.resize(range.size());
  } catch (const std::bad_alloc&) {
    return false;
  }
  for (std::size_t i = 0; i < range.size(); ++i)
    proxies[i] = {range[i].asValue(), static_cast<uint32_t>(i)};
  ProxyKeys keys(proxies, [](int32_t a, int32_t b) { return threeWay(a, b); });
  runAll(keys, range.size(), descending);
  applyPermutation(range, proxies);
  return true;
}

// The texts of Strings are their own bytes, which do not move; numbers are written
// once into a table of their own.
template <bool kCaseSensitive>
bool sortTextsByTable(std::span<Element> range, bool descending) {
  std::vector<Proxy<const char*>> proxies;
  std::vector<NumberText> numbers;
  try {
    proxies.resize(range.size());
    const auto valueCount = std::count_if(range.begin(), range.end(), [](const Element& e) {
      return e.type() == ElementType::Value;
    });
    numbers.resize(static_cast<std::size_t>(valueCount));
  } catch (const std::bad_alloc&) {
    return false;
  }
  std::size_t nextNumber = 0;
  for (std::size_t i = 0; i < range.size(); ++i) {
    const Element& e = range[i];
    const char* text = "";
    if (e.type() == ElementType::String) {
      text = e.bytes();
    } else if (e.type() == ElementType::Value) {
      text = numbers[nextNumber++].text;
      writeDecimal(e.number(), numbers[nextNumber - 1].text);
    }
    proxies[i] = {text, static_cast<uint32_t>(i)};
  }
  auto compare = [](const char* a, const char* b) {
    return kCaseSensitive ? textops::compareExact(a, b) : textops::compareFolded(a, b);
  };
  ProxyKeys keys(proxies, compare);
  runAll(keys, range.size(), descending);
  applyPermutation(range, proxies);
  return true;
}

// Keyless numbers (None being 0) that compare equal are equal in every respect, so
// every correct sort leaves the same sequence; the numbers are sorted on their own
// and written back, with no element moved.
bool sortPlainNumbers(std::span<Element> range, bool descending) {
  const bool plain = std::all_of(range.begin(), range.end(), [](const Element& e) {
    return !e.hasKey() && (e.type() == ElementType::Value || e.type() == ElementType::None);
  });
  if (!plain) return false;
  std::vector<int32_t> values;
  try {
    values.resize(range.size());
  } catch (const std::bad_alloc&) {
    return false;
  }
  for (std::size_t i = 0; i < range.size(); ++i) values[i] = range[i].number();
  if (descending) {
    std::sort(values.begin(), values.end(), std::greater<>());
  } else {
    std::sort(values.begin(), values.end());
  }
  for (std::size_t i = 0; i < range.size(); ++i) range[i].assign(ElementValue::ofValue(values[i]));
  return true;
}

void sortByValue(std::span<Element> range, bool descending, bool allowTables) {
  if (allowTables && sortPlainNumbers(range, descending)) return;
  if (allowTables && sortValuesByTable(range, descending)) return;
  DirectValueKeys keys(range);
  runAll(keys, range.size(), descending);
}

template <bool kCaseSensitive>
void sortByText(std::span<Element> range, bool descending, bool allowTables) {
  if (allowTables && sortTextsByTable<kCaseSensitive>(range, descending)) return;
  TextKeys<kCaseSensitive> keys(range);
  runAll(keys, range.size(), descending);
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
  sortdetail::sortRange(array, kind, descending, lo, hi, true);
}

void sortElements(ElementArray& array, SortKind kind, int16_t descending) {
  sortElementRange(array, kind, descending, 0, array.size() - 1);
}

namespace sortdetail {

void sortRange(ElementArray& array, SortKind kind, int16_t descending, int32_t lo, int32_t hi,
               bool allowTables) {
  lo = std::max(lo, 0);
  hi = std::min(hi, array.size() - 1);
  if (hi <= lo) return;
  const auto range =
      array.slots().subspan(static_cast<std::size_t>(lo), static_cast<std::size_t>(hi - lo + 1));
  const bool down = descending != 0;
  if (kind == SortByValue) {
    sortByValue(range, down, allowTables);
  } else if (kind == SortByText && isCaseSensitive(array)) {
    sortByText<true>(range, down, allowTables);
  } else if (kind == SortByText) {
    sortByText<false>(range, down, allowTables);
  } else {
    ByteKeys keys(range);
    runAll(keys, range.size(), down);
  }
}

}  // namespace sortdetail

}  // namespace quorrel
