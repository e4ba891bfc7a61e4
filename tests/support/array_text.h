// Building small arrays and reading a whole array back as one text, for tests that
// compare arrays at once.
#pragma once

#include <cstdlib>
#include <initializer_list>
#include <string>
#include <vector>

#include "array/element_array.h"

namespace quorrel {

inline constexpr uint8_t S = RowSelected;
inline constexpr uint8_t U = RowUnselected;
using States = std::vector<uint8_t>;

// An array of the given dimensions and first boundaries.
inline ElementArray shaped(int32_t dimensions, int32_t x = 0, int32_t y = 0) {
  ElementArray a;
  a.setDimensions(dimensions);
  if (x != 0) a.setBoundary(1, x);
  if (y != 0) a.setBoundary(2, y);
  return a;
}

// The array with texts, and numbers written as "#n" ("#0" stores None), appended.
inline ElementArray with(ElementArray a, std::initializer_list<const char*> items) {
  for (const char* item : items)
    item[0] == '#' ? a.appendValue(std::atoi(item + 1)) : a.appendString(item);
  return a;
}

// The element's own bytes (a String's with its terminator), for comparisons.
inline std::string contentOf(const Element& e) {
  return e.bytes() == nullptr ? std::string()
                              : std::string(e.bytes(), static_cast<size_t>(e.size()));
}
// One element in one text: type, size, text form and value, then its key's the same
// way, e.g. "String 5 «-42x» -42 key Value 4 «7» 7".
inline std::string describe(const Element& e) {
  static const char* const kTypes[] = {"None", "Value", "String", "File"};
  NumberText scratch;
  std::string out = std::string(kTypes[static_cast<int>(e.type())]) + " " +
                    std::to_string(e.size()) + " «" + e.asString(scratch) + "» " +
                    std::to_string(e.asValue());
  if (const Element* key = e.key()) out += " key " + describe(*key);
  return out;
}
// Every element in one text: texts as they are, "~" for None, "#n" for numbers and
// "<bytes>" for files.
inline std::string contents(ElementArray& a) {
  std::string out;
  for (int32_t i = 0; i < a.size(); ++i) {
    const Element& e = a.at(i);
    out += i == 0 ? "" : "|";
    out += e.type() == ElementType::None    ? "~"
           : e.type() == ElementType::Value ? "#" + std::to_string(e.number())
           : e.type() == ElementType::File  ? "<" + contentOf(e) + ">"
                                            : std::string(a.getString(i));
  }
  return out;
}

}  // namespace quorrel
