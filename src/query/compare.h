// Text comparison under the array's case and search settings, and the wildcard
// matcher. Every key lookup, find, label lookup, selection and sort compares through
// these. Nothing here allocates or keeps state.
//
// Texts are zero-terminated; a null pointer is a missing text, which orders before
// every present text (the empty one included). Bytes compare unsigned. Case folding
// maps only 'A'..'Z' to 'a'..'z'. Only the sign of a three-way result is meaningful.
#pragma once

#include <cstdint>
#include <string_view>

#include "array/element.h"
#include "array/element_array.h"

namespace quorrel {

inline bool isCaseSensitive(const ElementArray& array) {
  return array.settings.caseMode == CaseSensitive;
}
inline bool isWildcardSearch(const ElementArray& array) {
  return array.settings.searchMode == SearchWildcard;
}

// 'A'..'Z' to 'a'..'z'; every other byte unchanged.
inline unsigned char foldByte(unsigned char c) {
  return (c >= 'A' && c <= 'Z') ? static_cast<unsigned char>(c + ('a' - 'A')) : c;
}

// Three-way literal comparison under caseMode; case sensitive gives exactly -1, 0 or 1.
int32_t compareText(const ElementArray& array, const char* a, const char* b);
// The same over at most n characters (n below 1 compares nothing and gives 0).
int32_t compareTextPrefix(const ElementArray& array, const char* a, const char* b, int32_t n);

// Anchored match of the whole text: '*' any run, '?' exactly one character, no escape.
// Greedy with a single resume point: constant memory, no recursion.
bool wildcardMatch(const char* pattern, const char* text, bool caseSensitive);
// The same on counted texts (the text may be a span of a longer one).
bool wildcardMatch(std::string_view pattern, std::string_view text, bool caseSensitive);

// 0 when the pattern matches the whole text, otherwise non-zero (-1 missing pattern,
// 1 missing text or no match).
int32_t matchPattern(const ElementArray& array, const char* pattern, const char* text);

// Literal mode: compareText(probe, candidate). Wildcard mode: matchPattern(probe,
// candidate) - the probe is the pattern.
int32_t searchCompare(const ElementArray& array, const char* probe, const char* candidate);

// Compares the probe with the first n characters of the candidate. Literal mode:
// compareTextPrefix. Wildcard mode: 1 when the candidate has fewer than n characters,
// else the probe matched against exactly those n. Never reads past the candidate's
// first zero byte or its n-th byte, so the candidate may point into raw file bytes.
int32_t searchCompareSpan(const ElementArray& array, const char* probe, const char* candidate,
                          int32_t n);

// Three-way comparison of an operand with an element's content:
// - Value operand: its number against the element's asValue;
// - String operand: searchCompare(element's text, operand's text) - the element's text
//   comes first, so in wildcard mode it is the pattern;
// - None or File operand: byte counts first, then the stored bytes unsigned.
int32_t compareWithElement(const ElementArray& array, const ElementValue& operand,
                           const Element& element);

}  // namespace quorrel
