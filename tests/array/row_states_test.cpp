#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "array/element_array.h"

namespace quorrel {
namespace {

using States = std::vector<uint8_t>;
constexpr uint8_t S = RowSelected;
constexpr uint8_t U = RowUnselected;

// A table of `columns` columns holding the values 1 .. count, then given `states`.
ElementArray table(int32_t columns, int32_t autoSelect, int32_t count = 0, States states = {}) {
  ElementArray a;
  a.setAutoSelect(autoSelect);
  a.setDimensions(2);
  a.setBoundary(1, columns);
  for (int32_t i = 1; i <= count; ++i) a.appendValue(i);
  if (!states.empty()) a.rowStates = states;
  return a;
}

TEST(RowStates, NewRowsStartFromTheAutomaticSelection) {
  ElementArray list;
  list.setAutoSelect(1);
  for (int i = 0; i < 10; ++i) list.appendValue(i);
  list.setBoundary(0, 2);
  EXPECT_EQ(list.tableRowCount(), 0);  // one-dimensional arrays have no rows
  EXPECT_TRUE(list.rowStates.empty());

  for (int32_t autoSelect : {1, 0}) {
    const uint8_t start = autoSelect == 1 ? S : U;
    ElementArray a = table(3, autoSelect);
    for (size_t count : {0, 0, 1, 1, 1, 2}) {
      a.appendValue(1);
      EXPECT_EQ(a.rowStates.size(), count);
    }
    EXPECT_EQ(a.rowStates, (States{start, start}));
  }
}

TEST(RowStates, StatesBelongToPositionsNotRows) {
  ElementArray a = table(3, 1, 6, {U, S});
  a.deleteAt(4);
  EXPECT_EQ(a.rowStates, (States{U}));

  ElementArray b = table(3, 1, 6, {U, S});
  for (int i = 0; i < 3; ++i) b.insertValue(9, 0);
  EXPECT_EQ(b.rowStates, (States{U, S, S}));
  // Only positions added later see a new starting value.
  b.setAutoSelect(0);
  EXPECT_EQ(b.rowStates, (States{U, S, S}));
  for (int i = 0; i < 3; ++i) b.appendValue(9);
  EXPECT_EQ(b.rowStates, (States{U, S, S, U}));
  b.setKeyValue(1, 0);  // key setters change no row
  EXPECT_EQ(b.rowStates.size(), 4u);
}

TEST(RowStates, SettingChangesBringTheListUpToDate) {
  ElementArray a = table(3, 1, 6, {U, U});
  a.setBoundary(1, 2);  // three rows of two: the third position is new
  EXPECT_EQ(a.rowStates, (States{U, U, S}));
  a.setBoundary(1, 6);
  EXPECT_EQ(a.rowStates, (States{U}));
  a.setBoundary(1, 3);
  EXPECT_EQ(a.rowStates, (States{U, S}));
  a.setDimensions(3);
  EXPECT_TRUE(a.rowStates.empty());
  a.setDimensions(2);
  EXPECT_EQ(a.rowStates, (States{S, S}));

  a.rowStates = {U, U};
  a.clear();
  EXPECT_TRUE(a.rowStates.empty());
  EXPECT_EQ(a.tableRowCount(), 0);
  for (int i = 1; i <= 3; ++i) a.appendValue(i);
  EXPECT_EQ(a.rowStates, (States{S}));
}

TEST(RowStates, ResizeKeepsPositionsThatNeverDisappeared) {
  // Growing: no position is lost during the inserts.
  ElementArray a = table(3, 1, 8, {U, U});
  a.resizeBoundary(1, 5);
  EXPECT_EQ(a.size(), 12);
  EXPECT_EQ(a.rowStates, (States{U, U}));
  // Three columns to two: 6 elements remain, still two rows of three during the
  // deletes, then three rows of two.
  ElementArray b = table(3, 1, 8, {U, U});
  b.resizeBoundary(1, 2);
  EXPECT_EQ(b.rowStates, (States{U, U, S}));
  // Two columns to one on three rows: the deletes leave one row of two before the
  // boundary changes, so positions 1 and 2 come back new.
  ElementArray c = table(2, 1, 6, {U, U, U});
  c.resizeBoundary(1, 1);
  EXPECT_EQ(c.size(), 3);
  EXPECT_EQ(c.rowStates, (States{U, S, S}));
  // A resize that moves nothing only re-counts the rows.
  ElementArray d = table(3, 0, 3, {S});
  d.resizeBoundary(1, 1);
  EXPECT_EQ(d.rowStates, (States{S, U, U}));
}

// Whatever happens, there is exactly one state per table row.
TEST(RowStates, AlwaysOnePerTableRow) {
  std::mt19937 random(7);
  ElementArray a = table(3, 0);
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
