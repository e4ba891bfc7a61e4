// The recordset against models: selections and aggregates on many random small tables
// (each cell's text and value written down when the cell is made), and row sorts against
// the partition steps written out.
#include <gtest/gtest.h>
#include <pthread.h>

#include <algorithm>
#include <climits>
#include <functional>
#include <iterator>
#include <random>

#include "query/compare.h"
#include "recordset/aggregates.h"
#include "recordset/row_sort.h"
#include "recordset/selection.h"
#include "recordset/table.h"
#include "support/array_text.h"
#include "support/partition_sort.h"

namespace quorrel {
namespace {

struct ModelCell {
  std::string text;
  int32_t value = 0;
};

struct RandomTable {
  ElementArray array;
  std::vector<ModelCell> cells;
  int32_t columns = 1;
};

const std::string kAlphabet = "aAbBzZ@`*?0_\xE1\xC1";

std::string randomWord(std::mt19937& rng, std::size_t maxLength) {
  std::string s(rng() % (maxLength + 1), ' ');
  for (char& c : s) c = kAlphabet[rng() % kAlphabet.size()];
  return s;
}

// Appends one random cell of every kind the array can hold and records what it reads as.
void appendRandomCell(std::mt19937& rng, RandomTable& t) {
  static const int32_t kValues[] = {0, 1, -1, 7, 12345, -6, INT32_MAX, INT32_MIN, 500};
  static const char kPastZero[] = "aB\0zzzz";  // stored bytes go on past the text's zero
  static const char kNoZero[] = "Zab?";        // no zero of their own, as from a damaged file
  ElementArray& a = t.array;
  ModelCell cell;
  const auto kind = rng() % 9;
  if (kind <= 1) {  // a value (0 is None and reads as ""); keyed, it lives in a record
    cell.value = kind == 0 ? kValues[rng() % 9] : static_cast<int32_t>(rng() % 2000) - 1000;
    cell.text = cell.value == 0 ? "" : std::to_string(cell.value);
    a.appendValue(cell.value);
    if (kind == 1) a.setKeyString("key", a.size() - 1);
  } else if (kind == 2) {  // a text without a leading number
    cell.text = randomWord(rng, 12);
    if (!cell.text.empty() && cell.text[0] == '0') cell.text[0] = 'b';
    a.appendString(cell.text.c_str());
  } else if (kind == 3) {  // a text with a leading number
    cell.value = static_cast<int32_t>(rng() % 100);
    cell.text = std::to_string(cell.value) + "a" + randomWord(rng, 4);
    a.appendString(cell.text.c_str());
  } else if (kind == 4) {  // nothing
    a.insertElement(ElementValue{}, a.size());
  } else if (kind == 5) {  // file bytes read as the empty text
    a.appendFile(ByteBlock{"abc", 3});
  } else if (kind <= 7) {
    cell.text = kind == 6 ? "aB" : kNoZero;
    a.insertElement(
        ElementValue{ElementType::String, 0, kind == 6 ? kPastZero : kNoZero, kind == 6 ? 8 : 4},
        a.size());
  } else {  // a long text, past the lengths probes are prepared for
    cell.text = std::string(60 + rng() % 15, 'a') + randomWord(rng, 3);
    a.appendString(cell.text.c_str());
  }
  t.cells.push_back(cell);
}

RandomTable randomTable(std::mt19937& rng) {
  RandomTable t;
  t.columns = 1 + static_cast<int32_t>(rng() % 3);
  t.array.setDimensions(2);
  t.array.setBoundary(1, t.columns);
  t.array.settings.autoSelectNewRows = rng() % 2 == 1;
  const auto count = rng() % 14;
  for (unsigned i = 0; i < count; ++i) appendRandomCell(rng, t);
  for (uint8_t& state : t.array.rowStates) state = rng() % 2 == 0 ? RowSelected : RowUnselected;
  return t;
}

int32_t randomColumn(std::mt19937& rng, int32_t columns) {
  const int32_t choices[] = {0, 1, columns - 1, columns, columns + 1, -1, INT32_MAX, INT32_MIN};
  return choices[rng() % 8];
}

// The cell of table row r, or null when its index falls outside the array.
const ModelCell* modelCell(const RandomTable& t, int32_t r, int32_t column) {
  const auto index =
      static_cast<int32_t>(static_cast<uint32_t>(static_cast<int64_t>(r) * t.columns + column));
  if (index < 0 || index >= static_cast<int32_t>(t.cells.size())) return nullptr;
  return &t.cells[static_cast<std::size_t>(index)];
}

template <typename Test>
std::vector<uint8_t> expectedStates(const RandomTable& t, int32_t column, Test&& passes) {
  std::vector<uint8_t> states = t.array.rowStates;
  for (std::size_t r = 0; r < states.size(); ++r) {
    const ModelCell* cell = modelCell(t, static_cast<int32_t>(r), column);
    const bool pass = cell != nullptr && passes(*cell);
    if (t.array.settings.selectionMode == SelectOr && pass) states[r] = RowSelected;
    if (t.array.settings.selectionMode == SelectAnd && !pass) states[r] = RowUnselected;
  }
  return states;
}

// The containment test as the plain operations define it.
bool containsByCompare(const ElementArray& a, const std::string& text, const std::string& probe) {
  const auto n = static_cast<int32_t>(probe.size());
  for (std::size_t o = 0; o + probe.size() <= text.size(); ++o) {
    if (searchCompareSpan(a, probe.c_str(), text.c_str() + o, n) == 0) return true;
  }
  return false;
}

std::string randomProbe(std::mt19937& rng, const RandomTable& t) {
  if (t.cells.empty() || rng() % 3 == 0) return randomWord(rng, 4);
  const std::string& text = t.cells[rng() % t.cells.size()].text;
  std::string probe = text.substr(rng() % (text.size() + 1));
  probe.resize(std::min<std::size_t>(probe.size(), rng() % 6 == 0 ? 80 : 5));
  for (char& c : probe) {
    if (rng() % 4 == 0 && ((c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'))) c ^= 0x20;
    if (rng() % 10 == 0) c = '*';
  }
  return probe;
}

// Aggregates over the visible rows, in row order, a missing cell reading 0.
void expectAggregatesOfTheModel(const RandomTable& t, int32_t column, int round) {
  int32_t max = 0;
  int32_t min = 0;
  uint32_t sum = 0;
  int64_t n = 0;
  for (std::size_t r = 0; r < t.array.rowStates.size(); ++r) {
    if (t.array.rowStates[r] != RowSelected) continue;
    const ModelCell* cell = modelCell(t, static_cast<int32_t>(r), column);
    const int32_t v = cell != nullptr ? cell->value : 0;
    max = n == 0 || v > max ? v : max;
    min = n == 0 || v < min ? v : min;
    sum += static_cast<uint32_t>(v);
    ++n;
  }
  const int32_t average = n == 0 ? 0 : static_cast<int32_t>(static_cast<int32_t>(sum) / n);
  ASSERT_EQ(columnMax(t.array, column), max) << "round " << round;
  ASSERT_EQ(columnMin(t.array, column), min) << "round " << round;
  ASSERT_EQ(columnSum(t.array, column), static_cast<int32_t>(sum)) << "round " << round;
  ASSERT_EQ(columnAverage(t.array, column), average) << "round " << round;
}

// A where-test or between-test: its model over one cell, and the operation.
struct Where {
  const char* name;
  std::function<bool(const ModelCell&)> model;
  std::function<void(ElementArray&, int32_t column)> select;
};

TEST(RandomTables, SelectionsAndAggregatesAgreeWithTheModel) {
  std::mt19937 rng(99);
  int passes = 0;
  int failures = 0;
  for (int round = 0; round < 40000; ++round) {
    RandomTable t = randomTable(rng);
    ElementArray& a = t.array;
    const int32_t column = randomColumn(rng, t.columns);
    expectAggregatesOfTheModel(t, column, round);
    if (HasFatalFailure()) return;

    a.settings.caseMode = static_cast<CaseMode>(rng() % 2);
    a.settings.searchMode = static_cast<SearchMode>(rng() % 2);
    a.settings.selectionMode = static_cast<SelectionMode>(rng() % 2);
    // Texts: the probe is the low end of a between test, another random text the high end.
    const std::string probe = randomProbe(rng, t);
    const std::string high = randomProbe(rng, t);
    const char* low = rng() % 20 == 0 ? nullptr : probe.c_str();
    const char* top = rng() % 20 == 0 ? nullptr : high.c_str();
    const int32_t x = static_cast<int32_t>(rng() % 21) - 10;
    const auto byValue = [x](const char* name, auto op,
                             void (*select)(ElementArray&, int32_t, int32_t)) {
      return Where{name, [=](const ModelCell& c) { return op(c.value, x); },
                   [=](ElementArray& array, int32_t j) { select(array, j, x); }};
    };
    const Where wheres[] = {
        {"containing",
         [&](const ModelCell& c) { return containsByCompare(a, c.text, low ? probe : ""); },
         [&](ElementArray& array, int32_t j) { selectWhereContaining(array, j, low); }},
        {"matching", [&](const ModelCell& c) { return searchCompare(a, low, c.text.c_str()) == 0; },
         [&](ElementArray& array, int32_t j) { selectWhereMatching(array, j, low); }},
        {"between texts",
         [&](const ModelCell& c) {
           return compareText(a, low, c.text.c_str()) <= 0 &&
                  compareText(a, top, c.text.c_str()) >= 0;
         },
         [&](ElementArray& array, int32_t j) { selectBetweenStrings(array, j, low, top); }},
        byValue("equal", std::equal_to<>(), selectWhereEqual),
        byValue("not equal", std::not_equal_to<>(), selectWhereNotEqual),
        byValue("greater", std::greater<>(), selectWhereGreater),
        byValue("greater or equal", std::greater_equal<>(), selectWhereGreaterOrEqual),
        byValue("less", std::less<>(), selectWhereLess),
        byValue("less or equal", std::less_equal<>(), selectWhereLessOrEqual),
        {"between values", [&](const ModelCell& c) { return c.value >= x && c.value <= x + 5; },
         [&](ElementArray& array, int32_t j) { selectBetweenValues(array, j, x, x + 5); }}};
    const Where& where = wheres[rng() % std::size(wheres)];
    const std::vector<uint8_t> before = a.rowStates;
    const auto expected = expectedStates(t, column, where.model);
    where.select(a, column);
    ASSERT_EQ(a.rowStates, expected)
        << "round " << round << " " << where.name << " probe «" << (low ? probe : "(none)")
        << "» column " << column << " case " << a.settings.caseMode << " wildcard "
        << a.settings.searchMode << " mode " << a.settings.selectionMode;
    for (std::size_t r = 0; r < before.size(); ++r) {
      passes += before[r] != expected[r] && expected[r] == RowSelected;
      failures += before[r] != expected[r] && expected[r] == RowUnselected;
    }
  }
  // Both modes changed many states.
  EXPECT_GT(passes, 4000);
  EXPECT_GT(failures, 4000);
}

// A two-dimensional table of the given width, every row selected, filled from lists.
ElementArray makeTable(int32_t columns, std::initializer_list<const char*> rows = {}) {
  ElementArray a = shaped(2, columns);
  a.settings.autoSelectNewRows = 1;
  for (const char* row : rows) appendRowFromList(a, row);
  return a;
}

// The texts of column j, one per table row.
std::vector<std::string> columnTexts(ElementArray& a, int32_t j) {
  std::vector<std::string> out;
  for (int32_t r = 0; r < a.tableRowCount(); ++r) out.emplace_back(a.getString(cellIndex(a, r, j)));
  return out;
}

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
