// Element query scenarios: searches that find nothing (so they scan everything), the
// element list, and element sorts.
#include <strings.h>

#include <algorithm>
#include <cctype>
#include <numeric>
#include <string>
#include <vector>

#include "array/element_array.h"
#include "harness.h"
#include "query/compare.h"
#include "query/lists.h"
#include "query/search.h"
#include "query/sort.h"

namespace quorrel::bench {

namespace {

// Texts of the letters a to w, so that x, y and z never occur.
std::vector<std::string> textsWithoutXyz(int64_t n) {
  std::vector<std::string> texts = randomTexts(n, 8, 16);
  for (std::string& t : texts) {
    for (char& c : t) c = static_cast<char>('a' + (c - 'a') % 23);
  }
  return texts;
}

void fill(ElementArray& array, const std::vector<std::string>& texts) {
  for (const std::string& t : texts) array.appendString(t.c_str());
}

bool naiveContains(const std::string& text, const char* probe, std::size_t length) {
  for (std::size_t i = 0; i + length <= text.size(); ++i) {
    std::size_t k = 0;
    while (k < length && std::tolower(static_cast<unsigned char>(text[i + k])) ==
                             std::tolower(static_cast<unsigned char>(probe[k]))) {
      ++k;
    }
    if (k == length) return true;
  }
  return false;
}

void registerSearches(int64_t n) {
  auto texts = std::make_shared<std::vector<std::string>>(textsWithoutXyz(n));
  static const char* kMissing = "xyzzyxyzzy";
  add({"findString literal, no case, no hit", n, n, 2.0,
       [texts](benchmark::State& state) {
         ElementArray array;
         fill(array, *texts);
         for (auto _ : state) benchmark::DoNotOptimize(findString(array, kMissing));
       },
       [texts](benchmark::State& state) {
         for (auto _ : state) {
           int32_t found = -1;
           for (std::size_t i = 0; i < texts->size(); ++i) {
             if (strcasecmp((*texts)[i].c_str(), kMissing) == 0) {
               found = static_cast<int32_t>(i);
               break;
             }
           }
           benchmark::DoNotOptimize(found);
         }
       }});
  add({"findContainingString, no hit", n, n, 2.0,
       [texts](benchmark::State& state) {
         ElementArray array;
         fill(array, *texts);
         for (auto _ : state) benchmark::DoNotOptimize(findContainingString(array, "axb"));
       },
       [texts](benchmark::State& state) {
         for (auto _ : state) {
           int32_t found = -1;
           for (std::size_t i = 0; i < texts->size(); ++i) {
             if (naiveContains((*texts)[i], "axb", 3)) {
               found = static_cast<int32_t>(i);
               break;
             }
           }
           benchmark::DoNotOptimize(found);
         }
       }});
  add({"findString wildcard *x*, no hit", n, n, 2.0,
       [texts](benchmark::State& state) {
         ElementArray array;
         array.settings.searchMode = SearchWildcard;
         fill(array, *texts);
         for (auto _ : state) benchmark::DoNotOptimize(findString(array, "*x*"));
       },
       [texts](benchmark::State& state) {
         for (auto _ : state) {
           int32_t found = -1;
           for (std::size_t i = 0; i < texts->size(); ++i) {
             if (wildcardMatch("*x*", (*texts)[i].c_str(), false)) {
               found = static_cast<int32_t>(i);
               break;
             }
           }
           benchmark::DoNotOptimize(found);
         }
       }});
  add({"elementList with \",\"", n, n, 2.0,
       [texts](benchmark::State& state) {
         ElementArray array;
         fill(array, *texts);
         for (auto _ : state) benchmark::DoNotOptimize(elementList(array, ",").size());
       },
       [texts](benchmark::State& state) {
         for (auto _ : state) {
           std::size_t length = 0;
           for (const std::string& t : *texts) length += t.size() + 1;
           std::string joined;
           joined.reserve(length);
           for (std::size_t i = 0; i < texts->size(); ++i) {
             if (i > 0) joined += ',';
             joined += (*texts)[i];
           }
           benchmark::DoNotOptimize(joined.data());
         }
       }});
}

void registerSorts(int64_t n) {
  auto texts = std::make_shared<std::vector<std::string>>(randomTexts(n, 8, 16, 7));
  auto values = std::make_shared<std::vector<int32_t>>(randomValues(n, 8));
  add({"sortElements by text, no case, random", n, n, 2.0,
       [texts](benchmark::State& state) {
         for (auto _ : state) {
           state.PauseTiming();
           ElementArray array;
           fill(array, *texts);
           state.ResumeTiming();
           sortElements(array, SortByText, 0);
           state.PauseTiming();
           benchmark::DoNotOptimize(array.getString(0));
           array.clear();
           state.ResumeTiming();
         }
       },
       [texts](benchmark::State& state) {
         for (auto _ : state) {
           std::vector<int32_t> order(texts->size());
           std::iota(order.begin(), order.end(), 0);
           std::sort(order.begin(), order.end(), [&](int32_t a, int32_t b) {
             return strcasecmp((*texts)[static_cast<std::size_t>(a)].c_str(),
                               (*texts)[static_cast<std::size_t>(b)].c_str()) < 0;
           });
           benchmark::DoNotOptimize(order.data());
         }
       },
       5});
  add({"sortElements by value, random", n, n, 2.0,
       [values](benchmark::State& state) {
         for (auto _ : state) {
           state.PauseTiming();
           ElementArray array;
           for (int32_t v : *values) array.appendValue(v);
           state.ResumeTiming();
           sortElements(array, SortByValue, 0);
           state.PauseTiming();
           benchmark::DoNotOptimize(array.getValue(0));
           array.clear();
           state.ResumeTiming();
         }
       },
       [values](benchmark::State& state) {
         for (auto _ : state) {
           std::vector<std::pair<int32_t, int32_t>> keyed(values->size());
           for (std::size_t i = 0; i < values->size(); ++i) {
             keyed[i] = {(*values)[i], static_cast<int32_t>(i)};
           }
           std::sort(keyed.begin(), keyed.end());
           benchmark::DoNotOptimize(keyed.data());
         }
       },
       5});
}

}  // namespace

void registerQueryScenarios() {
  const int64_t n = scaled(1'000'000);
  registerSearches(n);
  registerSorts(n);
}

}  // namespace quorrel::bench
