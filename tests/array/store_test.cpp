#include <gtest/gtest.h>

#include <climits>
#include <cstring>
#include <string>
#include <vector>

#include "array/element_array.h"

namespace quorrel {
namespace {

// The array as one readable text: elements separated by '|', None shown as '_'.
std::string contents(ElementArray& a) {
  std::string out;
  for (int32_t i = 0; i < a.size(); ++i) {
    if (i > 0) out += '|';
    out += a.at(i).type() == ElementType::None ? std::string("_") : a.getString(i);
  }
  return out;
}

TEST(Store, FreshArrayAndReadsOutside) {
  ElementArray a;
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(a.capacity(), 25);
  EXPECT_EQ(a.getString(0), nullptr);
  EXPECT_EQ(a.getValue(0), 0);
  EXPECT_EQ(a.getKeyString(0), nullptr);
  EXPECT_STREQ(a.listDelimiter(), ",");
  EXPECT_EQ(a.selectionMode, 1);
  EXPECT_EQ(a.autoSelectNewRows, 0);
  EXPECT_EQ(a.caseMode, 0);
  EXPECT_EQ(a.searchMode, 0);
  EXPECT_EQ(a.fileMode, 0);
  ByteBlock block{"untouched", 9};
  EXPECT_FALSE(a.getBytes(block, 0));
  EXPECT_STREQ(block.bytes, "untouched");
  a.appendValue(3);
  EXPECT_EQ(a.getString(-1), nullptr);
  EXPECT_EQ(a.getValue(-1), 0);
  EXPECT_EQ(a.getValue(1), 0);
}

TEST(Store, SetFarPastTheEndFillsWithNone) {
  ElementArray a;
  a.setString("a", 5);
  EXPECT_EQ(a.size(), 6);
  EXPECT_EQ(contents(a), "_|_|_|_|_|a");
  EXPECT_STREQ(a.getString(2), "");
  EXPECT_EQ(a.getValue(2), 0);

  a.setValue(0, 7);  // stores None, but still grows
  EXPECT_EQ(a.size(), 8);
  EXPECT_EQ(a.at(7).type(), ElementType::None);

  a.setString(nullptr, 5);
  EXPECT_EQ(a.at(5).type(), ElementType::None);

  a.setString("b", -1);
  a.setString("b", INT32_MAX);
  a.insertString("b", INT32_MAX);
  EXPECT_EQ(a.size(), 8);
}

TEST(Store, InsertShiftsOrActsAsSetPastTheEnd) {
  ElementArray a;
  a.appendString("a");
  a.appendString("b");
  a.insertValue(7, 3);
  EXPECT_EQ(contents(a), "a|b|_|7");
  a.insertString("x", 10);
  EXPECT_EQ(a.size(), 11);
  EXPECT_EQ(contents(a), "a|b|_|7|_|_|_|_|_|_|x");

  ElementArray b;
  for (const char* t : {"0", "1", "2", "3", "4"}) b.appendString(t);
  b.insertValue(7, 3);
  EXPECT_EQ(contents(b), "0|1|2|7|3|4");
  b.insertString("z", 0);
  EXPECT_EQ(contents(b), "z|0|1|2|7|3|4");
  b.insertString("n", -1);
  b.deleteAt(-1);
  b.deleteAt(b.size());
  EXPECT_EQ(contents(b), "z|0|1|2|7|3|4");
  b.deleteAt(0);
  b.deleteAt(5);
  EXPECT_EQ(contents(b), "0|1|2|7|3");
}

TEST(Store, FileBlocksAndRawBytes) {
  ElementArray a;
  a.appendFile({"x\0y", 3});
  a.appendFile({nullptr, 4});
  a.appendFile({"abc", 0});
  a.appendString("abc");
  a.appendValue(-9);
  EXPECT_EQ(a.size(), 5);
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
  ASSERT_TRUE(a.getBytes(block, 3));
  EXPECT_EQ(block.length, 4);
  EXPECT_EQ(std::memcmp(block.bytes, "abc", 4), 0);
  ASSERT_TRUE(a.getBytes(block, 4));
  EXPECT_EQ(block.length, 4);
  EXPECT_EQ(a.getValue(4), -9);
}

TEST(Store, KeysTravelWithTheirElementAndDieWithIt) {
  ElementArray a;
  for (const char* t : {"a", "b", "c"}) a.appendString(t);
  a.setKeyString("ka", 0);
  a.setKeyValue(22, 2);
  a.setKeyString("far", 5);  // keys are never set beyond the end
  EXPECT_EQ(a.size(), 3);
  EXPECT_EQ(a.getKeyString(1), nullptr);
  EXPECT_EQ(a.getKeyValue(1), 0);

  // A new value keeps the key.
  a.setValue(5, 0);
  EXPECT_STREQ(a.getKeyString(0), "ka");

  // Inserting moves the keyed elements up; the new element has no key.
  a.insertString("new", 0);
  EXPECT_EQ(a.getKeyString(0), nullptr);
  EXPECT_STREQ(a.getKeyString(1), "ka");
  EXPECT_EQ(a.getKeyValue(3), 22);
  EXPECT_STREQ(a.getKeyString(3), "22");

  // Deleting destroys the key; the element that later fills that place has none.
  a.deleteAt(3);
  EXPECT_EQ(a.size(), 3);
  a.appendString("d");
  EXPECT_EQ(a.getKeyString(3), nullptr);
  a.setString("e", 3);
  EXPECT_EQ(a.getKeyString(3), nullptr);

  // Keys are not unique and a key of 0 exists but reads as nothing.
  a.setKeyString("ka", 2);
  EXPECT_STREQ(a.getKeyString(2), "ka");
  a.setKeyValue(0, 0);
  EXPECT_STREQ(a.getKeyString(0), "");
  EXPECT_EQ(a.at(0).key()->type(), ElementType::None);
  a.setKeyFile({"zz", 2}, 2);
  EXPECT_EQ(a.at(2).key()->type(), ElementType::File);
  EXPECT_STREQ(a.getKeyString(2), "");

  // After clear, elements set again start keyless.
  a.clear();
  a.setString("x", 1);
  EXPECT_EQ(a.getKeyString(0), nullptr);
  EXPECT_EQ(a.getKeyString(1), nullptr);
}

// appendNone(n) and appendElements of n elements must leave exactly what n single
// appends leave: size, capacity (the policy's steps), row states and the elements.
TEST(Store, BulkAppendsMatchSingleAppends) {
  const auto prepare = [](ElementArray& a, int32_t start) {
    a.setDimensions(2);
    a.setBoundary(1, 4);
    a.setAutoSelect(1);
    for (int32_t i = 0; i < start; ++i) a.appendValue(i + 1);
    // Deletes leave a sparse array whose next append may shrink the capacity.
    for (int32_t i = 0; i < start / 2; ++i) a.deleteAt(0);
    // Down to 20 elements in a large capacity, appends past 25 shrink it again.
    if (start == 600) {
      while (a.size() > 20) a.deleteAt(0);
    }
  };
  for (int32_t start : {0, 12, 30, 200, 600}) {
    for (int64_t n : {1, 2, 13, 100, 1000}) {
      ElementArray none, run, single, singleKeyed;
      for (ElementArray* a : {&none, &run, &single, &singleKeyed}) prepare(*a, start);
      none.appendNone(n);
      for (int64_t i = 0; i < n; ++i) single.appendString(nullptr);
      EXPECT_EQ(none.size(), single.size());
      EXPECT_EQ(none.capacity(), single.capacity()) << start << " + " << n;
      EXPECT_EQ(none.rowStates, single.rowStates);
      EXPECT_EQ(none.at(none.size() - 1).type(), ElementType::None);

      std::vector<Element> elements;
      for (int64_t i = 0; i < n; ++i) {
        const std::string text = "t" + std::to_string(i);
        elements.push_back(
            Element::keyed(ElementValue::ofText(text.c_str()), ElementValue::ofValue(-1)));
        singleKeyed.appendString(text.c_str());
        singleKeyed.setKeyValue(-1, singleKeyed.size() - 1);
      }
      run.appendElements(elements);
      EXPECT_EQ(elements.back().type(), ElementType::None);  // moved out
      ASSERT_EQ(run.size(), singleKeyed.size());
      EXPECT_EQ(run.capacity(), singleKeyed.capacity()) << start << " + " << n;
      EXPECT_EQ(run.rowStates, singleKeyed.rowStates);
      for (int32_t i = 0; i < run.size(); ++i) {
        EXPECT_STREQ(run.getString(i), singleKeyed.getString(i));
        EXPECT_EQ(run.getKeyValue(i), singleKeyed.getKeyValue(i));
      }
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
  EXPECT_EQ(a.dimensions(), 2);
  EXPECT_EQ(a.boundary(1), 4);
  EXPECT_EQ(a.labels, (LabelList{"n", "m"}));
  EXPECT_EQ(a.caseMode, 1);
  EXPECT_STREQ(a.listDelimiter(), ";:");
  a.setAutoSelect(7);
  EXPECT_EQ(a.autoSelectNewRows, 1);
  a.setAutoSelect(0);
  EXPECT_EQ(a.autoSelectNewRows, 0);
}

}  // namespace
}  // namespace quorrel
