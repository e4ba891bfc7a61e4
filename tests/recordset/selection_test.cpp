#include <gtest/gtest.h>

#include <vector>

#include "array/element_array.h"
#include "recordset/selection.h"
#include "recordset/table.h"

namespace quorrel {
namespace {

constexpr uint8_t S = RowSelected;
constexpr uint8_t U = RowUnselected;

using States = std::vector<uint8_t>;

// Two columns of values, one row per pair.
ElementArray pairs(std::initializer_list<std::pair<int32_t, int32_t>> rows,
                   int32_t autoSelect = 1) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, 2);
  a.setAutoSelect(autoSelect);
  for (auto [x, y] : rows) {
    a.appendValue(x);
    a.appendValue(y);
  }
  return a;
}

// One column of strings.
ElementArray column(std::initializer_list<const char*> cells) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, 1);
  a.setAutoSelect(1);
  for (const char* cell : cells) a.appendString(cell);
  return a;
}

TEST(Selection, OrAddsRowsAndAndNarrowsThem) {
  ElementArray a = pairs({{5, 7}, {5, 1}, {2, 7}, {2, 1}});
  startNewWhere(a);
  EXPECT_EQ(a.selectionMode, SelectOr);
  EXPECT_EQ(numberOfRows(a), 0);
  EXPECT_EQ(rowList(a, 0), std::nullopt);
  selectWhereEqual(a, 0, 5);
  selectWhereEqual(a, 1, 7);
  EXPECT_EQ(a.rowStates, (States{S, S, S, U}));

  selectAllRows(a);
  a.selectionMode = SelectAnd;
  selectWhereEqual(a, 0, 5);
  selectWhereEqual(a, 1, 7);
  EXPECT_EQ(a.rowStates, (States{S, U, U, U}));
  // In AND mode a passing row is never selected again.
  selectWhereEqual(a, 0, 2);
  EXPECT_EQ(a.rowStates, (States{U, U, U, U}));
}

TEST(Selection, MixedTestsFollowTheMode) {
  ElementArray a = pairs({{1, 10}, {2, 20}, {3, 30}, {4, 40}});
  startNewWhere(a);
  selectWhereLess(a, 0, 2);             // row 0
  selectWhereGreaterOrEqual(a, 1, 40);  // row 3
  EXPECT_EQ(a.rowStates, (States{S, U, U, S}));
  selectWhereNotEqual(a, 0, 1);  // OR: adds rows 1, 2, never removes row 0
  EXPECT_EQ(a.rowStates, (States{S, S, S, S}));
  a.selectionMode = SelectAnd;
  selectWhereGreater(a, 1, 10);     // drops row 0
  selectWhereLessOrEqual(a, 0, 3);  // drops row 3
  EXPECT_EQ(a.rowStates, (States{U, S, S, U}));
  selectBetweenValues(a, 1, 20, 25);
  EXPECT_EQ(a.rowStates, (States{U, S, U, U}));
}

TEST(Selection, InvertTwiceRestoresAndResetsAreModeFree) {
  ElementArray a = pairs({{1, 0}, {2, 0}, {3, 0}});
  a.rowStates = {S, U, S};
  invertSelection(a);
  EXPECT_EQ(a.rowStates, (States{U, S, U}));
  invertSelection(a);
  EXPECT_EQ(a.rowStates, (States{S, U, S}));
  a.selectionMode = SelectAnd;
  selectAllRows(a);
  EXPECT_EQ(a.rowStates, (States{S, S, S}));
  clearSelection(a);
  EXPECT_EQ(a.rowStates, (States{U, U, U}));
  EXPECT_EQ(a.selectionMode, SelectAnd);
}

TEST(Selection, MarkAndUnmarkOnlyActInTheirMode) {
  ElementArray a = pairs({{1, 0}, {2, 0}});
  a.rowStates = {U, S};
  a.selectionMode = SelectAnd;
  markRow(a, 0);
  EXPECT_EQ(a.rowStates, (States{U, S}));
  unmarkRow(a, 1);
  EXPECT_EQ(a.rowStates, (States{U, U}));
  a.selectionMode = SelectOr;
  unmarkRow(a, 0);
  markRow(a, 1);
  markRow(a, 2);
  markRow(a, -1);
  EXPECT_EQ(a.rowStates, (States{U, S}));
}

TEST(Selection, ValueTestsReadLeadingNumbers) {
  ElementArray a = column({"abc", "12x", " -3"});
  a.appendValue(0);  // a None cell
  startNewWhere(a);
  selectWhereEqual(a, 0, 0);
  EXPECT_EQ(a.rowStates, (States{S, U, U, S}));
  startNewWhere(a);
  selectWhereGreater(a, 0, -1);
  EXPECT_EQ(a.rowStates, (States{S, S, U, S}));
  startNewWhere(a);
  selectWhereGreater(a, 0, 0);
  EXPECT_EQ(a.rowStates, (States{U, S, U, U}));
}

TEST(Selection, BetweenBoundsAreIncludedAndLiteral) {
  ElementArray a = column({"b", "c", "cz", "d1", "a", "B", "d", "b*"});
  a.caseMode = 1;
  a.searchMode = 1;  // ignored by the between test
  startNewWhere(a);
  selectBetweenStrings(a, 0, "b", "d");
  EXPECT_EQ(a.rowStates, (States{S, S, S, U, U, U, S, S}));
  a.caseMode = 0;
  startNewWhere(a);
  selectBetweenStrings(a, 0, "b", "d");
  EXPECT_EQ(a.rowStates, (States{S, S, S, U, U, S, S, S}));

  ElementArray v = pairs({{5, 0}, {1, 0}, {3, 0}});
  startNewWhere(v);
  selectBetweenValues(v, 0, 5, 1);
  EXPECT_EQ(v.rowStates, (States{U, U, U}));
  selectAllRows(v);
  v.selectionMode = SelectAnd;
  selectBetweenValues(v, 0, 5, 1);
  EXPECT_EQ(v.rowStates, (States{U, U, U}));
}

TEST(Selection, ContainingAndMatching) {
  ElementArray a = column({"1234", "abc", "", "a"});
  a.appendValue(1234);
  startNewWhere(a);
  selectWhereContaining(a, 0, "23");
  EXPECT_EQ(a.rowStates, (States{S, U, U, U, S}));
  startNewWhere(a);
  selectWhereContaining(a, 0, "");
  EXPECT_EQ(a.rowStates, (States{S, S, S, S, S}));
  startNewWhere(a);
  selectWhereContaining(a, 0, "ABC");  // case insensitive by default
  EXPECT_EQ(a.rowStates, (States{U, S, U, U, U}));
  startNewWhere(a);
  selectWhereContaining(a, 0, "Bc");
  EXPECT_EQ(a.rowStates, (States{U, S, U, U, U}));
  a.caseMode = 1;
  startNewWhere(a);
  selectWhereContaining(a, 0, "Bc");
  EXPECT_EQ(a.rowStates, (States{U, U, U, U, U}));
  selectWhereContaining(a, 0, "34");
  EXPECT_EQ(a.rowStates, (States{S, U, U, U, S}));
  a.caseMode = 0;

  a.searchMode = 1;
  startNewWhere(a);
  selectWhereMatching(a, 0, "a*");
  EXPECT_EQ(a.rowStates, (States{U, S, U, S, U}));
  startNewWhere(a);
  selectWhereContaining(a, 0, "b?");
  EXPECT_EQ(a.rowStates, (States{U, S, U, U, U}));
  startNewWhere(a);
  selectWhereMatching(a, 0, "*");
  EXPECT_EQ(a.rowStates, (States{S, S, S, S, S}));

  a.searchMode = 0;
  startNewWhere(a);
  selectWhereMatching(a, 0, "A");
  EXPECT_EQ(a.rowStates, (States{U, U, U, S, U}));
  a.caseMode = 1;
  startNewWhere(a);
  selectWhereMatching(a, 0, "A");
  EXPECT_EQ(a.rowStates, (States{U, U, U, U, U}));
}

TEST(Selection, ColumnsAreNotRangeChecked) {
  // Rows (1, 2), (3, 4), (5, 6) and a partial row holding 7.
  ElementArray a = pairs({{1, 2}, {3, 4}, {5, 6}});
  a.appendValue(7);
  startNewWhere(a);
  // Column 2 reads the next row's first cell: 3, 5 and the partial row's 7.
  selectWhereGreater(a, 2, 4);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  startNewWhere(a);
  // Column -1 reads the previous row's last cell; row 0 has none and fails even a
  // test that 0 would pass.
  selectWhereLessOrEqual(a, -1, 4);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  startNewWhere(a);
  selectWhereEqual(a, 3, 0);  // row 2 reads index 7, outside the array
  EXPECT_EQ(a.rowStates, (States{U, U, U}));
  selectWhereEqual(a, 3, 4);
  EXPECT_EQ(a.rowStates, (States{S, U, U}));
  // In AND mode a missing cell unselects.
  selectAllRows(a);
  a.selectionMode = SelectAnd;
  selectWhereNotEqual(a, 3, 999);
  EXPECT_EQ(a.rowStates, (States{S, S, U}));
}

TEST(Selection, NewRowsTakeTheStartingStateAndStatesStayPut) {
  ElementArray a = pairs({{1, 1}, {2, 2}}, 0);
  EXPECT_EQ(numberOfRows(a), 0);
  // With no visible row, "append" lands at table row 0.
  appendRowFromList(a, "3,3");
  EXPECT_EQ(numberOfRows(a), 0);
  EXPECT_EQ(a.getValue(0), 3);
  startNewWhere(a);
  selectWhereGreater(a, 0, 1);
  EXPECT_EQ(a.rowStates, (States{S, U, S}));
  // Inserting moves the data down; the states stay with the positions.
  a.setAutoSelect(1);
  a.rowStates = {U, S, S};
  insertRowFromList(a, "0,0", 0);  // visible row 0 is table row 1
  EXPECT_EQ(a.getValue(2), 0);
  EXPECT_EQ(a.getValue(4), 1);
  EXPECT_EQ(a.rowStates, (States{U, S, S, S}));
  deleteRow(a, 0);
  EXPECT_EQ(a.getValue(2), 1);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
}

}  // namespace
}  // namespace quorrel
