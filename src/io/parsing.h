// Internal helpers of the file readers: a bounds-checked little-endian cursor over a
// file held in memory, and the byte scan that splits the text formats.
#pragma once

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

namespace quorrel::io_detail {

// Files are little-endian, like every machine the module runs on: fields and words are
// read with plain copies.
static_assert(std::endian::native == std::endian::little, "words are read little-endian");

// Reads fields from a file image. Bytes past the end read as zero, so a short file
// leaves the fields it does not hold at 0; the position never passes the end.
class Cursor {
 public:
  explicit Cursor(std::string_view file) : file_(file) {}

  bool atEnd() const { return pos_ >= file_.size(); }
  std::size_t fileSize() const { return file_.size(); }
  std::size_t position() const { return pos_; }
  // Whether a field or block wanted more bytes than the file had left.
  bool ranShort() const { return ranShort_; }
  std::size_t remaining() const { return file_.size() - pos_; }

  uint32_t unsignedLE(int byteCount) {
    const std::size_t held = std::min(static_cast<std::size_t>(byteCount), remaining());
    ranShort_ |= held < static_cast<std::size_t>(byteCount);
    const auto* p = reinterpret_cast<const unsigned char*>(file_.data()) + pos_;
    uint32_t v = 0;
    if (held == 4) {
      std::memcpy(&v, p, 4);
    } else if (held == 2) {
      uint16_t half;
      std::memcpy(&half, p, 2);
      v = half;
    } else {
      for (std::size_t i = 0; i < held; ++i) v |= uint32_t{p[i]} << (8 * i);
    }
    pos_ += held;
    return v;
  }
  uint16_t u16() { return static_cast<uint16_t>(unsignedLE(2)); }
  int32_t i32() { return static_cast<int32_t>(unsignedLE(4)); }

  bool matches(std::string_view magic) {
    const bool same = file_.substr(pos_).starts_with(magic);
    ranShort_ |= remaining() < magic.size();
    pos_ = std::min(pos_ + magic.size(), file_.size());
    return same;
  }

  // The next `count` bytes as far as the file holds them; the cursor moves past all
  // of them (a block cut short by the end leaves the cursor at the end).
  std::string_view take(int32_t count) {
    const std::size_t wanted = count > 0 ? static_cast<std::size_t>(count) : 0;
    const std::size_t held = std::min(wanted, remaining());
    ranShort_ |= held < wanted;
    std::string_view block = atEnd() ? std::string_view(kEmpty, 0) : file_.substr(pos_, held);
    pos_ = std::min(pos_ + wanted, file_.size());
    return block;
  }

 private:
  static constexpr char kEmpty[1] = {'\0'};
  std::string_view file_;
  std::size_t pos_ = 0;
  bool ranShort_ = false;
};

// The high bit of every byte of x that is zero, and no other bit (the carry of one
// byte's test never reaches the next).
inline uint64_t zeroBytes(uint64_t x) {
  constexpr uint64_t kLow7 = 0x7F7F7F7F7F7F7F7Full;
  return ~(((x & kLow7) + kLow7) | x | kLow7);
}

// std::popcount without the library call it becomes where the processor has no
// population count instruction (the baseline x86 targets).
inline int countBits(uint64_t x) {
  x -= (x >> 1) & 0x5555555555555555ull;
  x = (x & 0x3333333333333333ull) + ((x >> 2) & 0x3333333333333333ull);
  x = (x + (x >> 4)) & 0x0F0F0F0F0F0F0F0Full;
  return static_cast<int>((x * 0x0101010101010101ull) >> 56);
}

inline uint64_t bytesEqualTo(uint64_t word, char c) {
  return zeroBytes(word ^ (0x0101010101010101ull * static_cast<unsigned char>(c)));
}

// One block of a byte scan: the bytes [base, end) of the text. Bit k of `first` marks
// the byte at base + (k >> shift) as the scan's first byte value, bit k of `others` as
// one of the other two; shift is 0 for 16-byte blocks and 3 for 8-byte words (one bit,
// the top one, per byte).
struct ScanBlock {
  std::size_t base;
  std::size_t end;
  uint64_t first;
  uint64_t others;
  int shift;
  std::size_t at(int bit) const { return base + (static_cast<std::size_t>(bit) >> shift); }
};

// Calls visit(block) for the blocks of text[0, size) in order, marking the bytes equal
// to a, b or c (none of them zero). visit may overwrite any byte of its block or before.
template <class Visit>
void forEachBlockOf(const char* text, std::size_t size, char a, char b, char c, Visit&& visit) {
  const auto word = [&](std::size_t base, uint64_t w) {
    visit(ScanBlock{base, std::min(base + 8, size), bytesEqualTo(w, a),
                    bytesEqualTo(w, b) | bytesEqualTo(w, c), 3});
  };
  std::size_t base = 0;
#if defined(__SSE2__)
  // Sixteen bytes at a time where the processor has the instructions for it.
  const __m128i va = _mm_set1_epi8(a);
  const __m128i vb = _mm_set1_epi8(b);
  const __m128i vc = _mm_set1_epi8(c);
  for (; base + 16 <= size; base += 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(text + base));
    const auto first = static_cast<uint64_t>(_mm_movemask_epi8(_mm_cmpeq_epi8(v, va)));
    const auto others = static_cast<uint64_t>(
        _mm_movemask_epi8(_mm_or_si128(_mm_cmpeq_epi8(v, vb), _mm_cmpeq_epi8(v, vc))));
    visit(ScanBlock{base, base + 16, first, others, 0});
  }
#endif
  for (; base + 8 <= size; base += 8) {
    uint64_t w;
    std::memcpy(&w, text + base, sizeof w);
    word(base, w);
  }
  if (base < size) {
    uint64_t w = 0;  // zero bytes past the end match nothing
    std::memcpy(&w, text + base, size - base);
    word(base, w);
  }
}

// Calls visit(i), in order, for every i in [0, size) where text[i] is a, b or c (none
// of them zero). visit may overwrite text[i] and any byte before it.
template <class Visit>
void forEachByteOf(const char* text, std::size_t size, char a, char b, char c, Visit&& visit) {
  forEachBlockOf(text, size, a, b, c, [&](const ScanBlock& block) {
    for (uint64_t hits = block.first | block.others; hits != 0; hits &= hits - 1) {
      visit(block.at(std::countr_zero(hits)));
    }
  });
}

}  // namespace quorrel::io_detail
