#include "query/lists.h"

#include <string_view>

#include "array/int32.h"
#include "array/notes.h"
#include "array/text.h"

namespace quorrel {

namespace {

constexpr char kQuote = '\'';

bool isListed(const Element& e) {
  return e.type() == ElementType::Value || e.type() == ElementType::String;
}

// One field: the text form of a Value or String (nothing otherwise), in quotes when
// asked and the content is a String. The same description serves to measure and to
// write, so the two passes cannot disagree.
struct Field {
  std::string_view text;
  bool quoted = false;

  static Field of(const Element* e, bool quoteStrings, NumberText& scratch) {
    if (e == nullptr) return {};
    if (e->type() == ElementType::String)
      return {{e->bytes(), static_cast<std::size_t>(e->size() - 1)}, quoteStrings};
    if (e->type() == ElementType::Value)
      return {{scratch.text, static_cast<std::size_t>(writeDecimal(e->number(), scratch.text))},
              false};
    return {};
  }
  std::size_t length() const { return text.size() + (quoted ? 2 : 0); }
  void appendTo(std::string& out) const {
    if (quoted) out += kQuote;
    out.append(text);
    if (quoted) out += kQuote;
  }
};

std::string_view viewOf(const char* text) {
  return text == nullptr ? std::string_view{} : text;
}

// The field of element i in an element or key list.
template <bool kKeys>
const Element* listedPart(const Element& e) {
  if constexpr (kKeys) {
    return e.key() != nullptr && isListed(*e.key()) ? e.key() : nullptr;
  } else {
    return isListed(e) ? &e : nullptr;
  }
}

template <bool kKeys>
std::string fieldList(const ElementArray& array, const char* delimiterText, bool quoted) {
  const std::string_view delimiter = viewOf(delimiterText);
  const auto elements = array.slots();
  NumberText scratch;
  std::size_t total = 0;
  for (const Element& e : elements)
    total += Field::of(listedPart<kKeys>(e), quoted, scratch).length();
  if (!elements.empty()) total += delimiter.size() * (elements.size() - 1);

  std::string out;
  out.reserve(total);
  bool first = true;
  for (const Element& e : elements) {
    if (!first) out.append(delimiter);
    first = false;
    Field::of(listedPart<kKeys>(e), quoted, scratch).appendTo(out);
  }
  return out;
}

bool isPaired(const Element& e) {
  return isListed(e) && e.key() != nullptr;
}

std::string pairs(const ElementArray& array, const char* separatorText, const char* delimiterText,
                  bool quoted) {
  const std::string_view separator = viewOf(separatorText);
  const std::string_view delimiter = viewOf(delimiterText);
  const auto elements = array.slots();
  // A key of any type takes part (None and File read as empty); it is never quoted.
  auto keyField = [](const Element& e, NumberText& scratch) {
    return Field::of(e.key(), false, scratch);
  };
  NumberText keyScratch, scratch;
  std::size_t total = 0;
  std::size_t count = 0;
  for (const Element& e : elements) {
    if (!isPaired(e)) continue;
    total += keyField(e, keyScratch).length() + separator.size() +
             Field::of(&e, quoted, scratch).length();
    ++count;
  }
  if (count > 0) total += delimiter.size() * (count - 1);

  std::string out;
  out.reserve(total);
  bool first = true;
  for (const Element& e : elements) {
    if (!isPaired(e)) continue;
    if (!first) out.append(delimiter);
    first = false;
    keyField(e, keyScratch).appendTo(out);
    out.append(separator);
    Field::of(&e, quoted, scratch).appendTo(out);
  }
  return out;
}

}  // namespace

std::string elementList(const ElementArray& array, const char* delimiter) {
  return fieldList<false>(array, delimiter, false);
}

std::string quotedElementList(const ElementArray& array, const char* delimiter) {
  return fieldList<false>(array, delimiter, true);
}

std::string keyList(const ElementArray& array, const char* delimiter) {
  return fieldList<true>(array, delimiter, false);
}

std::string quotedKeyList(const ElementArray& array, const char* delimiter) {
  return fieldList<true>(array, delimiter, true);
}

std::string pairList(const ElementArray& array, const char* separator, const char* delimiter) {
  return pairs(array, separator, delimiter, false);
}

std::string quotedPairList(const ElementArray& array, const char* separator,
                           const char* delimiter) {
  return pairs(array, separator, delimiter, true);
}

int32_t maxValue(const ElementArray& array) {
  const auto elements = array.slots();
  if (elements.empty()) return 0;
  int32_t result = elements[0].asValue();
  for (const Element& e : elements) {
    int32_t v = e.asValue();
    if (v >= result) result = v;
  }
  return result;
}

int32_t minValue(const ElementArray& array) {
  const auto elements = array.slots();
  if (elements.empty()) return 0;
  int32_t result = elements[0].asValue();
  for (const Element& e : elements) {
    int32_t v = e.asValue();
    if (v <= result) result = v;
  }
  return result;
}

int32_t sumValue(const ElementArray& array) {
  int32_t sum = 0;
  for (const Element& e : array.slots()) sum = addWrap(sum, e.asValue());
  if (notesWanted()) {
    int64_t total = 0;
    for (const Element& e : array.slots()) total += e.asValue();
    noteTotal(total);
  }
  return sum;
}

int32_t averageValue(const ElementArray& array) {
  return divTrunc(sumValue(array), array.size());
}

}  // namespace quorrel
