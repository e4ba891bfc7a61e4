#include "query/text_probe.h"

#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "query/compare.h"

namespace quorrel {
namespace {

// Straightforward models of the two tests: fold whole strings, compare them, and match
// patterns with a table of prefix pairs.
std::string fold(std::string s, bool caseSensitive) {
  if (!caseSensitive) {
    for (char& c : s) {
      if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    }
  }
  return s;
}

bool patternMatches(const std::string& pattern, const std::string& text, bool caseSensitive) {
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

bool modelWhole(const std::string& probe, const std::string& text, bool wildcard,
                bool caseSensitive) {
  return wildcard ? patternMatches(probe, text, caseSensitive)
                  : fold(probe, caseSensitive) == fold(text, caseSensitive);
}

bool modelOccurs(const std::string& probe, const std::string& text, bool wildcard,
                 bool caseSensitive) {
  if (text.size() < probe.size()) return false;
  for (std::size_t o = 0; o + probe.size() <= text.size(); ++o) {
    if (modelWhole(probe, text.substr(o, probe.size()), wildcard, caseSensitive)) return true;
  }
  return false;
}

ElementArray settings(bool wildcard, bool caseSensitive) {
  ElementArray a;
  a.searchMode = wildcard ? SearchWildcard : SearchLiteral;
  a.caseMode = caseSensitive ? CaseSensitive : CaseInsensitive;
  return a;
}

// Letters of both cases, the characters next to the letter ranges ('@' '[' '`' '{'),
// which differ from letters by the case bit alone, the wildcard characters and a pair
// of high bytes one case bit apart.
const std::string kAlphabet = "aAbBzZ@[`{*?0_\xE1\xC1";

std::string randomText(std::mt19937& rng, std::size_t maxLength) {
  std::string s(rng() % (maxLength + 1), ' ');
  for (char& c : s) c = kAlphabet[rng() % kAlphabet.size()];
  return s;
}

// A probe that often occurs in the text: a piece of it with some letters flipped.
std::string probeFor(std::mt19937& rng, const std::string& text, std::size_t maxLength) {
  if (rng() % 3 == 0 || text.empty()) return randomText(rng, maxLength);
  const std::size_t from = rng() % text.size();
  std::string piece = text.substr(from, rng() % (maxLength + 1));
  for (char& c : piece) {
    if (rng() % 4 == 0 && ((c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'))) c ^= 0x20;
    if (rng() % 8 == 0) c = '?';
  }
  return piece;
}

void expectAgreement(const std::string& probe, const std::string& text, int& wholeHits,
                     int& occursHits) {
  for (int mode = 0; mode < 4; ++mode) {
    const bool wildcard = (mode & 1) != 0;
    const bool caseSensitive = (mode & 2) != 0;
    const ElementArray a = settings(wildcard, caseSensitive);
    const TextProbe prepared(a, probe.c_str());
    const bool whole = modelWhole(probe, text, wildcard, caseSensitive);
    const bool occurs = modelOccurs(probe, text, wildcard, caseSensitive);
    wholeHits += whole;
    occursHits += occurs;
    ASSERT_EQ(prepared.matchesWhole(text.c_str(), text.size()), whole)
        << "probe «" << probe << "» text «" << text << "» mode " << mode;
    ASSERT_EQ(searchCompare(a, probe.c_str(), text.c_str()) == 0, whole);
    ASSERT_EQ(prepared.occursIn(text.c_str(), text.size()), occurs)
        << "probe «" << probe << "» text «" << text << "» mode " << mode;
  }
}

TEST(TextProbe, AgreesWithAPlainModelOnRandomShortTexts) {
  std::mt19937 rng(2024);
  int wholeHits = 0;
  int occursHits = 0;
  for (int round = 0; round < 30000; ++round) {
    const std::string text = randomText(rng, 20);
    const std::string probe = probeFor(rng, text, 11);
    expectAgreement(probe, text, wholeHits, occursHits);
    if (HasFatalFailure()) return;
  }
  // Both outcomes of both tests are well exercised.
  EXPECT_GT(wholeHits, 5000);
  EXPECT_GT(occursHits, 40000);
  EXPECT_LT(occursHits, 100000);
}

TEST(TextProbe, LongProbesAroundThePreparedLength) {
  std::mt19937 rng(77);
  int wholeHits = 0;
  int occursHits = 0;
  for (int round = 0; round < 1500; ++round) {
    const std::string text = randomText(rng, 90);
    std::string probe = probeFor(rng, text, 80);
    if (rng() % 2 == 0) probe = text;  // whole-text hits for long texts
    expectAgreement(probe, text, wholeHits, occursHits);
    if (HasFatalFailure()) return;
  }
  EXPECT_GT(wholeHits, 2000);
  EXPECT_GT(occursHits, 2500);
}

TEST(TextProbe, ByHand) {
  const ElementArray literalFolded = settings(false, false);
  const ElementArray literalExact = settings(false, true);
  const ElementArray wild = settings(true, false);

  EXPECT_TRUE(TextProbe(literalFolded, "K000000500").matchesWhole("k000000500", 10));
  EXPECT_FALSE(TextProbe(literalExact, "K000000500").matchesWhole("k000000500", 10));
  EXPECT_FALSE(TextProbe(literalFolded, "abc").matchesWhole("abcd", 4));
  EXPECT_FALSE(TextProbe(literalFolded, "abcd").matchesWhole("abc", 3));
  // '@' and '`' differ by the case bit only, yet are different characters.
  EXPECT_FALSE(TextProbe(literalFolded, "`").matchesWhole("@", 1));
  EXPECT_FALSE(TextProbe(literalFolded, "\xE1").matchesWhole("\xC1", 1));
  EXPECT_TRUE(TextProbe(literalFolded, "").matchesWhole("", 0));
  // A missing probe matches nothing, and contains like the empty one.
  EXPECT_FALSE(TextProbe(literalFolded, nullptr).matchesWhole("", 0));
  EXPECT_FALSE(TextProbe(wild, nullptr).matchesWhole("", 0));
  EXPECT_TRUE(TextProbe(wild, nullptr).occursIn("", 0));
  EXPECT_TRUE(TextProbe(literalExact, nullptr).occursIn("abc", 3));

  EXPECT_TRUE(TextProbe(literalFolded, "05").occursIn("k000000500", 10));
  EXPECT_FALSE(TextProbe(literalFolded, "06").occursIn("k000000500", 10));
  EXPECT_TRUE(TextProbe(literalFolded, "B").occursIn("abc", 3));
  EXPECT_FALSE(TextProbe(literalExact, "B").occursIn("abc", 3));
  EXPECT_TRUE(TextProbe(literalFolded, "23").occursIn("1234", 4));
  EXPECT_TRUE(TextProbe(wild, "b?").occursIn("abc", 3));
  EXPECT_FALSE(TextProbe(wild, "b?").occursIn("ab", 2));
  EXPECT_TRUE(TextProbe(wild, "a*").matchesWhole("abc", 3));
  EXPECT_FALSE(TextProbe(wild, "b*").matchesWhole("abc", 3));
  // In literal mode the wildcard characters are ordinary ones.
  EXPECT_FALSE(TextProbe(literalFolded, "a*").matchesWhole("abc", 3));
  EXPECT_TRUE(TextProbe(literalFolded, "?c").occursIn("b?C", 3));
}

TEST(TextProbe, TheBoundOnlyLimitsWhatIsRead) {
  const ElementArray a = settings(false, false);
  // Text bytes after the zero are never part of the text, whatever the bound.
  const char stored[] = "ab\0cd";
  EXPECT_TRUE(TextProbe(a, "AB").matchesWhole(stored, 5));
  EXPECT_FALSE(TextProbe(a, "ABxcd").matchesWhole(stored, 5));
  EXPECT_FALSE(TextProbe(a, "abcdefghijk").matchesWhole(stored, 5));
  // A long probe against a text that ends before it.
  const std::string probe(70, 'q');
  const std::string shorter(69, 'Q');
  EXPECT_FALSE(TextProbe(a, probe.c_str()).matchesWhole(shorter.c_str(), shorter.size()));
  EXPECT_TRUE(TextProbe(a, probe.c_str()).matchesWhole((shorter + "q").c_str(), 70));
}

}  // namespace
}  // namespace quorrel
