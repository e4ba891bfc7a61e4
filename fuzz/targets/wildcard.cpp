// The greedy wildcard matcher against a plain memoised reference matcher: any
// disagreement is a crash. Input: byte 0 = flags (bit 0: case sensitive), byte 1 = pattern
// length, then the pattern, then the text (zero bytes end each, as in the host's texts).
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz_input.h"
#include "query/compare.h"

namespace {

unsigned char fold(unsigned char c, bool caseSensitive) {
  return (!caseSensitive && c >= 'A' && c <= 'Z') ? static_cast<unsigned char>(c + 32) : c;
}

// matches[i][j]: pattern from i matches the whole text from j.
bool referenceMatch(const std::string& p, const std::string& t, bool caseSensitive) {
  const size_t P = p.size(), T = t.size();
  std::vector<std::vector<char>> matches(P + 1, std::vector<char>(T + 1, 0));
  matches[P][T] = 1;
  for (size_t i = P; i-- > 0;) {
    for (size_t j = T + 1; j-- > 0;) {
      if (p[i] == '*') {
        matches[i][j] = matches[i + 1][j] || (j < T && matches[i][j + 1]);
      } else if (j < T &&
                 (p[i] == '?' || fold(static_cast<unsigned char>(p[i]), caseSensitive) ==
                                     fold(static_cast<unsigned char>(t[j]), caseSensitive))) {
        matches[i][j] = matches[i + 1][j + 1];
      }
    }
  }
  return matches[0][0] != 0;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  quorrel::FuzzInput in(data, size);
  const bool caseSensitive = (in.byte() & 1) != 0;
  std::string pattern = in.text(in.byte());
  std::string text = in.text(2048);
  const bool fast = quorrel::wildcardMatch(pattern.c_str(), text.c_str(), caseSensitive);
  if (fast != referenceMatch(pattern, text, caseSensitive)) __builtin_trap();
  return 0;
}
