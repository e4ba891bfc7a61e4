#include "recordset/row_sort.h"

#include <pthread.h>

#include <functional>
#include <random>

#include "support/partition_sort.h"
#include "table_test_support.h"

namespace quorrel {
namespace {

TEST(RowSort, CompareCellAgainstAPivotText) {
  ElementArray a = makeTable(2, {"abc,12x"});
  EXPECT_EQ(compareCell(a, 0, 1, "12", SortByValue), 0);
  EXPECT_LT(compareCell(a, 0, 1, "13 apples", SortByValue), 0);
  EXPECT_GT(compareCell(a, 0, 0, "ABB", SortByText), 0);
  EXPECT_EQ(compareCell(a, 0, 0, "ABC", SortByText), 0);
  EXPECT_EQ(compareCell(a, 1, 0, "", SortByText), -1);  // no such cell
  EXPECT_EQ(compareCell(a, 0, -1, "", SortByText), -1);
}

// --- Against a direct transcription of the partition steps ------------------------------

// The row sort step by step: the first row of a range holds the pivot.
void referenceRowSort(ElementArray& a, int32_t column, int32_t kind, bool descending) {
  partitionSort(
      0, a.tableRowCount() - 1,
      [&](int32_t lo, int32_t) { return std::string(a.getString(cellIndex(a, lo, column))); },
      [&](int32_t i, const std::string& pivot) {
        const int32_t order = compareCell(a, i, column, pivot.c_str(), kind);
        return descending ? (order < 0) - (order > 0) : order;
      },
      [&](int32_t i, int32_t j) { swapRows(a, i, j); });
}

// Sorts the table, and its copy by the transcription, on column 0; column 1 holds the
// row's identity, so the order of equal rows shows.
void expectSameAsReference(ElementArray& a, ElementArray& copy, int32_t kind, bool descending,
                           const std::string& what) {
  referenceRowSort(copy, 0, kind, descending);
  sortRows(a, 0, kind, descending);
  ASSERT_EQ(columnTexts(a, 1), columnTexts(copy, 1))
      << what << " kind " << kind << " descending " << descending << " case "
      << a.settings.caseMode;
}

// Keys from a small alphabet so that ties (including case-only ties) abound: codes below 10
// are texts, the others values -3 to 3.
TEST(RowSortExactness, RandomTablesWithManyTies) {
  static const char* const kTexts[] = {"a", "A", "b", "B", "10", "9", "x1", "", "-2", "ab"};
  std::mt19937 rng(20261122);
  for (int round = 0; round < 3000; ++round) {
    std::vector<uint32_t> codes(rng() % 14);
    for (uint32_t& code : codes) code = rng() % 4 == 0 ? 10 + rng() % 7 : rng() % 10;
    const auto caseMode = static_cast<CaseMode>(rng() % 2);
    auto build = [&] {
      ElementArray t = makeTable(2);
      t.settings.caseMode = caseMode;
      for (int32_t r = 0; r < static_cast<int32_t>(codes.size()); ++r) {
        const uint32_t code = codes[static_cast<std::size_t>(r)];
        if (code < 10) t.setString(kTexts[code], 2 * r);
        if (code >= 10) t.setValue(static_cast<int32_t>(code) - 13, 2 * r);
        t.setValue(r + 1, 2 * r + 1);
      }
      return t;
    };
    ElementArray a = build();
    ElementArray copy = build();
    const int32_t kind = rng() % 2 == 0 ? SortByValue : SortByText;
    const bool descending = rng() % 2 == 0;
    expectSameAsReference(a, copy, kind, descending, "random");
    // Sorted again: every range is in order, runs of ties remain; then the other way.
    expectSameAsReference(a, copy, kind, descending, "in order");
    expectSameAsReference(a, copy, kind, !descending, "reversed");
  }
}

// Larger tables make the first-row pivot degenerate, which the sort detects and
// shortcuts where that is exact.
TEST(RowSortExactness, DegenerateOrders) {
  std::mt19937 rng(7);
  const int32_t n = 600;
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
    ElementArray a = makeTable(2);
    for (int32_t r = 0; r < n; ++r) {
      a.setValue(key(r), 2 * r);
      a.setValue(r + 1, 2 * r + 1);
    }
    for (int32_t kind : {SortByValue, SortByText}) {
      for (bool descending : {false, true}) {
        ElementArray sorted = makeTable(2);
        ElementArray copy = makeTable(2);
        for (int32_t i = 0; i < a.size(); ++i) {
          sorted.setValue(a.getValue(i), i);
          copy.setValue(a.getValue(i), i);
        }
        expectSameAsReference(sorted, copy, kind, descending, name);
      }
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
  *static_cast<bool*>(result) = sorted && a.getValue(0) == n && a.getValue(n - 1) == 1;
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

}  // namespace
}  // namespace quorrel
