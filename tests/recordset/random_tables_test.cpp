// Selections and aggregates on many random small tables, against a model of every cell
// (its text and value, written down when the cell is made) and the plain per-cell
// comparisons.
#include <algorithm>
#include <climits>
#include <functional>
#include <iterator>
#include <random>

#include "query/compare.h"
#include "recordset/aggregates.h"
#include "recordset/selection.h"
#include "table_test_support.h"

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

}  // namespace
}  // namespace quorrel
