// Reads typed values off a fuzz input; past the end every read gives zeros / empty text.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

namespace quorrel {

class FuzzInput {
 public:
  FuzzInput(const uint8_t* data, size_t size) : data_(data), size_(size) {}

  bool empty() const { return pos_ >= size_; }
  uint8_t byte() { return pos_ < size_ ? data_[pos_++] : 0; }
  int32_t int32() {
    uint32_t v = 0;
    for (int i = 0; i < 4; ++i) v |= static_cast<uint32_t>(byte()) << (8 * i);
    return static_cast<int32_t>(v);
  }
  // An integer that is often extreme: near 0, the given size, -1 or INT32_MAX.
  int32_t index(int32_t size) {
    switch (byte() % 8) {
      case 0:
        return -1;
      case 1:
        return size;
      case 2:
        return size - 1;
      case 3:
        return INT32_MAX;
      case 4:
        return INT32_MIN;
      case 5:
        return int32();
      default:
        return byte() % 16;
    }
  }
  std::string text(size_t length) {
    length = length < size_ - pos_ ? length : size_ - pos_;
    if (length == 0) return {};
    std::string s(reinterpret_cast<const char*>(data_ + pos_), length);
    pos_ += length;
    return s.c_str();  // texts reach the extension zero-terminated
  }
  // A short text whose length comes from the input.
  std::string shortText() { return text(byte() % 24); }
  std::string rest() { return text(size_ - pos_); }
  // The remaining bytes as they are, zero bytes included.
  std::string bytes() {
    if (pos_ >= size_) return {};
    std::string s(reinterpret_cast<const char*>(data_ + pos_), size_ - pos_);
    pos_ = size_;
    return s;
  }

 private:
  const uint8_t* data_;
  size_t size_;
  size_t pos_ = 0;
};

}  // namespace quorrel
