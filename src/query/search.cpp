#include "query/search.h"

#include <cstdint>
#include <cstring>

#include "array/text.h"
#include "query/compare.h"
#include "query/text_ops.h"

namespace quorrel {

namespace {

std::string_view textOf(const Element& element, NumberText& scratch) {
  switch (element.type()) {
    case ElementType::String:
      return {element.bytes(), static_cast<std::size_t>(element.size() - 1)};
    case ElementType::Value:
      return {scratch.text, static_cast<std::size_t>(writeDecimal(element.number(), scratch.text))};
    default:
      return {};
  }
}

bool equalFolded(const char* a, const char* b, std::size_t n) {
  for (std::size_t i = 0; i < n; ++i) {
    if (foldByte(static_cast<unsigned char>(a[i])) != foldByte(static_cast<unsigned char>(b[i])))
      return false;
  }
  return true;
}

bool equalText(bool caseSensitive, std::string_view a, std::string_view b) {
  if (a.size() != b.size()) return false;
  if (std::memcmp(a.data(), b.data(), a.size()) == 0) return true;
  return !caseSensitive && equalFolded(a.data(), b.data(), a.size());
}

bool hasLetter(std::string_view text) {
  for (char c : text) {
    unsigned char folded = foldByte(static_cast<unsigned char>(c));
    if (folded >= 'a' && folded <= 'z') return true;
  }
  return false;
}

// Folded substring search. Candidate offsets come from two memchr scans (the first
// probe character in either case), each rerun only once its hit has been used.
bool containsFolded(std::string_view probe, std::string_view bytes) {
  const std::size_t length = probe.size();
  if (bytes.size() < length) return false;
  const char* base = bytes.data();
  const std::size_t lastOffset = bytes.size() - length;
  const auto first = foldByte(static_cast<unsigned char>(probe[0]));
  const char lower = static_cast<char>(first);
  const char upper = static_cast<char>(first >= 'a' && first <= 'z' ? first - ('a' - 'A') : first);
  auto findFrom = [&](char c, std::size_t from) -> std::size_t {
    if (from > lastOffset) return SIZE_MAX;
    const void* hit = std::memchr(base + from, c, lastOffset + 1 - from);
    return hit == nullptr ? SIZE_MAX
                          : static_cast<std::size_t>(static_cast<const char*>(hit) - base);
  };
  std::size_t nextLower = findFrom(lower, 0);
  std::size_t nextUpper = lower == upper ? SIZE_MAX : findFrom(upper, 0);
  for (;;) {
    std::size_t offset = nextLower < nextUpper ? nextLower : nextUpper;
    if (offset == SIZE_MAX) return false;
    if (equalFolded(base + offset + 1, probe.data() + 1, length - 1)) return true;
    if (offset == nextLower) nextLower = findFrom(lower, offset + 1);
    if (offset == nextUpper) nextUpper = findFrom(upper, offset + 1);
  }
}

// Wildcard containment: the probe must match exactly `length` bytes at some offset,
// and a span holding a zero byte never matches, so each zero-free run is searched alone.
bool containsPattern(std::string_view probe, std::string_view bytes, bool caseSensitive) {
  const std::size_t length = probe.size();
  const auto* p = reinterpret_cast<const unsigned char*>(probe.data());
  const auto head = p[0];
  const bool headIsLiteral = head != '*' && head != '?';
  const unsigned char foldedHead = caseSensitive ? head : foldByte(head);
  std::size_t runStart = 0;
  while (runStart + length <= bytes.size()) {
    const void* zero = std::memchr(bytes.data() + runStart, 0, bytes.size() - runStart);
    std::size_t runEnd =
        zero == nullptr ? bytes.size()
                        : static_cast<std::size_t>(static_cast<const char*>(zero) - bytes.data());
    const auto* run = reinterpret_cast<const unsigned char*>(bytes.data());
    for (std::size_t offset = runStart; offset + length <= runEnd; ++offset) {
      if (headIsLiteral) {
        unsigned char c = caseSensitive ? run[offset] : foldByte(run[offset]);
        if (c != foldedHead) continue;
      }
      if (textops::matchCounted(p, length, run + offset, length, caseSensitive)) return true;
    }
    runStart = runEnd + 1;
  }
  return false;
}

// One containment probe with its method chosen once for a whole scan.
class ProbeSearch {
 public:
  ProbeSearch(const ElementArray& array, std::string_view probe)
      : probe_(probe), caseSensitive_(isCaseSensitive(array)) {
    if (isWildcardSearch(array)) {
      method_ = Method::Pattern;
    } else if (caseSensitive_ || !hasLetter(probe)) {
      // The probe holds no zero byte, so a plain search never matches across one.
      method_ = Method::Exact;
    } else {
      method_ = Method::Folded;
    }
  }

  bool in(std::string_view bytes) const {
    if (probe_.empty()) return true;
    if (bytes.size() < probe_.size()) return false;
    switch (method_) {
      case Method::Exact:
        return bytes.find(probe_) != std::string_view::npos;
      case Method::Folded:
        return containsFolded(probe_, bytes);
      default:
        return containsPattern(probe_, bytes, caseSensitive_);
    }
  }

  bool inElement(const Element& element) const {
    switch (element.type()) {
      case ElementType::String:
        return in({element.bytes(), static_cast<std::size_t>(element.size() - 1)});
      case ElementType::Value: {
        NumberText scratch;
        return in(textOf(element, scratch));
      }
      case ElementType::File:
        return in({element.bytes(), static_cast<std::size_t>(element.size())});
      default:
        return probe_.empty();
    }
  }

 private:
  enum class Method { Exact, Folded, Pattern };

  std::string_view probe_;
  bool caseSensitive_;
  Method method_ = Method::Exact;
};

}  // namespace

int32_t indexOfKey(const ElementArray& array, const ElementValue& probe) {
  const auto elements = array.slots();
  for (std::size_t i = 0; i < elements.size(); ++i) {
    const Element* key = elements[i].key();
    if (key != nullptr && compareWithElement(array, probe, *key) == 0)
      return static_cast<int32_t>(i);
  }
  return -1;
}

const char* stringWithKey(ElementArray& array, const ElementValue& probe) {
  return array.getString(indexOfKey(array, probe));
}

int32_t valueWithKey(const ElementArray& array, const ElementValue& probe) {
  return array.getValue(indexOfKey(array, probe));
}

namespace {

// Literal find: equality of texts, tested by length first. A Value element can only
// equal a probe that is the canonical decimal text of a non-zero number.
int32_t findStringLiteral(const ElementArray& array, std::string_view probe) {
  const bool caseSensitive = isCaseSensitive(array);
  NumberText canonical;
  const int32_t probeNumber = readDecimal(probe);
  const bool probeIsNumber =
      probeNumber != 0 &&
      std::string_view(canonical.text, static_cast<std::size_t>(
                                           writeDecimal(probeNumber, canonical.text))) == probe;
  const auto elements = array.slots();
  for (std::size_t i = 0; i < elements.size(); ++i) {
    const Element& e = elements[i];
    bool hit;
    switch (e.type()) {
      case ElementType::String:
        hit = static_cast<std::size_t>(e.size()) == probe.size() + 1 &&
              equalText(caseSensitive, probe, {e.bytes(), probe.size()});
        break;
      case ElementType::Value:
        hit = probeIsNumber && e.number() == probeNumber;
        break;
      default:
        hit = probe.empty();
    }
    if (hit) return static_cast<int32_t>(i);
  }
  return -1;
}

int32_t findStringWildcard(const ElementArray& array, std::string_view probe) {
  const bool caseSensitive = isCaseSensitive(array);
  const bool matchesEmpty = textops::matchViews(probe, {}, caseSensitive);
  const auto elements = array.slots();
  NumberText scratch;
  for (std::size_t i = 0; i < elements.size(); ++i) {
    const Element& e = elements[i];
    bool hit = e.type() == ElementType::String || e.type() == ElementType::Value
                   ? textops::matchViews(probe, textOf(e, scratch), caseSensitive)
                   : matchesEmpty;
    if (hit) return static_cast<int32_t>(i);
  }
  return -1;
}

}  // namespace

int32_t findString(const ElementArray& array, const char* probe, int32_t /*ignored*/) {
  if (probe == nullptr) return -1;  // a missing probe equals and matches nothing present
  return isWildcardSearch(array) ? findStringWildcard(array, probe)
                                 : findStringLiteral(array, probe);
}

int32_t findValue(const ElementArray& array, int32_t number, int32_t /*ignored*/) {
  const auto elements = array.slots();
  for (std::size_t i = 0; i < elements.size(); ++i) {
    if (elements[i].asValue() == number) return static_cast<int32_t>(i);
  }
  return -1;
}

bool bytesContain(const ElementArray& array, std::string_view probe, std::string_view bytes) {
  return ProbeSearch(array, probe).in(bytes);
}

int32_t findContainingString(const ElementArray& array, const char* probe, int32_t /*ignored*/) {
  if (probe == nullptr) return -1;
  const std::string_view text(probe);
  if (text.empty()) return array.size() > 0 ? 0 : -1;
  const ProbeSearch search(array, text);
  const auto elements = array.slots();
  for (std::size_t i = 0; i < elements.size(); ++i) {
    if (search.inElement(elements[i])) return static_cast<int32_t>(i);
  }
  return -1;
}

int32_t findContainingValue(const ElementArray& array, int32_t number, int32_t ignored) {
  NumberText text;
  writeDecimal(number, text.text);
  return findContainingString(array, text.text, ignored);
}

}  // namespace quorrel
