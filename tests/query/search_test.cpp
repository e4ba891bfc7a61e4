#include "query/search.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "models.h"

namespace quorrel {
namespace {

ElementValue keyText(const char* text) {
  return ElementValue::ofText(text);
}
ElementValue keyNumber(int32_t n) {
  return ElementValue::ofValue(n);
}

TEST(KeyLookup, FirstMatchCaseAndTypes) {
  ElementArray array = arrayOf({"#100", "#101", "#102", "#103", "#104", "#105"});
  array.setKeyString("Apple", 3);
  array.setKeyString("apple", 5);
  array.setKeyValue(5, 1);
  array.setKeyString("5 apples", 2);
  EXPECT_EQ(indexOfKey(array, keyText("APPLE")), 3);
  array.caseMode = CaseSensitive;
  EXPECT_EQ(indexOfKey(array, keyText("APPLE")), -1);
  EXPECT_EQ(indexOfKey(array, keyText("apple")), 5);
  // Value key 5 answers the number and its text; the string key «5 apples» reads as 5
  // but comes later.
  EXPECT_EQ(indexOfKey(array, keyNumber(5)), 1);
  EXPECT_EQ(indexOfKey(array, keyText("5")), 1);
  array.setKeyValue(6, 1);
  EXPECT_EQ(indexOfKey(array, keyNumber(5)), 2);
  // Element 0 has no key and is passed over; the text key «Apple» reads as 0.
  EXPECT_EQ(indexOfKey(array, keyNumber(0)), 3);
  EXPECT_EQ(stringWithKey(array, keyNumber(5)), std::string("102"));
  EXPECT_EQ(valueWithKey(array, keyNumber(5)), 102);
  EXPECT_EQ(stringWithKey(array, keyNumber(77)), nullptr);
  EXPECT_EQ(valueWithKey(array, keyNumber(77)), 0);
  ElementArray empty;
  EXPECT_EQ(indexOfKey(empty, keyText("")), -1);
}

TEST(KeyLookup, ZeroKeysEqualKeysAndWildcardKeys) {
  ElementArray array = arrayOf({"a", "b", "c"});
  array.setKeyValue(0, 1);
  array.setKeyString("7k", 0);
  array.setKeyString("7k", 2);
  EXPECT_EQ(indexOfKey(array, keyNumber(0)), 1);
  EXPECT_EQ(indexOfKey(array, keyText("0")), -1);
  EXPECT_EQ(indexOfKey(array, keyText("")), 1);
  EXPECT_EQ(indexOfKey(array, keyText("7K")), 0);
  EXPECT_EQ(indexOfKey(array, keyNumber(7)), 0);
  EXPECT_EQ(stringWithKey(array, keyText("")), std::string("b"));

  // The key's text is the pattern: the probe «item*» is taken literally.
  ElementArray wild = arrayOf({"first", "second"});
  wild.setKeyString("item7", 0);
  wild.setKeyString("item*", 1);
  wild.searchMode = SearchWildcard;
  EXPECT_EQ(indexOfKey(wild, keyText("item*")), 1);
  EXPECT_EQ(indexOfKey(wild, keyText("ITEM9")), 1);
  EXPECT_EQ(indexOfKey(wild, keyText("item7")), 0);
}

TEST(Find, StringsLiteralAndWildcardWithTheProbeAsPattern) {
  ElementArray array = arrayOf({"#12", "item7", "a*", "Abc", "#0", ""});
  const struct {
    int16_t caseMode, searchMode;
    const char* probe;
    int32_t found;
  } cases[] = {
      {0, 0, "12", 0},    {0, 0, "012", -1},  {0, 0, "a*", 2},   {0, 0, "ABC", 3}, {0, 0, "", 4},
      {0, 0, "0", -1},    {0, 0, "ITEM7", 1}, {1, 0, "ABC", -1}, {1, 0, "Abc", 3}, {0, 1, "A*", 2},
      {0, 1, "item*", 1}, {0, 1, "1?", 0},    {0, 1, "*", 0},    {0, 1, "?b?", 3}, {0, 1, "", 4},
      {0, 1, "ab", -1},  // the element «a*» is a text here, never a pattern
      {1, 1, "A*", 3},    {1, 1, nullptr, -1}};
  for (const auto& c : cases) {
    array.caseMode = c.caseMode;
    array.searchMode = c.searchMode;
    EXPECT_EQ(findString(array, c.probe, 999), c.found) << (c.probe ? c.probe : "null");
  }
}

TEST(Find, NumericValuesOfEveryType) {
  ElementArray array = arrayOf({"", "  -7 apples", "#9"});
  array.appendFile({"42", 2});
  EXPECT_EQ(findValue(array, 0), 0);
  EXPECT_EQ(findValue(array, -7), 1);
  EXPECT_EQ(findValue(array, 9, -1), 2);
  EXPECT_EQ(findValue(array, 42), -1);  // file bytes have no numeric value
  EXPECT_EQ(findValue(ElementArray{}, 0), -1);
}

TEST(FindContaining, StringsValuesAndFileBytes) {
  ElementArray array = arrayOf({"xyz", "1234"});
  EXPECT_EQ(findContainingString(array, "23"), 1);
  EXPECT_EQ(findContainingValue(array, 23), 1);
  EXPECT_EQ(findContainingString(array, "YZ"), 0);     // folded, at the very end
  EXPECT_EQ(findContainingString(array, "xyz1"), -1);  // longer than every element
  EXPECT_EQ(findContainingString(array, ""), 0);
  array.caseMode = CaseSensitive;
  EXPECT_EQ(findContainingString(array, "YZ"), -1);
  // Values are searched in their decimal text.
  array.setValue(-512, 0);
  EXPECT_EQ(findContainingValue(array, -5), 0);
  EXPECT_EQ(findContainingString(array, "12"), 0);
  EXPECT_EQ(findContainingString(array, "-5120"), -1);

  ElementArray files = arrayOf({"#0"});  // None: only the empty probe is found there
  files.appendFile({"ab\0cd\0e", 7});
  const struct {
    int16_t searchMode;
    const char* probe;
    int32_t found;
  } cases[] = {{0, "", 0},    {0, "CD", 1},   {0, "e", 1},    // the last byte of the file
               {0, "bc", -1}, {1, "c?", 1},   {1, "b?", -1},  // the span would hold a zero byte
               {1, "??", 1},  {1, "???", -1}, {1, "*", 1},
               {1, "e*", -1}};  // needs two bytes after offset 6
  for (const auto& c : cases) {
    files.searchMode = c.searchMode;
    EXPECT_EQ(findContainingString(files, c.probe), c.found) << c.probe;
  }

  // Wildcard spans have the probe's length.
  ElementArray wild = arrayOf({"", "abc"});
  wild.searchMode = SearchWildcard;
  EXPECT_EQ(findContainingString(wild, "*"), 1);  // needs one character
  EXPECT_EQ(findContainingString(wild, "a*c"), 1);
  EXPECT_EQ(findContainingString(wild, "a**c"), -1);  // four characters
  EXPECT_EQ(findContainingString(wild, "C"), 1);
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
    array.caseMode = static_cast<int16_t>(round & 1);
    array.searchMode = static_cast<int16_t>((round >> 1) & 1);
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
