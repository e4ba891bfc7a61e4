#include "query/search.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "query/compare.h"

namespace quorrel {
namespace {

ElementValue keyText(const char* text) {
  return ElementValue::ofText(text);
}
ElementValue keyNumber(int32_t n) {
  return ElementValue::ofValue(n);
}

TEST(KeyLookup, FirstMatchCaseAndTypes) {
  ElementArray array;
  for (int i = 0; i < 6; ++i) array.appendValue(100 + i);
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
  EXPECT_EQ(stringWithKey(empty, keyText("")), nullptr);
}

TEST(KeyLookup, ZeroKeyIsNoneAndEqualKeysGiveTheLowerIndex) {
  ElementArray array;
  array.appendString("a");
  array.appendString("b");
  array.appendString("c");
  array.setKeyValue(0, 1);
  array.setKeyString("7k", 0);
  array.setKeyString("7k", 2);
  EXPECT_EQ(indexOfKey(array, keyNumber(0)), 1);
  EXPECT_EQ(indexOfKey(array, keyText("0")), -1);
  EXPECT_EQ(indexOfKey(array, keyText("")), 1);
  EXPECT_EQ(indexOfKey(array, keyText("7K")), 0);
  EXPECT_EQ(indexOfKey(array, keyNumber(7)), 0);
  EXPECT_EQ(stringWithKey(array, keyText("")), std::string("b"));
}

TEST(KeyLookup, WildcardKeyIsThePattern) {
  ElementArray array;
  array.appendString("first");
  array.appendString("second");
  array.setKeyString("item7", 0);
  array.setKeyString("item*", 1);
  array.searchMode = SearchWildcard;
  // The key's text is the pattern: the probe «item*» is taken literally.
  EXPECT_EQ(indexOfKey(array, keyText("item*")), 1);
  EXPECT_EQ(indexOfKey(array, keyText("ITEM9")), 1);
  EXPECT_EQ(indexOfKey(array, keyText("item7")), 0);
  EXPECT_EQ(indexOfKey(array, keyText("item?")), 1);
}

TEST(FindString, LiteralAndWildcardWithTheProbeAsPattern) {
  ElementArray array;
  array.appendValue(12);
  array.appendString("item7");
  array.appendString("a*");
  array.appendString("Abc");
  array.appendValue(0);  // None
  array.appendString("");
  EXPECT_EQ(findString(array, "12"), 0);
  EXPECT_EQ(findString(array, "012"), -1);
  EXPECT_EQ(findString(array, "a*"), 2);
  EXPECT_EQ(findString(array, "ABC"), 3);
  EXPECT_EQ(findString(array, ""), 4);
  EXPECT_EQ(findString(array, "0"), -1);
  EXPECT_EQ(findString(array, "ITEM7", 999), 1);
  array.caseMode = CaseSensitive;
  EXPECT_EQ(findString(array, "ABC"), -1);
  EXPECT_EQ(findString(array, "Abc"), 3);
  array.caseMode = CaseInsensitive;
  array.searchMode = SearchWildcard;
  EXPECT_EQ(findString(array, "a*"), 2);
  EXPECT_EQ(findString(array, "A*"), 2);
  EXPECT_EQ(findString(array, "item*"), 1);
  EXPECT_EQ(findString(array, "1?"), 0);
  EXPECT_EQ(findString(array, "*"), 0);
  EXPECT_EQ(findString(array, "?b?"), 3);
  EXPECT_EQ(findString(array, ""), 4);
  // The element «a*» is a text here, never a pattern.
  EXPECT_EQ(findString(array, "ab"), -1);
  array.caseMode = CaseSensitive;
  EXPECT_EQ(findString(array, "A*"), 3);
  EXPECT_EQ(findString(array, nullptr), -1);
}

TEST(FindValue, NumericValuesOfEveryType) {
  ElementArray array;
  array.appendString("");
  array.appendString("  -7 apples");
  array.appendValue(9);
  const char bytes[2] = {'4', '2'};
  array.appendFile({bytes, 2});
  EXPECT_EQ(findValue(array, 0), 0);
  EXPECT_EQ(findValue(array, -7), 1);
  EXPECT_EQ(findValue(array, 9, -1), 2);
  EXPECT_EQ(findValue(array, 42), -1);  // file bytes have no numeric value
  ElementArray empty;
  EXPECT_EQ(findValue(empty, 0), -1);
}

TEST(FindContaining, StringsValuesAndFileBytes) {
  ElementArray array;
  array.appendString("xyz");
  array.appendString("1234");
  EXPECT_EQ(findContainingString(array, "23"), 1);
  EXPECT_EQ(findContainingValue(array, 23), 1);
  EXPECT_EQ(findContainingString(array, "yz"), 0);     // at the very end of a text
  EXPECT_EQ(findContainingString(array, "YZ"), 0);     // folded
  EXPECT_EQ(findContainingString(array, "xyz1"), -1);  // longer than every element
  EXPECT_EQ(findContainingString(array, ""), 0);
  array.caseMode = CaseSensitive;
  EXPECT_EQ(findContainingString(array, "YZ"), -1);
  array.caseMode = CaseInsensitive;
  // Values are searched in their decimal text.
  array.setValue(-512, 0);
  EXPECT_EQ(findContainingValue(array, -5), 0);
  EXPECT_EQ(findContainingString(array, "12"), 0);
  EXPECT_EQ(findContainingString(array, "-512"), 0);
  EXPECT_EQ(findContainingString(array, "-5120"), -1);

  ElementArray files;
  files.appendValue(0);  // None: only the empty probe is found there
  const char data[7] = {'a', 'b', '\0', 'c', 'd', '\0', 'e'};
  files.appendFile({data, 7});
  EXPECT_EQ(findContainingString(files, ""), 0);
  EXPECT_EQ(findContainingString(files, "cd"), 1);
  EXPECT_EQ(findContainingString(files, "CD"), 1);
  EXPECT_EQ(findContainingString(files, "e"), 1);  // the last byte of the file
  EXPECT_EQ(findContainingString(files, "bc"), -1);
  files.searchMode = SearchWildcard;
  EXPECT_EQ(findContainingString(files, "c?"), 1);
  EXPECT_EQ(findContainingString(files, "b?"), -1);  // the span would hold a zero byte
  EXPECT_EQ(findContainingString(files, "??"), 1);
  EXPECT_EQ(findContainingString(files, "???"), -1);
  EXPECT_EQ(findContainingString(files, "*"), 1);
  EXPECT_EQ(findContainingString(files, "e*"), -1);  // needs two bytes after offset 6
}

TEST(FindContaining, WildcardSpansHaveTheProbeLength) {
  ElementArray array;
  array.searchMode = SearchWildcard;
  array.appendString("");
  array.appendString("abc");
  EXPECT_EQ(findContainingString(array, "b?"), 1);
  EXPECT_EQ(findContainingString(array, "*"), 1);  // needs one character
  EXPECT_EQ(findContainingString(array, "a*c"), 1);
  EXPECT_EQ(findContainingString(array, "a*"), 1);
  EXPECT_EQ(findContainingString(array, "a**c"), -1);  // four characters
  EXPECT_EQ(findContainingString(array, "?c"), 1);
  EXPECT_EQ(findContainingString(array, "C"), 1);
}

TEST(FindContaining, LongTextsAtEveryPlacement) {
  // Folded probes at the start, middle and end of long texts, and just short of them.
  for (std::size_t length : {63u, 64u, 511u, 512u, 513u, 1100u}) {
    for (std::size_t probeLength : {1u, 3u, 128u, 129u, 300u}) {
      if (probeLength > length) continue;
      std::string probe;
      for (std::size_t i = 0; i < probeLength; ++i) probe += static_cast<char>('a' + i % 3);
      std::string upper = probe;
      for (char& c : upper) c = static_cast<char>(c - 'a' + 'A');
      for (std::size_t at :
           {std::size_t{0}, length / 2, std::size_t{509}, std::size_t{510}, length - probeLength}) {
        if (at + probeLength > length) continue;
        std::string text(length, 'x');
        text.replace(at, probeLength, upper);
        ElementArray array;
        array.appendString(text.c_str());
        ASSERT_EQ(findContainingString(array, probe.c_str()), 0)
            << length << " " << probeLength << " " << at;
        text[at + probeLength - 1] = 'y';
        array.setString(text.c_str(), 0);
        ASSERT_EQ(findContainingString(array, probe.c_str()), -1)
            << length << " " << probeLength << " " << at;
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
      std::string bytes;
      int length = static_cast<int>(rng() % 7);
      for (int i = 0; i < length; ++i) bytes += alphabet[rng() % alphabet.size()];
      int kind = static_cast<int>(rng() % 4);
      if (kind == 0) {
        array.appendString(bytes.c_str());
      } else if (kind == 1) {
        if (!bytes.empty()) bytes[rng() % bytes.size()] = '\0';
        array.appendFile({bytes.data(), static_cast<int32_t>(bytes.size())});
      } else if (kind == 2) {
        array.appendValue(static_cast<int32_t>(rng() % 200) - 100);
      } else {
        array.appendValue(0);
      }
    }
    std::string probe;
    int probeLength = 1 + static_cast<int>(rng() % 3);
    for (int i = 0; i < probeLength; ++i) probe += alphabet[rng() % 5];
    int32_t expected = -1;
    for (int32_t i = 0; i < array.size() && expected < 0; ++i) {
      const Element& e = array.at(i);
      NumberText scratch;
      const char* bytes = e.type() == ElementType::File ? e.bytes() : e.asString(scratch);
      int32_t size = e.type() == ElementType::File   ? e.size()
                     : e.type() == ElementType::None ? 0
                                                     : e.textLength() + 1;
      const auto length = static_cast<int32_t>(probe.size());
      for (int32_t o = 0; o <= size - length; ++o) {
        if (searchCompareSpan(array, probe.c_str(), bytes + o, length) == 0) {
          expected = i;
          break;
        }
      }
    }
    ASSERT_EQ(findContainingString(array, probe.c_str()), expected) << "probe «" << probe << "»";
    int32_t expectedFind = -1;
    for (int32_t i = 0; i < array.size() && expectedFind < 0; ++i) {
      NumberText scratch;
      if (searchCompare(array, probe.c_str(), array.at(i).asString(scratch)) == 0) expectedFind = i;
    }
    ASSERT_EQ(findString(array, probe.c_str()), expectedFind) << "probe «" << probe << "»";
  }
}

}  // namespace
}  // namespace quorrel
