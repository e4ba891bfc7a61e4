// Shared pieces of the benchmark program: every scenario registers an implementation
// run and a baseline run under the same name, and the table reporter pairs them.
#pragma once

#include <benchmark/benchmark.h>

#include <cstdint>
#include <functional>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace quorrel::bench {

// Sizes are divided by this in the quick run that CI makes (one short iteration).
int64_t scaled(int64_t n);

// Bytes held by the allocator right now (small chunks and mapped blocks).
int64_t heapInUse();

// One scenario: `impl` and `base` do the same work, `n` is the size reported in the
// table and `ops` the number of operations one iteration performs.
struct Scenario {
  std::string name;
  int64_t n = 0;
  int64_t ops = 0;
  double target = 2.0;
  std::function<void(benchmark::State&)> impl;
  std::function<void(benchmark::State&)> base;
  // Iterations per repetition; 0 lets the library decide. Scenarios that rebuild their
  // input outside the timed part of every iteration fix a small number.
  int64_t iterations = 0;
};

void add(Scenario scenario);

// Records memory for the table: bytes per element (minus `textBytes` per element for
// strings) of the structure that `build` returns while it is alive.
void reportMemory(benchmark::State& state, double bytesPerElement);

// Deterministic test data.
std::vector<std::string> randomTexts(int64_t count, int minLength, int maxLength,
                                     uint32_t seed = 1);
std::vector<int32_t> randomValues(int64_t count, uint32_t seed = 2);
std::vector<int32_t> randomIndexes(int64_t count, int64_t below, uint32_t seed = 3);

}  // namespace quorrel::bench
