// Routines of the recordset, through the host's calls: the between column kept in the
// run record, and the automatic selection of the setup record.
#include "test_host.h"

namespace testhost {
namespace {

SetupRecord tableSetup() {
  return SetupRecord().set(kSetupXBoundary, 3).set(kSetupAutoSelectRows, 1);
}

// Rows visible after Start new Where and one selection action.
int32_t rowsAfter(Instance& t, int code, const Arg& p1, const Arg& p2 = Arg()) {
  t.action(78);
  t.action(code, p1, p2);
  return t.number(40);
}

TEST(RecordsetRoutinesTest, BetweenColumnLivesInTheRunRecord) {
  Instance t(tableSetup());
  for (const char* row : {"x,1,10", "y,2,20", "z,3,30"}) t.action(34, row);
  t.action(48, "name", 0);
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
  t.action(78);  // no row visible: cell reads ignore the row states
  EXPECT_EQ(t.number(47, {1, 2}), 3);
}

TEST(RecordsetRoutinesTest, AutomaticSelectionFollowsTheSetupRecord) {
  Instance on(tableSetup());
  EXPECT_EQ(on.action(34, "a,b,7"), 0);
  EXPECT_EQ(on.number(0), 3);
  EXPECT_EQ(on.text(41, {0}), "a,b,7");  // rowList$(
  EXPECT_EQ(on.allocationSizes(), std::vector<int32_t>{6});
  EXPECT_EQ(on.number(40), 1);  // numberOfRows(
  Instance off(tableSetup().set(kSetupAutoSelectRows, 2));
  off.action(34, "a,b,7");
  EXPECT_EQ(off.number(0), 3);
  EXPECT_EQ(off.number(40), 0);
}

}  // namespace
}  // namespace testhost
