#include "array/element.h"

#include <cstdlib>
#include <new>

#include "array/text.h"

namespace quorrel {

void Element::assign(const ElementValue& value) {
  if (value.type == ElementType::None || value.size < 1) {
    release();
    return;
  }
  if (value.type == ElementType::Value) {
    if (value.number == 0) {
      release();
      return;
    }
    release();
    number_ = value.number;
    size_ = value.size;
    type_ = ElementType::Value;
    return;
  }
  if (value.bytes == nullptr) {
    release();
    return;
  }
  // Copy first so that a failed allocation leaves the old value in place. One hidden
  // byte past the end keeps every String readable as zero-terminated text, even one
  // that arrived from a damaged file without its terminator.
  const auto count = static_cast<std::size_t>(value.size);
  auto* copy = static_cast<char*>(std::malloc(count + 1));
  if (copy == nullptr) throw std::bad_alloc();
  std::memcpy(copy, value.bytes, count);
  copy[count] = '\0';
  release();
  bytes_ = copy;
  size_ = value.size;
  type_ = value.type;
}

const char* Element::asString(NumberText& scratch) const {
  if (type_ == ElementType::String) return bytes_;
  if (type_ == ElementType::Value) {
    writeDecimal(number_, scratch.text);
  } else {
    scratch.text[0] = '\0';
  }
  return scratch.text;
}

int32_t Element::asValue() const {
  if (type_ == ElementType::Value) return number_;
  if (type_ == ElementType::String) return readDecimal(bytes_);
  return 0;
}

int32_t Element::textLength() const {
  if (type_ == ElementType::String) return static_cast<int32_t>(std::strlen(bytes_));
  if (type_ == ElementType::Value) {
    NumberText scratch;
    return writeDecimal(number_, scratch.text);
  }
  return 0;
}

void Element::setKey(const ElementValue& value) {
  ElementValue operand = value;
  if (value.type == ElementType::Value) {
    operand.size = 4;
  } else if (value.type == ElementType::String && value.bytes != nullptr) {
    // The key takes the whole text, whatever size the operand claims.
    operand.size = static_cast<int32_t>(std::strlen(value.bytes) + 1);
  }
  if (key_ == nullptr) {
    auto created = std::make_unique<Element>();
    created->assign(operand);
    key_ = std::move(created);
  } else {
    key_->assign(operand);
  }
}

}  // namespace quorrel
