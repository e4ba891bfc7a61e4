#include "query/text_probe.h"

#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <string>

#include "models.h"

namespace quorrel {
namespace {

// Models of the two tests over whole strings.
bool modelWhole(const std::string& probe, const std::string& text, bool wildcard,
                bool caseSensitive) {
  return wildcard ? patternMatches(probe, text, caseSensitive)
                  : fold(probe, caseSensitive) == fold(text, caseSensitive);
}

bool modelOccurs(const std::string& probe, const std::string& text, bool wildcard,
                 bool caseSensitive) {
  for (std::size_t o = 0; o + probe.size() <= text.size(); ++o) {
    if (modelWhole(probe, text.substr(o, probe.size()), wildcard, caseSensitive)) return true;
  }
  return false;
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

// The literal order of folded texts: unsigned bytes (as char_traits<char> compares), a
// text that ends first is smaller.
int modelOrder(const std::string& probe, const std::string& text, bool caseSensitive) {
  return sign(fold(probe, caseSensitive).compare(fold(text, caseSensitive)));
}

struct Hits {
  int whole = 0, occurs = 0, below = 0, above = 0;
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
    SCOPED_TRACE("probe «" + probe + "» text «" + text + "» mode " + std::to_string(mode));
    ASSERT_EQ(prepared.matchesWhole(stored.c_str(), bound), whole);
    ASSERT_EQ(searchCompare(a, probe.c_str(), text.c_str()) == 0, whole);
    ASSERT_EQ(prepared.occursIn(text.c_str(), text.size()), occurs);
    ASSERT_EQ(sign(prepared.compareTo(stored.c_str(), bound)), order);
    ASSERT_EQ(sign(compareText(a, probe.c_str(), text.c_str())), order);
  }
}

// Random texts up to `maxText` long with probes up to `maxProbe`; `copies` makes
// every other probe the whole text.
Hits randomRounds(uint32_t seed, int rounds, std::size_t maxText, std::size_t maxProbe,
                  bool copies) {
  std::mt19937 rng(seed);
  Hits hits;
  for (int round = 0; round < rounds && !::testing::Test::HasFatalFailure(); ++round) {
    const std::string text = randomText(rng, maxText);
    std::string probe = probeFor(rng, text, maxProbe);
    if (copies && rng() % 2 == 0) probe = text;
    expectAgreement(rng, probe, text, hits);
  }
  return hits;
}

TEST(TextProbe, AgreesWithAPlainModelOnRandomTexts) {
  // Short texts: every outcome of every test is well exercised.
  Hits hits = randomRounds(2024, 30000, 20, 11, false);
  EXPECT_GT(hits.whole, 5000);
  EXPECT_GT(hits.occurs, 40000);
  EXPECT_LT(hits.occurs, 100000);
  EXPECT_GT(hits.below, 20000);
  EXPECT_GT(hits.above, 20000);
  // Long probes around the prepared length, with whole-text hits for long texts.
  hits = randomRounds(77, 1500, 90, 80, true);
  EXPECT_GT(hits.whole, 2000);
  EXPECT_GT(hits.occurs, 2500);
  EXPECT_GT(hits.below, 500);
  EXPECT_GT(hits.above, 500);
}

// '@' and '`' differ by the case bit only, yet are different characters. A missing
// probe matches nothing, and contains like the empty one. In literal mode the wildcard
// characters are ordinary ones.
TEST(TextProbe, ByHand) {
  const ElementArray modes[] = {settings(false, false), settings(false, true),
                                settings(true, false)};
  enum { Folded, Exact, Wild, Whole = 0, Occurs = 1 };
  const struct {
    int mode, test;
    const char *probe, *text;
    bool expected;
  } cases[] = {// clang-format off
      {Folded, Whole, "K000000500", "k000000500", true},
      {Exact, Whole, "K000000500", "k000000500", false},
      {Folded, Whole, "abc", "abcd", false}, {Folded, Whole, "abcd", "abc", false},
      {Folded, Whole, "`", "@", false},      {Folded, Whole, "\xE1", "\xC1", false},
      {Folded, Whole, "", "", true},         {Folded, Whole, nullptr, "", false},
      {Wild, Whole, nullptr, "", false},     {Wild, Occurs, nullptr, "", true},
      {Exact, Occurs, nullptr, "abc", true}, {Folded, Occurs, "05", "k000000500", true},
      {Folded, Occurs, "06", "k000000500", false}, {Folded, Occurs, "B", "abc", true},
      {Exact, Occurs, "B", "abc", false},    {Wild, Occurs, "b?", "abc", true},
      {Wild, Occurs, "b?", "ab", false},     {Wild, Whole, "a*", "abc", true},
      {Wild, Whole, "b*", "abc", false},     {Folded, Whole, "a*", "abc", false},
      {Folded, Occurs, "?c", "b?C", true}};
  // clang-format on
  for (const auto& c : cases) {
    const TextProbe probe(modes[c.mode], c.probe);
    const std::size_t length = std::strlen(c.text);
    EXPECT_EQ(c.test == Whole ? probe.matchesWhole(c.text, length) : probe.occursIn(c.text, length),
              c.expected)
        << (c.probe ? c.probe : "null") << " " << c.text;
  }

  // The order is literal in any search mode. Folding goes to lower case, so '_' sorts
  // before the letters only when folded; characters one case bit apart that are not
  // letters differ, also inside a full word of text.
  const struct {
    int mode;
    const char *probe, *text;
    int order;
  } orders[] = {// clang-format off
      {Wild, "abc", "ABC", 0}, {Exact, "abc", "ABC", 1}, {Wild, "A", "_", 1}, {Exact, "A", "_", -1},
      {Wild, "k000000250", "K000000251", -1}, {Wild, "k000000250x", "K000000250", 1},
      {Wild, "k000000250", "K000000250x", -1}, {Wild, "\xE1", "z", 1},
      {Wild, "abcdefg{x", "ABCDEFG[x", 1}, {Wild, "abcdefg@x", "ABCDEFG`x", -1},
      {Wild, "abcdefg\xE1x", "ABCDEFG\xC1x", 1},
      {Wild, nullptr, "", -1}, {Wild, "", "a", -1}, {Wild, "", "", 0}};
  // clang-format on
  for (const auto& c : orders) {
    EXPECT_EQ(sign(TextProbe(modes[c.mode], c.probe).compareTo(c.text, std::strlen(c.text))),
              c.order)
        << (c.probe ? c.probe : "null") << " " << c.text;
  }
}

}  // namespace
}  // namespace quorrel
