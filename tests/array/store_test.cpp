#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstring>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "contents.h"

namespace quorrel {
namespace {

TEST(Store, FreshArrayAndReadsOutside) {
  ElementArray a;
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(a.capacity(), 25);
  EXPECT_EQ(a.getString(0), nullptr);
  EXPECT_EQ(a.getKeyString(0), nullptr);
  EXPECT_STREQ(a.listDelimiter(), ",");
  EXPECT_EQ(a.selectionMode, 1);
  EXPECT_EQ(a.autoSelectNewRows + a.caseMode + a.searchMode + a.fileMode, 0);
  ByteBlock block{"untouched", 9};
  EXPECT_FALSE(a.getBytes(block, 0));
  EXPECT_STREQ(block.bytes, "untouched");
  a.appendValue(3);
  EXPECT_EQ(a.getString(-1), nullptr);
  EXPECT_EQ(a.getValue(-1), 0);
  EXPECT_EQ(a.getValue(1), 0);
}

TEST(Store, SetAndInsertPastTheEndFillWithNone) {
  ElementArray a;
  a.setString("a", 5);
  EXPECT_EQ(contents(a), "_|_|_|_|_|a");
  EXPECT_STREQ(a.getString(2), "");
  a.setValue(0, 7);  // stores None, but still grows
  a.setString(nullptr, 5);
  a.setString("b", -1);
  a.setString("b", INT32_MAX);
  a.insertString("b", INT32_MAX);
  EXPECT_EQ(contents(a), "_|_|_|_|_|_|_|_");

  ElementArray b;
  fill(b, "ab").insertValue(7, 3);
  EXPECT_EQ(contents(b), "a|b|_|7");
  b.insertString("x", 10);
  b.insertString("n", -1);
  b.deleteAt(-1);
  b.deleteAt(b.size());
  EXPECT_EQ(contents(b), "a|b|_|7|_|_|_|_|_|_|x");
}

TEST(Store, FileBlocksAndRawBytes) {
  ElementArray a;
  a.appendFile({"x\0y", 3});
  a.appendFile({nullptr, 4});
  a.appendFile({"abc", 0});
  a.appendString("abc");
  a.appendValue(-9);
  EXPECT_EQ(a.at(0).type(), ElementType::File);
  EXPECT_EQ(a.at(1).type(), ElementType::None);
  EXPECT_EQ(a.at(2).type(), ElementType::None);

  ByteBlock block;
  ASSERT_TRUE(a.getBytes(block, 0));
  EXPECT_EQ(block.length, 3);
  EXPECT_EQ(std::memcmp(block.bytes, "x\0y", 3), 0);
  ASSERT_TRUE(a.getBytes(block, 1));
  EXPECT_EQ(block.bytes, nullptr);
  EXPECT_EQ(block.length, 0);
  ASSERT_TRUE(a.getBytes(block, 3));  // a text with its terminator
  EXPECT_EQ(block.length, 4);
  EXPECT_EQ(std::memcmp(block.bytes, "abc", 4), 0);
  ASSERT_TRUE(a.getBytes(block, 4));
  EXPECT_EQ(block.length, 4);
}

// Each element's text form and key text ("-" for no key).
using Entries = std::vector<std::pair<std::string, std::string>>;
Entries entries(ElementArray& a) {
  Entries out;
  for (int32_t i = 0; i < a.size(); ++i) {
    const std::string text = a.getString(i);  // read before the key: they share a buffer
    const char* key = a.getKeyString(i);
    out.emplace_back(text, key == nullptr ? "-" : key);
  }
  return out;
}

// Edits at the front, in the middle and at the back, with keys and every value type,
// agree with a vector of texts.
TEST(Store, EditsEverywhereAgreeWithAPlainVector) {
  std::mt19937 random(5);
  ElementArray a;
  Entries m;
  for (int step = 0; step < 20000; ++step) {
    const auto size = static_cast<int32_t>(m.size());
    const int pick = static_cast<int>(random() % 100);
    int32_t index = size == 0 ? 0 : static_cast<int32_t>(random() % static_cast<unsigned>(size));
    if (pick % 3 == 0) index = pick % 2 == 0 ? 0 : std::max(size - 1, 0);
    const auto at = m.begin() + index;
    const int32_t value = static_cast<int32_t>(random() % 5);
    const std::string number = value == 0 ? "" : std::to_string(value);
    const std::string text = "t" + std::to_string(step);
    if (pick < 40 || size < 50) {
      if (pick % 2 == 0) a.insertValue(value, index);
      if (pick % 2 != 0) a.insertString(text.c_str(), index);
      m.insert(at, {pick % 2 == 0 ? number : text, "-"});
    } else if (pick < 80) {
      a.deleteAt(index);
      m.erase(at);
    } else if (pick < 88) {
      a.setKeyString(text.c_str(), index);
      at->second = text;
    } else if (pick < 92) {
      a.setKeyValue(value, index);
      at->second = number;
    } else if (pick < 96) {
      a.setValue(value, index);
      at->first = number;
    } else {
      a.setFile({"bytes", 5}, index);
      at->first = "";
    }
    if (step % 97 == 0 || step == 19999) {
      ASSERT_EQ(entries(a), m) << "step " << step;
    }
  }
}

// Keys are never set beyond the end, die with their element and are not unique; a key
// of 0 or of file bytes reads as nothing.
TEST(Store, KeysOutsideTheEditsAbove) {
  ElementArray a;
  fill(a, "abc");
  a.setKeyString("far", 5);
  EXPECT_EQ(a.size(), 3);
  EXPECT_EQ(a.getKeyValue(1), 0);
  a.setKeyValue(22, 2);
  EXPECT_EQ(a.getKeyValue(2), 22);
  a.deleteAt(2);
  a.appendString("d");
  EXPECT_EQ(a.getKeyString(2), nullptr);
  a.setKeyString("ka", 0);
  a.setKeyString("ka", 1);
  a.setKeyFile({"zz", 2}, 2);
  EXPECT_EQ(entries(a), (Entries{{"a", "ka"}, {"b", "ka"}, {"d", ""}}));
  EXPECT_EQ(a.at(2).key()->type(), ElementType::File);
  // After clear, elements set again start keyless.
  a.clear();
  a.setString("x", 1);
  EXPECT_EQ(entries(a), (Entries{{"", "-"}, {"x", "-"}}));
}

// appendNone(n) and appendElements of n elements must leave exactly what n single
// appends leave: size, capacity (the policy's steps), row states and the elements.
TEST(Store, BulkAppendsMatchSingleAppends) {
  const auto prepare = [](ElementArray& a, int32_t start) {
    a.setDimensions(2);
    a.setBoundary(1, 4);
    a.setAutoSelect(1);
    for (int32_t i = 0; i < start; ++i) a.appendValue(i + 1);
    // A sparse array, whose next append may shrink the capacity; at 600, down to 20
    // elements in a large capacity, so that appends past 25 shrink it again.
    while (a.size() > (start == 600 ? 20 : start - start / 2)) a.deleteAt(0);
  };
  for (int32_t start : {0, 12, 30, 200, 600}) {
    for (int64_t n : {1, 2, 13, 100, 1000}) {
      ElementArray none, run, single, singleKeyed;
      for (ElementArray* a : {&none, &run, &single, &singleKeyed}) prepare(*a, start);
      none.appendNone(n);
      std::vector<Element> elements;
      for (int64_t i = 0; i < n; ++i) {
        single.appendString(nullptr);
        const std::string text = "t" + std::to_string(i);
        elements.push_back(
            Element::keyed(ElementValue::ofText(text.c_str()), ElementValue::ofValue(-1)));
        singleKeyed.appendString(text.c_str());
        singleKeyed.setKeyValue(-1, singleKeyed.size() - 1);
      }
      run.appendElements(elements);
      EXPECT_EQ(elements.back().type(), ElementType::None);  // moved out
      EXPECT_EQ(contents(none), contents(single));
      EXPECT_EQ(none.capacity(), single.capacity()) << start << " + " << n;
      EXPECT_EQ(none.rowStates, single.rowStates);
      ASSERT_EQ(contents(run), contents(singleKeyed));
      EXPECT_EQ(run.capacity(), singleKeyed.capacity()) << start << " + " << n;
      EXPECT_EQ(run.rowStates, singleKeyed.rowStates);
      for (int32_t i = 0; i < run.size(); ++i)
        EXPECT_EQ(run.getKeyValue(i), singleKeyed.getKeyValue(i));
    }
  }
  ElementArray capped;
  capped.appendNone(int64_t{ElementArray::kMaxSize} + 5);
  EXPECT_EQ(capped.size(), ElementArray::kMaxSize);
  std::vector<Element> more(3);
  more[0] = Element::of(ElementValue::ofValue(9));
  capped.appendElements(more);
  EXPECT_EQ(capped.size(), ElementArray::kMaxSize);
  EXPECT_EQ(more[0].number(), 9);  // refused, so not taken
}

TEST(Store, ClearKeepsSettingsAndDelimiterTakesAnyText) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, 4);
  a.labels = LabelList{"n", "m"};
  a.caseMode = 1;
  a.setListDelimiter("");
  EXPECT_STREQ(a.listDelimiter(), "");
  a.setListDelimiter(";:");
  for (int i = 1; i <= 1000; ++i) a.appendValue(i);
  a.clear();
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(a.capacity(), 25);
  EXPECT_EQ(a.boundary(1), 4);
  EXPECT_EQ(a.labels, (LabelList{"n", "m"}));
  EXPECT_EQ(a.caseMode, 1);
  EXPECT_STREQ(a.listDelimiter(), ";:");
  a.setAutoSelect(7);
  EXPECT_EQ(a.autoSelectNewRows, 1);
}

}  // namespace
}  // namespace quorrel
