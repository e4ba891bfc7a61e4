// Array store scenarios: appends with their memory, random reads, and edits at the
// front of a long array.
#include <string>
#include <vector>

#include "array/element_array.h"
#include "harness.h"
#include "hostsim/host_simulator.h"

namespace quorrel::bench {

namespace {

void appendValues(benchmark::State& state, int64_t n) {
  const std::vector<int32_t> values = randomValues(n);
  bool measured = false;
  for (auto _ : state) {
    const int64_t before = heapInUse();
    ElementArray array;
    for (int32_t v : values) array.appendValue(v);
    benchmark::DoNotOptimize(array.size());
    if (!measured) {
      reportMemory(state, static_cast<double>(heapInUse() - before) / static_cast<double>(n));
      measured = true;
    }
  }
}

void appendValuesBase(benchmark::State& state, int64_t n) {
  const std::vector<int32_t> values = randomValues(n);
  bool measured = false;
  for (auto _ : state) {
    const int64_t before = heapInUse();
    std::vector<int32_t> vector;
    for (int32_t v : values) vector.push_back(v);
    benchmark::DoNotOptimize(vector.data());
    if (!measured) {
      reportMemory(state, static_cast<double>(heapInUse() - before) / static_cast<double>(n));
      measured = true;
    }
  }
}

// Memory per string element is reported without the text itself (its characters and
// terminator), which both sides must hold somewhere.
double textBytes(const std::vector<std::string>& texts) {
  double total = 0;
  for (const std::string& t : texts) total += static_cast<double>(t.size() + 1);
  return total / static_cast<double>(texts.size());
}

void appendStrings(benchmark::State& state, int64_t n) {
  const std::vector<std::string> texts = randomTexts(n, 8, 16);
  bool measured = false;
  for (auto _ : state) {
    const int64_t before = heapInUse();
    ElementArray array;
    for (const std::string& t : texts) array.appendString(t.c_str());
    benchmark::DoNotOptimize(array.size());
    if (!measured) {
      const double perElement = static_cast<double>(heapInUse() - before) / static_cast<double>(n);
      reportMemory(state, perElement - textBytes(texts));
      measured = true;
    }
  }
}

void appendStringsBase(benchmark::State& state, int64_t n) {
  const std::vector<std::string> texts = randomTexts(n, 8, 16);
  bool measured = false;
  for (auto _ : state) {
    const int64_t before = heapInUse();
    std::vector<std::string> vector;
    for (const std::string& t : texts) vector.push_back(t);
    benchmark::DoNotOptimize(vector.data());
    if (!measured) {
      const double perElement = static_cast<double>(heapInUse() - before) / static_cast<double>(n);
      reportMemory(state, perElement - textBytes(texts));
      measured = true;
    }
  }
}

// `E get( i` as a game makes it: the host fetches the parameter and calls the
// expression routine through the module's table (the built module, opened as the host
// opens it).
void getRoundTrips(benchmark::State& state, int64_t n) {
  constexpr int32_t kAppendValue = 9;
  constexpr int32_t kGet = 3;
  const auto module = hostsim::Module::open(QUORREL_BENCH_MODULE);
  hostsim::Instance instance(*module);
  for (int32_t v : randomValues(n)) instance.callAction(kAppendValue, {v});
  const std::vector<int32_t> indexes = randomIndexes(n, n);
  for (auto _ : state) {
    int64_t sum = 0;
    for (int32_t i : indexes) sum += static_cast<int64_t>(instance.callExpressionRaw(kGet, {i}));
    benchmark::DoNotOptimize(sum);
  }
}

// The bare read that the round trip wraps.
void getValues(benchmark::State& state, int64_t n) {
  ElementArray array;
  for (int32_t v : randomValues(n)) array.appendValue(v);
  const std::vector<int32_t> indexes = randomIndexes(n, n);
  for (auto _ : state) {
    int32_t sum = 0;
    for (int32_t i : indexes) sum += array.getValue(i);
    benchmark::DoNotOptimize(sum);
  }
}

void getStrings(benchmark::State& state, int64_t n) {
  ElementArray array;
  for (const std::string& t : randomTexts(n, 8, 16)) array.appendString(t.c_str());
  const std::vector<int32_t> indexes = randomIndexes(n, n);
  for (auto _ : state) {
    unsigned sum = 0;
    for (int32_t i : indexes) sum += static_cast<unsigned char>(array.getString(i)[1]);
    benchmark::DoNotOptimize(sum);
  }
}

void getStringsBase(benchmark::State& state, int64_t n) {
  const std::vector<std::string> vector = randomTexts(n, 8, 16);
  const std::vector<int32_t> indexes = randomIndexes(n, n);
  for (auto _ : state) {
    unsigned sum = 0;
    for (int32_t i : indexes) {
      sum += static_cast<unsigned char>(vector[static_cast<std::size_t>(i)].c_str()[1]);
    }
    benchmark::DoNotOptimize(sum);
  }
}

void frontEdits(benchmark::State& state, int64_t n, int64_t times) {
  ElementArray array;
  for (int32_t v : randomValues(n)) array.appendValue(v);
  for (auto _ : state) {
    for (int64_t k = 0; k < times; ++k) {
      array.insertValue(static_cast<int32_t>(k), 0);
      array.deleteAt(0);
    }
    benchmark::DoNotOptimize(array.size());
  }
}

void frontEditsBase(benchmark::State& state, int64_t n, int64_t times) {
  std::vector<void*> vector(static_cast<std::size_t>(n));
  for (auto _ : state) {
    for (int64_t k = 0; k < times; ++k) {
      vector.insert(vector.begin(), &vector);
      vector.erase(vector.begin());
    }
    benchmark::DoNotOptimize(vector.data());
  }
}

}  // namespace

void registerArrayScenarios() {
  const int64_t n = scaled(1'000'000);
  add({"append values", n, n, 2.0, [n](auto& s) { appendValues(s, n); },
       [n](auto& s) { appendValuesBase(s, n); }});
  add({"append strings 8-16 bytes", n, n, 2.0, [n](auto& s) { appendStrings(s, n); },
       [n](auto& s) { appendStringsBase(s, n); }});
  // No target: the host's call costs far more than the read it wraps.
  add({"E get( round trip vs getValue", n, n, 0.0, [n](auto& s) { getRoundTrips(s, n); },
       [n](auto& s) { getValues(s, n); }});
  add({"random getString", n, n, 2.0, [n](auto& s) { getStrings(s, n); },
       [n](auto& s) { getStringsBase(s, n); }});
  const int64_t front = scaled(100'000);
  const int64_t times = scaled(10'000);
  // One operation is an insert at index 0 followed by a delete at index 0.
  add({"insert+delete at index 0", front, times, 2.0,
       [front, times](auto& s) { frontEdits(s, front, times); },
       [front, times](auto& s) { frontEditsBase(s, front, times); }});
}

}  // namespace quorrel::bench
