// One stored value with its optional key: a 32-bit number held in place, an owned
// zero-terminated text, or an owned block of file bytes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>  // kept for files that relied on it through this header

namespace quorrel {

enum class ElementType : uint16_t { None = 0, Value = 1, String = 2, File = 3 };

// A typed operand: owns nothing; the element copies what it keeps.
// For Value, `number` holds the value and `bytes` is unused; otherwise `bytes` points
// to `size` bytes (a String's size counts its terminator).
struct ElementValue {
  ElementType type = ElementType::None;
  int32_t number = 0;
  const char* bytes = nullptr;
  int32_t size = 0;

  static ElementValue ofValue(int32_t v) { return {ElementType::Value, v, nullptr, 4}; }
  static ElementValue ofText(const char* text) {
    if (text == nullptr) return {};
    return {ElementType::String, 0, text, static_cast<int32_t>(std::strlen(text) + 1)};
  }
  static ElementValue ofBytes(const char* bytes, int32_t size) {
    return {ElementType::File, 0, bytes, size};
  }
};

// Hands out element records from shared blocks, for code that builds many elements in
// one go (the loaders): one allocation per block instead of one per element. Each
// record still belongs to its element alone; a block is freed with its last record.
class RecordSlab {
 public:
  static constexpr std::size_t kBlockBytes = std::size_t{1} << 16;
  static constexpr std::size_t kLargestRecord = 512;

  RecordSlab() = default;
  ~RecordSlab() { releaseBlock(); }
  RecordSlab(const RecordSlab&) = delete;
  RecordSlab& operator=(const RecordSlab&) = delete;

 private:
  friend class Element;

  // `bytes` (a multiple of 8) of the current block and their distance from its start in
  // 8-byte units; null for large records or when no block can be had.
  char* take(std::size_t bytes, uint16_t& units);
  void releaseBlock() noexcept;

  char* block_ = nullptr;
  std::size_t used_ = 0;
};

// Scratch space for the decimal text of a number (sign, ten digits, terminator).
struct NumberText {
  char text[12] = {};
};

// An element is one machine word, so that the array's slots are small and edits move
// words. The word is
//   0                    a keyless None;
//   value << 32 | 1      a Value held in place (bit 1: it has a None key);
//   text << 2 | 2        a borrowed text, see below (bit 63: it has a None key);
//   4                    a None with a None key;
//   a multiple of 8      a heap record: a small header followed by the value (the bytes
//                        with a hidden terminator, or the number), preceded by the key
//                        element when the record was made for a key.
// A None key is what every element loaded from an array file has; carrying it as a
// flag keeps such elements in one word. Moving an element moves the word.
//
// A borrowed text is a keyless String whose zero-terminated text lives in a block that
// the element does not own (a loaded file's bytes, cut in place): the array that holds
// the element keeps the block alive (ElementArray::keepBlock). Loading a table thus
// costs one word per cell on top of the file's own bytes. Editing the element gives it
// a record of its own; the block stays until the array is cleared.
class Element {
 public:
  Element() = default;
  ~Element() {
    if (isRecord()) destroyRecord();
  }
  Element(Element&& other) noexcept : word_(other.word_) { other.word_ = 0; }
  Element& operator=(Element&& other) noexcept {
    if (this != &other) {
      if (isRecord()) destroyRecord();
      word_ = other.word_;
      other.word_ = 0;
    }
    return *this;
  }
  Element(const Element&) = delete;
  Element& operator=(const Element&) = delete;

  ElementType type() const {
    if (isInlineValue()) return ElementType::Value;
    if (isBorrowed()) return ElementType::String;
    return isRecord() ? record()->type : ElementType::None;
  }
  int32_t size() const {
    if (isInlineValue()) return 4;
    if (isBorrowed()) return borrowedSize();
    return isRecord() ? record()->size : 0;
  }
  // The number of a Value; 0 for every other type.
  int32_t number() const {
    if (isInlineValue()) return inlineNumber();
    return isRecord() && record()->type == ElementType::Value ? record()->number() : 0;
  }
  // The owned bytes of a String or File; null for None and Value.
  const char* bytes() const {
    if (isBorrowed()) return borrowedText();
    if (!isRecord()) return nullptr;
    const Record* r = record();
    return r->type != ElementType::None && r->type != ElementType::Value ? r->payload() : nullptr;
  }
  const Element* key() const {
    if (isRecord()) return (record()->flags & kHasKey) != 0 ? record()->key() : nullptr;
    return hasNoneKey() ? &kNoneKey : nullptr;
  }
  // Type, size, number (Value) and bytes (String, File) decoded at once, for readers
  // that need them all.
  ElementValue view() const {
    if (isInlineValue()) return ElementValue::ofValue(inlineNumber());
    if (isBorrowed()) return {ElementType::String, 0, borrowedText(), borrowedSize()};
    if (!isRecord()) return {};
    const Record* r = record();
    if (r->type == ElementType::None) return {};
    if (r->type == ElementType::Value) return {ElementType::Value, r->number(), nullptr, r->size};
    return {r->type, 0, r->payload(), r->size};
  }
  bool hasKey() const { return isRecord() ? (record()->flags & kHasKey) != 0 : hasNoneKey(); }
  // True for None, keyless Values and borrowed texts: nothing to free.
  bool ownsNothing() const { return !isRecord(); }

  // Replaces the value; the key stays. The number 0, a null operand, a size below 1
  // and the None type all store None. Throws std::bad_alloc and leaves the element
  // unchanged when the copy cannot be made.
  void assign(const ElementValue& value);
  // A new element holding `value`: the element that assign(value) makes of an empty
  // one. Its record, if it needs one, comes from `slab` when one is given.
  static Element of(const ElementValue& value, RecordSlab* slab = nullptr);
  // A new element holding `value` under `key`: the element that assign(value) followed
  // by setKey(key) makes, built with one record instead of two.
  static Element keyed(const ElementValue& value, const ElementValue& key,
                       RecordSlab* slab = nullptr);
  // The same with the key element already made (keyless; a borrowed text, say).
  static Element keyedWith(const ElementValue& value, Element&& key, RecordSlab* slab = nullptr);
  // A String element reading the zero-terminated `text` in place, without a copy. The
  // text must stay unchanged and alive as long as the element (see above). Addresses
  // fit the word's 61 bits on every system the module runs on.
  static Element borrowed(const char* text) {
    Element e;
    e.word_ = (static_cast<uint64_t>(reinterpret_cast<uintptr_t>(text)) << 2) | kBorrowedTag;
    return e;
  }
  // The same with a None key: as keyed(view, None) would make it.
  static Element borrowedWithNoneKey(const char* text) {
    Element e = borrowed(text);
    e.word_ |= kBorrowedNoneKey;
    return e;
  }
  // keyed(value, None): a Value or None stays one word.
  static Element noneKeyed(const ElementValue& value, RecordSlab* slab = nullptr) {
    Element e;
    if (value.type == ElementType::Value && value.size == 4) {  // most of a loaded file
      e.word_ = value.number == 0 ? kNoneWithNoneKey : inlineWord(value.number) | kInlineNoneKey;
    } else {
      e.word_ = noneKeyedWordFor(normalised(value), slab);
    }
    return e;
  }
  // True when a key set to `key` would be None (the element still has a key then).
  static bool isNoneKey(const ElementValue& key);

  // assign(ElementValue::ofValue(number)) without the detour.
  void assignValue(int32_t number) {
    if (isRecord() || hasNoneKey()) {
      assign(ElementValue::ofValue(number));
    } else {
      word_ = number == 0 ? 0 : inlineWord(number);
    }
  }

  // The value as text: a String's own text, a Value's decimal form (written into
  // scratch), or "" for None and File. Never null.
  const char* asString(NumberText& scratch) const {
    if (isBorrowed()) return borrowedText();
    if (isRecord() && record()->type == ElementType::String) return record()->payload();
    return numberOrEmptyText(scratch);
  }
  int32_t asValue() const {
    if (isInlineValue()) [[likely]]
      return inlineNumber();
    return word_ != 0 ? recordValue() : 0;
  }
  int32_t textLength() const;

  // Gives the element a key (created when there is none) or replaces the key's value.
  // Throws std::bad_alloc and leaves the element unchanged when it cannot be made.
  void setKey(const ElementValue& value);
  void deleteKey() noexcept;
  void reset() noexcept {
    if (isRecord()) destroyRecord();
    word_ = 0;
  }

 private:
  static constexpr uint16_t kHasKey = 1;   // a live key element precedes the header
  static constexpr uint16_t kKeySlot = 2;  // the allocation starts with a key slot
  static constexpr uint16_t kInSlab = 4;   // a slab block holds the allocation; the
  static constexpr int kSlabShift = 3;     // bits above say where, in 8-byte units

  struct Record {
    int32_t size;
    ElementType type;
    uint16_t flags;

    char* payload() { return reinterpret_cast<char*>(this + 1); }
    const char* payload() const { return reinterpret_cast<const char*>(this + 1); }
    int32_t number() const {
      int32_t n;
      std::memcpy(&n, payload(), sizeof n);
      return n;
    }
    Element* key() {
      return reinterpret_cast<Element*>(reinterpret_cast<char*>(this) - sizeof(Element));
    }
    const Element* key() const {
      return reinterpret_cast<const Element*>(reinterpret_cast<const char*>(this) -
                                              sizeof(Element));
    }
  };

  static constexpr uint64_t kBorrowedTag = 2;
  static constexpr uint64_t kInlineNoneKey = 2;
  static constexpr uint64_t kBorrowedNoneKey = uint64_t{1} << 63;
  static constexpr uint64_t kNoneWithNoneKey = 4;
  static const Element kNoneKey;

  static uint64_t inlineWord(int32_t number) {
    return (uint64_t{static_cast<uint32_t>(number)} << 32) | 1u;
  }
  bool isInlineValue() const { return (word_ & 1u) != 0; }
  bool isBorrowed() const { return (word_ & 3u) == kBorrowedTag; }
  // Records are 8-aligned, so their words end in three zero bits.
  bool isRecord() const { return word_ != 0 && (word_ & 7u) == 0; }
  // A word-sized element (not a record) that has a None key.
  bool hasNoneKey() const {
    if (isInlineValue()) return (word_ & kInlineNoneKey) != 0;
    if (isBorrowed()) return (word_ & kBorrowedNoneKey) != 0;
    return word_ == kNoneWithNoneKey;
  }
  // The word without its None key.
  uint64_t keylessWord() const {
    if (isInlineValue()) return word_ & ~kInlineNoneKey;
    if (isBorrowed()) return word_ & ~kBorrowedNoneKey;
    return word_ == kNoneWithNoneKey ? 0 : word_;
  }
  // The word of a keyless word-sized element given a None key.
  static uint64_t withNoneKey(uint64_t word) {
    if ((word & 1u) != 0) return word | kInlineNoneKey;
    if ((word & 3u) == kBorrowedTag) return word | kBorrowedNoneKey;
    return kNoneWithNoneKey;  // word is 0
  }
  const char* borrowedText() const {
    return reinterpret_cast<const char*>(static_cast<uintptr_t>((word_ & ~kBorrowedNoneKey) >> 2));
  }
  int32_t borrowedSize() const { return static_cast<int32_t>(std::strlen(borrowedText()) + 1); }
  int32_t inlineNumber() const { return static_cast<int32_t>(static_cast<uint32_t>(word_ >> 32)); }
  Record* record() const { return reinterpret_cast<Record*>(static_cast<uintptr_t>(word_)); }
  static uint64_t recordWord(Record* r) { return reinterpret_cast<uintptr_t>(r); }

  // The operand a key stores: a Value is 4 bytes and a text is taken whole, whatever
  // size the operand claims.
  static ElementValue keyOperand(const ElementValue& value);
  // The operand as it will be stored: None whenever it has no type, no data (the number
  // 0 for a Value) or a size below 1.
  static ElementValue normalised(const ElementValue& value);
  int32_t recordValue() const;
  const char* numberOrEmptyText(NumberText& scratch) const;
  // A new record holding `value` (already normalised), with a key slot when asked,
  // taken from `slab` when one is given and can hold it.
  static Record* makeRecord(const ElementValue& value, bool keySlot, RecordSlab* slab = nullptr);
  // The word of a keyless element holding `value` (already normalised).
  static uint64_t wordFor(const ElementValue& value, RecordSlab* slab);
  // The word of an element holding `value` (already normalised) under a None key.
  static uint64_t noneKeyedWordFor(const ElementValue& value, RecordSlab* slab);
  void destroyRecord() noexcept;

  uint64_t word_ = 0;
};

}  // namespace quorrel
