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

// The random texts never hold a missing probe: it matches nothing whole, occurs in
// everything like the empty one, and orders before every text.
TEST(TextProbe, MissingProbe) {
  for (const ElementArray& a : {settings(false, false), settings(true, true)}) {
    const TextProbe probe(a, nullptr);
    EXPECT_FALSE(probe.matchesWhole("", 0));
    EXPECT_TRUE(probe.occursIn("abc", 3));
    EXPECT_EQ(sign(probe.compareTo("", 0)), -1);
  }
}

}  // namespace
}  // namespace quorrel
