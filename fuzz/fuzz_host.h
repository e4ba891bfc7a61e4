// A host for the fuzz targets that drive the module: the routine tables come from
// GetRunObjectInfos, instances from CreateRunObject, and expressions reach the three
// host services through a fake run-time header, as the real host does. The module is
// linked in statically so that the sanitizers and coverage see all of it; in the Windows
// builds it is the quorrel.dll that ships, loaded as quorrel.exe loads it (fuzzModule).
//
// After every call the instance's array and the call's result are checked; any broken
// invariant is a crash. File paths handed to the module always lie inside a private
// temporary folder that is emptied before each input.
//
// The check reads the instance's ElementArray through the run record, which a host never
// does. With the DLL the array lives in the DLL's memory and this program reads it with
// its own copy of the core's code: the same headers and the same compiler and flags
// (one build tree) give both the same layout, and the program only reads it, never
// allocates or frees what the DLL owns.
#pragma once

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <deque>
#include <filesystem>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "array/element_array.h"
#include "fuzz_files.h"
#include "host/abi.h"
#include "host/run_record.h"
#include "hostsim/host_simulator.h"

namespace quorrel::fuzz {

namespace fs = std::filesystem;
using abi::HostWord;

// The module, reached as a host reaches it: linked into this program (so that the
// sanitizers and coverage see it), or on Windows a DLL opened with LoadLibrary and its
// entry points found by ordinal, so that the corpora replay through the DLL that ships:
// $QUORREL_FUZZ_MODULE, else the quorrel.dll beside the program (the build's own, the
// one scripts/build-dll copies to dist/). A DLL that does not load ends the run.
inline std::unique_ptr<hostsim::Module> openFuzzModule() {
#ifdef _WIN32
  const char* chosen = std::getenv("QUORREL_FUZZ_MODULE");
  const std::string path =
      chosen != nullptr && *chosen != '\0' ? chosen : hostsim::defaultModulePath();
  try {
    return hostsim::Module::open(path);
  } catch (const hostsim::ModuleError& error) {
    std::fprintf(stderr, "%s\n", error.what());
    std::exit(2);
  }
#else
  return hostsim::Module::linked();
#endif
}
inline const hostsim::Module& fuzzModule() {
  static const std::unique_ptr<hostsim::Module> module = openFuzzModule();
  return *module;
}

// The private folder every file action works in, and the working directory as it was
// when the process started: nothing may ever appear there.
class FuzzFolder {
 public:
  static FuzzFolder& get() {
    static FuzzFolder folder;
    return folder;
  }
  const std::string& path() const { return path_; }

  // Empties the folder so that every input starts from the same files.
  void clear() {
    std::error_code error;
    for (const auto& entry : fs::directory_iterator(path_, error)) fs::remove_all(entry, error);
  }
  // Total bytes of the files in the folder (one level: the module creates no folders).
  uintmax_t totalBytes() const {
    uintmax_t total = 0;
    std::error_code error;
    for (const auto& entry : fs::directory_iterator(path_, error)) {
      if (entry.is_regular_file(error)) total += entry.file_size(error);
    }
    return total;
  }
  void checkWorkingDirectoryUnchanged() const {
    if (listing(".") != workingDirectory_) __builtin_trap();
  }

 private:
  FuzzFolder() : path_(fuzzTempPath("session")) {
    std::error_code error;
    if (!fs::create_directory(path_, error)) std::abort();
    workingDirectory_ = listing(".");
  }
  ~FuzzFolder() {
    std::error_code error;
    fs::remove_all(path_, error);
  }
  static std::set<std::string> listing(const char* dir) {
    std::set<std::string> names;
    std::error_code error;
    for (const auto& entry : fs::directory_iterator(dir, error)) {
      names.insert(entry.path().filename().string());
    }
    return names;
  }
  std::string path_;
  std::set<std::string> workingDirectory_;
};

// One argument: a number or a text the host owns for the call.
using HostArg = hostsim::Argument;
inline std::string describe(const HostArg& arg) {
  return arg.isText ? "\"" + arg.text.substr(0, 40) + "\"" : std::to_string(arg.number);
}

// QUORREL_FUZZ_TRACE=1 prints every call, to see what a finding did.
inline bool tracing() {
  static const bool on = std::getenv("QUORREL_FUZZ_TRACE") != nullptr;
  return on;
}

// Told about every call into the module and every call back out of it, so that
// allocation-failure runs (alloc_faults.cpp) count only the module's allocations and
// can compare the array around the call that fails. Null in the fuzz programs.
struct CallObserver {
  virtual ~CallObserver() = default;
  virtual void enter(const ElementArray* array) = 0;
  virtual void leave(const ElementArray* array, int code) = 0;  // -1: not a routine
  virtual void enterHost() = 0;
  virtual void leaveHost() = 0;
};
inline CallObserver* callObserver = nullptr;

// Brackets one call into the module (or, with host true, one service of the host).
class ObservedCall {
 public:
  ObservedCall(const ElementArray* array, bool host = false) : host_(host) {
    if (callObserver == nullptr) return;
    if (host_) {
      callObserver->enterHost();
    } else {
      callObserver->enter(array);
    }
  }
  ~ObservedCall() {
    if (callObserver != nullptr && host_) callObserver->leaveHost();
  }
  void leave(const ElementArray* array, int code) {
    if (callObserver != nullptr && !host_) callObserver->leave(array, code);
  }
  ObservedCall(const ObservedCall&) = delete;
  ObservedCall& operator=(const ObservedCall&) = delete;

 private:
  bool host_;
};

// One run-time instance of the host simulator. Every call into the module is bracketed
// for the call observer, and after every call the array's invariants and the services'
// use are checked.
class FuzzInstance final : hostsim::Instance::ServiceObserver {
 public:
  explicit FuzzInstance(const hostsim::SetupRecord& setup) : instance_(fuzzModule(), setup, false) {
    const auto dataSize = fuzzModule().entry<abi::GetRunObjectDataSizeFn>("GetRunObjectDataSize");
    if (dataSize(0, 0) < static_cast<int16_t>(abi::kRunRecordSize)) __builtin_trap();
    instance_.serviceObserver = this;
    ObservedCall call(nullptr);
    instance_.create();
    call.leave(array(), -1);
    check();
  }
  ~FuzzInstance() override {
    ObservedCall call(array());
    instance_.destroy();
    call.leave(nullptr, -1);
  }
  FuzzInstance(const FuzzInstance&) = delete;
  FuzzInstance& operator=(const FuzzInstance&) = delete;

  const ElementArray* array() { return host::elementArrayOf(instance_.record()); }

  void action(int code, const HostArg& p1, const HostArg& p2) {
    if (tracing()) {
      std::fprintf(stderr, "A %d %s %s (size %d)\n", code, describe(p1).c_str(),
                   describe(p2).c_str(), array() ? array()->size() : -1);
    }
    const std::vector<HostArg> args{p1, p2};  // the host's allocation, before the call
    ObservedCall call(array());
    instance_.callAction(code, args);
    call.leave(array(), code);
    check();
  }

  // Calls an expression with the flags the host had before; it must keep the host's
  // rules (the simulator's check).
  void expression(int code, std::vector<HostArg> params, uint16_t flagsBefore) {
    if (tracing()) std::fprintf(stderr, "E %d\n", code);
    instance_.setFlags(flagsBefore);
    ObservedCall call(array());
    const HostWord result = instance_.callExpressionRaw(code, std::move(params), 0x5EED);
    call.leave(array(), 100 + code);
    try {
      instance_.checkExpression(code, result, flagsBefore, 0x5EED);
    } catch (const hostsim::ContractError& error) {
      std::fprintf(stderr, "%s\n", error.what());
      __builtin_trap();
    }
    check();
  }

  void check() {
    const ElementArray* a = array();
    if (a != nullptr) checkInvariants(*a);
  }

 private:
  void enterService() override { callObserver ? callObserver->enterHost() : void(); }
  void leaveService() override { callObserver ? callObserver->leaveHost() : void(); }

  hostsim::Instance instance_;
};

// The declared parameter types of a code, from the information entries.
inline const abi::InfoEntry& actionInfo(int code) {
  return *fuzzModule().entry<abi::GetInfoEntryFn>("GetActionInfos")(nullptr, code);
}
inline const abi::InfoEntry& expressionInfo(int code) {
  return *fuzzModule().entry<abi::GetInfoEntryFn>("GetExpressionInfos")(nullptr, code);
}

// Actions whose text parameter is a file path: (code, parameter number).
inline int filePathParameter(int code) {
  switch (code) {
    case 0:
    case 1:
    case 2:
    case 3:
    case 4:
    case 5:
    case 10:
    case 11:
    case 12:
    case 52:
    case 53:
    case 54:
    case 58:
    case 59:
    case 60:
      return 1;
    case 18:
    case 19:
      return 2;
    default:
      return 0;
  }
}

// Actions that can grow the files in the folder or read them into the array.
inline bool writesFile(int code) {
  return code == 0 || code == 1 || code == 2 || code == 18 || code == 19 || code == 58;
}

}  // namespace quorrel::fuzz
