// The all-or-nothing guard: an edit that is not committed leaves the array exactly as
// it was, whatever its kind; one that is committed keeps everything it did.
#include "array/array_edit.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/array_text.h"

namespace quorrel {
namespace {

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
