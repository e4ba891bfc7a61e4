#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "array/element_array.h"
#include "recordset/selection.h"
#include "recordset/table.h"

namespace quorrel {
namespace {

ElementArray makeTable(int32_t columns, int32_t autoSelect = 1) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, columns);
  a.setAutoSelect(autoSelect);
  return a;
}

std::string text(ElementArray& a, int32_t index) {
  const char* s = a.getString(index);
  return s == nullptr ? "<none>" : s;
}

std::vector<uint8_t> states(std::initializer_list<uint8_t> list) {
  return list;
}

constexpr uint8_t S = RowSelected;
constexpr uint8_t U = RowUnselected;

TEST(TableRows, ListFieldsFillColumnsAsStrings) {
  ElementArray a = makeTable(3);
  appendRowFromList(a, "a,b");
  appendRowFromList(a, "1,2,3,4");
  appendRowFromList(a, ",a,,b,");
  appendRowFromList(a, "0");
  ASSERT_EQ(a.size(), 12);
  EXPECT_EQ(text(a, 0), "a");
  EXPECT_EQ(text(a, 1), "b");
  EXPECT_EQ(a.at(2).type(), ElementType::None);
  // Numbers stay strings; "0" is the string «0», not a None element.
  EXPECT_EQ(a.at(3).type(), ElementType::String);
  EXPECT_EQ(text(a, 5), "3");
  EXPECT_EQ(a.getValue(5), 3);
  EXPECT_EQ(text(a, 6), "a");
  EXPECT_EQ(text(a, 7), "b");
  EXPECT_EQ(a.at(8).type(), ElementType::None);
  EXPECT_EQ(a.at(9).type(), ElementType::String);
  EXPECT_EQ(text(a, 9), "0");
  EXPECT_EQ(a.at(10).type(), ElementType::None);
  EXPECT_EQ(numberOfRows(a), 4);
  EXPECT_EQ(numberOfCols(a), 3);
}

TEST(TableRows, DelimiterIsASetForSplittingAndWholeForJoining) {
  ElementArray a = makeTable(3);
  a.setListDelimiter(", ");
  appendRowFromList(a, "a, b");
  EXPECT_EQ(text(a, 0), "a");
  EXPECT_EQ(text(a, 1), "b");
  EXPECT_EQ(a.at(2).type(), ElementType::None);
  // Either character separates on its own, and runs count as one.
  replaceRowWithList(a, "x y,,  z", 0);
  EXPECT_EQ(rowList(a, 0), "x, y, z");
  a.setListDelimiter("; ");
  EXPECT_EQ(rowList(a, 0), "x; y; z");
  EXPECT_EQ(std::string(listDelimiter(a)), "; ");
}

TEST(TableRows, ListsUseTheTextFormOfCells) {
  ElementArray a = makeTable(3);
  a.appendValue(5);
  a.appendString("x");
  a.appendFile({"zz", 2});
  a.appendValue(0);  // stored as None
  a.appendValue(-12);
  a.appendString("");
  EXPECT_EQ(rowList(a, 0), "5,x,");
  EXPECT_EQ(rowList(a, 1), ",-12,");
  EXPECT_EQ(columnList(a, 1), "x,-12");
  EXPECT_EQ(rowList(a, 2), std::nullopt);
  EXPECT_EQ(rowList(a, -1), std::nullopt);
  EXPECT_EQ(columnList(a, 3), std::nullopt);
  EXPECT_EQ(columnList(a, -1), std::nullopt);
  clearSelection(a);
  EXPECT_EQ(columnList(a, 0), "");
  EXPECT_EQ(rowList(a, 0), std::nullopt);
}

// Rows 0..3 with only rows 1 and 3 selected.
ElementArray fourRowsOneAndThreeSelected() {
  ElementArray a = makeTable(2);
  for (const char* row : {"r0,0", "r1,1", "r2,2", "r3,3"}) appendRowFromList(a, row);
  a.rowStates = states({U, S, U, S});
  return a;
}

TEST(TableRows, VisibleRowsCountOnlySelectedRows) {
  ElementArray a = fourRowsOneAndThreeSelected();
  EXPECT_EQ(numberOfRows(a), 2);
  EXPECT_EQ(visibleCellIndex(a, 0, 0), 2);
  EXPECT_EQ(visibleCellIndex(a, 1, 1), 7);
  // Past the visible rows: the table row whose position is the number of visible rows.
  EXPECT_EQ(visibleCellIndex(a, 2, 0), 4);
  EXPECT_EQ(visibleCellIndex(a, -1, 1), 5);
  EXPECT_EQ(rowList(a, 1), "r3,3");
  EXPECT_EQ(columnList(a, 0), "r1,r3");
  // Cell reads by column and row take table rows.
  EXPECT_EQ(text(a, cellIndex(a, 2, 0)), "r2");
  EXPECT_EQ(cellIndex(a, 2, -1), 3);
}

TEST(TableRows, AppendLandsAtThePositionOfTheVisibleRowCount) {
  ElementArray a = fourRowsOneAndThreeSelected();
  appendRowFromList(a, "new,9");
  ASSERT_EQ(a.size(), 10);
  EXPECT_EQ(text(a, 4), "new");
  EXPECT_EQ(text(a, 6), "r2");
  EXPECT_EQ(text(a, 8), "r3");
  // States stay at their positions; the new last position gets the starting state.
  EXPECT_EQ(a.rowStates, states({U, S, U, S, S}));
  EXPECT_EQ(rowList(a, 1), "r2,2");
  EXPECT_EQ(rowList(a, 2), "r3,3");
}

TEST(TableRows, AllVisibleAppendGoesToTheEnd) {
  ElementArray a = makeTable(2);
  appendRowFromList(a, "a,1");
  a.appendString("partial");
  EXPECT_EQ(visibleCellIndex(a, numberOfRows(a), 0), 2);
  appendRowFromList(a, "b,2");
  // The partial row's cell is pushed along by the inserted row.
  EXPECT_EQ(text(a, 2), "b");
  EXPECT_EQ(text(a, 4), "partial");
}

TEST(TableRows, InsertReplaceAndDeleteByVisibleRow) {
  ElementArray a = fourRowsOneAndThreeSelected();
  insertRowFromList(a, "ins,7", 1);  // before table row 3
  EXPECT_EQ(text(a, 6), "ins");
  EXPECT_EQ(text(a, 8), "r3");
  EXPECT_EQ(a.rowStates, states({U, S, U, S, S}));
  insertRowFromList(a, "no", 4);  // above numberOfRows (3): nothing
  EXPECT_EQ(a.size(), 10);

  replaceRowWithList(a, "rep", 0);  // visible row 0 is table row 1
  EXPECT_EQ(text(a, 2), "rep");
  EXPECT_EQ(a.at(3).type(), ElementType::None);
  replaceRowWithList(a, "x,y", 3);  // not below numberOfRows: nothing
  EXPECT_EQ(a.size(), 10);

  deleteRow(a, 1);  // visible row 1 is table row 3 ("ins")
  EXPECT_EQ(a.size(), 8);
  EXPECT_EQ(text(a, 6), "r3");
  EXPECT_EQ(a.rowStates, states({U, S, U, S}));
  deleteRow(a, 2);  // not below numberOfRows (2)
  EXPECT_EQ(a.size(), 8);
}

TEST(TableRows, RowsPastTheCapAreNotInserted) {
  ElementArray a = makeTable(INT32_MAX);
  appendRowFromList(a, "a,b");
  insertRowFromList(a, "a,b", 0);
  EXPECT_EQ(a.size(), 0);
  a.setBoundary(1, ElementArray::kMaxSize);
  a.appendValue(1);
  appendRowFromList(a, "x");  // one cell too many
  EXPECT_EQ(a.size(), 1);
  a.setBoundary(1, 2);
  appendRowFromList(a, "x,y");  // the table is one half row: it goes at 0
  EXPECT_EQ(a.size(), 3);
  EXPECT_EQ(text(a, 0), "x");

  // A negative row falls back to the row past the last complete one, here row 0 at
  // index 0: in a table too wide for the cap, replace writes nothing, and delete
  // removes only the cells that are there.
  ElementArray w = makeTable(INT32_MAX);
  w.appendString("keep");
  replaceRowWithList(w, "r", -1);
  EXPECT_EQ(text(w, 0), "keep");
  w.appendString("too");
  deleteRow(w, -1);
  EXPECT_EQ(w.size(), 0);
}

TEST(TableRows, OneDimensionalArrayHasNoTable) {
  ElementArray a;
  a.setBoundary(1, 3);  // refused: dimension 1 is the last one
  appendRowFromList(a, "a,b,c");
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(numberOfCols(a), 0);
  EXPECT_EQ(numberOfRows(a), 0);
  setLabel(a, "x", 0);
  EXPECT_EQ(getLabel(a, 0), nullptr);
  EXPECT_EQ(labelList(a), std::nullopt);
  EXPECT_EQ(columnOfLabel(a, "x"), -1);
}

TEST(TableRows, SwapRowsMovesCellsWithKeysAndLeavesStates) {
  ElementArray a = makeTable(2);
  appendRowFromList(a, "a,1");
  appendRowFromList(a, "b,2");
  appendRowFromList(a, "c,3");
  a.setKeyString("ka", 0);
  a.setKeyValue(22, 3);
  a.rowStates = states({S, S, U});
  swapRows(a, 0, 1);
  EXPECT_EQ(rowList(a, 0), "b,2");
  EXPECT_EQ(rowList(a, 1), "a,1");
  EXPECT_EQ(std::string(a.getKeyString(2)), "ka");
  EXPECT_EQ(a.getKeyValue(1), 22);
  EXPECT_EQ(a.rowStates, states({S, S, U}));
  swapRows(a, 0, 2);  // row 2 is not below numberOfRows
  EXPECT_EQ(text(a, 4), "c");
}

TEST(TableLabels, SetGetListAndFind) {
  ElementArray a = makeTable(2);
  EXPECT_EQ(labelList(a), std::nullopt);
  EXPECT_EQ(columnOfLabel(a, "*"), -1);
  setLabel(a, "age", 1);
  EXPECT_EQ(getLabel(a, 0), nullptr);
  EXPECT_EQ(std::string(getLabel(a, 1)), "age");
  EXPECT_EQ(labelList(a), ",age");
  setLabel(a, "name", 0);
  setLabel(a, "out", 2);
  setLabel(a, "neg", -1);
  EXPECT_EQ(labelList(a), "name,age");
  EXPECT_EQ(getLabel(a, 2), nullptr);

  a.caseMode = 0;
  EXPECT_EQ(columnOfLabel(a, "AGE"), 1);
  a.caseMode = 1;
  EXPECT_EQ(columnOfLabel(a, "AGE"), -1);
  EXPECT_EQ(columnOfLabel(a, "age"), 1);
  a.searchMode = 1;
  EXPECT_EQ(columnOfLabel(a, "a*"), 1);
  EXPECT_EQ(columnOfLabel(a, "*"), 0);
  EXPECT_EQ(columnOfLabel(a, "A*"), -1);
  a.caseMode = 0;
  EXPECT_EQ(columnOfLabel(a, "A*"), 1);
  EXPECT_EQ(columnOfLabel(a, "?"), -1);
}

TEST(TableLabels, ListKeepsItsLengthUntilTheNextSetLabel) {
  ElementArray a = makeTable(2);
  setLabel(a, "a", 0);
  setLabel(a, "b", 1);
  a.setBoundary(1, 4);
  EXPECT_EQ(labelList(a), "a,b");
  EXPECT_EQ(getLabel(a, 3), nullptr);
  setLabel(a, "d", 3);
  EXPECT_EQ(labelList(a), "a,b,,d");
  a.setBoundary(1, 1);
  EXPECT_EQ(columnOfLabel(a, "d"), 3);
  setLabel(a, "z", 5);  // shrinks to one column, stores nothing
  EXPECT_EQ(labelList(a), "a");
  EXPECT_EQ(columnOfLabel(a, "d"), -1);
}

TEST(TableLabels, TablesWiderThanTheLabelCapKeepTheirLabels) {
  ElementArray a = makeTable(2);
  setLabel(a, "a", 0);
  a.setBoundary(1, INT32_MAX);
  setLabel(a, "b", 1);  // would need a list of 2147483647 entries
  EXPECT_EQ(labelList(a), "a,");
  a.setBoundary(1, kMaxLabelColumns + 1);
  setLabel(a, "b", 1);
  EXPECT_EQ(a.labels->size(), 2u);
  a.setBoundary(1, kMaxLabelColumns);  // the widest table that still gets its list
  setLabel(a, "b", 1);
  EXPECT_EQ(a.labels->size(), static_cast<size_t>(kMaxLabelColumns));
  EXPECT_EQ(getLabel(a, 1), std::string("b"));
}

TEST(TableLabels, MissingLabelsNeverMatch) {
  ElementArray a = makeTable(3);
  setLabel(a, "c", 2);
  a.searchMode = 1;
  EXPECT_EQ(columnOfLabel(a, "*"), 2);
  a.searchMode = 0;
  EXPECT_EQ(columnOfLabel(a, ""), -1);
  EXPECT_EQ(columnOfLabel(a, nullptr), -1);
}

TEST(TableLabels, AnEmptyLabelIsALabel) {
  ElementArray a = makeTable(3);
  setLabel(a, "", 0);
  setLabel(a, "b", 1);
  ASSERT_NE(getLabel(a, 0), nullptr);
  EXPECT_EQ(std::string(getLabel(a, 0)), "");
  EXPECT_EQ(getLabel(a, 2), nullptr);
  EXPECT_EQ(columnOfLabel(a, ""), 0);
  EXPECT_EQ(labelList(a), ",b,");
  a.searchMode = 1;
  EXPECT_EQ(columnOfLabel(a, "*"), 0);
  EXPECT_EQ(columnOfLabel(a, "?"), 1);
  // Replacing it, and dropping it with its column, leave no trace.
  setLabel(a, "a", 0);
  EXPECT_EQ(columnOfLabel(a, "*"), 0);
  setLabel(a, "", 2);
  a.setBoundary(1, 2);
  setLabel(a, "x", 0);
  a.setBoundary(1, 3);
  setLabel(a, "y", 0);
  EXPECT_EQ(getLabel(a, 2), nullptr);
  a.searchMode = 0;
  EXPECT_EQ(columnOfLabel(a, ""), -1);
}

// The empty text is a label like any other; only a column never labelled has none.
TEST(TableLabels, EmptyTextIsALabel) {
  ElementArray a = makeTable(3);
  EXPECT_FALSE(labelList(a).has_value());
  setLabel(a, "", 1);
  ASSERT_NE(getLabel(a, 1), nullptr);
  EXPECT_STREQ(getLabel(a, 1), "");
  EXPECT_EQ(getLabel(a, 0), nullptr);
  EXPECT_EQ(columnOfLabel(a, ""), 1);
  EXPECT_EQ(labelList(a), ",,");

  // Labels created on a table of no columns exist, empty: their list is the empty text.
  ElementArray b;
  b.setDimensions(2);
  setLabel(b, "x", 0);
  EXPECT_EQ(labelList(b), "");
  EXPECT_EQ(columnOfLabel(b, "x"), -1);
}

}  // namespace
}  // namespace quorrel
