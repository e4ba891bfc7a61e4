// The element store: capacity steps, edits everywhere and appends against plain models,
// dimensions and row states, and the all-or-nothing guard of edits.
#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "array/array_edit.h"
#include "support/array_text.h"

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
  // A shrink also needs more than 25 elements before the delete: 3534 elements
  // (capacity 10599) deleted down to 25 leave 105, and the delete from 25 keeps it.
  ElementArray last;
  last.setString("a", 3533);
  EXPECT_EQ(last.capacity(), 10599);
  while (last.size() > 24) last.deleteAt(last.size() - 1);
  EXPECT_EQ(last.capacity(), 105);
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
  EXPECT_EQ(inserted.capacity(), 310);
  ElementArray keyed = sparse();
  keyed.setKeyValue(1, 0);
  EXPECT_EQ(keyed.capacity(), 414);
}

// File bytes: empty or missing ones store None; a text reads with its terminator; a
// read outside leaves the block alone.
TEST(Store, FileBytesAndByteReads) {
  ElementArray f;
  ByteBlock block{"untouched", 9};
  EXPECT_FALSE(f.getBytes(block, 0));
  EXPECT_STREQ(block.bytes, "untouched");
  f.appendFile({"x\0y", 3});
  f.appendFile({nullptr, 4});
  f.appendFile({"abc", 0});
  f.appendString("abc");
  EXPECT_EQ(contents(f), std::string("<x\0y>|~|~|abc", 13));
  ASSERT_TRUE(f.getBytes(block, 1));
  EXPECT_EQ(block.bytes, nullptr);
  EXPECT_EQ(block.length, 0);
  ASSERT_TRUE(f.getBytes(block, 3));
  EXPECT_EQ(block.length, 4);
  EXPECT_EQ(std::memcmp(block.bytes, "abc", 4), 0);
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

// Appends take a shortcut while they cannot change the capacity or the row count, and
// appendNone(n) and appendElements of n elements append in bulk: each must leave what
// inserting at the end one by one leaves (elements, keys, capacity, row states),
// through growth, shrinking and tables.
TEST(Store, AppendsMatchSingleInsertsAtTheEnd) {
  for (int32_t dims : {1, 2}) {
    ElementArray appended, inserted;
    for (ElementArray* a : {&appended, &inserted}) {
      a->setDimensions(dims);
      a->setBoundary(1, 3);  // refused in one dimension
    }
    for (int step = 0; step < 400; ++step) {
      if (step % 97 == 96) {
        // Delete most of the array so that the capacity shrinks on the next appends.
        for (ElementArray* a : {&appended, &inserted}) {
          while (a->size() > 3) a->deleteAt(0);
        }
      }
      const std::string text = step % 5 == 0 ? std::string() : "t" + std::to_string(step);
      if (step % 3 == 0) {
        appended.appendValue(step);
        inserted.insertValue(step, inserted.size());
      } else {
        const char* t = step % 7 == 0 ? nullptr : text.c_str();
        appended.appendString(t);
        inserted.insertString(t, inserted.size());
      }
      ASSERT_EQ(contents(appended), contents(inserted)) << "dims " << dims << " step " << step;
      ASSERT_EQ(appended.capacity(), inserted.capacity()) << "dims " << dims << " step " << step;
      ASSERT_EQ(appended.rowStates, inserted.rowStates) << "dims " << dims << " step " << step;
    }
  }

  const auto prepare = [](ElementArray& a, int32_t start) {
    a.setDimensions(2);
    a.setBoundary(1, 4);
    a.settings.autoSelectNewRows = true;
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
      for (auto [bulk, one] : {std::pair{&none, &single}, std::pair{&run, &singleKeyed}}) {
        ASSERT_EQ(entries(*bulk), entries(*one)) << start << " + " << n;
        EXPECT_EQ(bulk->capacity(), one->capacity()) << start << " + " << n;
        EXPECT_EQ(bulk->rowStates, one->rowStates) << start << " + " << n;
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

// The all-or-nothing guard: an edit that is not committed leaves the array exactly as
// it was, whatever its kind; one that is committed keeps everything it did.
// Everything an edit may change, as one text: elements, capacity, shape, row states.
std::string state(ElementArray& a) {
  std::string out = "[" + contents(a) + "] cap " + std::to_string(a.capacity()) + " dims " +
                    std::to_string(a.dimensions()) + " x " + std::to_string(a.boundary(1)) +
                    " rows";
  for (uint8_t s : a.rowStates) out += " " + std::to_string(s);
  return out + (a.labels ? " labelled" : "");
}

// A 2-column table of 3 rows, the middle one selected.
ElementArray table() {
  ElementArray a = shaped(2, 2);
  for (int i = 0; i < 6; ++i) a.appendValue(i);
  a.rowStates[1] = RowSelected;
  return a;
}

TEST(ArrayEdit, UndoneUnlessCommitted) {
  ElementArray a = table();
  const std::string before = state(a);
  {  // Growing: appends past a capacity step, a new shape, labels.
    ArrayEdit edit(a, ArrayEdit::Growing);
    for (int i = 0; i < 40; ++i) a.appendString("g");
    a.setDimensions(3);
    a.labels.emplace();
  }
  EXPECT_EQ(state(a), before);
  {  // InsertingAt: inserts in the middle, a swapped cell, growth past the end.
    std::vector<Element> cells;
    cells.push_back(Element::of(ElementValue::ofText("swapped")));
    ArrayEdit edit(a, ArrayEdit::InsertingAt, 2);
    a.insertString("i", 2);
    a.insertString("j", 2);
    edit.swapIn(0, cells);
    ArrayEdit growth(a, ArrayEdit::InsertingAt, a.size());
    a.setString("far", 60);
  }
  EXPECT_EQ(state(a), before);
  {  // Replacing: the array itself is never touched; the copy keeps its shape.
    ArrayEdit edit(a, ArrayEdit::Replacing);
    EXPECT_EQ(state(edit.target()), "[] cap 25 dims 2 x 2 rows");
    edit.target().appendString("new");
  }
  EXPECT_EQ(state(a), before);
}

TEST(ArrayEdit, CommittedEditsStay) {
  ElementArray a = table();
  {
    ArrayEdit edit(a, ArrayEdit::Replacing);
    edit.target().appendString("p");
    edit.target().appendString("q");
    edit.commit();
  }
  EXPECT_EQ(contents(a), "p|q");
  EXPECT_EQ(a.boundary(1), 2);
  {
    std::vector<Element> cells;
    cells.push_back(Element::of(ElementValue::ofValue(7)));
    ArrayEdit edit(a, ArrayEdit::InsertingAt, a.size());
    edit.swapIn(1, cells);
    a.setString("r", 2);
    edit.commit();
  }
  EXPECT_EQ(contents(a), "p|#7|r");
}

}  // namespace
}  // namespace quorrel
