#include "query/compare.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

namespace quorrel {
namespace {

ElementArray arrayWith(int16_t caseMode, int16_t searchMode) {
  ElementArray array;
  array.caseMode = caseMode;
  array.searchMode = searchMode;
  return array;
}

TEST(CompareText, FoldingMissingTextsAndUnsignedBytes) {
  ElementArray insensitive = arrayWith(CaseInsensitive, SearchLiteral);
  ElementArray sensitive = arrayWith(CaseSensitive, SearchLiteral);
  EXPECT_EQ(compareText(insensitive, "abc", "ABC"), 0);
  EXPECT_EQ(compareText(sensitive, "abc", "ABC"), 1);
  // '_' (0x5F) orders before the letters when folded, between the cases when not.
  EXPECT_GT(compareText(insensitive, "A", "_"), 0);
  EXPECT_EQ(compareText(sensitive, "A", "_"), -1);
  EXPECT_EQ(compareText(sensitive, "_", "a"), -1);
  // Bytes above 0x7F order after ASCII and never fold.
  EXPECT_EQ(compareText(sensitive, "\xC9", "z"), 1);
  EXPECT_GT(compareText(insensitive, "\xC9", "z"), 0);
  EXPECT_NE(compareText(insensitive, "\xC9", "\xE9"), 0);
  // Missing texts order before every present text, the empty one included.
  EXPECT_EQ(compareText(insensitive, nullptr, ""), -1);
  EXPECT_EQ(compareText(insensitive, "", nullptr), 1);
  EXPECT_EQ(compareText(insensitive, nullptr, nullptr), 0);
  // A text that ends first is smaller.
  EXPECT_LT(compareText(insensitive, "ab", "abc"), 0);
  EXPECT_EQ(compareText(sensitive, "abc", "ab"), 1);
  // The largest byte against the smallest: no signed overflow of the difference.
  EXPECT_GT(compareText(insensitive, "\xFF", "\x01"), 0);
  // Case sensitive results are exactly -1, 0, 1.
  EXPECT_EQ(compareText(sensitive, "a", "z"), -1);
  EXPECT_EQ(compareText(sensitive, "z", "a"), 1);
}

TEST(CompareText, PrefixOrderOfTests) {
  ElementArray insensitive = arrayWith(CaseInsensitive, SearchLiteral);
  EXPECT_EQ(compareTextPrefix(insensitive, "abcd", "abXY", 2), 0);
  EXPECT_LT(compareTextPrefix(insensitive, "abcd", "abXY", 3), 0);
  EXPECT_EQ(compareTextPrefix(insensitive, "ABcd", "abXY", 2), 0);
  EXPECT_EQ(compareTextPrefix(insensitive, nullptr, "x", 0), 0);
  EXPECT_EQ(compareTextPrefix(insensitive, "x", nullptr, -3), 0);
  EXPECT_EQ(compareTextPrefix(insensitive, nullptr, nullptr, 5), 0);
  EXPECT_EQ(compareTextPrefix(insensitive, nullptr, "x", 1), -1);
  EXPECT_EQ(compareTextPrefix(insensitive, "x", nullptr, 1), 1);
  // Stops early at the end of both texts: equal texts shorter than n are equal.
  EXPECT_EQ(compareTextPrefix(insensitive, "ab", "AB", 10), 0);
  EXPECT_LT(compareTextPrefix(insensitive, "ab", "abc", 10), 0);
}

TEST(WildcardMatch, SpecifiedCases) {
  EXPECT_TRUE(wildcardMatch("a*c", "abc", false));
  EXPECT_TRUE(wildcardMatch("a*c", "ac", false));
  EXPECT_TRUE(wildcardMatch("a*c", "abbbc", false));
  EXPECT_FALSE(wildcardMatch("a*c", "abcd", false));
  EXPECT_TRUE(wildcardMatch("a?c", "abc", false));
  EXPECT_FALSE(wildcardMatch("a?c", "ac", false));
  EXPECT_TRUE(wildcardMatch("*", "", false));
  EXPECT_TRUE(wildcardMatch("*", "anything at all", false));
  EXPECT_TRUE(wildcardMatch("", "", false));
  EXPECT_FALSE(wildcardMatch("", "a", false));
  EXPECT_FALSE(wildcardMatch("?", "", false));
  EXPECT_TRUE(wildcardMatch("*a", "bca", false));
  EXPECT_TRUE(wildcardMatch("*ab", "aab", false));
  EXPECT_TRUE(wildcardMatch("a*b*c", "axxbyyc", false));
  EXPECT_FALSE(wildcardMatch("a*b*c", "axxcyyb", false));
  EXPECT_FALSE(wildcardMatch("ab", "abc", false));
  EXPECT_TRUE(wildcardMatch("ab*", "abc", false));
  EXPECT_TRUE(wildcardMatch("A*", "abc", false));
  EXPECT_FALSE(wildcardMatch("A*", "abc", true));
}

TEST(WildcardMatch, AdversarialCases) {
  EXPECT_TRUE(wildcardMatch("***", "", true));
  EXPECT_TRUE(wildcardMatch("**a**", "a", true));
  EXPECT_TRUE(wildcardMatch("*a*", "xxaxx", true));
  EXPECT_FALSE(wildcardMatch("*a*", "xxbxx", true));
  EXPECT_TRUE(wildcardMatch("*?", "x", true));
  EXPECT_FALSE(wildcardMatch("*??", "x", true));
  EXPECT_FALSE(wildcardMatch("abc?", "abc", true));  // '?' never matches the end
  EXPECT_TRUE(wildcardMatch("a*?", "ab", true));
  EXPECT_TRUE(wildcardMatch("*a*a*a*a*b", "aaaaaaaaaaaaaaaaaab", true));
  EXPECT_FALSE(wildcardMatch("*a*a*a*a*b", "aaaaaaaaaaaaaaaaaaa", true));
  // '*' and '?' in the text are ordinary characters.
  EXPECT_TRUE(wildcardMatch("a?c", "a*c", true));
  EXPECT_TRUE(wildcardMatch("a*c", "a?c", true));
  EXPECT_TRUE(wildcardMatch("a\\*", "a\\*", true));  // no escape character
  EXPECT_FALSE(wildcardMatch("ab", "a*", true));
  // Folding: only A-Z; '_' and bytes above 0x7F compare unchanged.
  EXPECT_TRUE(wildcardMatch("HELLO_world", "hello_WORLD", false));
  EXPECT_FALSE(wildcardMatch("_", "\x7F", false));
  EXPECT_FALSE(wildcardMatch("\xC9*", "\xE9t\xE9", false));
  EXPECT_TRUE(wildcardMatch("\xC9?", "\xC9t", false));
  EXPECT_FALSE(wildcardMatch("[", "{", false));  // 0x5B is not folded to 0x7B
  // A long run that defeats naive greedy matching still ends quickly and correctly.
  std::string text(2000, 'a');
  EXPECT_FALSE(wildcardMatch("*a*a*a*a*a*a*a*b", text.c_str(), true));
  EXPECT_TRUE(wildcardMatch("*a*a*a*a*a*a*a*", text.c_str(), true));
}

// An independent matcher: plain recursion over the definition.
bool referenceMatch(const char* p, const char* t, bool caseSensitive) {
  if (*p == '\0') return *t == '\0';
  if (*p == '*')
    return referenceMatch(p + 1, t, caseSensitive) ||
           (*t != '\0' && referenceMatch(p, t + 1, caseSensitive));
  if (*t == '\0') return false;
  auto a = static_cast<unsigned char>(*p);
  auto b = static_cast<unsigned char>(*t);
  if (!caseSensitive) {
    if (a >= 'A' && a <= 'Z') a = static_cast<unsigned char>(a + 32);
    if (b >= 'A' && b <= 'Z') b = static_cast<unsigned char>(b + 32);
  }
  return (*p == '?' || a == b) && referenceMatch(p + 1, t + 1, caseSensitive);
}

TEST(WildcardMatch, AgreesWithRecursiveMatcherOnRandomInputs) {
  std::mt19937 rng(12345);
  const std::string patternAlphabet = "aAb*?*_\xE1";
  const std::string textAlphabet = "aAbB*?_\xE1\xC1";
  int matches = 0;
  for (int round = 0; round < 200000; ++round) {
    std::string pattern, text;
    int pl = static_cast<int>(rng() % 9);
    int tl = static_cast<int>(rng() % 11);
    for (int i = 0; i < pl; ++i) pattern += patternAlphabet[rng() % patternAlphabet.size()];
    for (int i = 0; i < tl; ++i) text += textAlphabet[rng() % textAlphabet.size()];
    bool caseSensitive = (round & 1) != 0;
    bool expected = referenceMatch(pattern.c_str(), text.c_str(), caseSensitive);
    matches += expected;
    ASSERT_EQ(wildcardMatch(pattern.c_str(), text.c_str(), caseSensitive), expected)
        << "pattern «" << pattern << "» text «" << text << "» case " << caseSensitive;
  }
  EXPECT_GT(matches, 10000);  // the inputs exercise both outcomes
}

TEST(SearchCompare, ModesAndArgumentOrder) {
  ElementArray wildcard = arrayWith(CaseInsensitive, SearchWildcard);
  ElementArray literal = arrayWith(CaseInsensitive, SearchLiteral);
  EXPECT_EQ(searchCompare(wildcard, "b*", "abc"), 1);
  EXPECT_EQ(searchCompare(wildcard, "*b*", "abc"), 0);
  EXPECT_EQ(searchCompare(wildcard, "abc", "*"), 1);  // the candidate is never a pattern
  EXPECT_EQ(searchCompare(wildcard, nullptr, "x"), -1);
  EXPECT_EQ(searchCompare(wildcard, "x", nullptr), 1);
  EXPECT_EQ(searchCompare(wildcard, nullptr, nullptr), 0);
  EXPECT_NE(searchCompare(literal, "*b*", "abc"), 0);
  EXPECT_EQ(searchCompare(literal, "ABC", "abc"), 0);
  EXPECT_LT(searchCompare(literal, "abb", "abc"), 0);
}

TEST(SearchCompare, SpanNeverReadsPastTheSpanOrAZero) {
  ElementArray wildcard = arrayWith(CaseInsensitive, SearchWildcard);
  ElementArray literal = arrayWith(CaseInsensitive, SearchLiteral);
  EXPECT_EQ(searchCompareSpan(wildcard, "b?", "abcd", 2), 1);
  EXPECT_EQ(searchCompareSpan(wildcard, "b?", "bcd", 2), 0);
  EXPECT_EQ(searchCompareSpan(wildcard, "b?", "b", 2), 1);
  EXPECT_EQ(searchCompareSpan(wildcard, "*", "", 0), 0);
  EXPECT_EQ(searchCompareSpan(wildcard, "", "", 0), 0);
  EXPECT_EQ(searchCompareSpan(literal, "bc", "BCD", 2), 0);
  EXPECT_NE(searchCompareSpan(literal, "bc", "bXd", 2), 0);
  // Raw bytes without a terminator: only the first n bytes are looked at.
  const char raw[3] = {'x', 'y', 'z'};
  EXPECT_EQ(searchCompareSpan(wildcard, "x?", raw, 2), 0);
  EXPECT_EQ(searchCompareSpan(literal, "xy", raw, 2), 0);
  // A zero byte inside the span ends the candidate: no match.
  const char zeroed[2] = {'x', '\0'};
  EXPECT_EQ(searchCompareSpan(wildcard, "x*", zeroed, 2), 1);
  EXPECT_NE(searchCompareSpan(literal, "xy", zeroed, 2), 0);
}

TEST(CompareWithElement, ByOperandType) {
  ElementArray literal = arrayWith(CaseInsensitive, SearchLiteral);
  ElementArray wildcard = arrayWith(CaseInsensitive, SearchWildcard);
  Element text7;
  text7.assign(ElementValue::ofText("7abc"));
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofValue(7), text7), 0);
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofValue(6), text7), -1);
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofValue(8), text7), 1);
  Element value7;
  value7.assign(ElementValue::ofValue(7));
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofText("7"), value7), 0);

  Element pattern;
  pattern.assign(ElementValue::ofText("ab*"));
  Element plain;
  plain.assign(ElementValue::ofText("abc"));
  EXPECT_EQ(compareWithElement(wildcard, ElementValue::ofText("abc"), pattern), 0);
  EXPECT_EQ(compareWithElement(wildcard, ElementValue::ofText("ab*"), plain), 1);

  Element zero;
  zero.assign(ElementValue::ofValue(0));
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofValue(0), zero), 0);
  EXPECT_NE(compareWithElement(literal, ElementValue::ofText("0"), zero), 0);
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofText(""), zero), 0);

  // Byte operands: count first, then unsigned bytes.
  Element file;
  const char bytes[3] = {'a', '\x80', 'c'};
  file.assign(ElementValue::ofBytes(bytes, 3));
  const char same[3] = {'a', '\x80', 'c'};
  const char lower[3] = {'a', '\x7F', 'z'};
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofBytes(same, 3), file), 0);
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofBytes(lower, 3), file), -1);
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofBytes(same, 2), file), -1);
  EXPECT_EQ(compareWithElement(literal, ElementValue::ofBytes("abcd", 4), file), 1);
  EXPECT_EQ(compareWithElement(literal, ElementValue{}, zero), 0);
  EXPECT_EQ(compareWithElement(literal, ElementValue{}, plain), -1);
}

}  // namespace
}  // namespace quorrel
