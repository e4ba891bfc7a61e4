// Allocation-failure runs, as trusted embedded databases test themselves: an input runs
// once to count the module's allocations, then again and again with allocation n
// failing (n = 1, 2, 3, ...) until a run passes with no failure injected. Linked with one
// fuzz target (session or script), whose checks run after every call: the session goes
// on past the failure, the invariants hold and no exception leaves an entry point (one
// that did would end the program). The call in which the allocation fails must also
// leave the array either as it was, settings and all, or as the same call left it when
// nothing failed (a sort without memory for its table still sorts). Leaks are
// LeakSanitizer's part in the asan build.
//
//   alloc_faults_script FILE...        every script case
//   alloc_faults_session CALLS SEED    a random session of at least CALLS calls
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <iterator>
#include <new>
#include <random>
#include <string>
#include <vector>

#include "fuzz_host.h"
#include "platform/allocation.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace {

using quorrel::ElementArray;
using quorrel::fuzz::CallObserver;

// Everything about the array that an operation may change, as one text.
std::string describe(const ElementArray& a) {
  std::string s = std::to_string(a.size()) + "/" + std::to_string(a.capacity()) + "/" +
                  std::to_string(a.dimensions()) + "/";
  for (int32_t d = 0; d < ElementArray::kBoundaryCount; ++d) {
    s += std::to_string(a.boundaryEntry(d)) + ",";
  }
  s += "/" + std::to_string(a.settings.caseMode) + std::to_string(a.settings.searchMode) +
       std::to_string(a.settings.selectionMode) + std::to_string(a.settings.autoSelectNewRows) +
       "/" + a.listDelimiter() + "/";
  if (a.labels) {
    for (const auto& label : *a.labels) s += label ? "[" + *label + "]" : "-";
  }
  s += "/";
  for (uint8_t state : a.rowStates) s += static_cast<char>('0' + state);
  auto element = [&s](const quorrel::Element& e) {
    s += "|" + std::to_string(static_cast<int>(e.type())) + ":" + std::to_string(e.size()) + ":" +
         std::to_string(e.number()) + ":";
    if (e.bytes() != nullptr && e.size() > 0) s.append(e.bytes(), static_cast<size_t>(e.size()));
  };
  for (const quorrel::Element& e : a.slots()) {
    element(e);
    if (e.key() != nullptr) {
      s += "k";
      element(*e.key());
    }
  }
  return s;
}

struct FaultRun final : CallObserver {
  // Allocations are counted only inside the module, outside the host's services.
  bool inModule = false;
  bool savedInModule = false;
  long long allocations = 0;
  long long failAt = 0;  // 0: none fails
  bool injected = false;

  long long call = 0;
  bool recording = false;
  std::vector<long long> callStarts;    // allocations made before each call, in the count run
  std::vector<std::size_t> cleanAfter;  // the array after each call, in the count run
  long long watchedCall = -1;
  bool watching = false;
  std::size_t before = 0;
  std::vector<int> broken;  // codes of calls that changed the array and failed

  void enter(const ElementArray* array) override {
    ++call;
    if (recording) callStarts.push_back(allocations);
    watching = call == watchedCall && array != nullptr;
    if (watching) before = std::hash<std::string>()(describe(*array));
    inModule = true;
  }
  void leave(const ElementArray* array, int code) override {
    inModule = false;
    if (recording) cleanAfter.push_back(array ? std::hash<std::string>()(describe(*array)) : 0);
    if (watching && injected && array != nullptr) {
      const std::size_t after = std::hash<std::string>()(describe(*array));
      if (after != before && after != cleanAfter[static_cast<std::size_t>(call - 1)]) {
        broken.push_back(code);
      }
    }
    watching = false;
  }
  void enterHost() override {
    savedInModule = inModule;
    inModule = false;
  }
  void leaveHost() override { inModule = savedInModule; }

  void start(long long failure) {
    inModule = false;
    allocations = 0;
    failAt = failure;
    injected = false;
    call = 0;
    recording = failure == 0;
    if (recording) {
      callStarts.clear();
      cleanAfter.clear();
    }
    // The call during which allocation `failure` happens, if the run goes as counted.
    const auto after = std::lower_bound(callStarts.begin(), callStarts.end(), failure);
    watchedCall = failure == 0 ? -1 : after - callStarts.begin();
  }
};

FaultRun run;

bool refuseThisOne() {
  if (!run.inModule) return false;
  if (++run.allocations != run.failAt) return false;
  run.injected = true;
  return true;
}

struct Totals {
  long long inputs = 0;
  long long calls = 0;
  long long failurePoints = 0;
  long long broken = 0;
};

void runInput(const std::string& name, const std::vector<uint8_t>& input, Totals& totals) {
  const auto* data = input.data();
  run.start(0);
  LLVMFuzzerTestOneInput(data, input.size());
  const long long calls = run.call;
  const long long counted = run.allocations;
  long long points = 0;
  std::vector<int> broken;
  for (long long n = 1;; ++n) {
    run.start(n);
    run.broken.clear();
    LLVMFuzzerTestOneInput(data, input.size());
    for (int code : run.broken) broken.push_back(code);
    if (!run.injected) break;
    ++points;
  }
  std::printf("%s: %lld calls, %lld allocations counted, %lld failure points, %zu calls changed\n",
              name.c_str(), calls, counted, points, broken.size());
  for (int code : broken) {
    std::printf("  array changed by a failed %s %d\n", code >= 100 ? "expression" : "action",
                code >= 100 ? code - 100 : code);
  }
  ++totals.inputs;
  totals.calls += calls;
  totals.failurePoints += points;
  totals.broken += static_cast<long long>(broken.size());
}

std::vector<uint8_t> fileBytes(const char* path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

}  // namespace

// Every allocation of the process asks the same hook as the module's own.
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"
void* operator new(std::size_t size) {
  if (quorrel::allocationRefused()) throw std::bad_alloc();
  if (void* p = std::malloc(size == 0 ? 1 : size)) return p;
  throw std::bad_alloc();
}
void* operator new[](std::size_t size) {
  return operator new(size);
}
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
  try {
    return operator new(size);
  } catch (...) {
    return nullptr;
  }
}
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
  return operator new(size, std::nothrow);
}
void operator delete(void* p) noexcept {
  std::free(p);
}
void operator delete[](void* p) noexcept {
  std::free(p);
}
void operator delete(void* p, std::size_t) noexcept {
  std::free(p);
}
void operator delete[](void* p, std::size_t) noexcept {
  std::free(p);
}
void operator delete(void* p, const std::nothrow_t&) noexcept {
  std::free(p);
}
void operator delete[](void* p, const std::nothrow_t&) noexcept {
  std::free(p);
}

int main(int argc, char** argv) {
  std::setvbuf(stdout, nullptr, _IONBF, 0);
  quorrel::allocationFaultHook = refuseThisOne;
  quorrel::fuzz::callObserver = &run;
  Totals totals;
  const bool session =
      argc == 3 && std::string(argv[1]).find_first_not_of("0123456789") == std::string::npos;
  if (session) {
    // Random bytes, longer and longer, until the session makes enough calls.
    const long long wanted = std::atoll(argv[1]);
    std::mt19937 random(static_cast<uint32_t>(std::atoll(argv[2])));
    std::vector<uint8_t> input;
    for (;;) {
      for (int i = 0; i < 1024; ++i) input.push_back(static_cast<uint8_t>(random()));
      run.start(0);
      LLVMFuzzerTestOneInput(input.data(), input.size());
      if (run.call >= wanted || input.size() >= (1u << 20)) break;
    }
    runInput("session", input, totals);
  } else {
    for (int i = 1; i < argc; ++i) runInput(argv[i], fileBytes(argv[i]), totals);
  }
  std::printf("%lld inputs, %lld calls, %lld failure points, %lld calls changed the array\n",
              totals.inputs, totals.calls, totals.failurePoints, totals.broken);
  return totals.broken == 0 ? 0 : 1;
}
