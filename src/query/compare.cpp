#include "query/compare.h"

#include <cstring>

#include "query/text_ops.h"

namespace quorrel {

namespace textops {

namespace {

// The matcher is written once per case setting so the inner loop carries no flag.
template <bool kCaseSensitive>
bool same(unsigned char p, unsigned char t) {
  if constexpr (kCaseSensitive) {
    return p == t;
  } else {
    return foldByte(p) == foldByte(t);
  }
}

template <bool kCaseSensitive>
bool matchGreedy(const unsigned char* p, const unsigned char* pe, const unsigned char* t,
                 const unsigned char* te) {
  // Literal head up to the first star.
  while (t < te && (p == pe || *p != '*')) {
    if (p == pe || (*p != '?' && !same<kCaseSensitive>(*p, *t))) return false;
    ++p;
    ++t;
  }
  // From here on a star has been seen, so a resume point exists before it is needed.
  const unsigned char* resume = p;
  const unsigned char* retry = t;
  while (t < te) {
    if (p < pe && *p == '*') {
      if (++p == pe) return true;
      resume = p;
      retry = t + 1;
    } else if (p < pe && (*p == '?' || same<kCaseSensitive>(*p, *t))) {
      ++p;
      ++t;
    } else {
      p = resume;
      t = retry++;
    }
  }
  while (p < pe && *p == '*') ++p;
  return p == pe;
}

}  // namespace

bool matchCounted(const unsigned char* pattern, std::size_t patternLength,
                  const unsigned char* text, std::size_t textLength, bool caseSensitive) {
  const unsigned char* pe = pattern + patternLength;
  const unsigned char* te = text + textLength;
  return caseSensitive ? matchGreedy<true>(pattern, pe, text, te)
                       : matchGreedy<false>(pattern, pe, text, te);
}

}  // namespace textops

int32_t compareText(const ElementArray& array, const char* a, const char* b) {
  if (a == nullptr) return b == nullptr ? 0 : -1;
  if (b == nullptr) return 1;
  return textops::compareCase(isCaseSensitive(array), a, b);
}

int32_t compareTextPrefix(const ElementArray& array, const char* a, const char* b, int32_t n) {
  if (a == nullptr && b == nullptr) return 0;
  if (n < 1) return 0;
  if (a == nullptr) return -1;
  if (b == nullptr) return 1;
  return textops::comparePrefix(isCaseSensitive(array), a, b, n);
}

bool wildcardMatch(const char* pattern, const char* text, bool caseSensitive) {
  if (pattern == nullptr || text == nullptr) return false;  // matchPattern orders these
  return textops::matchViews(pattern, text, caseSensitive);
}

bool wildcardMatch(std::string_view pattern, std::string_view text, bool caseSensitive) {
  return textops::matchViews(pattern, text, caseSensitive);
}

int32_t matchPattern(const ElementArray& array, const char* pattern, const char* text) {
  if (pattern == nullptr) return text == nullptr ? 0 : -1;
  if (text == nullptr) return 1;
  return wildcardMatch(pattern, text, isCaseSensitive(array)) ? 0 : 1;
}

int32_t searchCompare(const ElementArray& array, const char* probe, const char* candidate) {
  return isWildcardSearch(array) ? matchPattern(array, probe, candidate)
                                 : compareText(array, probe, candidate);
}

int32_t searchCompareSpan(const ElementArray& array, const char* probe, const char* candidate,
                          int32_t n) {
  if (!isWildcardSearch(array)) return compareTextPrefix(array, probe, candidate, n);
  if (probe == nullptr) return candidate == nullptr ? 0 : -1;
  if (candidate == nullptr) return 1;
  int32_t count = n < 0 ? 0 : n;
  if (textops::boundedLength(candidate, count) < count) return 1;
  return wildcardMatch(std::string_view(probe),
                       std::string_view(candidate, static_cast<std::size_t>(count)),
                       isCaseSensitive(array))
             ? 0
             : 1;
}

namespace {

int32_t compareNumbers(int32_t a, int32_t b) {
  return (a > b) - (a < b);
}

// The element's data as it is stored: a Value's number in memory order (4 bytes), the
// owned bytes of a String or File, nothing for None.
int32_t compareStoredBytes(const ElementValue& operand, const Element& element) {
  if (operand.size != element.size()) return operand.size < element.size() ? -1 : 1;
  if (operand.size <= 0) return 0;
  char number[4];
  const char* stored = element.bytes();
  if (element.type() == ElementType::Value) {
    int32_t value = element.number();
    std::memcpy(number, &value, sizeof number);
    stored = number;
  }
  const char* given = operand.bytes;
  // A count without bytes orders like a missing text.
  if (given == nullptr || stored == nullptr) return (given != nullptr) - (stored != nullptr);
  return textops::sign(std::memcmp(given, stored, static_cast<std::size_t>(operand.size)));
}

}  // namespace

int32_t compareWithElement(const ElementArray& array, const ElementValue& operand,
                           const Element& element) {
  switch (operand.type) {
    case ElementType::Value:
      return compareNumbers(operand.number, element.asValue());
    case ElementType::String: {
      NumberText scratch;
      return searchCompare(array, element.asString(scratch), operand.bytes);
    }
    default:
      return compareStoredBytes(operand, element);
  }
}

}  // namespace quorrel
