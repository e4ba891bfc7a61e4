#include <gtest/gtest.h>

#include <random>
#include <string>

#include "contents.h"

namespace quorrel {
namespace {

// An array of `dims` dimensions with boundary entries 0 and 1 set (where positive)
// holding one single-character text per character of `chars`.
ElementArray shaped(int32_t dims, int32_t entry0, int32_t columns, const char* chars) {
  ElementArray a;
  a.setDimensions(dims);
  a.setBoundary(0, entry0);
  a.setBoundary(1, columns);
  fill(a, chars);
  return a;
}

ElementArray table(int32_t columns, const char* chars = "") {
  return shaped(2, 0, columns, chars);
}

TEST(Dimensions, FreshArrayAndBoundaryRules) {
  ElementArray a;
  EXPECT_EQ(a.dimensions(), 1);
  EXPECT_EQ(a.boundary(0), -1);
  EXPECT_EQ(a.boundary(1), 0);
  EXPECT_EQ(a.dimIndexOfIndex(1, 7), 7);
  EXPECT_EQ(a.dimIndexOfIndex(2, 7), 0);

  a.setDimensions(2);
  a.setBoundary(1, 10);
  a.setBoundary(2, 5);  // the last dimension has no boundary
  EXPECT_EQ(a.boundaryEntry(2), 0);
  a.setBoundary(1, 0);
  a.setBoundary(1, -4);
  EXPECT_EQ(a.boundary(1), 10);
  a.setBoundary(-1, 5);
  EXPECT_EQ(a.boundary(-1), 0);
  a.setBoundary(0, 6);  // entry 0 is settable like any other
  EXPECT_EQ(a.boundary(0), 6);

  a.setDimensions(10);
  EXPECT_EQ(a.dimensions(), 2);
  a.setDimensions(0);
  EXPECT_EQ(a.dimensions(), 0);
  EXPECT_EQ(a.boundary(1), 0);
  EXPECT_EQ(a.boundary(0), 0);
  a.setDimensions(-3);
  EXPECT_EQ(a.dimensions(), -3);
  EXPECT_EQ(a.dimIndexOfIndex(1, 7), 0);

  // An entry stored while it had a dimension stays, unread, when the count drops.
  a.setDimensions(3);
  a.setBoundary(2, 4);
  a.setDimensions(2);
  EXPECT_EQ(a.boundary(2), 0);
  EXPECT_EQ(a.boundaryEntry(2), 4);
}

TEST(Dimensions, CoordinatesOfAnIndex) {
  ElementArray a = table(10);
  const int32_t cases[][3] = {{1, 23, 3},   {2, 23, 2}, {1, -1, -1}, {2, -1, 0}, {2, -23, -2},
                              {1, -23, -3}, {0, 23, 0}, {-1, 23, 0}, {3, 23, 0}};
  for (auto [dim, index, expected] : cases) {
    EXPECT_EQ(a.dimIndexOfIndex(dim, index), expected) << dim << " " << index;
  }
  EXPECT_EQ(a.indexOfXY(3, 2), 23);
  // 3 * 10^8 * 10 + 1 wraps past 2^32.
  EXPECT_EQ(a.indexOfXY(1, 300000000), -1294967295);

  ElementArray cube;
  cube.setDimensions(3);
  cube.setBoundary(1, 4);
  cube.setBoundary(2, 3);
  EXPECT_EQ(cube.stride(0), 1);
  EXPECT_EQ(cube.stride(1), 4);
  EXPECT_EQ(cube.stride(2), 12);
  for (int32_t dim = 1; dim <= 3; ++dim) EXPECT_EQ(cube.dimIndexOfIndex(dim, 17), 1);

  // A 2D array whose X boundary was never set divides by 0: the answer is 0.
  ElementArray unset = table(0);
  EXPECT_EQ(unset.dimIndexOfIndex(1, 5), 0);
  EXPECT_EQ(unset.dimIndexOfIndex(2, 5), 0);
  EXPECT_EQ(unset.indexOfXY(5, 3), 5);
}

TEST(Dimensions, IndexOfCoordinateListSplitsAtEveryDelimiterCharacter) {
  ElementArray a = table(10);
  EXPECT_EQ(a.indexOfDimIndex(nullptr), 0);
  const struct {
    const char* delimiter;
    const char* list;
    int32_t index;
  } cases[] = {// clang-format off
      {",", "3,2", 23}, {",", ",,3,,,2,,", 23}, {",", " 3, -2", -17}, {",", "x,2", 20},
      {",", "", 0},     {",", ",,,", 0},        {";", "3;2", 23},     {";", "3,2", 3},
      // A set of characters, not a word; digits can separate too; with no delimiter
      // the whole text is one token.
      {"ab", "3a2", 23}, {"ab", "3b2", 23}, {"ab", "3ba2", 23}, {"0", "305", 53},
      {"", "3,2", 3},    {"", "", 0}};
  // clang-format on
  for (const auto& c : cases) {
    a.setListDelimiter(c.delimiter);
    EXPECT_EQ(a.indexOfDimIndex(c.list), c.index) << "«" << c.list << "» by «" << c.delimiter;
  }
  EXPECT_EQ(a.indexOfXY(3, 2), 23);

  // Coordinates are not limited to their boundaries.
  ElementArray b = table(3);
  EXPECT_EQ(b.indexOfDimIndex("5,2"), 11);
  EXPECT_EQ(b.indexOfDimIndex("2,3"), 11);

  // Tokens past the last dimension use the entries stored above it.
  ElementArray c;
  c.setDimensions(3);
  c.setBoundary(1, 10);
  c.setBoundary(2, 4);
  c.setDimensions(2);
  EXPECT_EQ(c.indexOfDimIndex("1,2,3"), 141);
  c.setDimensions(1);
  EXPECT_EQ(c.indexOfDimIndex("1,2,3"), 141);
}

// Complete blocks keep their coordinates; data filling at most one old block, a table
// without an X boundary (blocks of 0) and refused resizes move nothing. Entry 0 starts
// at -1: growing it to 1 adds 1 - (-1) = 2 empty elements after each element; shrinking
// it by one block (one element) deletes at index 0 once per element, so all go; by more
// than one it would delete at negative indexes, so nothing moves.
TEST(Dimensions, ResizeOfColumnsAndOfEntryZero) {
  const struct {
    int32_t dims, entry0, columns;
    const char* chars;
    int32_t dim, boundary;
    const char* after;
    int32_t boundaryAfter;
  } cases[] = {// clang-format off
      {2, 0, 3, "klmnopqr", 1, 5, "k|l|m|_|_|n|o|p|_|_|q|r", 5},
      {2, 0, 3, "klmnopqr", 1, 2, "k|l|n|o|q|r", 2}, {2, 0, 3, "klmnopqr", 1, 1, "k|n|q|r", 1},
      {2, 0, 2, "123456", 1, 4, "1|2|_|_|3|4|_|_|5|6|_|_", 4},
      {2, 0, 3, "abc", 1, 5, "a|b|c", 5},    {2, 0, 0, "abcd", 1, 3, "a|b|c|d", 3},
      {2, 0, 2, "abcd", 1, 0, "a|b|c|d", 2}, {2, 0, 2, "abcd", -1, 3, "a|b|c|d", 2},
      {2, 0, 2, "abcd", 2, 3, "a|b|c|d", 2}, {2, 0, 2, "abcd", 1, 2, "a|b|c|d", 2},
      {1, 0, 0, "abc", 0, 1, "a|_|_|b|_|_|c|_|_", 1}, {1, 2, 0, "abc", 0, 1, "", 1},
      {1, 5, 0, "abc", 0, 2, "a|b|c", 2}};
  // clang-format on
  for (const auto& c : cases) {
    ElementArray a = shaped(c.dims, c.entry0, c.columns, c.chars);
    a.resizeBoundary(c.dim, c.boundary);
    EXPECT_EQ(contents(a), c.after) << c.chars << " " << c.dim << " to " << c.boundary;
    EXPECT_EQ(a.boundary(c.dim == 0 ? 0 : 1), c.boundaryAfter);
  }

  // Keys move with their elements; removed elements take their keys with them.
  ElementArray e = table(2, "1234");
  e.setKeyString("k3", 2);
  e.setKeyString("k4", 3);
  e.resizeBoundary(1, 1);
  EXPECT_EQ(contents(e), "1|3");
  EXPECT_STREQ(e.getKeyString(1), "k3");
  e.resizeBoundary(1, 3);
  EXPECT_EQ(contents(e), "1|_|_|3|_|_");
  EXPECT_STREQ(e.getKeyString(3), "k3");
  EXPECT_EQ(e.getKeyString(1), nullptr);
}

TEST(Dimensions, ResizeOfPages) {
  ElementArray a;
  a.setDimensions(3);
  a.setBoundary(1, 2);
  a.setBoundary(2, 2);
  for (int i = 1; i <= 10; ++i) a.appendValue(i);
  a.resizeBoundary(2, 3);  // every complete page of 4 gains a row of 2
  EXPECT_EQ(contents(a), "1|2|3|4|_|_|5|6|7|8|_|_|9|10");
  EXPECT_EQ(a.getValue(a.indexOfDimIndex("0,0,2")), 9);
  a.resizeBoundary(2, 1);
  EXPECT_EQ(contents(a), "1|2|5|6|9|10");
  a.resizeBoundary(3, 4);  // the last dimension: nothing
  EXPECT_EQ(a.boundaryEntry(3), 0);
  EXPECT_EQ(a.size(), 6);
}

// The capacity after a resize is the one its inserts and deletes reach one by one.
TEST(Dimensions, CapacityAfterResize) {
  // The last insert lands inside the array at size 12, so the capacity stays 25
  // although 13 elements result.
  ElementArray a = table(2, "abcdefg");
  a.resizeBoundary(1, 4);
  EXPECT_EQ(contents(a), "a|b|_|_|c|d|_|_|e|f|_|_|g");
  EXPECT_EQ(a.capacity(), 25);
  a.appendValue(1);
  EXPECT_EQ(a.capacity(), 37);

  // One column to two: the sizes before the inserts run 12 .. 22 and the last insert is
  // a set at index 23, giving 24 elements and capacity 55.
  ElementArray b = table(1);
  for (int i = 1; i <= 12; ++i) b.appendValue(i);
  b.resizeBoundary(1, 2);
  EXPECT_EQ(b.size(), 24);
  EXPECT_EQ(b.capacity(), 55);
  EXPECT_EQ(b.getValue(22), 12);

  // Four columns to one on 200 elements: 150 deletes from sizes 200 .. 51 shrink
  // 414 -> 310 (at 102) -> 232 (at 76) -> 174 (at 57).
  ElementArray c = table(4);
  for (int i = 1; i <= 200; ++i) c.appendValue(i);
  c.resizeBoundary(1, 1);
  EXPECT_EQ(c.size(), 50);
  EXPECT_EQ(c.capacity(), 174);
  EXPECT_EQ(c.getValue(49), 197);
}

// The resize written out step by step with single inserts and deletes.
void resizeStepByStep(ElementArray& a, int32_t d, int32_t n) {
  if (n < 1 || d < 0 || d >= a.dimensions()) return;
  const int32_t old = a.boundaryEntry(d);
  const int32_t block = a.stride(d);
  const int32_t unit = a.stride(d - 1);
  const int32_t size = a.size();
  if (n != old && block > 0 && block < size) {
    for (int32_t k = 1; k * block <= size; ++k) {
      const int32_t count = unit * (n > old ? n - old : old - n);
      for (int32_t i = 0; i < count; ++i) {
        if (n > old) {
          a.insertFile({}, k * block + (k - 1) * count);
        } else {
          a.deleteAt(k * (block - count));
        }
      }
    }
  }
  a.setBoundary(d, n);
}

TEST(Dimensions, ResizeMatchesSingleStepsOnRandomArrays) {
  std::mt19937 random(11);
  for (int round = 0; round < 400; ++round) {
    ElementArray fast;
    ElementArray slow;
    const auto pick = [&](uint32_t n) { return static_cast<int32_t>(random() % n); };
    const int32_t dims = 1 + pick(3), x = 1 + pick(4), y = 1 + pick(3), count = pick(70);
    const int32_t autoSelect = pick(2);
    for (ElementArray* a : {&fast, &slow}) {
      a->setAutoSelect(autoSelect);
      a->setDimensions(3);
      a->setBoundary(1, x);
      a->setBoundary(2, y);
      a->setDimensions(dims);
      if (round % 3 == 0) a->setBoundary(0, 1 + round % 4);
      for (int32_t i = 1; i <= count; ++i) a->appendValue(i);
      for (uint8_t& state : a->rowStates) state = RowSelected + (state + round) % 2;
    }
    for (int step = 0; step < 2; ++step) {
      const int32_t d = pick(3), n = 1 + pick(5);
      fast.resizeBoundary(d, n);
      resizeStepByStep(slow, d, n);
      ASSERT_EQ(contents(fast), contents(slow)) << "round " << round << " d " << d << " n " << n;
      ASSERT_EQ(fast.capacity(), slow.capacity()) << "round " << round;
      ASSERT_EQ(fast.boundaryEntry(d), slow.boundaryEntry(d));
      ASSERT_EQ(fast.rowStates, slow.rowStates) << "round " << round;
    }
  }
}

}  // namespace
}  // namespace quorrel
