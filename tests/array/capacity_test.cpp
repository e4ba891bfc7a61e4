#include <gtest/gtest.h>

#include "array/element_array.h"

namespace quorrel {
namespace {

// 200 values deleted from the front down to 102: still 414, since the last delete
// started from 103 = 414 / 4; the next balance below that shrinks to 310.
ElementArray sparse() {
  ElementArray a;
  for (int i = 1; i <= 200; ++i) a.appendValue(i);
  while (a.size() > 102) a.deleteAt(0);
  return a;
}

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

  // Setting far past the end grows step by step; clear starts over.
  ElementArray far;
  far.setString("a", 1000);
  EXPECT_EQ(far.size(), 1001);
  EXPECT_EQ(far.capacity(), 2094);
  far.clear();
  EXPECT_EQ(far.capacity(), 25);

  // An insert inside balances for the size before it grows, so inserting at the front
  // reaches 37 one element later than appending does.
  ElementArray front;
  for (int i = 1; i <= 13; ++i) front.insertValue(i, 0);
  EXPECT_EQ(front.capacity(), 25);
  front.insertValue(14, 0);
  EXPECT_EQ(front.capacity(), 37);
}

// Shrinking to 75 % happens when the size before a delete is under a quarter of the
// capacity; between a quarter and a half nothing changes.
TEST(Capacity, ShrinksWithHysteresis) {
  ElementArray a = sparse();
  ASSERT_EQ(a.capacity(), 414);
  // Growing back needs more than 207 elements.
  while (a.size() < 207) a.appendValue(1);
  EXPECT_EQ(a.capacity(), 414);
  a.appendValue(1);
  EXPECT_EQ(a.capacity(), 621);
  while (a.size() > 102) a.deleteAt(a.size() - 1);
  // 621 / 4 = 155, so the deletes from 154 down already shrank to 465 (465 / 4 = 116,
  // then from 115 down to 348).
  EXPECT_EQ(a.capacity(), 348);

  ElementArray b = sparse();
  const int steps[][2] = {{101, 310}, {76, 310}, {75, 232}, {57, 232}, {56, 174},
                          {42, 174},  {41, 130}, {31, 130}, {30, 97},  {0, 97}};
  for (auto [size, capacity] : steps) {
    while (b.size() > size) b.deleteAt(0);
    EXPECT_EQ(b.capacity(), capacity) << "at size " << size;  // below 26 nothing shrinks
  }
  for (int i = 1; i <= 48; ++i) b.appendValue(i);
  EXPECT_EQ(b.capacity(), 97);
  b.appendValue(49);
  EXPECT_EQ(b.capacity(), 145);

  // A set or insert inside the array also rebalances, which can shrink it; key setters
  // and reads leave the capacity alone.
  ElementArray set = sparse();
  set.setValue(5, 0);
  EXPECT_EQ(set.capacity(), 310);
  ElementArray inserted = sparse();
  inserted.insertValue(5, 0);
  EXPECT_EQ(inserted.size(), 103);
  EXPECT_EQ(inserted.capacity(), 310);
  ElementArray keyed = sparse();
  keyed.setKeyValue(1, 0);
  keyed.getValue(0);
  EXPECT_EQ(keyed.capacity(), 414);
}

}  // namespace
}  // namespace quorrel
