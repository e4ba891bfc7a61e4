// Makes an edit of an array all or nothing. The only failure the core knows is memory
// running out part-way, and the array must then be left as it was. An edit that can
// take all its memory before its first change needs no guard (resizeBoundary, the
// sorts); one that grows as it goes (loads, appends, row inserts) runs under an
// ArrayEdit. The guard records what the edit can change,
// the edit works on target(), and commit() keeps the result; a guard that goes without
// commit() puts the array back. It records only what its kind of edit needs:
//  - Replacing: the edit fills an empty copy of the array (same settings, dimensions,
//    labels and delimiter), which commit() moves in.
//  - Growing: appends, which may also change the dimensions, labels and row states.
//  - InsertingAt(index): inserts at one index, or growth past the end with the array's
//    size as the index; no setting changes. Cells replaced in place are handed over
//    with swapIn and swapped back on undo.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "array/element_array.h"

namespace quorrel {

class ArrayEdit {
 public:
  enum Kind { Replacing, Growing, InsertingAt };

  ArrayEdit(ElementArray& array, Kind kind, int32_t index = 0);
  ~ArrayEdit();
  ArrayEdit(const ArrayEdit&) = delete;
  ArrayEdit& operator=(const ArrayEdit&) = delete;

  ElementArray& target() { return staged_ ? *staged_ : array_; }
  // Exchanges the cells from `first` on (all in range) with `cells`, without
  // allocating, and gives the capacity that an edit keeping the size leaves. `cells`
  // must outlive the guard: undo swaps them back.
  void swapIn(int32_t first, std::vector<Element>& cells) noexcept;
  void commit() noexcept;

 private:
  void undo() noexcept;
  void undoInserts() noexcept;

  ElementArray& array_;
  const Kind kind_;
  const int32_t index_;
  bool committed_ = false;
  std::optional<ElementArray> staged_;  // Replacing
  // What the array held when the guard was made.
  int32_t size_;
  int32_t capacity_;
  std::size_t rows_;
  int32_t dimensions_ = 0;                                 // Growing
  int32_t boundaries_[ElementArray::kBoundaryCount] = {};  // Growing
  std::optional<LabelList> labels_;                        // Growing
  std::vector<uint8_t> rowStates_;                         // Growing
  int32_t swappedFirst_ = 0;
  std::vector<Element>* swapped_ = nullptr;
};

}  // namespace quorrel
