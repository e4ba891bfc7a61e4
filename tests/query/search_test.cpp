// Finding texts: the prepared probe against plain models of its tests, and the searches
// that use it against the comparisons applied offset by offset.
#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <string>

#include "models.h"
#include "query/search.h"
#include "query/text_probe.h"

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

// A probe that often occurs in the text: a piece of it with some letters flipped and
// some characters made wildcards.
std::string probeFor(std::mt19937& rng, const std::string& text, std::size_t maxLength) {
  if (rng() % 3 == 0 || text.empty()) return randomText(rng, maxLength);
  const std::size_t from = rng() % text.size();
  std::string piece = text.substr(from, rng() % (maxLength + 1));
  for (char& c : piece) {
    if (rng() % 4 == 0 && ((c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'))) c ^= 0x20;
    // The case bit of a character that is not a letter makes a different character.
    if (rng() % 12 == 0) c ^= 0x20;
    if (rng() % 8 == 0) c = "?*"[rng() % 2];
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

TEST(FindContaining, LongTextsAtEveryPlacement) {
  // Folded probes at the start, middle and end of long texts, and just short of them.
  for (std::size_t length : {63u, 64u, 511u, 512u, 513u, 1100u}) {
    for (std::size_t probeLength : {1u, 3u, 128u, 129u, 300u}) {
      std::string probe;
      for (std::size_t i = 0; i < probeLength; ++i) probe += static_cast<char>('a' + i % 3);
      for (std::size_t at :
           {std::size_t{0}, length / 2, std::size_t{509}, std::size_t{510}, length - probeLength}) {
        if (probeLength > length || at + probeLength > length) continue;
        std::string text(length, 'x');
        for (std::size_t i = 0; i < probeLength; ++i) text[at + i] = probe[i] - 'a' + 'A';
        ElementArray array;
        array.appendString(text.c_str());
        ASSERT_EQ(findContainingString(array, probe.c_str()), 0) << length << " " << at;
        text[at + probeLength - 1] = 'y';
        array.setString(text.c_str(), 0);
        ASSERT_EQ(findContainingString(array, probe.c_str()), -1) << length << " " << at;
      }
    }
  }
}

// The scans against the comparison operations applied offset by offset.
TEST(FindContaining, AgreesWithSpanComparisonAtEveryOffset) {
  std::mt19937 rng(777);
  const std::string alphabet = "aAb?*\x01\xE1";
  for (int round = 0; round < 3000; ++round) {
    ElementArray array;
    array.settings.caseMode = static_cast<CaseMode>(round & 1);
    array.settings.searchMode = static_cast<SearchMode>((round >> 1) & 1);
    for (int e = 0; e < 4; ++e) {
      std::string bytes(rng() % 7, ' ');
      for (char& c : bytes) c = alphabet[rng() % alphabet.size()];
      const auto kind = rng() % 4;
      if (kind == 0) {
        array.appendString(bytes.c_str());
      } else if (kind == 1) {
        if (!bytes.empty()) bytes[rng() % bytes.size()] = '\0';
        array.appendFile({bytes.data(), static_cast<int32_t>(bytes.size())});
      } else {
        array.appendValue(kind == 2 ? static_cast<int32_t>(rng() % 200) - 100 : 0);
      }
    }
    std::string probe(1 + rng() % 3, ' ');
    for (char& c : probe) c = alphabet[rng() % 5];
    const auto length = static_cast<int32_t>(probe.size());
    int32_t expected = -1;
    int32_t expectedFind = -1;
    for (int32_t i = array.size() - 1; i >= 0; --i) {
      const Element& e = array.at(i);
      NumberText scratch;
      const char* text = e.asString(scratch);
      if (searchCompare(array, probe.c_str(), text) == 0) expectedFind = i;
      const bool file = e.type() == ElementType::File;
      const char* bytes = file ? e.bytes() : text;
      const int32_t size = file ? e.size() : e.type() == ElementType::None ? 0 : e.textLength() + 1;
      for (int32_t o = 0; o <= size - length; ++o) {
        if (searchCompareSpan(array, probe.c_str(), bytes + o, length) == 0) expected = i;
      }
    }
    ASSERT_EQ(findContainingString(array, probe.c_str()), expected) << "probe «" << probe << "»";
    ASSERT_EQ(findString(array, probe.c_str()), expectedFind) << "probe «" << probe << "»";
  }
}

}  // namespace
}  // namespace quorrel
