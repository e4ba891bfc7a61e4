#include "array/element.h"

#include <cstdlib>
#include <new>
#include <utility>

#include "array/text.h"

namespace quorrel {

namespace {

// The operand as it will be stored: None whenever it has no type, no data (the number
// 0 for a Value) or a size below 1.
ElementValue normalised(const ElementValue& value) {
  if (value.type == ElementType::None || value.size < 1) return {};
  if (value.type == ElementType::Value) return value.number == 0 ? ElementValue{} : value;
  if (value.bytes == nullptr) return {};
  return value;
}

}  // namespace

Element::Record* Element::makeRecord(const ElementValue& value, bool keySlot) {
  std::size_t payload = 0;
  if (value.type == ElementType::Value) {
    payload = sizeof(int32_t);
  } else if (value.type != ElementType::None) {
    // One hidden byte past the end keeps every String readable as zero-terminated
    // text, even one that arrived from a damaged file without its terminator.
    payload = static_cast<std::size_t>(value.size) + 1;
  }
  const std::size_t offset = keySlot ? sizeof(Element) : 0;
  auto* base = static_cast<char*>(std::malloc(offset + sizeof(Record) + payload));
  if (base == nullptr) throw std::bad_alloc();
  if (keySlot) new (base) Element();
  auto* record =
      new (base + offset) Record{value.type == ElementType::None ? 0 : value.size, value.type,
                                 static_cast<uint16_t>(keySlot ? kKeySlot : 0)};
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
  std::free(base);
}

void Element::assign(const ElementValue& value) {
  const ElementValue v = normalised(value);
  if (!hasKey()) {
    uint64_t next = 0;
    if (v.type == ElementType::Value && v.size == 4) {
      next = inlineWord(v.number);
    } else if (v.type != ElementType::None) {
      next = recordWord(makeRecord(v, false));
    }
    if (isRecord()) destroyRecord();
    word_ = next;
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
  const Record* r = record();
  if (r->type == ElementType::Value) return r->number();
  if (r->type == ElementType::String) return readDecimal(r->payload());
  return 0;
}

int32_t Element::textLength() const {
  if (type() == ElementType::String) return static_cast<int32_t>(std::strlen(record()->payload()));
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

Element Element::keyed(const ElementValue& value, const ElementValue& key) {
  Element keyElement = of(keyOperand(key));
  Element e;
  Record* r = makeRecord(normalised(value), true);
  *r->key() = std::move(keyElement);
  r->flags |= kHasKey;
  e.word_ = recordWord(r);
  return e;
}

void Element::setKey(const ElementValue& value) {
  const ElementValue operand = keyOperand(value);
  if (hasKey()) {
    record()->key()->assign(operand);
    return;
  }
  Element key;
  key.assign(operand);
  if (isRecord() && (record()->flags & kKeySlot) != 0) {
    *record()->key() = std::move(key);
    record()->flags |= kHasKey;
    return;
  }
  // Re-home the value in a record with room for the key.
  ElementValue current;
  if (isInlineValue()) {
    current = ElementValue::ofValue(inlineNumber());
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
