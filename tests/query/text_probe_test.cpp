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
    // The case bit of a character that is not a letter makes a different character.
    if (rng() % 12 == 0) c ^= 0x20;
    if (rng() % 8 == 0) c = '?';
  }
  return piece;
}

// The literal order of folded texts: unsigned bytes, a text that ends first is smaller.
int modelOrder(const std::string& probe, const std::string& text, bool caseSensitive) {
  const std::string p = fold(probe, caseSensitive);
  const std::string t = fold(text, caseSensitive);
  for (std::size_t i = 0; i < p.size() && i < t.size(); ++i) {
    const auto a = static_cast<unsigned char>(p[i]);
    const auto b = static_cast<unsigned char>(t[i]);
    if (a != b) return a < b ? -1 : 1;
  }
  return p.size() < t.size() ? -1 : p.size() > t.size() ? 1 : 0;
}

int sign(int32_t v) {
  return (v > 0) - (v < 0);
}

struct Hits {
  int whole = 0;
  int occurs = 0;
  int below = 0;
  int above = 0;
};

// Checks every mode. The text is stored with up to eight bytes after its zero, as a
// String element may be, and the bound covers them.
void expectAgreement(std::mt19937& rng, const std::string& probe, const std::string& text,
                     Hits& hits) {
  std::string stored = text + '\0';
  const std::size_t extra = rng() % 9;
  for (std::size_t i = 0; i < extra; ++i) stored += kAlphabet[rng() % kAlphabet.size()];
  const std::size_t bound = text.size() + extra;
  for (int mode = 0; mode < 4; ++mode) {
    const bool wildcard = (mode & 1) != 0;
    const bool caseSensitive = (mode & 2) != 0;
    const ElementArray a = settings(wildcard, caseSensitive);
    const TextProbe prepared(a, probe.c_str());
    const bool whole = modelWhole(probe, text, wildcard, caseSensitive);
    const bool occurs = modelOccurs(probe, text, wildcard, caseSensitive);
    const int order = modelOrder(probe, text, caseSensitive);
    hits.whole += whole;
    hits.occurs += occurs;
    hits.below += order < 0;
    hits.above += order > 0;
    ASSERT_EQ(prepared.matchesWhole(stored.c_str(), bound), whole)
        << "probe «" << probe << "» text «" << text << "» mode " << mode;
    ASSERT_EQ(searchCompare(a, probe.c_str(), text.c_str()) == 0, whole);
    ASSERT_EQ(prepared.occursIn(text.c_str(), text.size()), occurs)
        << "probe «" << probe << "» text «" << text << "» mode " << mode;
    ASSERT_EQ(sign(prepared.compareTo(stored.c_str(), bound)), order)
        << "probe «" << probe << "» text «" << text << "» mode " << mode;
    ASSERT_EQ(sign(compareText(a, probe.c_str(), text.c_str())), order);
  }
}

TEST(TextProbe, AgreesWithAPlainModelOnRandomShortTexts) {
  std::mt19937 rng(2024);
  Hits hits;
  for (int round = 0; round < 30000; ++round) {
    const std::string text = randomText(rng, 20);
    const std::string probe = probeFor(rng, text, 11);
    expectAgreement(rng, probe, text, hits);
    if (HasFatalFailure()) return;
  }
  // Every outcome of every test is well exercised.
  EXPECT_GT(hits.whole, 5000);
  EXPECT_GT(hits.occurs, 40000);
  EXPECT_LT(hits.occurs, 100000);
  EXPECT_GT(hits.below, 20000);
  EXPECT_GT(hits.above, 20000);
}

TEST(TextProbe, LongProbesAroundThePreparedLength) {
  std::mt19937 rng(77);
  Hits hits;
  for (int round = 0; round < 1500; ++round) {
    const std::string text = randomText(rng, 90);
    std::string probe = probeFor(rng, text, 80);
    if (rng() % 2 == 0) probe = text;  // whole-text hits for long texts
    expectAgreement(rng, probe, text, hits);
    if (HasFatalFailure()) return;
  }
  EXPECT_GT(hits.whole, 2000);
  EXPECT_GT(hits.occurs, 2500);
  EXPECT_GT(hits.below, 500);
  EXPECT_GT(hits.above, 500);
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

TEST(TextProbe, OrderByHand) {
  const ElementArray folded = settings(true, false);  // the order is literal in any mode
  const ElementArray exact = settings(false, true);
  EXPECT_EQ(TextProbe(folded, "abc").compareTo("ABC", 3), 0);
  EXPECT_GT(TextProbe(exact, "abc").compareTo("ABC", 3), 0);
  // Folding goes to lower case: '_' sorts before the letters only when folded.
  EXPECT_GT(TextProbe(folded, "A").compareTo("_", 1), 0);
  EXPECT_LT(TextProbe(exact, "A").compareTo("_", 1), 0);
  EXPECT_LT(TextProbe(folded, "k000000250").compareTo("K000000251", 10), 0);
  EXPECT_GT(TextProbe(folded, "k000000250x").compareTo("K000000250", 10), 0);
  EXPECT_LT(TextProbe(folded, "k000000250").compareTo("K000000250x", 11), 0);
  EXPECT_GT(TextProbe(folded, "\xE1").compareTo("z", 1), 0);
  // Characters one case bit apart that are not letters, inside a full word of text.
  EXPECT_GT(TextProbe(folded, "abcdefg{x").compareTo("ABCDEFG[x", 9), 0);
  EXPECT_LT(TextProbe(folded, "abcdefg@x").compareTo("ABCDEFG`x", 9), 0);
  EXPECT_GT(TextProbe(folded, "abcdefg\xE1x").compareTo("ABCDEFG\xC1x", 9), 0);
  EXPECT_LT(TextProbe(folded, nullptr).compareTo("", 0), 0);
  EXPECT_LT(TextProbe(folded, "").compareTo("a", 1), 0);
  EXPECT_EQ(TextProbe(folded, "").compareTo("", 0), 0);
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
