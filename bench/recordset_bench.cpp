// Recordset scenarios on 100,000 rows of 4 columns: row sorts on columns of several
// shapes, every where-selection, and column aggregates over half the rows.
#include <strings.h>

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <string>
#include <vector>

#include "array/element_array.h"
#include "harness.h"
#include "recordset/aggregates.h"
#include "recordset/row_sort.h"
#include "recordset/selection.h"
#include "recordset/table.h"

namespace quorrel::bench {

namespace {

constexpr int32_t kColumns = 4;

// Column 0 holds the keys (as values or as texts of a fixed width, which sort the same
// way); the other columns hold random values.
struct Table {
  std::vector<int32_t> keys;
  std::vector<std::string> keyTexts;
  std::vector<int32_t> others;
};

std::vector<int32_t> shapedKeys(const std::string& shape, int64_t rows) {
  std::vector<int32_t> keys = randomValues(rows, 21);
  for (int64_t i = 0; i < rows; ++i) {
    int32_t& k = keys[static_cast<std::size_t>(i)];
    if (shape == "random") k = static_cast<int32_t>(static_cast<uint32_t>(k) % 1'000'000'000u);
    if (shape == "sorted") k = static_cast<int32_t>(i);
    if (shape == "reversed") k = static_cast<int32_t>(rows - i);
    if (shape == "all equal") k = 7;
    if (shape == "sorted with duplicates") k = static_cast<int32_t>(i / 10);
  }
  return keys;
}

std::shared_ptr<Table> makeTable(const std::vector<int32_t>& keys) {
  auto table = std::make_shared<Table>();
  table->keys = keys;
  for (int32_t k : keys) {
    char text[16];
    std::snprintf(text, sizeof text, "k%09d", k);
    table->keyTexts.emplace_back(text);
  }
  table->others = randomValues(static_cast<int64_t>(keys.size()) * (kColumns - 1), 22);
  return table;
}

// Row sorts work on the visible rows, so their tables start with every row selected;
// the selections start from none.
void fill(ElementArray& array, const Table& table, bool keysAsText, bool allSelected = false) {
  array.settings.autoSelectNewRows = allSelected ? 1 : 0;
  array.setDimensions(2);
  array.setBoundary(1, kColumns);
  for (std::size_t r = 0; r < table.keys.size(); ++r) {
    if (keysAsText) {
      array.appendString(table.keyTexts[r].c_str());
    } else {
      array.appendValue(table.keys[r]);
    }
    for (int32_t c = 1; c < kColumns; ++c) {
      array.appendValue(table.others[r * (kColumns - 1) + static_cast<std::size_t>(c - 1)]);
    }
  }
}

void registerRowSorts(int64_t rows) {
  for (const char* shape :
       {"random", "sorted", "reversed", "all equal", "sorted with duplicates"}) {
    auto table = makeTable(shapedKeys(shape, rows));
    for (bool text : {false, true}) {
      add({std::string("sortRows by ") + (text ? "text, " : "value, ") + shape, rows, rows, 3.0,
           [table, text](benchmark::State& state) {
             for (auto _ : state) {
               state.PauseTiming();
               ElementArray array;
               fill(array, *table, text, true);
               state.ResumeTiming();
               sortRows(array, 0, text ? 2 : 1, false);
               state.PauseTiming();
               benchmark::DoNotOptimize(array.getValue(0));
               array.clear();
               state.ResumeTiming();
             }
           },
           [table, text](benchmark::State& state) {
             for (auto _ : state) {
               if (text) {
                 std::vector<std::pair<const char*, int32_t>> keyed;
                 keyed.reserve(table->keys.size());
                 for (std::size_t r = 0; r < table->keys.size(); ++r) {
                   keyed.emplace_back(table->keyTexts[r].c_str(), static_cast<int32_t>(r));
                 }
                 std::sort(keyed.begin(), keyed.end(), [](const auto& a, const auto& b) {
                   const int c = strcasecmp(a.first, b.first);
                   return c != 0 ? c < 0 : a.second < b.second;
                 });
                 benchmark::DoNotOptimize(keyed.data());
               } else {
                 std::vector<std::pair<int32_t, int32_t>> keyed;
                 keyed.reserve(table->keys.size());
                 for (std::size_t r = 0; r < table->keys.size(); ++r) {
                   keyed.emplace_back(table->keys[r], static_cast<int32_t>(r));
                 }
                 std::sort(keyed.begin(), keyed.end());
                 benchmark::DoNotOptimize(keyed.data());
               }
             }
           },
           5});
    }
  }
}

// A where-selection against a loop that tests every cell of the column and marks a
// byte per row.
template <typename Select, typename Test>
void addSelection(const std::string& name, int64_t rows, std::shared_ptr<Table> table, bool text,
                  Select select, Test test) {
  add({name, rows, rows, 2.0,
       [table, text, select](benchmark::State& state) {
         ElementArray array;
         fill(array, *table, text);
         for (auto _ : state) {
           select(array);
           benchmark::DoNotOptimize(array.rowStates.data());
         }
       },
       [table, text, test](benchmark::State& state) {
         std::vector<uint8_t> marks(table->keys.size());
         for (auto _ : state) {
           for (std::size_t r = 0; r < table->keys.size(); ++r) {
             if (text ? test(table->keyTexts[r].c_str()) : test(table->keys[r])) marks[r] = 1;
           }
           benchmark::DoNotOptimize(marks.data());
         }
       }});
}

void registerSelections(int64_t rows) {
  std::vector<int32_t> keys = randomValues(rows, 23);
  for (int32_t& k : keys) k = static_cast<int32_t>(static_cast<uint32_t>(k) % 1000u);
  auto table = makeTable(keys);
  const int32_t x = 500;
  auto value = [](auto compare) {
    return [compare](auto cell) {
      if constexpr (std::is_same_v<decltype(cell), const char*>) {
        return false;
      } else {
        return compare(cell);
      }
    };
  };
  addSelection(
      "selectWhereEqual", rows, table, false, [x](ElementArray& a) { selectWhereEqual(a, 0, x); },
      value([x](int32_t v) { return v == x; }));
  addSelection(
      "selectWhereNotEqual", rows, table, false,
      [x](ElementArray& a) { selectWhereNotEqual(a, 0, x); },
      value([x](int32_t v) { return v != x; }));
  addSelection(
      "selectWhereGreater", rows, table, false,
      [x](ElementArray& a) { selectWhereGreater(a, 0, x); },
      value([x](int32_t v) { return v > x; }));
  addSelection(
      "selectWhereGreaterOrEqual", rows, table, false,
      [x](ElementArray& a) { selectWhereGreaterOrEqual(a, 0, x); },
      value([x](int32_t v) { return v >= x; }));
  addSelection(
      "selectWhereLess", rows, table, false, [x](ElementArray& a) { selectWhereLess(a, 0, x); },
      value([x](int32_t v) { return v < x; }));
  addSelection(
      "selectWhereLessOrEqual", rows, table, false,
      [x](ElementArray& a) { selectWhereLessOrEqual(a, 0, x); },
      value([x](int32_t v) { return v <= x; }));
  addSelection(
      "selectBetweenValues", rows, table, false,
      [](ElementArray& a) { selectBetweenValues(a, 0, 250, 750); },
      value([](int32_t v) { return v >= 250 && v <= 750; }));
  auto textTest = [](auto compare) {
    return [compare](auto cell) {
      if constexpr (std::is_same_v<decltype(cell), const char*>) {
        return compare(cell);
      } else {
        return false;
      }
    };
  };
  addSelection(
      "selectWhereMatching", rows, table, true,
      [](ElementArray& a) { selectWhereMatching(a, 0, "K000000500"); },
      textTest([](const char* t) { return strcasecmp(t, "K000000500") == 0; }));
  addSelection(
      "selectWhereContaining", rows, table, true,
      [](ElementArray& a) { selectWhereContaining(a, 0, "05"); }, textTest([](const char* t) {
        for (; t[0] != '\0' && t[1] != '\0'; ++t) {
          if (t[0] == '0' && t[1] == '5') return true;
        }
        return false;
      }));
  addSelection(
      "selectBetweenStrings", rows, table, true,
      [](ElementArray& a) { selectBetweenStrings(a, 0, "k000000250", "k000000750"); },
      textTest([](const char* t) {
        return strcasecmp(t, "k000000250") >= 0 && strcasecmp(t, "k000000750") <= 0;
      }));
}

void registerAggregates(int64_t rows) {
  auto table = makeTable(randomValues(rows, 24));
  auto halfSelected = [table](bool text) {
    auto array = std::make_shared<ElementArray>();
    fill(*array, *table, text);
    for (std::size_t r = 0; r < array->rowStates.size(); ++r) {
      array->rowStates[r] = r % 2 == 0 ? RowSelected : RowUnselected;
    }
    return array;
  };
  add({"columnSum, half the rows selected", rows, rows, 2.0,
       [halfSelected](benchmark::State& state) {
         auto array = halfSelected(false);
         for (auto _ : state) benchmark::DoNotOptimize(columnSum(*array, 0));
       },
       [table](benchmark::State& state) {
         std::vector<uint8_t> states(table->keys.size());
         for (std::size_t r = 0; r < states.size(); ++r) states[r] = r % 2 == 0 ? 1 : 2;
         for (auto _ : state) {
           uint32_t sum = 0;
           for (std::size_t r = 0; r < states.size(); ++r) {
             if (states[r] == 1) sum += static_cast<uint32_t>(table->keys[r]);
           }
           benchmark::DoNotOptimize(sum);
         }
       }});
  add({"columnList, half the rows selected", rows, rows, 2.0,
       [halfSelected](benchmark::State& state) {
         auto array = halfSelected(true);
         for (auto _ : state) benchmark::DoNotOptimize(columnList(*array, 0));
       },
       [table](benchmark::State& state) {
         std::vector<uint8_t> states(table->keys.size());
         for (std::size_t r = 0; r < states.size(); ++r) states[r] = r % 2 == 0 ? 1 : 2;
         for (auto _ : state) {
           std::size_t length = 0;
           for (std::size_t r = 0; r < states.size(); ++r) {
             if (states[r] == 1) length += table->keyTexts[r].size() + 1;
           }
           std::string joined;
           joined.reserve(length);
           for (std::size_t r = 0; r < states.size(); ++r) {
             if (states[r] != 1) continue;
             if (!joined.empty()) joined += ',';
             joined += table->keyTexts[r];
           }
           benchmark::DoNotOptimize(joined.data());
         }
       }});
}

}  // namespace

void registerRecordsetScenarios() {
  const int64_t rows = scaled(100'000);
  registerRowSorts(rows);
  registerSelections(rows);
  registerAggregates(rows);
}

}  // namespace quorrel::bench
