// A probe text prepared once for testing many candidate texts, as the row selections
// do: the whole-text test of searchCompare, the containment test built on
// searchCompareSpan and the literal order of compareText. The results are exactly those of the
// plain operations; only the per-candidate work shrinks, because the folding of the probe happens
// once.
//
// The array's case and search settings are read when the probe is made; the probe
// text must outlive it. Nothing is allocated.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "array/element_array.h"

namespace quorrel {

class TextProbe {
 public:
  TextProbe(const ElementArray& array, const char* probe);

  // searchCompare(array, probe, text) == 0 for a present text. The text's zero lies at
  // or before text[bound], and every byte up to text[bound] may be read.
  bool matchesWhole(const char* text, std::size_t bound) const {
    if (!prepared_) return matchesWholePlain(text);
    // Equal texts have equal lengths, and the text is no longer than its bound; the
    // needle's zero then checks the text ends where the probe does.
    if (bound < length_) return false;
    const auto* t = reinterpret_cast<const unsigned char*>(text);
    return firstMatches(t[0]) && sameAt(t, 1, length_ + 1);
  }

  // Whether searchCompareSpan(array, probe, text + o, L) is 0 for some o from 0 to
  // length - L, L being the probe's length: the probe occurs in the text (as a pattern
  // over spans of its own length in wildcard mode). A missing probe counts as empty,
  // and the empty probe occurs in every text. `length` is the text's exact length.
  bool occursIn(const char* text, std::size_t length) const;

  // The sign of compareText(array, probe, text) for a present text: literal under the
  // case setting, whatever the search setting. The bound is as for matchesWhole.
  int32_t compareTo(const char* text, std::size_t bound) const;

 private:
  // Longer literal probes take the plain operations.
  static constexpr std::size_t kPreparedLength = 64;

  static uint64_t loadWord(const unsigned char* bytes) {
    uint64_t word;
    std::memcpy(&word, bytes, sizeof word);
    return word;
  }
  // Whether text[i] matches the needle at i for every i from `from` to `to` - 1.
  bool sameAt(const unsigned char* text, std::size_t from, std::size_t to) const {
    std::size_t i = from;
    for (; i + 8 <= to; i += 8) {
      if (((loadWord(text + i) ^ loadWord(needle_ + i)) & ~loadWord(mask_ + i)) != 0) return false;
    }
    for (; i < to; ++i) {
      if (((text[i] ^ needle_[i]) & ~mask_[i] & 0xFF) != 0) return false;
    }
    return true;
  }
  bool matchesWholePlain(const char* text) const;
  bool occursPrepared(const unsigned char* text, std::size_t last) const;
  uint64_t foldWord(uint64_t word) const;
  bool firstMatches(unsigned char c) const { return ((c ^ needle_[0]) & ~mask_[0] & 0xFF) == 0; }

  const ElementArray& array_;
  const char* probe_;
  std::size_t length_ = 0;
  bool wildcard_;
  bool caseSensitive_;
  // The needle below holds the whole probe.
  bool wholeNeedle_ = false;
  // Literal search with the whole needle.
  bool prepared_ = false;
  // The probe's first character is tested on its own before anything else: it is not
  // a wildcard character.
  bool literalHead_ = false;
  // The probe folded when case insensitive, with its zero and zero padding. A text byte
  // t matches needle byte n exactly when (t ^ n) & ~m is 0, m being the mask byte:
  // 0x20 where a case-insensitive needle holds a letter (so 'a' also accepts 'A'),
  // else 0.
  unsigned char needle_[kPreparedLength + 8] = {};
  unsigned char mask_[kPreparedLength + 8] = {};
};

}  // namespace quorrel
