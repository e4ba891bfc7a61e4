#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "support/array_text.h"

namespace quorrel {
namespace {

using States = std::vector<uint8_t>;
constexpr uint8_t S = RowSelected;
constexpr uint8_t U = RowUnselected;

// An array of `dims` dimensions with boundary entries 0 and 1 set (where positive)
// holding one single-character text per character of `chars`.
ElementArray shaped(int32_t dims, int32_t entry0, int32_t columns, const char* chars = "") {
  ElementArray a;
  a.setDimensions(dims);
  a.setBoundary(0, entry0);
  a.setBoundary(1, columns);
  for (; *chars != '\0'; ++chars) a.appendString(std::string(1, *chars).c_str());
  return a;
}

// Counts outside 1..3 are stored but give no coordinates; a 2D array whose X boundary
// was never set divides by 0, and the answer is 0.
TEST(Dimensions, CoordinatesOfAnIndex) {
  ElementArray a = shaped(2, 0, 10);
  const int32_t cases[][3] = {{1, 23, 3},   {2, 23, 2}, {1, -1, -1}, {2, -1, 0}, {2, -23, -2},
                              {1, -23, -3}, {0, 23, 0}, {-1, 23, 0}, {3, 23, 0}};
  for (auto [dim, index, expected] : cases) {
    EXPECT_EQ(a.dimIndexOfIndex(dim, index), expected) << dim << " " << index;
  }
  // 3 * 10^8 * 10 + 1 wraps past 2^32.
  EXPECT_EQ(a.indexOfXY(1, 300000000), -1294967295);
  a.setDimensions(-3);
  EXPECT_EQ(a.dimensions(), -3);
  EXPECT_EQ(a.dimIndexOfIndex(1, 7), 0);
  a.setDimensions(0);
  EXPECT_EQ(a.boundary(0), 0);

  ElementArray cube = shaped(3, 0, 4);
  cube.setBoundary(2, 3);
  for (int32_t dim = 1; dim <= 3; ++dim) EXPECT_EQ(cube.dimIndexOfIndex(dim, 17), 1);

  ElementArray unset = shaped(2, 0, 0);
  EXPECT_EQ(unset.dimIndexOfIndex(1, 5), 0);
  EXPECT_EQ(unset.dimIndexOfIndex(2, 5), 0);
  EXPECT_EQ(unset.indexOfXY(5, 3), 5);
}

TEST(Dimensions, IndexOfCoordinateListSplitsAtEveryDelimiterCharacter) {
  ElementArray a = shaped(2, 0, 10);
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
  // Coordinates are not limited to their boundaries.
  EXPECT_EQ(shaped(2, 0, 3).indexOfDimIndex("5,2"), 11);

  // Tokens past the last dimension use the entries stored above it.
  ElementArray c = shaped(3, 0, 10);
  c.setBoundary(2, 4);
  c.setDimensions(2);
  EXPECT_EQ(c.boundary(2), 0);
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
      {2, 0, 3, "klmnopqr", 1, 5, "k|l|m|~|~|n|o|p|~|~|q|r", 5},
      {2, 0, 3, "klmnopqr", 1, 1, "k|n|q|r", 1},
      {2, 0, 3, "abc", 1, 5, "a|b|c", 5},    {2, 0, 0, "abcd", 1, 3, "a|b|c|d", 3},
      {2, 0, 2, "abcd", 1, 0, "a|b|c|d", 2}, {2, 0, 2, "abcd", -1, 3, "a|b|c|d", 2},
      {2, 0, 2, "abcd", 2, 3, "a|b|c|d", 2},
      {1, 0, 0, "abc", 0, 1, "a|~|~|b|~|~|c|~|~", 1}, {1, 2, 0, "abc", 0, 1, "", 1},
      {1, 5, 0, "abc", 0, 2, "a|b|c", 2}};
  // clang-format on
  for (const auto& c : cases) {
    ElementArray a = shaped(c.dims, c.entry0, c.columns, c.chars);
    a.resizeBoundary(c.dim, c.boundary);
    EXPECT_EQ(contents(a), c.after) << c.chars << " " << c.dim << " to " << c.boundary;
    EXPECT_EQ(a.boundary(c.dim == 0 ? 0 : 1), c.boundaryAfter);
  }
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

// Elements, keys, capacity and row states after a resize are those its single inserts
// and deletes reach.
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
      for (int32_t i = 0; i < count; i += 3) a->setKeyValue(i + 1, i);
      for (uint8_t& state : a->rowStates) state = RowSelected + (state + round) % 2;
    }
    for (int step = 0; step < 2; ++step) {
      const int32_t d = pick(3), n = 1 + pick(5);
      fast.resizeBoundary(d, n);
      resizeStepByStep(slow, d, n);
      ASSERT_EQ(contents(fast), contents(slow)) << "round " << round << " d " << d << " n " << n;
      for (int32_t i = 0; i < fast.size(); ++i) ASSERT_EQ(fast.getKeyValue(i), slow.getKeyValue(i));
      ASSERT_EQ(fast.capacity(), slow.capacity()) << "round " << round;
      ASSERT_EQ(fast.boundaryEntry(d), slow.boundaryEntry(d));
      ASSERT_EQ(fast.rowStates, slow.rowStates) << "round " << round;
    }
  }
}

// States belong to positions, not rows: edits that change the row count drop or add
// positions at the end, new ones from the automatic selection; key setters change none.
TEST(RowStates, StatesBelongToPositionsNotRows) {
  ElementArray a = shaped(2, 0, 3);
  a.setAutoSelect(1);
  for (int i = 1; i <= 6; ++i) a.appendValue(i);
  a.rowStates = {U, S};
  a.deleteAt(4);
  EXPECT_EQ(a.rowStates, (States{U}));
  for (int i = 0; i < 4; ++i) a.insertValue(9, 0);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  a.setAutoSelect(0);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  for (int i = 0; i < 3; ++i) a.appendValue(9);
  EXPECT_EQ(a.rowStates, (States{U, S, S, U}));
  a.setKeyValue(1, 0);
  EXPECT_EQ(a.rowStates.size(), 4u);

  // Setting changes bring the list up to date.
  a.setAutoSelect(1);
  a.setBoundary(1, 4);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  a.setBoundary(1, 2);
  EXPECT_EQ(a.rowStates, (States{U, S, S, S, S, S}));
  a.setDimensions(3);
  EXPECT_TRUE(a.rowStates.empty());
  a.setDimensions(2);
  EXPECT_EQ(a.rowStates, (States{S, S, S, S, S, S}));
  a.clear();
  EXPECT_TRUE(a.rowStates.empty());
}

// Whatever happens, there is exactly one state per table row.
TEST(RowStates, AlwaysOnePerTableRow) {
  std::mt19937 random(7);
  ElementArray a = shaped(2, 0, 3);
  for (int step = 0; step < 3000; ++step) {
    const int32_t pick = static_cast<int32_t>(random() % 100);
    const int32_t index = static_cast<int32_t>(random() % 40) - 2;
    const int32_t small = static_cast<int32_t>(random() % 6) - 1;
    if (pick < 30) {
      a.appendValue(index);
    } else if (pick < 45) {
      a.insertString("t", index);
    } else if (pick < 60) {
      a.deleteAt(index);
    } else if (pick < 68) {
      a.setValue(small, index);
    } else if (pick < 74) {
      a.setBoundary(small, small + 1);
    } else if (pick < 82) {
      a.resizeBoundary(small, small + static_cast<int32_t>(random() % 3));
    } else if (pick < 88) {
      a.setDimensions(pick < 85 ? 2 : small);
    } else if (pick < 90) {
      a.clear();
    } else if (pick < 95) {
      a.setAutoSelect(small > 1 ? 1 : 0);
    } else if (a.size() > 60) {
      a.deleteAt(0);
    }
    ASSERT_EQ(a.rowStates.size(), static_cast<size_t>(a.tableRowCount())) << "step " << step;
    for (uint8_t state : a.rowStates) ASSERT_TRUE(state == S || state == U);
    ASSERT_LT(a.size(), 100000);
  }
}

}  // namespace
}  // namespace quorrel
