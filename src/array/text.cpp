#include "array/text.h"

#include <algorithm>
#include <charconv>
#include <cstring>

namespace quorrel {

namespace {

bool isCSpace(char c) {
  return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r';
}

}  // namespace

int32_t readDecimal(std::string_view text) {
  std::size_t i = 0;
  while (i < text.size() && isCSpace(text[i])) ++i;
  bool negative = false;
  if (i < text.size() && (text[i] == '+' || text[i] == '-')) {
    negative = text[i] == '-';
    ++i;
  }
  // Accumulate the magnitude, stopping once it is past any 32-bit value.
  constexpr int64_t kLimit = int64_t{INT32_MAX} + 1;
  int64_t magnitude = 0;
  for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
    if (magnitude <= kLimit) magnitude = magnitude * 10 + (text[i] - '0');
  }
  if (negative) return magnitude >= kLimit ? INT32_MIN : static_cast<int32_t>(-magnitude);
  return magnitude > INT32_MAX ? INT32_MAX : static_cast<int32_t>(magnitude);
}

bool isWholeDecimal(std::string_view text) {
  while (!text.empty() && isCSpace(text.front())) text.remove_prefix(1);
  while (!text.empty() && isCSpace(text.back())) text.remove_suffix(1);
  const bool negative = !text.empty() && text.front() == '-';
  if (!text.empty() && (text.front() == '+' || negative)) text.remove_prefix(1);
  if (text.empty()) return false;
  int64_t magnitude = 0;
  for (const char c : text) {
    if (c < '0' || c > '9') return false;
    magnitude = std::min<int64_t>(magnitude * 10 + (c - '0'), int64_t{INT32_MAX} + 2);
  }
  return magnitude <= int64_t{INT32_MAX} + (negative ? 1 : 0);
}

int32_t readDecimal(const char* text) {
  return text == nullptr ? 0 : readDecimal(std::string_view(text));
}

int writeDecimal(int32_t value, char* out) {
  char* const end = std::to_chars(out, out + 11, value).ptr;
  *end = '\0';
  return static_cast<int>(end - out);
}

std::optional<std::string_view> TokenSplitter::next() {
  while (pos_ < text_.size() && isSeparator(text_[pos_])) ++pos_;
  if (pos_ >= text_.size()) return std::nullopt;
  std::size_t start = pos_;
  while (pos_ < text_.size() && !isSeparator(text_[pos_])) ++pos_;
  return text_.substr(start, pos_ - start);
}

}  // namespace quorrel
