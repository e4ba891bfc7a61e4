// Names, kinds, extensions and locale names are compared without regard to ASCII case.
#pragma once

#include <cctype>
#include <string>
#include <string_view>

namespace quorrel::tool {

inline std::string lowerCase(std::string_view text) {
  std::string out(text);
  for (char& c : out) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return out;
}

}  // namespace quorrel::tool
