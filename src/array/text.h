// Small text helpers shared by every subsystem: the C library's number reading and
// tokenizing rules, without their locale or hidden global state.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace quorrel {

// Reads a decimal integer the way atol does: skip C-locale white space, one optional
// sign, then digits up to the first non-digit. No digits give 0. Numbers that do not
// fit 32 bits saturate to INT32_MAX / INT32_MIN.
int32_t readDecimal(const char* text);
int32_t readDecimal(std::string_view text);
// Whether readDecimal reads all of the text (blanks around it aside) without saturating.
bool isWholeDecimal(std::string_view text);

// Writes value in decimal into out (at least 12 bytes) with its terminator and
// returns the number of characters written.
int writeDecimal(int32_t value, char* out);

// strtok's splitting rules without its global state: every character of separators
// separates, runs of separators count as one, leading and trailing separators are
// skipped and no token is empty. Empty separators leave the whole text as one token.
class TokenSplitter {
 public:
  TokenSplitter(std::string_view text, std::string_view separators)
      : text_(text), separators_(separators) {}

  std::optional<std::string_view> next();

 private:
  bool isSeparator(char c) const { return separators_.find(c) != std::string_view::npos; }

  std::string_view text_;
  std::string_view separators_;
  std::size_t pos_ = 0;
};

}  // namespace quorrel
