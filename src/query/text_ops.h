// Inner loops shared by the comparison, search and sort code of this folder: the
// folded and unfolded comparisons on raw pointers and the counted wildcard matcher.
// Not part of the public query interface.
#pragma once

#include <cstdint>
#include <cstring>
#include <string_view>

#include "query/compare.h"

namespace quorrel::textops {

inline int32_t sign(int value) {
  return (value > 0) - (value < 0);
}

// Folded three-way comparison of two zero-terminated texts.
inline int32_t compareFolded(const char* a, const char* b) {
  auto* pa = reinterpret_cast<const unsigned char*>(a);
  auto* pb = reinterpret_cast<const unsigned char*>(b);
  for (;; ++pa, ++pb) {
    unsigned char ca = foldByte(*pa);
    unsigned char cb = foldByte(*pb);
    if (ca != cb || ca == 0) return static_cast<int32_t>(ca) - static_cast<int32_t>(cb);
  }
}

// strcmp compares as unsigned char, which is the order we need.
inline int32_t compareExact(const char* a, const char* b) {
  return sign(std::strcmp(a, b));
}

inline int32_t compareCase(bool caseSensitive, const char* a, const char* b) {
  return caseSensitive ? compareExact(a, b) : compareFolded(a, b);
}

// Both texts present; at most n characters, stopping at the end of either.
inline int32_t comparePrefix(bool caseSensitive, const char* a, const char* b, int32_t n) {
  auto* pa = reinterpret_cast<const unsigned char*>(a);
  auto* pb = reinterpret_cast<const unsigned char*>(b);
  for (int32_t i = 0; i < n; ++i) {
    unsigned char ca = caseSensitive ? pa[i] : foldByte(pa[i]);
    unsigned char cb = caseSensitive ? pb[i] : foldByte(pb[i]);
    if (ca != cb) return ca < cb ? -1 : 1;
    if (ca == 0) break;
  }
  return 0;
}

// Number of characters before the first zero byte, reading at most n bytes.
inline int32_t boundedLength(const char* text, int32_t n) {
  int32_t i = 0;
  while (i < n && text[i] != '\0') ++i;
  return i;
}

bool matchCounted(const unsigned char* pattern, std::size_t patternLength,
                  const unsigned char* text, std::size_t textLength, bool caseSensitive);

inline bool matchViews(std::string_view pattern, std::string_view text, bool caseSensitive) {
  return matchCounted(reinterpret_cast<const unsigned char*>(pattern.data()), pattern.size(),
                      reinterpret_cast<const unsigned char*>(text.data()), text.size(),
                      caseSensitive);
}

}  // namespace quorrel::textops
