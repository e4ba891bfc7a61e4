// Text made safe for the page's HTML, in element content and in quoted attributes.
#pragma once

#include <string>
#include <string_view>

namespace quorrel::help {

inline std::string escapeHtml(std::string_view text) {
  std::string out;
  for (char c : text) {
    switch (c) {
      case '&':
        out += "&amp;";
        break;
      case '<':
        out += "&lt;";
        break;
      case '>':
        out += "&gt;";
        break;
      case '"':
        out += "&quot;";
        break;
      default:
        out += c;
    }
  }
  return out;
}

}  // namespace quorrel::help
