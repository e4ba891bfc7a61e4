// The per-instance container: a growable row of elements that reads as a 1-, 2- or
// 3-dimensional array and doubles as a small table (the recordset fields live here
// too, their operations in recordset/).
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "array/element.h"
#include "array/element_store.h"
#include "array/settings.h"

namespace quorrel {

// File contents entering or leaving the array; owns nothing.
struct ByteBlock {
  const char* bytes = nullptr;
  int32_t length = 0;
};

// A column's label text per column; an absent entry is a column without a label.
using LabelList = std::vector<std::optional<std::string>>;

enum RowState : uint8_t { RowUnset = 0, RowSelected = 1, RowUnselected = 2 };

class ElementArray {
 public:
  static constexpr int32_t kInitialCapacity = 25;
  static constexpr int32_t kBoundaryCount = 10;
  // Growth past this many elements is refused (the array stays as it was): it keeps a
  // single bad index from asking for gigabytes.
  static constexpr int32_t kMaxSize = 1 << 26;

  ElementArray();

  // --- Store -------------------------------------------------------------------------
  int32_t size() const { return static_cast<int32_t>(elements_.size()); }
  // The slot count of the growth policy (25, 37, 55, 82, ...). Only the elements in
  // use are materialised; spare slots are a number.
  int32_t capacity() const { return capacity_; }
  // One unsigned comparison: a negative index wraps past every size.
  bool inRange(int32_t index) const {
    return static_cast<uint32_t>(index) < static_cast<uint32_t>(elements_.size());
  }

  // Unchecked access to the elements in use, for the query, recordset and file code.
  std::span<Element> slots() { return elements_.span(); }
  std::span<const Element> slots() const { return elements_.span(); }
  Element& at(int32_t index) { return elements_[static_cast<std::size_t>(index)]; }
  const Element& at(int32_t index) const { return elements_[static_cast<std::size_t>(index)]; }

  // The element's text, valid until the next text read from this array; null outside.
  const char* getString(int32_t index) {
    return inRange(index) ? std::as_const(*this).at(index).asString(scratch_) : nullptr;
  }
  int32_t getValue(int32_t index) const { return inRange(index) ? at(index).asValue() : 0; }
  // Raw view of an element: a String's bytes with terminator, a File's bytes; for a
  // Value `bytes` is null and `length` 4 (use getValue). False outside.
  bool getBytes(ByteBlock& out, int32_t index) const;
  const char* getKeyString(int32_t index);
  int32_t getKeyValue(int32_t index) const;

  void setString(const char* text, int32_t index) { setAt(ElementValue::ofText(text), index); }
  void setValue(int32_t value, int32_t index) { setAt(ElementValue::ofValue(value), index); }
  void setFile(ByteBlock block, int32_t index) { setAt(fileOperand(block), index); }
  void setElement(const ElementValue& value, int32_t index) { setAt(value, index); }

  void insertString(const char* text, int32_t index) {
    insertAt(ElementValue::ofText(text), index);
  }
  void insertValue(int32_t value, int32_t index) { insertAt(ElementValue::ofValue(value), index); }
  void insertFile(ByteBlock block, int32_t index) { insertAt(fileOperand(block), index); }
  void insertElement(const ElementValue& value, int32_t index) { insertAt(value, index); }

  void appendString(const char* text) {
    if (appendOnlyStores()) {
      elements_.pushBack(Element::of(ElementValue::ofText(text)));
    } else {
      insertString(text, size());
    }
  }
  void appendValue(int32_t value) {
    if (appendOnlyStores()) {
      elements_.pushBackValue(value);
    } else {
      insertValue(value, size());
    }
  }
  void appendFile(ByteBlock block) { insertFile(block, size()); }
  // The same as `count` appends of a null text, in one step: a file of byteless cells
  // can declare millions of them.
  void appendNone(int64_t count);
  // The same as appending each element in turn (the sources are left empty), in one
  // step: the loaders hand over their elements in runs.
  void appendElements(std::span<Element> run);
  // Room for `count` more elements in one allocation, for a loader that knows how many
  // it will append; what the array holds and reports does not change.
  void reserveAppends(int64_t count);

  void setKeyString(const char* text, int32_t index);
  void setKeyValue(int32_t value, int32_t index);
  void setKeyFile(ByteBlock block, int32_t index);
  void setKey(const ElementValue& key, int32_t index);

  void deleteAt(int32_t index);
  void clear();

  // Keeps a block of texts alive for elements made with Element::borrowed: until the
  // array is cleared (or destroyed), since any element may still read from it.
  void keepBlock(std::shared_ptr<const void> block) { blocks_.push_back(std::move(block)); }

  // --- Settings ----------------------------------------------------------------------
  void setListDelimiter(const char* text);
  const char* listDelimiter() const { return delimiterText_.c_str(); }

  // --- Dimensions --------------------------------------------------------------------
  int32_t dimensions() const { return dimensions_; }
  void setDimensions(int32_t n);
  int32_t boundary(int32_t d) const;
  // The stored entry, whether or not d is a bounded dimension today (file savers
  // write all ten).
  int32_t boundaryEntry(int32_t d) const { return boundaries_[d]; }
  void setBoundary(int32_t d, int32_t n);
  void resizeBoundary(int32_t d, int32_t n);
  int32_t stride(int32_t d) const;
  int32_t dimIndexOfIndex(int32_t d, int32_t index) const;
  int32_t indexOfDimIndex(const char* list) const;
  int32_t indexOfXY(int32_t x, int32_t y) const;

  // --- Row states --------------------------------------------------------------------
  int32_t tableRowCount() const;
  void syncRowStates();

  ArraySettings settings;
  // Column labels, set through recordset/: absent until the first setLabel, then one
  // entry per column as counted at the last setLabel; an entry is absent for a column
  // whose label was never set (an empty text is a label).
  std::optional<LabelList> labels;
  std::vector<uint8_t> rowStates;  // one RowState per table row, always tableRowCount()

 private:
  friend class ArrayEdit;  // records and restores what an edit may change

  static ElementValue fileOperand(ByteBlock block) {
    return ElementValue::ofBytes(block.bytes, block.length);
  }
  void setAt(const ElementValue& value, int32_t index);
  void insertAt(const ElementValue& value, int32_t index);
  // The capacity that the growth policy reaches for newSize from the current state.
  int32_t rebalancedCapacity(int32_t capacity, int32_t sizeBefore, int64_t newSize) const;
  // The capacity that `count` single appends reach from the current state.
  int32_t capacityAfterAppends(int64_t count) const;
  void resizeRowStates(int32_t keep);
  // Room for the row states of `size` elements under the given dimension count and X
  // boundary, taken before a change so that syncRowStates cannot fail after it.
  void reserveRowStates(int64_t size, int32_t dimensions, int32_t columns);

  // Sizes from which an append neither changes the capacity nor adds a table row, so
  // that it only stores: kept up to date by every operation that changes the capacity
  // or the dimension count.
  void refreshAppendRange();
  bool appendOnlyStores() const {
    return size() >= plainAppendFloor_ && size() < plainAppendLimit_;
  }
  int32_t plainAppendFloor_ = 0;
  int32_t plainAppendLimit_ = 0;

  ElementStore elements_;
  std::vector<std::shared_ptr<const void>> blocks_;
  int32_t capacity_ = kInitialCapacity;
  int32_t dimensions_ = 1;
  int32_t boundaries_[kBoundaryCount] = {-1, 0, 0, 0, 0, 0, 0, 0, 0, 0};
  std::string delimiterText_ = ",";
  NumberText scratch_;
};

}  // namespace quorrel
