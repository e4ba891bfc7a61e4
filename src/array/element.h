// One stored value with its optional key: a 32-bit number held in place, an owned
// zero-terminated text, or an owned block of file bytes.
#pragma once

#include <cstdint>
#include <cstring>
#include <memory>

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

// Scratch space for the decimal text of a number (sign, ten digits, terminator).
struct NumberText {
  char text[12] = {};
};

class Element {
 public:
  Element() : number_(0) {}
  ~Element() { reset(); }
  Element(Element&& other) noexcept { moveFrom(other); }
  Element& operator=(Element&& other) noexcept {
    if (this != &other) {
      reset();
      moveFrom(other);
    }
    return *this;
  }
  Element(const Element&) = delete;
  Element& operator=(const Element&) = delete;

  ElementType type() const { return type_; }
  int32_t size() const { return size_; }
  // The number of a Value; 0 for every other type.
  int32_t number() const { return type_ == ElementType::Value ? number_ : 0; }
  // The owned bytes of a String or File; null for None and Value.
  const char* bytes() const { return isOwning() ? bytes_ : nullptr; }
  const Element* key() const { return key_.get(); }
  bool hasKey() const { return key_ != nullptr; }

  // Replaces the value; the key stays. The number 0, a null operand, a size below 1
  // and the None type all store None. Throws std::bad_alloc and leaves the element
  // unchanged when the copy cannot be made.
  void assign(const ElementValue& value);

  // The value as text: a String's own text, a Value's decimal form (written into
  // scratch), or "" for None and File. Never null.
  const char* asString(NumberText& scratch) const;
  int32_t asValue() const;
  int32_t textLength() const;

  void setKey(const ElementValue& value);
  void deleteKey() { key_.reset(); }
  void reset() {
    release();
    key_.reset();
  }

 private:
  bool isOwning() const { return type_ != ElementType::None && type_ != ElementType::Value; }
  void release() {
    if (isOwning()) std::free(bytes_);
    number_ = 0;
    size_ = 0;
    type_ = ElementType::None;
  }
  // Inline: the sorts move elements by the million.
  void moveFrom(Element& other) noexcept {
    if (other.isOwning()) {
      bytes_ = other.bytes_;
    } else {
      number_ = other.number_;
    }
    size_ = other.size_;
    type_ = other.type_;
    key_ = std::move(other.key_);
    other.number_ = 0;
    other.size_ = 0;
    other.type_ = ElementType::None;
  }

  union {
    int32_t number_;
    char* bytes_;
  };
  int32_t size_ = 0;
  ElementType type_ = ElementType::None;
  std::unique_ptr<Element> key_;
};

}  // namespace quorrel
