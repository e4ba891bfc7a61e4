#include "query/text_probe.h"

#include <cstring>
#include <string_view>

#include "query/compare.h"
#include "query/text_ops.h"

namespace quorrel {

namespace {

uint64_t loadWord(const unsigned char* bytes) {
  uint64_t word;
  std::memcpy(&word, bytes, sizeof word);
  return word;
}

uint16_t loadPair(const unsigned char* bytes) {
  uint16_t pair;
  std::memcpy(&pair, bytes, sizeof pair);
  return pair;
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
  prepared_ = !wildcard_ && length_ <= kPreparedLength;
  const auto head = static_cast<unsigned char>(probe[0]);
  literalHead_ = length_ > 0 && (!wildcard_ || (head != '*' && head != '?'));
}

bool TextProbe::sameAt(const unsigned char* text, std::size_t from, std::size_t to) const {
  std::size_t i = from;
  for (; i + 8 <= to; i += 8) {
    if (((loadWord(text + i) ^ loadWord(needle_ + i)) & ~loadWord(mask_ + i)) != 0) return false;
  }
  for (; i < to; ++i) {
    if (((text[i] ^ needle_[i]) & ~mask_[i] & 0xFF) != 0) return false;
  }
  return true;
}

bool TextProbe::matchesWhole(const char* text, std::size_t bound) const {
  if (probe_ == nullptr) return false;
  if (wildcard_) {
    return textops::matchViews(std::string_view(probe_, length_), std::string_view(text),
                               caseSensitive_);
  }
  if (!prepared_) return compareText(array_, probe_, text) == 0;
  // Equal texts have equal lengths, and the text is no longer than its bound; the
  // needle's zero then checks the text ends where the probe does.
  if (bound < length_) return false;
  const auto* t = reinterpret_cast<const unsigned char*>(text);
  return firstMatches(t[0]) && sameAt(t, 1, length_ + 1);
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

}  // namespace quorrel
