// Long random sessions through the routine tables, as game logic may drive the module:
// any action or expression, in any order, with arguments that are often extreme. Each
// input is a sequence of steps; byte 0 of a step picks what to do. The instances and
// the private folder are checked after every call (see fuzz_host.h).
//
// Bounds, so that a finding is a fault and not legitimate bulk work. Indexes wrap in 32
// bits and the array accepts anything under its cap of 67108864 elements, so an
// allowed index or boundary that is merely large (a row number times a wide X, a
// resize of many blocks) asks for gigabytes: real work, not a fault. Hence:
//  - numbers are extreme (-1, INT32_MIN, INT32_MAX, 2147483646, the cap, 1 << 30,
//    random ones at or past the cap) or small; the one "wide but allowed" boundary is
//    16, while extreme boundaries stay in.
//  - an input ends once the array holds more than kMaxElements elements, since each
//    call can multiply the size by a boundary.
//  - a save that makes the folder's files exceed kMaxFolderBytes ends the input, since
//    save-then-append-the-file doubles the data with every few input bytes.
//  - at most kMaxSteps calls per input.
#include <algorithm>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "fuzz_host.h"
#include "fuzz_input.h"

namespace {

using quorrel::ElementArray;
using quorrel::FuzzInput;
using namespace quorrel::fuzz;
namespace abi = quorrel::abi;
namespace hostsim = quorrel::hostsim;

// Allocation-failure runs build this target with a longer session.
#ifndef QUORREL_SESSION_STEPS
#define QUORREL_SESSION_STEPS 300
#endif
constexpr int kMaxSteps = QUORREL_SESSION_STEPS;
constexpr uintmax_t kMaxFolderBytes = 256 << 10;
constexpr int32_t kMaxElements = 65536;

// A random number only where the array must refuse it as an index.
int32_t refusedOrSmall(int32_t n) {
  return (n >= ElementArray::kMaxSize || n < 0) ? n : n % 64;
}

// An index for an element, row or column of an array of the given size.
int32_t fuzzIndex(FuzzInput& in, int32_t size) {
  switch (in.byte() % 12) {
    case 0:
      return -1;
    case 1:
      return size;
    case 2:
      return size - 1;
    case 3:
      return size + 1;
    case 4:
      return INT32_MAX;
    case 5:
      return INT32_MAX - 1;
    case 6:
      return INT32_MIN;
    case 7:
      return ElementArray::kMaxSize + 1;  // the cap itself is allowed as a boundary: bulk
    case 8:
      return refusedOrSmall(in.int32());
    default:
      return in.byte() % 24;
  }
}

int32_t fuzzBoundary(FuzzInput& in) {
  switch (in.byte() % 10) {
    case 0:
      return -1;
    case 1:
      return INT32_MAX;
    case 2:
      return INT32_MIN;
    case 3:
      return 16;
    case 4:
      return 1 << 30;
    default:
      return in.byte() % 6;
  }
}

// A value argument: also a dimension number (-1..12) or a plain number.
int32_t fuzzNumber(FuzzInput& in, const ElementArray* array) {
  const int32_t size = array != nullptr ? array->size() : 0;
  switch (in.byte() % 4) {
    case 0:
      return static_cast<int32_t>(in.byte() % 14) - 1;  // dimension numbers
    case 1:
      return fuzzBoundary(in);
    case 2:
      return refusedOrSmall(in.int32());
    default:
      return fuzzIndex(in, size);
  }
}

std::string fuzzText(FuzzInput& in) {
  switch (in.byte() % 12) {
    case 0:
      return "";
    case 1:
      return ",";
    case 2:
      return ";;";
    case 3:
      return "*";
    case 4:
      return "a?c*";
    case 5:
      return std::string(300, 'x');
    case 6:
      return "1,2,3";
    case 7:
      return "-2147483648";
    case 8:
      return "\"q\",\"\"";
    default:
      return in.shortText();
  }
}

std::string fuzzPath(FuzzInput& in) {
  static const char* const names[] = {"a.arr", "b.csv", "c.ini", "d.bin", "", "missing/x"};
  const std::string& folder = FuzzFolder::get().path();
  const char* name = names[in.byte() % 6];
  return *name == '\0' ? folder : folder + "/" + name;  // the folder itself as a path
}

hostsim::SetupRecord fuzzSetup(FuzzInput& in) {
  hostsim::SetupRecord setup;
  abi::writeField(setup.data(), abi::kSetupObjectWidth, static_cast<int16_t>(in.int32()));
  abi::writeField(setup.data(), abi::kSetupObjectHeight, static_cast<int16_t>(in.int32()));
  setup.set(abi::kSetupDimensionCount, static_cast<int32_t>(in.byte() % 14) - 1);
  setup.set(abi::kSetupXBoundary, fuzzBoundary(in));
  setup.set(abi::kSetupYBoundary, fuzzBoundary(in));
  setup.set(abi::kSetupCaseSensitive, in.byte() % 3);
  setup.set(abi::kSetupWildcardSearch, in.byte() % 3);
  setup.set(abi::kSetupAutoSelectRows, in.byte() % 3);
  if (in.byte() % 8 == 0) {
    // A field filled to its end without a terminator.
    std::memset(setup.data() + abi::kSetupListDelimiter, ';', abi::kSetupListDelimiterSize);
  } else {
    setup.delimiter(fuzzText(in));
  }
  return setup;
}

HostArg actionArg(FuzzInput& in, uint16_t type, bool isPath, const ElementArray* array) {
  HostArg arg;
  if (type == abi::kActionParamText) {
    arg.isText = true;
    arg.text = isPath ? fuzzPath(in) : fuzzText(in);
  } else if (type == abi::kActionParamNumber) {
    arg.number = fuzzNumber(in, array);
  }
  return arg;
}

void runAction(FuzzInstance& instance, FuzzInput& in, int code) {
  const abi::InfoEntry& info = actionInfo(code);
  const int pathParameter = filePathParameter(code);
  const HostArg p1 = actionArg(in, info.paramTypes[0], pathParameter == 1, instance.array());
  const HostArg p2 = actionArg(in, info.paramTypes[1], pathParameter == 2, instance.array());
  instance.action(code, p1, p2);
}

void runExpression(FuzzInstance& instance, FuzzInput& in) {
  const int code = in.byte() % abi::kExpressionCount;
  const abi::InfoEntry& info = expressionInfo(code);
  std::vector<HostArg> params;
  for (uint16_t type : info.paramTypes) {
    if (type == 0) break;
    HostArg arg;
    arg.isText = type == abi::kExpressionParamText;
    if (arg.isText) {
      arg.text = fuzzText(in);
    } else {
      arg.number = fuzzNumber(in, instance.array());
    }
    params.push_back(std::move(arg));
  }
  // The host clears the string bit between calls; an uncleared bit must stay set.
  const uint16_t flags = (in.byte() % 8 == 0 ? abi::kResultIsString : 0) | 0x0011;
  instance.expression(code, std::move(params), flags);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  FuzzFolder& folder = FuzzFolder::get();
  folder.clear();
  FuzzInput in(data, size);
  auto instance = std::make_unique<FuzzInstance>(fuzzSetup(in));
  for (int step = 0; step < kMaxSteps && !in.empty(); ++step) {
    const uint8_t what = in.byte();
    if (what < 8) {
      instance.reset();
      instance = std::make_unique<FuzzInstance>(fuzzSetup(in));
    } else if (what < 140) {
      const int code = in.byte() % abi::kActionCount;
      runAction(*instance, in, code);
      if (writesFile(code) && folder.totalBytes() > kMaxFolderBytes) break;
      const ElementArray* array = instance->array();
      if (array != nullptr && array->size() > kMaxElements) break;
    } else {
      runExpression(*instance, in);
    }
  }
  instance.reset();
  folder.checkWorkingDirectoryUnchanged();
  return 0;
}
