// The row of elements in use, in one contiguous block with free room at both ends, so
// that edits near either end move few elements and appends grow the block in place.
#pragma once

#include <cstddef>
#include <cstdint>
#include <new>
#include <span>

#include "array/element.h"

namespace quorrel {

// Elements are relocated with memmove/realloc: an element is one word that owns what
// it points to, and moving that word moves the ownership with it.
class ElementStore {
 public:
  ElementStore() = default;
  ~ElementStore() { release(); }
  ElementStore(ElementStore&& other) noexcept { take(other); }
  ElementStore& operator=(ElementStore&& other) noexcept {
    if (this != &other) {
      release();
      take(other);
    }
    return *this;
  }
  ElementStore(const ElementStore&) = delete;
  ElementStore& operator=(const ElementStore&) = delete;

  std::size_t size() const { return count_; }
  // Mutable access may store anything, so the store stops counting on plain words.
  Element* data() {
    onlyPlainWords_ = false;
    return buffer_ + head_;
  }
  const Element* data() const { return buffer_ + head_; }
  Element& operator[](std::size_t i) { return data()[i]; }
  const Element& operator[](std::size_t i) const { return data()[i]; }
  std::span<Element> span() { return {data(), count_}; }
  std::span<const Element> span() const { return {data(), count_}; }

  // Room for `total` elements without another allocation at the back. Throws
  // std::bad_alloc and changes nothing when the block cannot grow.
  void reserve(std::size_t total);
  // Appends an empty element and returns it.
  Element& pushBack() {
    if (head_ + count_ == room_) makeRoomAtBack(count_ + 1);
    onlyPlainWords_ = false;
    Element* slot = new (buffer_ + head_ + count_) Element();
    ++count_;
    return *slot;
  }
  // Appends a Value (None for 0) that owns nothing.
  void pushBackValue(int32_t number) {
    if (head_ + count_ == room_) makeRoomAtBack(count_ + 1);
    new (buffer_ + head_ + count_) Element();
    buffer_[head_ + count_].assignValue(number);
    ++count_;
  }
  void pushBack(Element&& element) {
    if (head_ + count_ == room_) makeRoomAtBack(count_ + 1);
    if (!element.ownsNothing()) onlyPlainWords_ = false;
    new (buffer_ + head_ + count_) Element(std::move(element));
    ++count_;
  }
  // Moves `count` elements to the back in one step, leaving the sources empty. Throws
  // std::bad_alloc and changes nothing when the block cannot grow.
  void appendMoved(Element* first, std::size_t count);
  // Appends empty elements up to `total`.
  void growTo(std::size_t total);
  // Opens an empty element at index (≤ size) and returns it.
  Element& insertAt(std::size_t index);
  void insertAt(std::size_t index, Element&& element) {
    const bool plain = onlyPlainWords_ && element.ownsNothing();
    insertAt(index) = std::move(element);
    onlyPlainWords_ = plain;
  }
  // Destroys the element at index and closes the gap.
  void eraseAt(std::size_t index);
  // Destroys the elements from index `count` on.
  void truncate(std::size_t count) noexcept;
  void clear() { release(); }

 private:
  void release() noexcept;
  void take(ElementStore& other) noexcept;
  Element* rawSlots() const { return buffer_ + head_; }
  void makeRoomAtBack(std::size_t total);
  void makeRoomAtFront();
  // Moves the elements so that `head` free slots precede them.
  void moveTo(std::size_t head) noexcept;
  void shrinkIfSparse() noexcept;

  Element* buffer_ = nullptr;
  std::size_t head_ = 0;   // free slots before the first element
  std::size_t count_ = 0;  // elements in use
  std::size_t room_ = 0;   // slots allocated
  // True while every element is known to own nothing (None or a keyless Value), so
  // that releasing the store need not visit them.
  bool onlyPlainWords_ = true;
};

}  // namespace quorrel
