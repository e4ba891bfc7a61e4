// Routines of the recordset, through the host's calls: rows, labels, cell reads,
// selections, the between column, row sorts and aggregates.
#include "test_host.h"

namespace testhost {
namespace {

SetupRecord tableSetup() {
  return SetupRecord().set(kSetupXBoundary, 3).set(kSetupAutoSelectRows, 1);
}

// Three rows: x,1,10 / y,2,20 / z,3,30, labelled name, num, big.
void fillTable(Instance& t) {
  t.action(34, "x,1,10");  // Append row from list
  t.action(34, "y,2,20");
  t.action(34, "z,3,30");
  t.action(48, "name", 0);  // Set label
  t.action(48, "num", 1);
  t.action(48, "big", 2);
}

TEST(RecordsetRoutinesTest, RowsLabelsAndCellReads) {
  Instance t(tableSetup());
  fillTable(t);
  EXPECT_EQ(t.number(40), 3);  // numberOfRows(
  EXPECT_EQ(t.number(42), 3);  // numberOfCols(
  EXPECT_EQ(t.text(41, {1}), "y,2,20");
  EXPECT_EQ(t.text(46, {1}), "1,2,3");  // columnList$(
  EXPECT_EQ(t.text(43, {1}), "num");    // getLabel$(, twice: the label stays
  EXPECT_EQ(t.text(43, {1}), "num");
  EXPECT_EQ(t.text(44), "name,num,big");  // labelList$(
  EXPECT_EQ(t.number(45, {"NUM"}), 1);    // getCol(
  EXPECT_EQ(t.number(45, {"zz"}), -1);

  EXPECT_EQ(t.number(47, {1, 2}), 3);       // getFromColumnRow(: element 7
  EXPECT_EQ(t.text(48, {0, 1}), "y");       // getFromColumnRow$(
  EXPECT_TRUE(t.noText(48, {0, 3}));        // element 9 is past the array
  EXPECT_EQ(t.number(49, {"big", 1}), 20);  // getFromLabelRow(
  EXPECT_EQ(t.text(50, {"name", 2}), "z");  // getFromLabelRow$(
  EXPECT_EQ(t.number(49, {"nolabel", 1}), 0);
  EXPECT_TRUE(t.noText(50, {"nolabel", 1}));

  EXPECT_EQ(t.number(52, {2}), 30);  // colMax(
  EXPECT_EQ(t.number(53, {2}), 10);  // colMin(
  EXPECT_EQ(t.number(54, {2}), 60);  // colSum(
  EXPECT_EQ(t.number(55, {2}), 20);  // colAvg(
  EXPECT_EQ(t.number(56, {"num"}), 3);
  EXPECT_EQ(t.number(57, {"num"}), 1);
  EXPECT_EQ(t.number(58, {"big"}), 60);
  EXPECT_EQ(t.number(59, {"big"}), 20);

  // Cell reads ignore the row states; lists follow the current delimiter.
  t.action(78);  // Start new Where: no row visible
  EXPECT_EQ(t.number(47, {1, 2}), 3);
  t.action(63);
  t.action(57, ";");
  EXPECT_EQ(t.text(51), ";");
  EXPECT_EQ(t.text(51), ";");
  EXPECT_EQ(t.text(41, {0}), "x;1;10");
  t.action(57, ",");

  t.action(32, "w,0,5", 0);  // Insert row from list
  EXPECT_EQ(t.text(41, {0}), "w,0,5");
  EXPECT_EQ(t.number(40), 4);
  t.action(36, "v,9,9", 0);  // Replace row with list
  EXPECT_EQ(t.text(41, {0}), "v,9,9");
  t.action(39, 0);  // Delete row
  EXPECT_EQ(t.text(41, {0}), "x,1,10");
  EXPECT_EQ(t.number(40), 3);
  EXPECT_TRUE(t.noText(41, {5}) || t.text(41, {5}).empty());
}

int32_t rowsAfter(Instance& t, int code, const Arg& p1, const Arg& p2 = Arg()) {
  t.action(78);  // Start new Where
  t.action(code, p1, p2);
  return t.number(40);
}

TEST(RecordsetRoutinesTest, SelectionsByColumnAndLabel) {
  Instance t(tableSetup());
  fillTable(t);
  EXPECT_EQ(rowsAfter(t, 65, 0, "y"), 1);  // col matching
  EXPECT_EQ(t.text(41, {0}), "y,2,20");
  EXPECT_EQ(rowsAfter(t, 66, 0, "Z"), 1);  // col containing
  EXPECT_EQ(rowsAfter(t, 67, 1, 2), 1);    // =
  EXPECT_EQ(rowsAfter(t, 68, 1, 2), 2);    // <>
  EXPECT_EQ(rowsAfter(t, 69, 1, 2), 1);    // >
  EXPECT_EQ(rowsAfter(t, 70, 1, 2), 2);    // >=
  EXPECT_EQ(rowsAfter(t, 71, 1, 2), 1);    // <
  EXPECT_EQ(rowsAfter(t, 72, 1, 2), 2);    // <=
  EXPECT_EQ(rowsAfter(t, 73, "name", "x"), 1);
  EXPECT_EQ(rowsAfter(t, 74, "name", "y"), 1);
  EXPECT_EQ(rowsAfter(t, 75, "num", 3), 1);
  EXPECT_EQ(rowsAfter(t, 76, "num", 3), 2);
  EXPECT_EQ(rowsAfter(t, 77, "big", 10), 2);
  EXPECT_EQ(rowsAfter(t, 33, "big", 20), 2);  // label >=
  EXPECT_EQ(rowsAfter(t, 35, "big", 20), 1);  // label <
  EXPECT_EQ(rowsAfter(t, 37, "big", 20), 2);  // label <=
  EXPECT_EQ(t.text(41, {1}), "y,2,20");
  EXPECT_EQ(t.number(54, {2}), 30);  // aggregates see only the visible rows

  // OR adds passing rows; AND removes failing ones.
  EXPECT_EQ(rowsAfter(t, 67, 1, 1), 1);
  t.action(67, 1, 3);
  EXPECT_EQ(t.number(40), 2);
  t.action(61);  // AND (Exclusive)
  t.action(69, 1, 1);
  EXPECT_EQ(t.number(40), 1);
  EXPECT_EQ(t.text(41, {0}), "z,3,30");
  t.action(62);  // OR (Inclusive)
  t.action(64);  // Invert selection
  EXPECT_EQ(t.number(40), 2);
  t.action(63);  // Select all rows
  EXPECT_EQ(t.number(40), 3);
}

TEST(RecordsetRoutinesTest, BetweenColumnLivesInTheRunRecord) {
  Instance t(tableSetup());
  fillTable(t);
  t.action(15, 2);  // Pick column for select between
  EXPECT_EQ(t.betweenColumn(), 2);
  EXPECT_EQ(rowsAfter(t, 26, 15, 30), 2);  // Select rows between values
  t.action(38, "NAME");                    // Pick label for select between
  EXPECT_EQ(t.betweenColumn(), 0);
  EXPECT_EQ(rowsAfter(t, 49, "a", "y"), 2);  // Select rows between strings
  t.action(38, "missing");
  EXPECT_EQ(t.betweenColumn(), -1);
  // Column -1 tests each row's previous cell: rows 1 and 2 read 10 and 20, row 0
  // reads outside the array.
  EXPECT_EQ(rowsAfter(t, 26, 0, 100), 2);
}

TEST(RecordsetRoutinesTest, RowSorts) {
  Instance t(tableSetup());
  fillTable(t);
  t.action(41, 2);  // by column value descending
  EXPECT_EQ(t.text(41, {0}), "z,3,30");
  t.action(46, "name");  // by label string ascending
  EXPECT_EQ(t.text(41, {0}), "x,1,10");
  t.action(45, "big");  // by label value descending
  EXPECT_EQ(t.text(41, {0}), "z,3,30");
  t.action(44, "num");  // by label value ascending
  EXPECT_EQ(t.text(41, {0}), "x,1,10");
  t.action(47, "name");  // by label string descending: the label's column
  EXPECT_EQ(t.text(41, {0}), "z,3,30");
  t.action(42, 0);  // by column string ascending
  EXPECT_EQ(t.text(41, {2}), "z,3,30");
  t.action(43, 0);  // by column string descending
  EXPECT_EQ(t.text(41, {2}), "x,1,10");
  t.action(40, 1);  // by column value ascending
  EXPECT_EQ(t.text(41, {0}), "x,1,10");
  EXPECT_EQ(t.text(43, {0}), "name");  // labels stay with their columns
}

TEST(RecordsetRoutinesTest, AutomaticSelectionFollowsTheSetupRecord) {
  Instance on(tableSetup());
  on.action(34, "a,b,7");
  EXPECT_EQ(on.number(40), 1);
  Instance off(tableSetup().set(kSetupAutoSelectRows, 2));
  off.action(34, "a,b,7");
  EXPECT_EQ(off.number(0), 3);
  EXPECT_EQ(off.number(40), 0);
}

TEST(EndToEndTest, AppendRowListItAndSaveIt) {
  Instance t(tableSetup().delimiter(","));
  EXPECT_EQ(t.action(34, "a,b,7"), 0);
  EXPECT_EQ(t.number(0), 3);
  EXPECT_EQ(t.text(41, {0}), "a,b,7");
  EXPECT_EQ(t.allocations, std::vector<int32_t>{6});

  const std::string path = ::testing::TempDir() + "quorrel_end_to_end.arr";
  std::remove(path.c_str());
  EXPECT_EQ(t.action(0, path), 0);  // Save to file
  std::FILE* file = std::fopen(path.c_str(), "rb");
  ASSERT_NE(file, nullptr);
  char magic[8] = {};
  EXPECT_EQ(std::fread(magic, 1, 8, file), 8u);
  std::fclose(file);
  EXPECT_EQ(std::string(magic, 8), "ZUBARRAY");

  Instance loaded(SetupRecord().set(kSetupDimensionCount, 1));
  loaded.action(3, path);  // Load from file
  EXPECT_EQ(loaded.number(26), 2);
  EXPECT_EQ(loaded.number(28), 3);
  EXPECT_EQ(loaded.text(2, {2}), "7");
  loaded.action(10, path);  // Append elements from file
  EXPECT_EQ(loaded.number(0), 6);
  std::remove(path.c_str());
}

}  // namespace
}  // namespace testhost
