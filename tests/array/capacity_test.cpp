#include <gtest/gtest.h>

#include "array/element_array.h"

namespace quorrel {
namespace {

TEST(Capacity, GrowsByHalfWhenSizePassesHalf) {
  ElementArray a;
  EXPECT_EQ(a.capacity(), 25);
  const int expected[][2] = {{12, 25}, {13, 37}, {18, 37}, {19, 55}, {27, 55}, {28, 82},
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

}  // namespace
}  // namespace quorrel
