#include "recordset/table.h"

#include "recordset/selection.h"
#include "table_test_support.h"

namespace quorrel {
namespace {

// The table script case covers list fields (missing, surplus, runs of delimiters) and
// plain reads; these pin text forms of every cell type, splitting at each delimiter
// character while joining with the whole text, and rows and columns outside.
TEST(TableRows, ListsUseTheTextFormOfCells) {
  ElementArray a = makeTable(3, {"a,0"});
  EXPECT_EQ(contents(a), "a|0|~");  // "0" stays a text
  a.setListDelimiter(", ");
  replaceRowWithList(a, "x y,,  z", 0);
  EXPECT_EQ(rowList(a, 0), "x, y, z");
  a.setListDelimiter(",");
  a.clear();
  a.appendValue(5);
  a.appendString("x");
  a.appendFile({"zz", 2});
  a.appendValue(0);  // stored as None
  a.appendValue(-12);
  a.appendString("");
  EXPECT_EQ(rowList(a, 0), "5,x,");
  EXPECT_EQ(rowList(a, 1), ",-12,");
  EXPECT_EQ(columnList(a, 1), "x,-12");
  for (int32_t outside : {2, -1}) EXPECT_EQ(rowList(a, outside), std::nullopt);
  for (int32_t outside : {3, -1}) EXPECT_EQ(columnList(a, outside), std::nullopt);
  clearSelection(a);
  EXPECT_EQ(columnList(a, 0), "");
  EXPECT_EQ(rowList(a, 0), std::nullopt);
}

TEST(TableRows, VisibleRowsCountOnlySelectedRows) {
  ElementArray a = makeTable(2, {"r0,0", "r1,1", "r2,2", "r3,3"});
  a.rowStates = {U, S, U, S};
  EXPECT_EQ(numberOfRows(a), 2);
  EXPECT_EQ(visibleCellIndex(a, 0, 0), 2);
  EXPECT_EQ(visibleCellIndex(a, 1, 1), 7);
  // Past the visible rows: the table row whose position is the number of visible rows.
  EXPECT_EQ(visibleCellIndex(a, 2, 0), 4);
  EXPECT_EQ(visibleCellIndex(a, -1, 1), 5);
  EXPECT_EQ(rowList(a, 1), "r3,3");
  EXPECT_EQ(columnList(a, 0), "r1,r3");
  EXPECT_EQ(cellIndex(a, 2, -1), 3);  // cells by column and table row, unchecked

  // Append lands at the position of the visible row count; states stay at their
  // positions and the new last position gets the starting state.
  appendRowFromList(a, "new,9");
  EXPECT_EQ(contents(a), "r0|0|r1|1|new|9|r2|2|r3|3");
  EXPECT_EQ(a.rowStates, (States{U, S, U, S, S}));
  EXPECT_EQ(rowList(a, 1), "r2,2");

  insertRowFromList(a, "ins,7", 2);  // before table row 4
  EXPECT_EQ(contents(a), "r0|0|r1|1|new|9|r2|2|ins|7|r3|3");
  EXPECT_EQ(a.rowStates, (States{U, S, U, S, S, S}));
  insertRowFromList(a, "no", 5);    // above numberOfRows (4): nothing
  replaceRowWithList(a, "rep", 0);  // visible row 0 is table row 1
  replaceRowWithList(a, "x,y", 4);  // not below numberOfRows: nothing
  EXPECT_EQ(contents(a), "r0|0|rep|~|new|9|r2|2|ins|7|r3|3");
  deleteRow(a, 2);  // visible row 2 is table row 4 ("ins")
  deleteRow(a, 3);  // not below numberOfRows (3)
  EXPECT_EQ(contents(a), "r0|0|rep|~|new|9|r2|2|r3|3");
  EXPECT_EQ(a.rowStates, (States{U, S, U, S, S}));

  // All rows visible: the partial row's cell is pushed along by the appended row.
  ElementArray b = makeTable(2, {"a,1"});
  b.appendString("partial");
  EXPECT_EQ(visibleCellIndex(b, numberOfRows(b), 0), 2);
  appendRowFromList(b, "b,2");
  EXPECT_EQ(contents(b), "a|1|b|2|partial");
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
  EXPECT_EQ(contents(a), "x|y|#1");

  // A negative row falls back to the row past the last complete one, here row 0 at
  // index 0: in a table too wide for the cap, replace writes nothing, and delete
  // removes only the cells that are there.
  ElementArray w = makeTable(INT32_MAX);
  w.appendString("keep");
  replaceRowWithList(w, "r", -1);
  EXPECT_EQ(contents(w), "keep");
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

// The table script case covers setting, reading, listing and finding labels folded;
// these pin finding under every case and search mode.
TEST(TableLabels, SetGetListAndFind) {
  ElementArray a = makeTable(2);
  EXPECT_EQ(labelList(a), std::nullopt);
  EXPECT_EQ(columnOfLabel(a, "*"), -1);
  setLabel(a, "age", 1);
  EXPECT_EQ(labelList(a), ",age");
  setLabel(a, "name", 0);
  setLabel(a, "neg", -1);
  const struct {
    int16_t caseMode, searchMode;
    const char* name;
    int32_t column;
  } finds[] = {{0, 0, "AGE", 1}, {1, 0, "AGE", -1}, {1, 0, "age", 1}, {1, 1, "a*", 1},
               {1, 1, "*", 0},   {1, 1, "A*", -1},  {0, 1, "A*", 1},  {0, 1, "?", -1}};
  for (const auto& f : finds) {
    a.caseMode = f.caseMode;
    a.searchMode = f.searchMode;
    EXPECT_EQ(columnOfLabel(a, f.name), f.column) << f.name << " " << f.caseMode;
  }
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

  // Tables wider than the label cap keep their labels as they are.
  a.setBoundary(1, INT32_MAX);
  setLabel(a, "b", 1);
  EXPECT_EQ(labelList(a), "a");
  a.setBoundary(1, kMaxLabelColumns + 1);
  setLabel(a, "b", 1);
  EXPECT_EQ(a.labels->size(), 1u);
  a.setBoundary(1, kMaxLabelColumns);  // the widest table that still gets its list
  setLabel(a, "b", 1);
  EXPECT_EQ(a.labels->size(), static_cast<size_t>(kMaxLabelColumns));
  EXPECT_EQ(getLabel(a, 1), std::string("b"));
}

// The empty text is a label like any other; only a column never labelled has none.
TEST(TableLabels, EmptyTextIsALabelAndMissingLabelsNeverMatch) {
  ElementArray a = makeTable(3);
  setLabel(a, "c", 2);
  a.searchMode = 1;
  EXPECT_EQ(columnOfLabel(a, "*"), 2);
  a.searchMode = 0;
  EXPECT_EQ(columnOfLabel(a, ""), -1);
  EXPECT_EQ(columnOfLabel(a, nullptr), -1);

  setLabel(a, "", 0);
  setLabel(a, "b", 1);
  EXPECT_STREQ(getLabel(a, 0), "");
  EXPECT_EQ(columnOfLabel(a, ""), 0);
  EXPECT_EQ(labelList(a), ",b,c");
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
  EXPECT_EQ(labelList(a), "y,b,");

  // Labels created on a table of no columns exist, empty: their list is the empty text.
  ElementArray b;
  b.setDimensions(2);
  setLabel(b, "x", 0);
  EXPECT_EQ(labelList(b), "");
  EXPECT_EQ(columnOfLabel(b, "x"), -1);
}

}  // namespace
}  // namespace quorrel
