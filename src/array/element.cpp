#include "array/element.h"

#include "platform/allocation.h"

#include <cstdlib>
#include <new>
#include <utility>

#include "array/text.h"

#if defined(__SANITIZE_ADDRESS__)
#define QUORREL_ASAN 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define QUORREL_ASAN 1
#endif
#endif
#ifdef QUORREL_ASAN
#include <sanitizer/asan_interface.h>
#endif

namespace quorrel {

ElementValue Element::normalised(const ElementValue& value) {
  if (value.type == ElementType::None || value.size < 1) return {};
  if (value.type == ElementType::Value) return value.number == 0 ? ElementValue{} : value;
  if (value.bytes == nullptr) return {};
  return value;
}

namespace {

struct SlabHeader {
  uint32_t live;  // records in the block, plus one while the slab still fills it
};

SlabHeader* headerOf(char* block) {
  return std::launder(reinterpret_cast<SlabHeader*>(block));
}

void dropSlabHold(char* block) noexcept {
  if (--headerOf(block)->live != 0) return;
#ifdef QUORREL_ASAN
  ASAN_UNPOISON_MEMORY_REGION(block, RecordSlab::kBlockBytes);
#endif
  std::free(block);
}

constexpr std::size_t roundUp8(std::size_t n) {
  return (n + 7) & ~std::size_t{7};
}

}  // namespace

const Element Element::kNoneKey{};

char* RecordSlab::take(std::size_t bytes, uint16_t& units) {
  if (bytes > kLargestRecord) return nullptr;
  if (block_ == nullptr || used_ + bytes > kBlockBytes) {
    releaseBlock();
    block_ = static_cast<char*>(allocateBytes(kBlockBytes));
    if (block_ == nullptr) return nullptr;
    new (block_) SlabHeader{1};
    used_ = roundUp8(sizeof(SlabHeader));
  }
  char* room = block_ + used_;
  units = static_cast<uint16_t>(used_ / 8);
  used_ += bytes;
  ++headerOf(block_)->live;
  return room;
}

void RecordSlab::releaseBlock() noexcept {
  if (block_ != nullptr) dropSlabHold(block_);
  block_ = nullptr;
}

Element::Record* Element::makeRecord(const ElementValue& value, bool keySlot, RecordSlab* slab) {
  // A record's distance from its slab block, in 8-byte units, lives in the flag bits above
  // kSlabShift; every offset inside a block must fit there.
  static_assert((RecordSlab::kBlockBytes / 8 - 1) <= (uint16_t{0xFFFF} >> kSlabShift),
                "slab offsets fit the flag bits");
  std::size_t payload = 0;
  if (value.type == ElementType::Value) {
    payload = sizeof(int32_t);
  } else if (value.type != ElementType::None) {
    // One hidden byte past the end keeps every String readable as zero-terminated
    // text, even one that arrived from a damaged file without its terminator.
    payload = static_cast<std::size_t>(value.size) + 1;
  }
  const std::size_t offset = keySlot ? sizeof(Element) : 0;
  const std::size_t total = offset + sizeof(Record) + payload;
  uint16_t flags = keySlot ? kKeySlot : 0;
  uint16_t units = 0;
  char* base = slab != nullptr ? slab->take(roundUp8(total), units) : nullptr;
  if (base != nullptr) {
    flags |= static_cast<uint16_t>(kInSlab | units << kSlabShift);
  } else {
    base = static_cast<char*>(allocateBytes(total));
    if (base == nullptr) throw std::bad_alloc();
  }
  if (keySlot) new (base) Element();
  auto* record = new (base + offset)
      Record{value.type == ElementType::None ? 0 : value.size, value.type, flags};
  if (value.type == ElementType::Value) {
    std::memcpy(record->payload(), &value.number, sizeof(int32_t));
  } else if (payload > 0) {
    std::memcpy(record->payload(), value.bytes, payload - 1);
    record->payload()[payload - 1] = '\0';
  }
  return record;
}

void Element::destroyRecord() noexcept {
  Record* r = record();
  char* base = reinterpret_cast<char*>(r);
  if ((r->flags & kKeySlot) != 0) {
    r->key()->~Element();
    base -= sizeof(Element);
  }
  if ((r->flags & kInSlab) == 0) {
    std::free(base);
    return;
  }
  char* block = base - std::size_t{8} * (r->flags >> kSlabShift);
#ifdef QUORREL_ASAN
  // The block outlives the record; poisoned, a use after this still shows up.
  std::size_t payload = 0;
  if (r->type == ElementType::Value) {
    payload = sizeof(int32_t);
  } else if (r->type != ElementType::None) {
    payload = static_cast<std::size_t>(r->size) + 1;
  }
  ASAN_POISON_MEMORY_REGION(base,
                            roundUp8(reinterpret_cast<char*>(r) - base + sizeof(Record) + payload));
#endif
  dropSlabHold(block);
}

void Element::assign(const ElementValue& value) {
  const ElementValue v = normalised(value);
  if (!hasKey()) {
    const uint64_t next = wordFor(v, nullptr);
    if (isRecord()) destroyRecord();
    word_ = next;
    return;
  }
  if (!isRecord()) {  // the key is the None that the word carries
    word_ = noneKeyedWordFor(v, nullptr);
    return;
  }
  // A keyed element gets a new record that takes the key over.
  Record* fresh = makeRecord(v, true);
  *fresh->key() = std::move(*record()->key());
  fresh->flags |= kHasKey;
  destroyRecord();
  word_ = recordWord(fresh);
}

const char* Element::numberOrEmptyText(NumberText& scratch) const {
  if (isInlineValue()) {
    writeDecimal(inlineNumber(), scratch.text);
    return scratch.text;
  }
  if (isRecord()) {
    const Record* r = record();
    if (r->type == ElementType::Value) {
      writeDecimal(r->number(), scratch.text);
      return scratch.text;
    }
  }
  scratch.text[0] = '\0';
  return scratch.text;
}

int32_t Element::recordValue() const {
  if (isBorrowed()) return readDecimal(borrowedText());
  if (!isRecord()) return 0;
  const Record* r = record();
  if (r->type == ElementType::Value) return r->number();
  if (r->type == ElementType::String) return readDecimal(r->payload());
  return 0;
}

int32_t Element::textLength() const {
  if (type() == ElementType::String) return static_cast<int32_t>(std::strlen(bytes()));
  if (type() == ElementType::Value) {
    NumberText scratch;
    return writeDecimal(number(), scratch.text);
  }
  return 0;
}

ElementValue Element::keyOperand(const ElementValue& value) {
  ElementValue operand = value;
  if (value.type == ElementType::Value) {
    operand.size = 4;
  } else if (value.type == ElementType::String && value.bytes != nullptr) {
    operand.size = static_cast<int32_t>(std::strlen(value.bytes) + 1);
  }
  return operand;
}

uint64_t Element::wordFor(const ElementValue& value, RecordSlab* slab) {
  if (value.type == ElementType::Value && value.size == 4) return inlineWord(value.number);
  if (value.type == ElementType::None) return 0;
  return recordWord(makeRecord(value, false, slab));
}

bool Element::isNoneKey(const ElementValue& key) {
  return normalised(keyOperand(key)).type == ElementType::None;
}

uint64_t Element::noneKeyedWordFor(const ElementValue& value, RecordSlab* slab) {
  if (value.type == ElementType::None || (value.type == ElementType::Value && value.size == 4)) {
    return withNoneKey(wordFor(value, nullptr));
  }
  Record* r = makeRecord(value, true, slab);
  r->flags |= kHasKey;
  return recordWord(r);
}

Element Element::of(const ElementValue& value, RecordSlab* slab) {
  Element e;
  e.word_ = wordFor(normalised(value), slab);
  return e;
}

Element Element::keyed(const ElementValue& value, const ElementValue& key, RecordSlab* slab) {
  return keyedWith(value, of(keyOperand(key), slab), slab);
}

Element Element::keyedWith(const ElementValue& value, Element&& key, RecordSlab* slab) {
  if (key.word_ == 0) return noneKeyed(value, slab);
  Element e;
  Record* r = makeRecord(normalised(value), true, slab);
  *r->key() = std::move(key);
  r->flags |= kHasKey;
  e.word_ = recordWord(r);
  return e;
}

void Element::setKey(const ElementValue& value) {
  const ElementValue operand = keyOperand(value);
  if (isRecord() && (record()->flags & kHasKey) != 0) {
    record()->key()->assign(operand);
    return;
  }
  Element key;
  key.assign(operand);
  if (hasNoneKey() && key.word_ == 0) return;  // None stays None
  if (isRecord() && (record()->flags & kKeySlot) != 0) {
    *record()->key() = std::move(key);
    record()->flags |= kHasKey;
    return;
  }
  // Re-home the value in a record with room for the key.
  ElementValue current;
  if (isInlineValue()) {
    current = ElementValue::ofValue(inlineNumber());
  } else if (isBorrowed()) {
    current = view();
  } else if (isRecord()) {
    const Record* r = record();
    current = {r->type, r->type == ElementType::Value ? r->number() : 0, r->payload(), r->size};
  }
  Record* fresh = makeRecord(current, true);
  *fresh->key() = std::move(key);
  fresh->flags |= kHasKey;
  if (isRecord()) destroyRecord();
  word_ = recordWord(fresh);
}

void Element::deleteKey() noexcept {
  if (!hasKey()) return;
  if (!isRecord()) {
    word_ = keylessWord();
    return;
  }
  Record* r = record();
  r->key()->reset();
  r->flags &= static_cast<uint16_t>(~kHasKey);
  // None and plain Values go back to their keyless in-place forms.
  if (r->type == ElementType::None) {
    destroyRecord();
    word_ = 0;
  } else if (r->type == ElementType::Value && r->size == 4) {
    const int32_t n = r->number();
    destroyRecord();
    word_ = inlineWord(n);
  }
}

}  // namespace quorrel
