#include "recordset/selection.h"

#include "table_test_support.h"

namespace quorrel {
namespace {

// Every where-test and between-test, in both modes and on any column, is checked on
// random tables; these cover the commands that test no cell and the row edits.
TEST(Selection, InvertResetsAndMarksByMode) {
  ElementArray a = makeTable(1, {"1", "2", "3"});
  startNewWhere(a);
  EXPECT_EQ(a.selectionMode, SelectOr);
  EXPECT_EQ(numberOfRows(a), 0);
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

  // Reversed value bounds pass nothing.
  selectAllRows(a);
  a.selectionMode = SelectAnd;
  selectBetweenValues(a, 0, 3, 1);
  EXPECT_EQ(a.rowStates, (States{U, U, U}));
}

TEST(Selection, NewRowsTakeTheStartingStateAndStatesStayPut) {
  ElementArray a = makeTable(2, {}, 0);
  for (int32_t v : {1, 1, 2, 2}) a.appendValue(v);
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
