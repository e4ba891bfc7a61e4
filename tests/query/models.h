// Plain reference models shared by the query tests.
#pragma once

#include <string>
#include <vector>

#include "query/compare.h"

namespace quorrel {

inline ElementArray settings(bool wildcard, bool caseSensitive) {
  ElementArray a;
  a.settings.searchMode = wildcard ? SearchWildcard : SearchLiteral;
  a.settings.caseMode = caseSensitive ? CaseSensitive : CaseInsensitive;
  return a;
}

inline int sign(int32_t v) {
  return (v > 0) - (v < 0);
}

inline std::string fold(std::string s, bool caseSensitive) {
  for (char& c : s) {
    if (!caseSensitive && c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  }
  return s;
}

// Whole-text wildcard match by a table of prefix pairs.
inline bool patternMatches(const std::string& pattern, const std::string& text,
                           bool caseSensitive) {
  const std::string p = fold(pattern, caseSensitive);
  const std::string t = fold(text, caseSensitive);
  // ok[i][j]: the first i pattern characters match the first j text characters.
  const std::size_t width = t.size() + 1;
  std::vector<char> ok((p.size() + 1) * width, 0);
  auto at = [&](std::size_t i, std::size_t j) -> char& { return ok[i * width + j]; };
  at(0, 0) = 1;
  for (std::size_t i = 1; i <= p.size(); ++i) {
    for (std::size_t j = 0; j <= t.size(); ++j) {
      if (pattern[i - 1] == '*') {
        at(i, j) = at(i - 1, j) || (j > 0 && at(i, j - 1));
      } else if (j > 0) {
        at(i, j) = at(i - 1, j - 1) && (pattern[i - 1] == '?' || p[i - 1] == t[j - 1]);
      }
    }
  }
  return at(p.size(), t.size()) != 0;
}

}  // namespace quorrel
