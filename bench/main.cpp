// The benchmark program. Every scenario runs its implementation and its baseline in the
// same process; the table at the end shows the median time per operation of both and
// their ratio. `--quick` shrinks every size a hundredfold and runs one short iteration
// of each, so CI can check that every scenario still works.
#include <malloc.h>

#include <cmath>
#include <cstdio>
#include <cstring>
#include <map>
#include <string>
#include <vector>

#include "harness.h"

namespace quorrel::bench {

void registerArrayScenarios();
void registerQueryScenarios();
void registerRecordsetScenarios();
void registerIoScenarios();
void removeScratchFiles();

namespace {

bool quickRun = false;
std::vector<Scenario>& scenarios() {
  static std::vector<Scenario> all;
  return all;
}

struct Measured {
  double nsPerOp = NAN;
  double memory = NAN;
};

// Collects the median (or the single run) of every benchmark and prints one table.
class TableReporter : public benchmark::BenchmarkReporter {
 public:
  bool ReportContext(const Context&) override { return true; }

  void ReportRuns(const std::vector<Run>& runs) override {
    for (const Run& run : runs) {
      if (run.error_occurred) {
        std::fprintf(stderr, "%s: %s\n", run.benchmark_name().c_str(), run.error_message.c_str());
        continue;
      }
      const bool aggregate = run.run_type == Run::RT_Aggregate;
      if (aggregate && run.aggregate_name != "median") continue;
      if (!aggregate && run.repetitions > 1) continue;
      const std::string name = run.run_name.function_name;
      const auto ops = run.counters.find("ops");
      Measured m;
      const double seconds =
          run.GetAdjustedCPUTime() / benchmark::GetTimeUnitMultiplier(run.time_unit);
      m.nsPerOp = seconds * 1e9 / (ops == run.counters.end() ? 1.0 : ops->second.value);
      const auto memory = run.counters.find("bytes_per_element");
      if (memory != run.counters.end()) m.memory = memory->second.value;
      results_[name] = m;
      std::fprintf(stderr, ".");
    }
  }

  void Finalize() override { std::fprintf(stderr, "\n"); }

  void printTable() const {
    std::printf("%-44s %10s %12s %12s %7s %7s %10s %10s\n", "scenario", "N", "time/op", "baseline",
                "ratio", "target", "B/elem", "base B/el");
    for (const Scenario& s : scenarios()) {
      const Measured impl = find(s.name + "|impl");
      const Measured base = find(s.name + "|base");
      if (std::isnan(impl.nsPerOp) && std::isnan(base.nsPerOp)) continue;  // filtered out
      const double ratio = impl.nsPerOp / base.nsPerOp;
      // A scenario without a target (0) only sets two costs side by side.
      const std::string target = s.target > 0 ? number(s.target) : "-";
      std::printf("%-44s %10lld %12s %12s %7.2f %7s %10s %10s%s\n", s.name.c_str(),
                  static_cast<long long>(s.n), time(impl.nsPerOp).c_str(),
                  time(base.nsPerOp).c_str(), ratio, target.c_str(), number(impl.memory).c_str(),
                  number(base.memory).c_str(), s.target <= 0 || ratio <= s.target ? "" : "  MISS");
    }
  }

 private:
  Measured find(const std::string& name) const {
    const auto it = results_.find(name);
    return it == results_.end() ? Measured{} : it->second;
  }
  static std::string time(double ns) {
    char text[32];
    if (std::isnan(ns)) return "-";
    if (ns < 1e3) {
      std::snprintf(text, sizeof text, "%.2f ns", ns);
    } else if (ns < 1e6) {
      std::snprintf(text, sizeof text, "%.2f us", ns / 1e3);
    } else {
      std::snprintf(text, sizeof text, "%.2f ms", ns / 1e6);
    }
    return text;
  }
  static std::string number(double v) {
    if (std::isnan(v)) return "-";
    char text[32];
    std::snprintf(text, sizeof text, "%.1f", v);
    return text;
  }

  std::map<std::string, Measured> results_;
};

}  // namespace

int64_t scaled(int64_t n) {
  return quickRun ? std::max<int64_t>(n / 100, 10) : n;
}

int64_t heapInUse() {
  const struct mallinfo2 info = mallinfo2();
  return static_cast<int64_t>(info.uordblks + info.hblkhd);
}

void add(Scenario scenario) {
  for (const char* side : {"|impl", "|base"}) {
    const bool impl = side[1] == 'i';
    auto body = impl ? scenario.impl : scenario.base;
    const int64_t ops = scenario.ops;
    auto* b = benchmark::RegisterBenchmark((scenario.name + side).c_str(),
                                           [body, ops](benchmark::State& state) {
                                             body(state);
                                             state.counters["ops"] = static_cast<double>(ops);
                                           });
    b->Unit(benchmark::kMillisecond);
    if (quickRun) {
      b->Iterations(1);
    } else if (scenario.iterations > 0) {
      b->Iterations(scenario.iterations);
    }
  }
  scenarios().push_back(std::move(scenario));
}

void reportMemory(benchmark::State& state, double bytesPerElement) {
  state.counters["bytes_per_element"] = bytesPerElement;
}

std::vector<std::string> randomTexts(int64_t count, int minLength, int maxLength, uint32_t seed) {
  std::mt19937 random(seed);
  std::uniform_int_distribution<int> length(minLength, maxLength);
  std::uniform_int_distribution<int> letter('a', 'z');
  std::vector<std::string> texts(static_cast<std::size_t>(count));
  for (std::string& t : texts) {
    t.resize(static_cast<std::size_t>(length(random)));
    for (char& c : t) c = static_cast<char>(letter(random));
  }
  return texts;
}

std::vector<int32_t> randomValues(int64_t count, uint32_t seed) {
  std::mt19937 random(seed);
  std::vector<int32_t> values(static_cast<std::size_t>(count));
  for (int32_t& v : values) v = static_cast<int32_t>(random());
  return values;
}

std::vector<int32_t> randomIndexes(int64_t count, int64_t below, uint32_t seed) {
  std::mt19937 random(seed);
  std::uniform_int_distribution<int64_t> pick(0, below - 1);
  std::vector<int32_t> indexes(static_cast<std::size_t>(count));
  for (int32_t& i : indexes) i = static_cast<int32_t>(pick(random));
  return indexes;
}

}  // namespace quorrel::bench

int main(int argc, char** argv) {
  using namespace quorrel::bench;
  std::vector<char*> args;
  for (int i = 0; i < argc; ++i) {
    if (std::strcmp(argv[i], "--quick") == 0) {
      quickRun = true;
    } else {
      args.push_back(argv[i]);
    }
  }
  int count = static_cast<int>(args.size());
  benchmark::Initialize(&count, args.data());
  registerArrayScenarios();
  registerQueryScenarios();
  registerRecordsetScenarios();
  registerIoScenarios();
  TableReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  reporter.printTable();
  removeScratchFiles();
  benchmark::Shutdown();
  return 0;
}
