#include <gtest/gtest.h>
#include <pthread.h>

#include <functional>
#include <random>
#include <string>
#include <vector>

#include "array/element_array.h"
#include "recordset/aggregates.h"
#include "recordset/row_sort.h"
#include "recordset/table.h"

namespace quorrel {
namespace {

constexpr uint8_t S = RowSelected;
constexpr uint8_t U = RowUnselected;

ElementArray makeTable(int32_t columns) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, columns);
  a.setAutoSelect(1);
  return a;
}

std::vector<std::string> column(ElementArray& a, int32_t j) {
  std::vector<std::string> out;
  for (int32_t r = 0; r < a.tableRowCount(); ++r) out.emplace_back(a.getString(cellIndex(a, r, j)));
  return out;
}

using Texts = std::vector<std::string>;

TEST(RowSort, SortsWholeRowsByOneColumn) {
  ElementArray a = makeTable(2);
  for (const char* row : {"b,2", "a,3", "c,1"}) appendRowFromList(a, row);
  sortRows(a, 0, SortByText, false);
  EXPECT_EQ(column(a, 0), (Texts{"a", "b", "c"}));
  EXPECT_EQ(column(a, 1), (Texts{"3", "2", "1"}));
  sortRows(a, 1, SortByValue, false);
  EXPECT_EQ(column(a, 0), (Texts{"c", "b", "a"}));
  sortRows(a, 1, SortByValue, true);
  EXPECT_EQ(column(a, 0), (Texts{"a", "b", "c"}));
  sortRows(a, 0, SortByText, true);
  EXPECT_EQ(column(a, 0), (Texts{"c", "b", "a"}));
}

TEST(RowSort, TextAndValueOrdersDiffer) {
  ElementArray a = makeTable(1);
  a.appendValue(10);
  a.appendValue(9);
  a.appendString("7 days");
  a.appendValue(0);  // None: value 0, empty text
  sortRows(a, 0, SortByText, false);
  EXPECT_EQ(column(a, 0), (Texts{"", "10", "7 days", "9"}));
  sortRows(a, 0, SortByValue, false);
  EXPECT_EQ(column(a, 0), (Texts{"", "7 days", "9", "10"}));
}

// Ties end in the order the first-row-pivot partition steps give them (worked by hand).
TEST(RowSort, TiesEndInThePartitionOrder) {
  ElementArray a = makeTable(2);
  for (const char* row : {"2,A", "1,B", "2,C", "1,D"}) appendRowFromList(a, row);
  sortRows(a, 0, SortByValue, false);
  EXPECT_EQ(column(a, 1), (Texts{"B", "D", "C", "A"}));

  ElementArray t = makeTable(1);
  for (const char* cell : {"b", "A", "a"}) t.appendString(cell);
  sortRows(t, 0, SortByText, false);
  EXPECT_EQ(column(t, 0), (Texts{"A", "a", "b"}));
  t.caseMode = 1;
  sortRows(t, 0, SortByText, false);
  EXPECT_EQ(column(t, 0), (Texts{"A", "a", "b"}));

  // Three equal keys already in order: the run is reversed end to end.
  ElementArray e = makeTable(2);
  for (const char* row : {"5,p", "5,q", "5,r", "6,s"}) appendRowFromList(e, row);
  sortRows(e, 0, SortByValue, false);
  EXPECT_EQ(column(e, 1), (Texts{"r", "q", "p", "s"}));
}

TEST(RowSort, KeysTravelAndStatesStay) {
  ElementArray a = makeTable(2);
  for (const char* row : {"3,c", "1,a", "2,b"}) appendRowFromList(a, row);
  a.setKeyString("key-c", 1);
  a.setKeyValue(11, 2);
  a.rowStates = {S, S, S};
  sortRows(a, 0, SortByValue, false);
  EXPECT_EQ(column(a, 1), (Texts{"a", "b", "c"}));
  EXPECT_EQ(std::string(a.getKeyString(5)), "key-c");
  EXPECT_EQ(a.getKeyValue(0), 11);
  EXPECT_EQ(a.rowStates, (std::vector<uint8_t>{S, S, S}));
}

TEST(RowSort, RangeIsTheFirstVisibleCountOfTableRows) {
  ElementArray a = makeTable(1);
  for (int v : {4, 3, 2, 1}) a.appendValue(v);
  a.rowStates = {U, U, S, S};
  sortRows(a, 0, SortByValue, false);
  EXPECT_EQ(column(a, 0), (Texts{"3", "4", "2", "1"}));
  EXPECT_EQ(a.rowStates, (std::vector<uint8_t>{U, U, S, S}));
}

TEST(RowSort, ColumnsOutsideTheTableChangeNothing) {
  ElementArray a = makeTable(2);
  for (const char* row : {"b,2", "a,1"}) appendRowFromList(a, row);
  sortRows(a, 2, SortByText, false);
  sortRows(a, -1, SortByText, false);
  EXPECT_EQ(column(a, 0), (Texts{"b", "a"}));
  ElementArray flat;
  flat.appendValue(2);
  flat.appendValue(1);
  sortRows(flat, 0, SortByValue, false);
  EXPECT_EQ(flat.getValue(0), 2);
}

TEST(RowSort, CompareCellAgainstAPivotText) {
  ElementArray a = makeTable(2);
  appendRowFromList(a, "abc,12x");
  EXPECT_EQ(compareCell(a, 0, 1, "12", SortByValue), 0);
  EXPECT_LT(compareCell(a, 0, 1, "13 apples", SortByValue), 0);
  EXPECT_GT(compareCell(a, 0, 0, "ABB", SortByText), 0);
  EXPECT_EQ(compareCell(a, 0, 0, "ABC", SortByText), 0);
  EXPECT_EQ(compareCell(a, 1, 0, "", SortByText), -1);  // no such cell
  EXPECT_EQ(compareCell(a, 0, -1, "", SortByText), -1);
}

// --- Against a direct transcription of the partition steps ------------------------------

void referenceRowSort(ElementArray& a, int32_t column, int32_t kind, bool descending, int32_t lo,
                      int32_t hi) {
  while (hi > lo) {
    const std::string pivot = a.getString(cellIndex(a, lo, column));
    int32_t i = lo;
    int32_t j = hi;
    for (;;) {
      if (descending) {
        while (compareCell(a, i, column, pivot.c_str(), kind) > 0) ++i;
        while (compareCell(a, j, column, pivot.c_str(), kind) < 0) --j;
      } else {
        while (compareCell(a, i, column, pivot.c_str(), kind) < 0) ++i;
        while (compareCell(a, j, column, pivot.c_str(), kind) > 0) --j;
      }
      if (i > j) break;
      swapRows(a, i, j);
      ++i;
      --j;
      if (j < i) break;
    }
    referenceRowSort(a, column, kind, descending, lo, j);
    lo = i;
  }
}

// Cells drawn from a small alphabet so that ties (including case-only ties) abound.
void fillCell(ElementArray& a, std::mt19937& rng, int32_t index) {
  static const char* const kTexts[] = {"a", "A", "b", "B", "10", "9", "x1", "", "-2", "ab"};
  switch (rng() % 4) {
    case 0:
      a.setValue(static_cast<int32_t>(rng() % 7) - 3, index);
      break;
    default:
      a.setString(kTexts[rng() % 10], index);
  }
}

// Second column: the row's identity, so the order of equal rows is visible.
ElementArray randomTable(std::mt19937& rng, int32_t rows) {
  ElementArray a = makeTable(2);
  for (int32_t r = 0; r < rows; ++r) {
    fillCell(a, rng, 2 * r);
    a.setValue(r + 1, 2 * r + 1);
  }
  return a;
}

void expectSameAsReference(ElementArray& a, int32_t kind, bool descending, int16_t caseMode,
                           const std::string& what) {
  a.caseMode = caseMode;
  ElementArray expected = makeTable(2);
  expected.caseMode = caseMode;
  for (int32_t i = 0; i < a.size(); ++i) expected.setElement({}, i);
  for (int32_t i = 0; i < a.size(); ++i) {
    const Element& e = a.at(i);
    if (e.type() == ElementType::Value) expected.setValue(e.number(), i);
    if (e.type() == ElementType::String) expected.setString(e.bytes(), i);
  }
  referenceRowSort(expected, 0, kind, descending, 0, expected.tableRowCount() - 1);
  sortRows(a, 0, kind, descending);
  ASSERT_EQ(column(a, 1), column(expected, 1))
      << what << " kind " << kind << " descending " << descending << " case " << caseMode;
}

TEST(RowSortExactness, RandomTablesWithManyTies) {
  std::mt19937 rng(20261122);
  for (int round = 0; round < 3000; ++round) {
    const auto rows = static_cast<int32_t>(rng() % 14);
    ElementArray a = randomTable(rng, rows);
    const int32_t kind = rng() % 2 == 0 ? SortByValue : SortByText;
    const bool descending = rng() % 2 == 0;
    const auto caseMode = static_cast<int16_t>(rng() % 2);
    expectSameAsReference(a, kind, descending, caseMode, "random");
    // The sorted table again: every range is now in order, runs of ties remain.
    expectSameAsReference(a, kind, descending, caseMode, "in order");
    // And the other direction: reversed, distinct or not.
    expectSameAsReference(a, kind, !descending, caseMode, "reversed");
  }
}

// Larger tables make the first-row pivot degenerate, which the sort detects and
// shortcuts where that is exact.
TEST(RowSortExactness, DegenerateOrders) {
  std::mt19937 rng(7);
  const int32_t n = 600;
  auto build = [&](auto key) {
    ElementArray a = makeTable(2);
    for (int32_t r = 0; r < n; ++r) {
      a.setValue(key(r), 2 * r);
      a.setValue(r + 1, 2 * r + 1);
    }
    return a;
  };
  std::vector<std::pair<const char*, std::function<int32_t(int32_t)>>> shapes = {
      {"reversed", [&](int32_t r) { return n - r; }},
      {"reversed with pairs", [&](int32_t r) { return (n - r) / 2; }},
      {"reversed but first", [&](int32_t r) { return r == 0 ? 0 : n - r; }},
      {"organ pipe", [&](int32_t r) { return r < n / 2 ? r : n - r; }},
      {"sawtooth", [&](int32_t r) { return r % 50; }},
      {"all equal", [&](int32_t) { return 4; }},
      {"sorted with duplicates", [&](int32_t r) { return r / 3; }},
      {"nearly sorted", [&](int32_t r) { return r % 100 == 0 ? 0 : r; }},
      {"random wide", [&](int32_t) { return static_cast<int32_t>(rng()); }},
  };
  for (auto& [name, key] : shapes) {
    for (bool descending : {false, true}) {
      ElementArray a = build(key);
      expectSameAsReference(a, SortByValue, descending, 0, name);
      ElementArray t = build(key);
      expectSameAsReference(t, SortByText, descending, 0, name);
    }
  }
}

// The host may run us on a 1 MB stack.
void* sortMillionReversedRows(void* result) {
  ElementArray a = makeTable(1);
  const int32_t n = 1000000;
  for (int32_t r = 0; r < n; ++r) a.appendValue(n - r);
  sortRows(a, 0, SortByValue, false);
  bool sorted = true;
  for (int32_t r = 0; r < n; ++r) sorted = sorted && a.getValue(r) == r + 1;
  sortRows(a, 0, SortByValue, true);
  sorted = sorted && a.getValue(0) == n && a.getValue(n - 1) == 1;
  *static_cast<bool*>(result) = sorted;
  return nullptr;
}

TEST(RowSortDepth, MillionReversedRowsOnAOneMegabyteStack) {
  pthread_attr_t attributes;
  ASSERT_EQ(pthread_attr_init(&attributes), 0);
  ASSERT_EQ(pthread_attr_setstacksize(&attributes, 1 << 20), 0);
  bool sorted = false;
  pthread_t thread;
  ASSERT_EQ(pthread_create(&thread, &attributes, sortMillionReversedRows, &sorted), 0);
  pthread_join(thread, nullptr);
  pthread_attr_destroy(&attributes);
  EXPECT_TRUE(sorted);
}

// --- Aggregates ----------------------------------------------------------------------------

TEST(ColumnAggregates, OverTheVisibleRows) {
  ElementArray a = makeTable(1);
  a.appendValue(4);
  a.appendString("abc");
  a.appendValue(-6);
  EXPECT_EQ(columnMax(a, 0), 4);
  EXPECT_EQ(columnMin(a, 0), -6);
  EXPECT_EQ(columnSum(a, 0), -2);
  EXPECT_EQ(columnAverage(a, 0), 0);

  ElementArray b = makeTable(1);
  for (int v : {10, 20, 30}) b.appendValue(v);
  b.rowStates = {S, U, S};
  EXPECT_EQ(columnSum(b, 0), 40);
  EXPECT_EQ(columnAverage(b, 0), 20);
  EXPECT_EQ(columnMax(b, 0), 30);
  EXPECT_EQ(columnMin(b, 0), 10);
  b.rowStates = {U, U, U};
  EXPECT_EQ(columnMax(b, 0), 0);
  EXPECT_EQ(columnMin(b, 0), 0);
  EXPECT_EQ(columnSum(b, 0), 0);
  EXPECT_EQ(columnAverage(b, 0), 0);
}

TEST(ColumnAggregates, SumWrapsAndAverageTruncates) {
  ElementArray a = makeTable(1);
  for (int32_t v : {INT32_MAX, 2, 1000, -7}) a.appendValue(v);
  a.rowStates = {S, S, U, S};
  // 2147483647 + 2 wraps to -2147483647; minus 7 gives -2147483654 mod 2^32 = 2147483642.
  EXPECT_EQ(columnSum(a, 0), 2147483642);
  EXPECT_EQ(columnAverage(a, 0), 715827880);
  a.rowStates = {S, S, U, U};
  EXPECT_EQ(columnSum(a, 0), -2147483647);
  EXPECT_EQ(columnAverage(a, 0), -1073741823);
}

TEST(ColumnAggregates, ColumnsOutsideTheTableReadNeighbours) {
  // Rows (1, 2), (3, 4), (5, 6).
  ElementArray a = makeTable(2);
  for (int v : {1, 2, 3, 4, 5, 6}) a.appendValue(v);
  // Column -1: row 0 has no previous cell (0), then 2 and 4.
  EXPECT_EQ(columnSum(a, -1), 6);
  EXPECT_EQ(columnMin(a, -1), 0);
  // Column 2: 3, 5, then past the end (0).
  EXPECT_EQ(columnSum(a, 2), 8);
  EXPECT_EQ(columnMax(a, 2), 5);
  EXPECT_EQ(columnAverage(a, 2), 2);
  EXPECT_EQ(columnSum(a, 1000), 0);
}

}  // namespace
}  // namespace quorrel
