// A host for the fuzz targets that drive the module: the routine tables come from
// GetRunObjectInfos, instances from CreateRunObject, and expressions reach the three
// host services through a fake run-time header, as the real host does. The module is
// linked in statically so that the sanitizers and coverage see all of it.
//
// After every call the instance's array and the call's result are checked; any broken
// invariant is a crash. File paths handed to the module always lie inside a private
// temporary folder that is emptied before each input.
#pragma once

#include <dirent.h>
#include <unistd.h>

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
#include "host/entry_points.h"
#include "host/run_record.h"

namespace quorrel::fuzz {

namespace fs = std::filesystem;
using abi::HostWord;

// The routine tables and information entries, as the host reads them.
struct ModuleTables {
  const abi::ActionRoutine* actions = nullptr;
  const abi::ExpressionRoutine* expressions = nullptr;
  int actionCount = 0;
  int expressionCount = 0;

  static const ModuleTables& get() {
    static const ModuleTables tables = load();
    return tables;
  }

 private:
  static ModuleTables load() {
    unsigned char info[64];
    std::memset(info, 0xCC, sizeof info);
    GetRunObjectInfos(0, info);
    ModuleTables t;
    t.actions = host::readField<const abi::ActionRoutine*>(info, abi::kInfoActionRoutines);
    t.expressions =
        host::readField<const abi::ExpressionRoutine*>(info, abi::kInfoExpressionRoutines);
    t.actionCount = host::readField<uint16_t>(info, abi::kInfoActionCount);
    t.expressionCount = host::readField<uint16_t>(info, abi::kInfoExpressionCount);
    return t;
  }
};

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
  FuzzFolder() {
    std::string pattern = fuzzTempPath("session-XXXXXX");
    if (mkdtemp(pattern.data()) == nullptr) std::abort();
    path_ = pattern;
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
struct HostArg {
  bool isText = false;
  int32_t number = 0;
  std::string text;
  std::string describe() const {
    return isText ? "\"" + text.substr(0, 40) + "\"" : std::to_string(number);
  }
  HostWord word() const {
    return isText ? reinterpret_cast<HostWord>(text.c_str()) : static_cast<HostWord>(number);
  }
};

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

// One run-time instance with its record and fake run-time header.
class FuzzInstance {
 public:
  explicit FuzzInstance(const std::vector<unsigned char>& setupRecord) {
    const int16_t dataSize = GetRunObjectDataSize(0, 0);
    if (dataSize < static_cast<int16_t>(abi::kRunRecordSize)) __builtin_trap();
    record_.assign(static_cast<size_t>(dataSize), 0);
    header_.assign(abi::kRunHeaderMinSize, 0);
    host::writeField<FuzzInstance*>(record_.data(), 0, this);  // host-owned bytes
    host::writeField<void*>(record_.data(), abi::kRunHeader, header_.data());
    host::writeField<abi::FetchParameterService>(header_.data(), abi::kFetchFirstParameter,
                                                 &fetchFirst);
    host::writeField<abi::FetchParameterService>(header_.data(), abi::kFetchNextParameter,
                                                 &fetchNext);
    host::writeField<abi::AllocateResultStringService>(header_.data(), abi::kAllocateResultString,
                                                       &allocate);
    std::vector<unsigned char> setup = setupRecord;
    ObservedCall call(nullptr);
    CreateRunObject(record_.data(), setup.data(), 0);
    call.leave(array(), -1);
    check();
  }
  ~FuzzInstance() {
    ObservedCall call(array());
    DestroyRunObject(record_.data(), 0);
    call.leave(nullptr, -1);
  }
  FuzzInstance(const FuzzInstance&) = delete;
  FuzzInstance& operator=(const FuzzInstance&) = delete;

  const ElementArray* array() const { return host::elementArrayOf(record_.data()); }

  void action(int code, const HostArg& p1, const HostArg& p2) {
    if (tracing()) {
      std::fprintf(stderr, "A %d %s %s (size %d)\n", code, p1.describe().c_str(),
                   p2.describe().c_str(), array() ? array()->size() : -1);
    }
    ObservedCall call(array());
    ModuleTables::get().actions[code](record_.data(), p1.word(), p2.word());
    call.leave(array(), code);
    check();
  }

  // Calls an expression with the flags the host had before; answers the text result or
  // nothing. A text result must lie in the one buffer allocated for it.
  void expression(int code, std::vector<HostArg> params, uint16_t flagsBefore) {
    if (tracing()) std::fprintf(stderr, "E %d\n", code);
    params_ = std::move(params);
    next_ = 0;
    buffers_.clear();
    host::writeField<uint16_t>(record_.data(), abi::kRunHostFlags, flagsBefore);
    ObservedCall call(array());
    const HostWord result = ModuleTables::get().expressions[code](record_.data(), 0x5EED);
    call.leave(array(), 100 + code);
    const auto flags = host::readField<uint16_t>(record_.data(), abi::kRunHostFlags);
    // Only the string bit may change, and only from clear to set.
    if ((flags & ~abi::kResultIsString) != (flagsBefore & ~abi::kResultIsString)) {
      __builtin_trap();
    }
    if ((flagsBefore & abi::kResultIsString) && !(flags & abi::kResultIsString)) __builtin_trap();
    const bool newlyText = (flags & abi::kResultIsString) && !(flagsBefore & abi::kResultIsString);
    if (newlyText || !buffers_.empty()) checkTextResult(result);
    if (!(flags & abi::kResultIsString) && !buffers_.empty()) {
      __builtin_trap();  // a buffer was allocated for a number result
    }
    check();
  }

  void check() const {
    const ElementArray* a = array();
    if (a != nullptr) checkInvariants(*a);
  }

 private:
  void checkTextResult(HostWord result) const {
    if (buffers_.size() != 1) __builtin_trap();
    const std::vector<char>& buffer = *buffers_.back();
    if (result != reinterpret_cast<HostWord>(buffer.data())) __builtin_trap();
    if (std::memchr(buffer.data(), 0, buffer.size()) == nullptr) __builtin_trap();
  }

  static FuzzInstance* owner(void* record) { return host::readField<FuzzInstance*>(record, 0); }
  static HostWord QUORREL_CALL fetchFirst(void* record, int32_t flag, HostWord token) {
    ObservedCall host(nullptr, true);
    FuzzInstance* self = owner(record);
    self->next_ = 0;
    return self->fetch(flag, token);
  }
  static HostWord QUORREL_CALL fetchNext(void* record, int32_t flag, HostWord token) {
    ObservedCall host(nullptr, true);
    return owner(record)->fetch(flag, token);
  }
  // Exactly the requested size, so that the sanitizer sees any write past it.
  static char* QUORREL_CALL allocate(void* record, int32_t count, int32_t reserved) {
    ObservedCall host(nullptr, true);
    FuzzInstance* self = owner(record);
    if (reserved != 0 || count <= 0) __builtin_trap();
    self->buffers_.push_back(std::make_unique<std::vector<char>>(static_cast<size_t>(count), 0x7f));
    return self->buffers_.back()->data();
  }
  HostWord fetch(int32_t flag, HostWord token) {
    if (token != 0x5EED) __builtin_trap();
    if (next_ >= params_.size()) __builtin_trap();  // more fetches than declared parameters
    const HostArg& arg = params_[next_++];
    if (flag == abi::kFetchText) {
      if (!arg.isText) __builtin_trap();
      return reinterpret_cast<HostWord>(arg.text.c_str());
    }
    if (flag != abi::kFetchInteger || arg.isText) __builtin_trap();
    return static_cast<HostWord>(arg.number);
  }

  std::vector<unsigned char> record_;
  std::vector<unsigned char> header_;
  std::vector<HostArg> params_;
  size_t next_ = 0;
  std::vector<std::unique_ptr<std::vector<char>>> buffers_;
};

// The declared parameter types of a code, from the information entries.
inline const abi::InfoEntry& actionInfo(int code) {
  return *GetActionInfos(nullptr, code);
}
inline const abi::InfoEntry& expressionInfo(int code) {
  return *GetExpressionInfos(nullptr, code);
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
