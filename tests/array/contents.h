#pragma once

#include <string>

#include "array/element_array.h"

namespace quorrel {

// The array as one readable text: elements separated by '|', None shown as '_'.
inline std::string contents(ElementArray& a) {
  std::string out;
  for (int32_t i = 0; i < a.size(); ++i) {
    if (i > 0) out += '|';
    out += a.at(i).type() == ElementType::None ? std::string("_") : a.getString(i);
  }
  return out;
}

// Appends one single-character text per character of `chars`.
inline ElementArray& fill(ElementArray& a, const char* chars) {
  for (; *chars != '\0'; ++chars) a.appendString(std::string(1, *chars).c_str());
  return a;
}

}  // namespace quorrel
