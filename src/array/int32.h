// 32-bit arithmetic as the host sees it: two's-complement wrap, truncating division.
// Signed overflow is undefined in C++, so every operation goes through unsigned or 64-bit.
#pragma once

#include <cstdint>

namespace quorrel {

inline int32_t wrap(int64_t v) {
  return static_cast<int32_t>(static_cast<uint32_t>(v));
}
inline int32_t addWrap(int32_t a, int32_t b) {
  return static_cast<int32_t>(static_cast<uint32_t>(a) + static_cast<uint32_t>(b));
}
inline int32_t subWrap(int32_t a, int32_t b) {
  return static_cast<int32_t>(static_cast<uint32_t>(a) - static_cast<uint32_t>(b));
}
inline int32_t mulWrap(int32_t a, int32_t b) {
  return static_cast<int32_t>(static_cast<uint32_t>(a) * static_cast<uint32_t>(b));
}

// Division truncating toward zero. A divisor of 0 answers 0; INT32_MIN / -1 wraps.
inline int32_t divTrunc(int32_t a, int32_t b) {
  if (b == 0) return 0;
  if (b == -1) return subWrap(0, a);
  return a / b;
}

// Remainder with the sign of the dividend. A divisor of 0 answers 0.
inline int32_t modTrunc(int32_t a, int32_t b) {
  if (b == 0 || b == -1) return 0;
  return a % b;
}

}  // namespace quorrel
