#include "query/search.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "models.h"

namespace quorrel {
namespace {

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
