#include <gtest/gtest.h>

#include <random>
#include <string>

#include "array/element_array.h"

namespace quorrel {
namespace {

std::string contents(ElementArray& a) {
  std::string out;
  for (int32_t i = 0; i < a.size(); ++i) {
    if (i > 0) out += '|';
    out += a.at(i).type() == ElementType::None ? std::string("_") : a.getString(i);
  }
  return out;
}

void appendTexts(ElementArray& a, std::initializer_list<const char*> texts) {
  for (const char* t : texts) a.appendString(t);
}

ElementArray table(int32_t columns) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, columns);
  return a;
}

TEST(Dimensions, FreshArrayAndBoundaryRules) {
  ElementArray a;
  EXPECT_EQ(a.dimensions(), 1);
  EXPECT_EQ(a.boundary(0), -1);
  EXPECT_EQ(a.boundary(1), 0);
  EXPECT_EQ(a.dimIndexOfIndex(1, 7), 7);
  EXPECT_EQ(a.dimIndexOfIndex(2, 7), 0);
  EXPECT_EQ(a.dimIndexOfIndex(3, 7), 0);

  a.setDimensions(2);
  a.setBoundary(1, 10);
  EXPECT_EQ(a.boundary(1), 10);
  EXPECT_EQ(a.boundary(2), 0);
  a.setBoundary(2, 5);  // the last dimension has no boundary
  EXPECT_EQ(a.boundaryEntry(2), 0);
  a.setBoundary(1, 0);
  a.setBoundary(1, -4);
  EXPECT_EQ(a.boundary(1), 10);
  a.setBoundary(-1, 5);
  EXPECT_EQ(a.boundary(-1), 0);
  a.setBoundary(0, 6);  // entry 0 is settable like any other
  EXPECT_EQ(a.boundary(0), 6);

  a.setDimensions(12);
  EXPECT_EQ(a.dimensions(), 2);
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
  EXPECT_EQ(a.dimIndexOfIndex(1, 23), 3);
  EXPECT_EQ(a.dimIndexOfIndex(2, 23), 2);
  EXPECT_EQ(a.dimIndexOfIndex(1, -1), -1);
  EXPECT_EQ(a.dimIndexOfIndex(2, -1), 0);
  EXPECT_EQ(a.dimIndexOfIndex(2, -23), -2);
  EXPECT_EQ(a.dimIndexOfIndex(1, -23), -3);
  EXPECT_EQ(a.dimIndexOfIndex(0, 23), 0);
  EXPECT_EQ(a.dimIndexOfIndex(-1, 23), 0);
  EXPECT_EQ(a.dimIndexOfIndex(3, 23), 0);
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
  EXPECT_EQ(cube.dimIndexOfIndex(1, 17), 1);
  EXPECT_EQ(cube.dimIndexOfIndex(2, 17), 1);
  EXPECT_EQ(cube.dimIndexOfIndex(3, 17), 1);

  // A 2D array whose X boundary was never set divides by 0: the answer is 0.
  ElementArray unset;
  unset.setDimensions(2);
  EXPECT_EQ(unset.dimIndexOfIndex(1, 5), 0);
  EXPECT_EQ(unset.dimIndexOfIndex(2, 5), 0);
  EXPECT_EQ(unset.indexOfXY(5, 3), 5);
}

TEST(Dimensions, IndexOfCoordinateListSplitsAtEveryDelimiterCharacter) {
  ElementArray a = table(10);
  EXPECT_EQ(a.indexOfDimIndex("3,2"), 23);
  EXPECT_EQ(a.indexOfDimIndex(",,3,,,2,,"), 23);
  EXPECT_EQ(a.indexOfDimIndex(" 3, -2"), -17);
  EXPECT_EQ(a.indexOfDimIndex("x,2"), 20);
  EXPECT_EQ(a.indexOfDimIndex(""), 0);
  EXPECT_EQ(a.indexOfDimIndex(",,,"), 0);
  EXPECT_EQ(a.indexOfDimIndex(nullptr), 0);

  a.setListDelimiter(";");
  EXPECT_EQ(a.indexOfDimIndex("3;2"), 23);
  EXPECT_EQ(a.indexOfDimIndex("3,2"), 3);
  EXPECT_EQ(a.indexOfXY(3, 2), 23);

  a.setListDelimiter("ab");  // a set of characters, not a word
  EXPECT_EQ(a.indexOfDimIndex("3a2"), 23);
  EXPECT_EQ(a.indexOfDimIndex("3b2"), 23);
  EXPECT_EQ(a.indexOfDimIndex("3ba2"), 23);

  a.setListDelimiter("0");  // digits can separate too
  EXPECT_EQ(a.indexOfDimIndex("305"), 53);

  a.setListDelimiter("");  // the whole text is one token
  EXPECT_EQ(a.indexOfDimIndex("3,2"), 3);
  EXPECT_EQ(a.indexOfDimIndex(""), 0);

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

TEST(Dimensions, ResizeKeepsCoordinatesOfCompleteBlocks) {
  ElementArray a = table(3);
  appendTexts(a, {"k", "l", "m", "n", "o", "p", "q", "r"});
  a.resizeBoundary(1, 5);
  EXPECT_EQ(contents(a), "k|l|m|_|_|n|o|p|_|_|q|r");
  EXPECT_EQ(a.boundary(1), 5);

  ElementArray b = table(3);
  appendTexts(b, {"k", "l", "m", "n", "o", "p", "q", "r"});
  b.resizeBoundary(1, 2);
  EXPECT_EQ(contents(b), "k|l|n|o|q|r");
  EXPECT_EQ(b.boundary(1), 2);

  ElementArray c = table(3);
  appendTexts(c, {"k", "l", "m", "n", "o", "p", "q", "r"});
  c.resizeBoundary(1, 1);
  EXPECT_EQ(contents(c), "k|n|q|r");

  ElementArray d = table(2);
  appendTexts(d, {"1", "2", "3", "4", "5", "6"});
  d.resizeBoundary(1, 4);
  EXPECT_EQ(contents(d), "1|2|_|_|3|4|_|_|5|6|_|_");
  EXPECT_EQ(d.capacity(), 25);

  // Keys move with their elements; removed elements take their keys with them.
  ElementArray e = table(2);
  appendTexts(e, {"1", "2", "3", "4"});
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

TEST(Dimensions, ResizeOfPagesInThreeDimensions) {
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
  // A resize of the last dimension does nothing.
  a.resizeBoundary(3, 4);
  EXPECT_EQ(a.boundaryEntry(3), 0);
  EXPECT_EQ(a.size(), 6);
}

TEST(Dimensions, ResizeThatMovesNothing) {
  // The data fills at most one old block.
  ElementArray a = table(3);
  appendTexts(a, {"a", "b", "c"});
  a.resizeBoundary(1, 5);
  EXPECT_EQ(contents(a), "a|b|c");
  EXPECT_EQ(a.boundary(1), 5);

  // No X boundary yet: the old block holds 0 elements.
  ElementArray b;
  b.setDimensions(2);
  appendTexts(b, {"a", "b", "c", "d"});
  b.resizeBoundary(1, 3);
  EXPECT_EQ(contents(b), "a|b|c|d");
  EXPECT_EQ(b.boundary(1), 3);

  // Refused dimension numbers and boundaries.
  ElementArray c = table(2);
  appendTexts(c, {"a", "b", "c", "d"});
  c.resizeBoundary(1, 0);
  c.resizeBoundary(-1, 3);
  c.resizeBoundary(2, 3);
  EXPECT_EQ(contents(c), "a|b|c|d");
  EXPECT_EQ(c.boundary(1), 2);
  c.resizeBoundary(1, 2);  // the same boundary
  EXPECT_EQ(contents(c), "a|b|c|d");
}

TEST(Dimensions, ResizeOfEntryZeroWorksElementByElement) {
  // Entry 0 starts at -1: growing to 1 adds 1 - (-1) = 2 empty elements after each one.
  ElementArray a;
  appendTexts(a, {"a", "b", "c"});
  a.resizeBoundary(0, 1);
  EXPECT_EQ(contents(a), "a|_|_|b|_|_|c|_|_");
  EXPECT_EQ(a.boundary(0), 1);

  // Shrinking by one block (one element) deletes at index 0 once per element: all go.
  ElementArray b;
  appendTexts(b, {"a", "b", "c"});
  b.setBoundary(0, 2);
  b.resizeBoundary(0, 1);
  EXPECT_EQ(b.size(), 0);
  EXPECT_EQ(b.boundary(0), 1);

  // Shrinking by more than one element would delete at negative indexes: nothing moves.
  ElementArray c;
  appendTexts(c, {"a", "b", "c"});
  c.setBoundary(0, 5);
  c.resizeBoundary(0, 2);
  EXPECT_EQ(contents(c), "a|b|c");
  EXPECT_EQ(c.boundary(0), 2);
}

// The capacity after a resize is the one its inserts and deletes reach one by one.
TEST(Dimensions, CapacityAfterResize) {
  // Growing a b / c d / e f / g to four columns: the last insert lands inside the
  // array at size 12, so the capacity stays 25 although 13 elements result.
  ElementArray a = table(2);
  appendTexts(a, {"a", "b", "c", "d", "e", "f", "g"});
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
  ASSERT_EQ(c.capacity(), 414);
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
      if (n > old) {
        const int32_t count = unit * (n - old);
        for (int32_t i = 0; i < count; ++i) a.insertFile({}, k * block + (k - 1) * count);
      } else {
        const int32_t count = unit * (old - n);
        for (int32_t i = 0; i < count; ++i) a.deleteAt(k * (block - count));
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
    const int32_t dims = 1 + static_cast<int32_t>(random() % 3);
    const int32_t x = 1 + static_cast<int32_t>(random() % 4);
    const int32_t y = 1 + static_cast<int32_t>(random() % 3);
    const int32_t count = static_cast<int32_t>(random() % 70);
    const int32_t autoSelect = static_cast<int32_t>(random() % 2);
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
      const int32_t d = static_cast<int32_t>(random() % 3);
      const int32_t n = 1 + static_cast<int32_t>(random() % 5);
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
