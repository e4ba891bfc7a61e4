#include "array/element_store.h"

#include "platform/allocation.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <new>
#include <type_traits>

namespace quorrel {

namespace {

constexpr std::size_t kMinimumRoom = 16;

void moveElements(Element* to, const Element* from, std::size_t count) {
  std::memmove(static_cast<void*>(to), static_cast<const void*>(from), count * sizeof(Element));
}

// moveElements and realloc relocate elements as raw bytes, skipping their move
// constructors and destructors. That is sound only while an element is one plain word
// that nothing points back to: standard layout, the size of its word, and no virtual
// table. A member that breaks this must fail here, not corrupt arrays.
static_assert(sizeof(Element) == sizeof(uint64_t), "an element is one word");
static_assert(std::is_standard_layout_v<Element> && !std::is_polymorphic_v<Element> &&
                  std::is_nothrow_move_constructible_v<Element>,
              "elements are relocated with memmove/realloc");

// Destroys the elements, passing over eight at a time where none of them owns
// anything: loaded files leave millions of empty, in-place and borrowed elements.
void destroyElements(Element* slots, std::size_t count) noexcept {
  std::size_t i = 0;
  for (; i + 8 <= count; i += 8) {
    bool owning = false;
    for (std::size_t k = i; k < i + 8; ++k) owning |= !slots[k].ownsNothing();
    if (!owning) continue;
    for (std::size_t k = i; k < i + 8; ++k) slots[k].~Element();
  }
  for (; i < count; ++i) slots[i].~Element();
}

}  // namespace

void ElementStore::release() noexcept {
  if (!onlyPlainWords_) destroyElements(rawSlots(), count_);
  std::free(buffer_);
  buffer_ = nullptr;
  head_ = count_ = room_ = 0;
  onlyPlainWords_ = true;
}

void ElementStore::take(ElementStore& other) noexcept {
  buffer_ = other.buffer_;
  head_ = other.head_;
  count_ = other.count_;
  room_ = other.room_;
  onlyPlainWords_ = other.onlyPlainWords_;
  other.buffer_ = nullptr;
  other.head_ = other.count_ = other.room_ = 0;
  other.onlyPlainWords_ = true;
}

void ElementStore::moveTo(std::size_t head) noexcept {
  if (head != head_) moveElements(buffer_ + head, buffer_ + head_, count_);
  head_ = head;
}

void ElementStore::reserve(std::size_t total) {
  if (head_ + total <= room_) return;
  makeRoomAtBack(total);
}

// Room runs out at the back: reuse a large free front by sliding the elements down,
// otherwise grow the block by half (realloc keeps the front gap and often avoids the
// copy for large blocks).
void ElementStore::makeRoomAtBack(std::size_t total) {
  if (total <= room_ && head_ >= count_ / 4 + 1) {
    moveTo(head_ / 2 < room_ - total ? head_ / 2 : room_ - total);
    return;
  }
  const std::size_t grown = head_ + std::max({total, count_ + count_ / 2, kMinimumRoom});
  void* block = reallocateBytes(static_cast<void*>(buffer_), grown * sizeof(Element));
  if (block == nullptr) throw std::bad_alloc();
  buffer_ = static_cast<Element*>(block);
  room_ = grown;
}

// No free slot before the first element: centre the elements in the free room,
// growing the block first when the room is short.
void ElementStore::makeRoomAtFront() {
  if (room_ - count_ < count_ / 4 + 2) {
    const std::size_t grown = std::max(count_ + count_ / 2 + 2, kMinimumRoom);
    void* block = reallocateBytes(static_cast<void*>(buffer_), grown * sizeof(Element));
    if (block == nullptr) throw std::bad_alloc();
    buffer_ = static_cast<Element*>(block);
    room_ = grown;
  }
  moveTo((room_ - count_ + 1) / 2);
}

// An empty element is the zero word, so a run of them is cleared memory: files of
// byteless cells can ask for millions. A run that outgrows the block by far gets a
// fresh zeroed block, whose pages the system hands out already cleared.
void ElementStore::growTo(std::size_t total) {
  if (total <= count_) return;
  if (head_ + total > room_ && total / 2 > room_) {
    void* block = allocateZeroed(total, sizeof(Element));
    if (block == nullptr) throw std::bad_alloc();
    if (count_ > 0)
      std::memcpy(block, static_cast<const void*>(rawSlots()), count_ * sizeof(Element));
    std::free(static_cast<void*>(buffer_));
    buffer_ = static_cast<Element*>(block);
    head_ = 0;
    room_ = count_ = total;
    return;
  }
  reserve(total);
  std::memset(static_cast<void*>(rawSlots() + count_), 0, (total - count_) * sizeof(Element));
  count_ = total;
}

void ElementStore::appendMoved(Element* first, std::size_t count) {
  if (count == 0) return;
  reserve(count_ + count);
  moveElements(rawSlots() + count_, first, count);
  std::memset(static_cast<void*>(first), 0, count * sizeof(Element));
  count_ += count;
  onlyPlainWords_ = false;
}

Element& ElementStore::insertAt(std::size_t index) {
  if (index >= count_) return pushBack();
  if (index < count_ - index) {
    if (head_ == 0) makeRoomAtFront();
    moveElements(buffer_ + head_ - 1, buffer_ + head_, index);
    --head_;
  } else {
    if (head_ + count_ == room_) makeRoomAtBack(count_ + 1);
    moveElements(buffer_ + head_ + index + 1, buffer_ + head_ + index, count_ - index);
  }
  ++count_;
  onlyPlainWords_ = false;
  return *new (buffer_ + head_ + index) Element();
}

void ElementStore::eraseAt(std::size_t index) {
  rawSlots()[index].~Element();
  if (index < count_ - 1 - index) {
    moveElements(buffer_ + head_ + 1, buffer_ + head_, index);
    ++head_;
  } else {
    moveElements(buffer_ + head_ + index, buffer_ + head_ + index + 1, count_ - 1 - index);
  }
  --count_;
  shrinkIfSparse();
}

void ElementStore::truncate(std::size_t count) noexcept {
  while (count_ > count) rawSlots()[--count_].~Element();
}

// After many deletions give memory back: a block less than a quarter full halves.
void ElementStore::shrinkIfSparse() noexcept {
  if (room_ <= 1024 || count_ >= room_ / 4) return;
  moveTo(0);
  const std::size_t smaller = std::max(count_ * 2, kMinimumRoom);
  void* block = reallocateBytes(static_cast<void*>(buffer_), smaller * sizeof(Element));
  if (block == nullptr) return;  // keeping the larger block is fine
  buffer_ = static_cast<Element*>(block);
  room_ = smaller;
}

}  // namespace quorrel
