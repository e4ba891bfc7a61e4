#include "recordset/selection.h"

#include "table_test_support.h"

namespace quorrel {
namespace {

// Two columns of values, one row per pair.
ElementArray pairs(std::initializer_list<std::pair<int32_t, int32_t>> rows,
                   int32_t autoSelect = 1) {
  ElementArray a = makeTable(2, {}, autoSelect);
  for (auto [x, y] : rows) {
    a.appendValue(x);
    a.appendValue(y);
  }
  return a;
}

// Equal and Greater in both modes are checked on random tables; these cover the others.
TEST(Selection, OrAddsRowsAndAndNarrowsThem) {
  ElementArray b = pairs({{1, 10}, {2, 20}, {3, 30}, {4, 40}});
  startNewWhere(b);
  EXPECT_EQ(b.selectionMode, SelectOr);
  EXPECT_EQ(numberOfRows(b), 0);
  selectWhereLess(b, 0, 2);
  selectWhereGreaterOrEqual(b, 1, 40);
  EXPECT_EQ(b.rowStates, (States{S, U, U, S}));
  selectWhereNotEqual(b, 0, 1);  // adds rows 1 and 2, never removes row 0
  EXPECT_EQ(b.rowStates, (States{S, S, S, S}));
  b.selectionMode = SelectAnd;
  selectWhereGreater(b, 1, 10);
  selectWhereLessOrEqual(b, 0, 3);
  EXPECT_EQ(b.rowStates, (States{U, S, S, U}));
  selectWhereNotEqual(b, 0, 3);  // row 0 passes, yet AND mode never selects a row
  EXPECT_EQ(b.rowStates, (States{U, S, U, U}));
}

TEST(Selection, InvertResetsAndMarksByMode) {
  ElementArray a = pairs({{1, 0}, {2, 0}, {3, 0}});
  a.rowStates = {S, U, S};
  invertSelection(a);
  EXPECT_EQ(a.rowStates, (States{U, S, U}));
  a.selectionMode = SelectAnd;
  selectAllRows(a);
  EXPECT_EQ(a.rowStates, (States{S, S, S}));
  clearSelection(a);
  EXPECT_EQ(a.rowStates, (States{U, U, U}));
  EXPECT_EQ(a.selectionMode, SelectAnd);

  // Mark only selects in OR mode, unmark only unselects in AND mode.
  a.rowStates = {U, S, S};
  markRow(a, 0);
  unmarkRow(a, 1);
  EXPECT_EQ(a.rowStates, (States{U, U, S}));
  a.selectionMode = SelectOr;
  unmarkRow(a, 2);
  markRow(a, 1);
  markRow(a, 3);
  markRow(a, -1);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
}

TEST(Selection, TextTestsUnderCaseAndWildcardModes) {
  enum Kind { Containing, Matching, Between };
  ElementArray a = makeTable(1);
  for (const char* cell : {"1234", "abc", "", "a"}) a.appendString(cell);
  a.appendValue(1234);
  ElementArray b = makeTable(1);
  for (const char* cell : {"b", "c", "cz", "d1", "a", "B", "d", "b*"}) b.appendString(cell);
  const struct {
    ElementArray& array;
    int16_t caseMode, searchMode;
    Kind kind;
    const char* probe;
    States expected;
  } cases[] = {
      {a, 0, 0, Containing, "23", {S, U, U, U, S}},
      {a, 0, 0, Containing, "", {S, S, S, S, S}},
      {a, 1, 0, Containing, "Bc", {U, U, U, U, U}},
      {a, 0, 1, Matching, "a*", {U, S, U, S, U}},
      {a, 0, 1, Containing, "b?", {U, S, U, U, U}},
      {a, 0, 0, Matching, "A", {U, U, U, S, U}},
      {a, 1, 0, Matching, "A", {U, U, U, U, U}},
      // Between "b" and "d", both included, literal even in wildcard mode.
      {b, 1, 1, Between, "b", {S, S, S, U, U, U, S, S}},
      {b, 0, 1, Between, "b", {S, S, S, U, U, S, S, S}},
  };
  for (const auto& c : cases) {
    c.array.caseMode = c.caseMode;
    c.array.searchMode = c.searchMode;
    startNewWhere(c.array);
    if (c.kind == Containing) selectWhereContaining(c.array, 0, c.probe);
    if (c.kind == Matching) selectWhereMatching(c.array, 0, c.probe);
    if (c.kind == Between) selectBetweenStrings(c.array, 0, c.probe, "d");
    EXPECT_EQ(c.array.rowStates, c.expected)
        << c.kind << " «" << c.probe << "» case " << c.caseMode << " wildcard " << c.searchMode;
  }

  // Reversed value bounds pass nothing, in either mode.
  ElementArray v = pairs({{5, 0}, {1, 0}, {3, 0}});
  startNewWhere(v);
  selectBetweenValues(v, 0, 5, 1);
  EXPECT_EQ(v.rowStates, (States{U, U, U}));
  selectAllRows(v);
  v.selectionMode = SelectAnd;
  selectBetweenValues(v, 0, 5, 1);
  EXPECT_EQ(v.rowStates, (States{U, U, U}));
}

// The random tables check every column against the model; these pin the neighbours read.
TEST(Selection, ColumnsAreNotRangeChecked) {
  ElementArray a = pairs({{1, 2}, {3, 4}, {5, 6}});
  a.appendValue(7);  // a partial row
  startNewWhere(a);
  selectWhereGreater(a, 2, 4);  // the next row's first cell: 3, 5 and the partial 7
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  startNewWhere(a);
  // The previous row's last cell; row 0 has none and fails even a test 0 would pass.
  selectWhereLessOrEqual(a, -1, 4);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
}

TEST(Selection, NewRowsTakeTheStartingStateAndStatesStayPut) {
  ElementArray a = pairs({{1, 1}, {2, 2}}, 0);
  appendRowFromList(a, "3,3");  // no visible row: "append" lands at table row 0
  EXPECT_EQ(numberOfRows(a), 0);
  EXPECT_EQ(contents(a), "3|3|#1|#1|#2|#2");
  startNewWhere(a);
  selectWhereGreater(a, 0, 1);
  EXPECT_EQ(a.rowStates, (States{S, U, S}));
  // Inserting moves the data down; the states stay with the positions.
  a.setAutoSelect(1);
  a.rowStates = {U, S, S};
  insertRowFromList(a, "0,0", 0);  // visible row 0 is table row 1
  EXPECT_EQ(contents(a), "3|3|0|0|#1|#1|#2|#2");
  EXPECT_EQ(a.rowStates, (States{U, S, S, S}));
  deleteRow(a, 0);
  EXPECT_EQ(contents(a), "3|3|#1|#1|#2|#2");
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
}

}  // namespace
}  // namespace quorrel
