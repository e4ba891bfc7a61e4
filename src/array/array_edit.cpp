#include "array/array_edit.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace quorrel {

ArrayEdit::ArrayEdit(ElementArray& array, Kind kind, int32_t index)
    : array_(array),
      kind_(kind),
      index_(index),
      size_(array.size()),
      capacity_(array.capacity_),
      rows_(array.rowStates.size()) {
  if (kind == Replacing) {
    ElementArray& copy = staged_.emplace();
    copy.settings = array.settings;
    copy.labels = array.labels;
    copy.dimensions_ = array.dimensions_;
    std::copy(std::begin(array.boundaries_), std::end(array.boundaries_), copy.boundaries_);
    copy.delimiterText_ = array.delimiterText_;
    copy.syncRowStates();
  } else if (kind == Growing) {
    dimensions_ = array.dimensions_;
    std::copy(std::begin(array.boundaries_), std::end(array.boundaries_), boundaries_);
    labels_ = array.labels;
    rowStates_ = array.rowStates;
  }
}

ArrayEdit::~ArrayEdit() {
  if (!committed_) undo();
}

void ArrayEdit::swapIn(int32_t first, std::vector<Element>& cells) noexcept {
  for (std::size_t i = 0; i < cells.size(); ++i) {
    std::swap(array_.at(first + static_cast<int32_t>(i)), cells[i]);
  }
  swappedFirst_ = first;
  swapped_ = &cells;
  if (cells.empty()) return;
  array_.capacity_ = array_.rebalancedCapacity(array_.capacity_, array_.size(), array_.size());
  array_.refreshAppendRange();
}

void ArrayEdit::commit() noexcept {
  committed_ = true;
  if (staged_) array_ = std::move(*staged_);
}

void ArrayEdit::undo() noexcept {
  switch (kind_) {
    case Replacing:
      return;  // the array itself was never touched
    case Growing:
      array_.elements_.truncate(static_cast<std::size_t>(size_));
      array_.capacity_ = capacity_;
      array_.dimensions_ = dimensions_;
      std::copy(std::begin(boundaries_), std::end(boundaries_), array_.boundaries_);
      array_.labels.swap(labels_);
      array_.rowStates.swap(rowStates_);
      array_.refreshAppendRange();
      return;
    case InsertingAt:
      undoInserts();
      if (swapped_) {
        for (std::size_t i = 0; i < swapped_->size(); ++i) {
          std::swap(array_.at(swappedFirst_ + static_cast<int32_t>(i)), (*swapped_)[i]);
        }
      }
      return;
  }
}

// Removes what the inserts at index_ added (at or past the recorded size: everything
// past it, the empty elements of a growth included).
void ArrayEdit::undoInserts() noexcept {
  if (index_ >= size_) {
    array_.elements_.truncate(static_cast<std::size_t>(size_));
  } else {
    for (int32_t i = array_.size() - size_ - 1; i >= 0; --i) {
      array_.elements_.eraseAt(static_cast<std::size_t>(index_ + i));
    }
  }
  array_.capacity_ = capacity_;
  if (array_.rowStates.size() > rows_) array_.rowStates.resize(rows_);
  array_.refreshAppendRange();
}

}  // namespace quorrel
