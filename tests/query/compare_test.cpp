#include "query/compare.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "models.h"

namespace quorrel {
namespace {

// '_' (0x5F) orders before the letters when folded, between the cases when not. Bytes
// above 0x7F order after ASCII and never fold. A missing text orders before every
// present one, the empty one included; a text that ends first is smaller. The largest
// byte against the smallest must not overflow a signed difference.
TEST(CompareText, FoldingMissingTextsAndUnsignedBytes) {
  const ElementArray modes[] = {settings(false, false), settings(false, true)};
  const struct {
    int caseSensitive;
    const char *a, *b;
    int order;
  } cases[] = {{0, "abc", "ABC", 0}, {1, "abc", "ABC", 1},     {0, "A", "_", 1},
               {1, "A", "_", -1},    {1, "_", "a", -1},        {1, "\xC9", "z", 1},
               {0, "\xC9", "z", 1},  {0, "\xC9", "\xE9", -1},  {0, nullptr, "", -1},
               {0, "", nullptr, 1},  {0, nullptr, nullptr, 0}, {0, "ab", "abc", -1},
               {1, "abc", "ab", 1},  {0, "\xFF", "\x01", 1},   {1, "a", "z", -1}};
  for (const auto& c : cases) {
    const int32_t result = compareText(modes[c.caseSensitive], c.a, c.b);
    EXPECT_EQ(sign(result), c.order) << (c.a ? c.a : "null") << " " << (c.b ? c.b : "null");
    EXPECT_TRUE(!c.caseSensitive || result == c.order) << "case sensitive: exactly -1, 0, 1";
  }

  // Prefixes: n below 1 compares nothing; equal texts shorter than n are equal.
  const struct {
    const char *a, *b;
    int32_t n, order;
  } prefixes[] = {// clang-format off
      {"ABcd", "abXY", 2, 0}, {"abcd", "abXY", 3, -1}, {nullptr, "x", 0, 0}, {"x", nullptr, -3, 0},
      {nullptr, nullptr, 5, 0}, {nullptr, "x", 1, -1}, {"x", nullptr, 1, 1}, {"ab", "AB", 10, 0},
      {"ab", "abc", 10, -1}};
  // clang-format on
  for (const auto& c : prefixes) {
    EXPECT_EQ(sign(compareTextPrefix(modes[0], c.a, c.b, c.n)), c.order) << c.n;
  }
}

// The random inputs below cover the wildcard rules over their alphabet; these pin what
// lies outside it: no escape character, folding only A-Z, and long runs that defeat
// naive greedy matching.
TEST(WildcardMatch, ByHand) {
  EXPECT_TRUE(wildcardMatch("a\\*", "a\\bc", false));  // a backslash escapes nothing
  EXPECT_TRUE(wildcardMatch("HELLO_world", "hello_WORLD", false));
  EXPECT_FALSE(wildcardMatch("_", "\x7F", false));
  EXPECT_FALSE(wildcardMatch("[", "{", false));
  EXPECT_FALSE(wildcardMatch("\xC9*", "\xE9t\xE9", false));
  std::string text(2000, 'a');
  EXPECT_FALSE(wildcardMatch("*a*a*a*a*a*a*a*b", text.c_str(), true));
  EXPECT_TRUE(wildcardMatch("*a*a*a*a*a*a*a*", text.c_str(), true));
}

TEST(WildcardMatch, AgreesWithAReferenceMatcherOnRandomInputs) {
  std::mt19937 rng(12345);
  const std::string patternAlphabet = "aAb*?*_\xE1";
  const std::string textAlphabet = "aAbB*?_\xE1\xC1";
  int matches = 0;
  for (int round = 0; round < 200000; ++round) {
    std::string pattern(rng() % 9, ' '), text(rng() % 11, ' ');
    for (char& c : pattern) c = patternAlphabet[rng() % patternAlphabet.size()];
    for (char& c : text) c = textAlphabet[rng() % textAlphabet.size()];
    const bool caseSensitive = (round & 1) != 0;
    const bool expected = patternMatches(pattern, text, caseSensitive);
    matches += expected;
    ASSERT_EQ(wildcardMatch(pattern.c_str(), text.c_str(), caseSensitive), expected)
        << "pattern «" << pattern << "» text «" << text << "» case " << caseSensitive;
  }
  EXPECT_GT(matches, 10000);  // the inputs exercise both outcomes
}

// The probe is the pattern, never the candidate. Spans never read past their length or
// a zero byte: the candidates below are not terminated ("xyz" is cut at 2) or hold a
// zero inside the span.
TEST(SearchCompare, ModesArgumentOrderAndSpans) {
  const ElementArray modes[] = {settings(false, false), settings(true, false)};
  const struct {
    bool wildcard;
    const char *probe, *candidate;
    int32_t n, result;  // n < 0: the whole candidate
  } cases[] = {         // clang-format off
      {1, "b*", "abc", -1, 1},   {1, "*b*", "abc", -1, 0},  {1, "abc", "*", -1, 1},
      {1, nullptr, "x", -1, -1}, {1, "x", nullptr, -1, 1},  {1, nullptr, nullptr, -1, 0},
      {0, "*b*", "abc", -1, -1},  {0, "ABC", "abc", -1, 0},  {1, "b?", "abcd", 2, 1},
      {1, "b?", "bcd", 2, 0},    {1, "b?", "b", 2, 1},      {1, "*", "", 0, 0},
      {0, "bc", "BCD", 2, 0},    {0, "bc", "bXd", 2, -1},    {1, "x?", "xyz", 2, 0},
      {0, "xy", "xyz", 2, 0},    {1, "x*", "x\0", 2, 1},    {0, "xy", "x\0", 2, 1}};
  // clang-format on
  for (const auto& c : cases) {
    const ElementArray& a = modes[c.wildcard];
    const int32_t result = c.n < 0 ? searchCompare(a, c.probe, c.candidate)
                                   : searchCompareSpan(a, c.probe, c.candidate, c.n);
    EXPECT_EQ(c.wildcard ? result : sign(result), c.result)
        << (c.probe ? c.probe : "null") << " " << (c.candidate ? c.candidate : "null");
  }
}

// Numbers against texts by leading number, texts against patterns in wildcard mode, a
// missing operand as None; byte operands by count first, then unsigned bytes.
TEST(CompareWithElement, ByOperandType) {
  using V = ElementValue;
  const ElementArray modes[] = {settings(false, false), settings(true, false)};
  const char bytes[3] = {'a', '\x80', 'c'};
  const char lower[3] = {'a', '\x7F', 'z'};
  const struct {
    bool wildcard;
    V operand, element;
    int32_t result;
  } cases[] = {// clang-format off
      {0, V::ofValue(7), V::ofText("7abc"), 0}, {0, V::ofValue(6), V::ofText("7abc"), -1},
      {0, V::ofValue(8), V::ofText("7abc"), 1}, {0, V::ofText("7"), V::ofValue(7), 0},
      {1, V::ofText("abc"), V::ofText("ab*"), 0}, {1, V::ofText("ab*"), V::ofText("abc"), 1},
      {0, V::ofValue(0), V::ofValue(0), 0}, {0, V::ofText(""), V::ofValue(0), 0},
      {0, V{}, V::ofValue(0), 0}, {0, V{}, V::ofText("abc"), -1},
      {0, V::ofBytes(bytes, 3), V::ofBytes(bytes, 3), 0},
      {0, V::ofBytes(lower, 3), V::ofBytes(bytes, 3), -1},
      {0, V::ofBytes(bytes, 2), V::ofBytes(bytes, 3), -1},
      {0, V::ofBytes("abcd", 4), V::ofBytes(bytes, 3), 1}};
  // clang-format on
  for (const auto& c : cases) {
    Element e;
    e.assign(c.element);
    EXPECT_EQ(compareWithElement(modes[c.wildcard], c.operand, e), c.result)
        << (c.operand.bytes ? c.operand.bytes : "") << " " << c.operand.number;
  }
  Element none;
  EXPECT_NE(compareWithElement(modes[0], V::ofText("0"), none), 0);
}

}  // namespace
}  // namespace quorrel
