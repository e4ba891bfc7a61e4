#include "query/text_probe.h"

#include <bit>
#include <cstring>
#include <string_view>

#include "query/compare.h"
#include "query/text_ops.h"

namespace quorrel {

namespace {

uint16_t loadPair(const unsigned char* bytes) {
  uint16_t pair;
  std::memcpy(&pair, bytes, sizeof pair);
  return pair;
}

// The index of the lowest-addressed non-zero byte of a non-zero word.
std::size_t firstNonZeroByte(uint64_t word) {
  if constexpr (std::endian::native == std::endian::little) {
    return static_cast<std::size_t>(std::countr_zero(word)) / 8;
  } else {
    return static_cast<std::size_t>(std::countl_zero(word)) / 8;
  }
}

}  // namespace

TextProbe::TextProbe(const ElementArray& array, const char* probe)
    : array_(array),
      probe_(probe),
      wildcard_(isWildcardSearch(array)),
      caseSensitive_(isCaseSensitive(array)) {
  if (probe == nullptr) return;
  length_ = std::strlen(probe);
  const std::size_t kept = length_ < kPreparedLength ? length_ : kPreparedLength;
  for (std::size_t i = 0; i < kept; ++i) {
    const auto c = static_cast<unsigned char>(probe[i]);
    needle_[i] = caseSensitive_ ? c : foldByte(c);
    mask_[i] = !caseSensitive_ && needle_[i] >= 'a' && needle_[i] <= 'z' ? 0x20 : 0;
  }
  wholeNeedle_ = length_ <= kPreparedLength;
  prepared_ = !wildcard_ && wholeNeedle_;
  const auto head = static_cast<unsigned char>(probe[0]);
  literalHead_ = length_ > 0 && (!wildcard_ || (head != '*' && head != '?'));
}

bool TextProbe::matchesWholePlain(const char* text) const {
  if (probe_ == nullptr) return false;
  if (wildcard_) {
    return textops::matchViews(std::string_view(probe_, length_), std::string_view(text),
                               caseSensitive_);
  }
  return compareText(array_, probe_, text) == 0;
}

bool TextProbe::occursIn(const char* text, std::size_t length) const {
  if (length_ == 0) return true;
  if (length < length_) return false;
  const auto* t = reinterpret_cast<const unsigned char*>(text);
  const std::size_t last = length - length_;
  if (prepared_) return occursPrepared(t, last);
  // Patterns and long literal probes: each span through the plain operations, but only
  // where the first character can match.
  const std::string_view pattern(probe_, length_);
  for (std::size_t o = 0; o <= last; ++o) {
    if (literalHead_ && !firstMatches(t[o])) continue;
    if (wildcard_) {
      if (textops::matchViews(pattern, std::string_view(text + o, length_), caseSensitive_)) {
        return true;
      }
    } else if (compareTextPrefix(array_, probe_, text + o, static_cast<int32_t>(length_)) == 0) {
      return true;
    }
  }
  return false;
}

bool TextProbe::occursPrepared(const unsigned char* text, std::size_t last) const {
  if (length_ == 1) {
    const unsigned char wanted = needle_[0];
    const auto kept = static_cast<unsigned char>(~mask_[0]);
    for (std::size_t o = 0; o <= last; ++o) {
      if (((text[o] ^ wanted) & kept) == 0) return true;
    }
    return false;
  }
  // The first two characters are tested together, so that a span is looked at further
  // only where both match.
  const uint16_t wanted = loadPair(needle_);
  const auto kept = static_cast<uint16_t>(~loadPair(mask_));
  for (std::size_t o = 0; o <= last; ++o) {
    if (((loadPair(text + o) ^ wanted) & kept) != 0) continue;
    if (sameAt(text + o, 2, length_)) return true;
  }
  return false;
}

// 'A'..'Z' to 'a'..'z' in each byte of the word when case insensitive: a byte below
// 0x80 whose low seven bits lie from 'A' to 'Z' gets the case bit.
uint64_t TextProbe::foldWord(uint64_t word) const {
  if (caseSensitive_) return word;
  constexpr uint64_t kOnes = 0x0101010101010101u;
  constexpr uint64_t kHigh = kOnes * 0x80;
  const uint64_t low = word & ~kHigh;
  const uint64_t atLeastA = low + kOnes * (0x80 - 'A');
  const uint64_t pastZ = low + kOnes * (0x80 - 'Z' - 1);
  const uint64_t upper = atLeastA & ~pastZ & ~word & kHigh;
  return word | (upper >> 2);
}

int32_t TextProbe::compareTo(const char* text, std::size_t bound) const {
  if (probe_ == nullptr) return -1;
  if (!wholeNeedle_) return compareText(array_, probe_, text);
  // Up to and including the probe's zero: the first difference decides, and the
  // text's own zero differs from every probe character before the probe's end, so
  // nothing past it is ever compared (words are only read up to the bound).
  const auto* t = reinterpret_cast<const unsigned char*>(text);
  const std::size_t end = length_ + 1;
  std::size_t i = 0;
  for (; i + 8 <= end && i + 8 <= bound + 1; i += 8) {
    const uint64_t diff = foldWord(loadWord(t + i)) ^ loadWord(needle_ + i);
    if (diff != 0) {
      i += firstNonZeroByte(diff);
      break;
    }
  }
  for (; i < end; ++i) {
    const unsigned char c = caseSensitive_ ? t[i] : foldByte(t[i]);
    if (c != needle_[i]) return needle_[i] < c ? -1 : 1;
  }
  return 0;
}

}  // namespace quorrel
