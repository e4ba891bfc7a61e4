#include <gtest/gtest.h>

#include "array/element_array.h"

namespace quorrel {
namespace {

TEST(Capacity, GrowsByHalfWhenSizePassesHalf) {
  ElementArray a;
  EXPECT_EQ(a.capacity(), 25);
  const int expected[][2] = {{12, 25}, {13, 37},  {18, 37},  {19, 55},  {27, 55},  {28, 82},
                             {41, 82}, {42, 123}, {62, 184}, {93, 276}, {139, 414}};
  int appended = 0;
  for (auto [count, capacity] : expected) {
    while (appended < count) a.appendValue(++appended);
    EXPECT_EQ(a.capacity(), capacity) << "after " << count << " appends";
  }
}

TEST(Capacity, SetFarPastTheEndGrowsStepByStep) {
  ElementArray a;
  a.setString("a", 1000);
  EXPECT_EQ(a.size(), 1001);
  EXPECT_EQ(a.capacity(), 2094);
  a.clear();
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(a.capacity(), 25);
}

// An insert inside the array balances the capacity for the size before it grows, so
// inserting at the front reaches 37 one element later than appending does.
TEST(Capacity, InsertInsideBalancesForTheSizeBefore) {
  ElementArray a;
  for (int i = 1; i <= 13; ++i) a.insertValue(i, 0);
  EXPECT_EQ(a.size(), 13);
  EXPECT_EQ(a.capacity(), 25);
  a.insertValue(14, 0);
  EXPECT_EQ(a.capacity(), 37);
}

// Shrinking to 75 % happens when the size before a delete is under a quarter of the
// capacity; between a quarter and a half nothing changes.
TEST(Capacity, ShrinksWithHysteresis) {
  ElementArray a;
  for (int i = 1; i <= 200; ++i) a.appendValue(i);
  ASSERT_EQ(a.capacity(), 414);

  // 414 / 4 = 103: deleting from 103 elements keeps 414, from 102 shrinks to 310.
  while (a.size() > 102) a.deleteAt(0);
  EXPECT_EQ(a.capacity(), 414);
  // Growing back needs more than 207 elements.
  while (a.size() < 207) a.appendValue(1);
  EXPECT_EQ(a.capacity(), 414);
  a.appendValue(1);
  EXPECT_EQ(a.capacity(), 621);
  while (a.size() > 102) a.deleteAt(a.size() - 1);
  // 621 / 4 = 155, so the deletes from 154 down already shrank to 465 (465 / 4 = 116,
  // then from 115 down to 348).
  EXPECT_EQ(a.capacity(), 348);

  ElementArray b;
  for (int i = 1; i <= 200; ++i) b.appendValue(i);
  while (b.size() > 102) b.deleteAt(0);
  b.deleteAt(0);  // from 102: 414 -> 310
  EXPECT_EQ(b.size(), 101);
  EXPECT_EQ(b.capacity(), 310);
  const int steps[][2] = {{76, 310}, {75, 232}, {57, 232}, {56, 174},
                          {42, 174}, {41, 130}, {31, 130}, {30, 97}};
  for (auto [size, capacity] : steps) {
    while (b.size() > size) b.deleteAt(0);
    EXPECT_EQ(b.capacity(), capacity) << "at size " << size;
  }
  while (b.size() > 0) b.deleteAt(0);
  EXPECT_EQ(b.capacity(), 97);  // below 26 elements nothing shrinks
  for (int i = 1; i <= 48; ++i) b.appendValue(i);
  EXPECT_EQ(b.capacity(), 97);
  b.appendValue(49);
  EXPECT_EQ(b.capacity(), 145);
}

// A set or insert inside the array also rebalances, which can shrink it.
TEST(Capacity, SetInsideCanShrink) {
  ElementArray a;
  for (int i = 1; i <= 200; ++i) a.appendValue(i);
  while (a.size() > 102) a.deleteAt(0);
  ASSERT_EQ(a.capacity(), 414);
  a.setValue(5, 0);
  EXPECT_EQ(a.capacity(), 310);

  ElementArray b;
  for (int i = 1; i <= 200; ++i) b.appendValue(i);
  while (b.size() > 102) b.deleteAt(0);
  b.insertValue(5, 0);
  EXPECT_EQ(b.size(), 103);
  EXPECT_EQ(b.capacity(), 310);

  // Key setters and reads leave the capacity alone.
  ElementArray c;
  for (int i = 1; i <= 200; ++i) c.appendValue(i);
  while (c.size() > 102) c.deleteAt(0);
  c.setKeyValue(1, 0);
  c.getValue(0);
  EXPECT_EQ(c.capacity(), 414);
}

}  // namespace
}  // namespace quorrel
