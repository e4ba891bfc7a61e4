#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "support/array_text.h"

namespace quorrel {
namespace {

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
      a->settings.autoSelectNewRows = autoSelect;
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
  ElementArray a = shaped(2, 3);
  EXPECT_EQ(a.indexOfDimIndex(nullptr), 0);  // no list at all reads as index 0
  a.settings.autoSelectNewRows = true;
  for (int i = 1; i <= 6; ++i) a.appendValue(i);
  a.rowStates = {U, S};
  a.deleteAt(4);
  EXPECT_EQ(a.rowStates, (States{U}));
  for (int i = 0; i < 4; ++i) a.insertValue(9, 0);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  a.settings.autoSelectNewRows = false;
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  for (int i = 0; i < 3; ++i) a.appendValue(9);
  EXPECT_EQ(a.rowStates, (States{U, S, S, U}));
  a.setKeyValue(1, 0);
  EXPECT_EQ(a.rowStates.size(), 4u);

  // Setting changes bring the list up to date.
  a.settings.autoSelectNewRows = true;
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
  ElementArray a = shaped(2, 3);
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
      a.settings.autoSelectNewRows = small > 1 ? 1 : 0;
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
