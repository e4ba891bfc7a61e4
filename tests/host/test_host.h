// A small host for tests: loads the module by path, reads its RunInfo, and runs
// instances with a fake run-time header whose three services record every call.
#pragma once

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <deque>
#include <string>
#include <vector>

#include "host/abi.h"

namespace testhost {

using namespace quorrel::abi;

// The module, loaded once for the whole test program, and its entry points by name.
struct Module {
  void* handle = dlopen(QUORREL_MODULE_PATH, RTLD_NOW | RTLD_LOCAL);
  std::string error = handle ? "" : dlerror();
  std::vector<unsigned char> runInfo = std::vector<unsigned char>(64, 0xCC);
  static Module& get() {
    static Module module;
    return module;
  }
};
inline void* symbol(const char* name) {
  return Module::get().handle ? dlsym(Module::get().handle, name) : nullptr;
}
template <typename Fn>
Fn entry(const char* name) {
  void* address = symbol(name);
  Fn fn = nullptr;
  std::memcpy(&fn, &address, sizeof fn);
  return fn;
}
// The routine tables, from the RunInfo the module fills in once.
inline const unsigned char* runInfo() {
  static const bool filled =
      symbol("GetRunObjectInfos") &&
      entry<GetRunObjectInfosFn>("GetRunObjectInfos")(0, Module::get().runInfo.data());
  (void)filled;
  return Module::get().runInfo.data();
}
inline const ActionRoutine* actionRoutines() {
  return readField<const ActionRoutine*>(runInfo(), kInfoActionRoutines);
}
inline const ExpressionRoutine* expressionRoutines() {
  return readField<const ExpressionRoutine*>(runInfo(), kInfoExpressionRoutines);
}

#define ASSERT_MODULE_LOADED() ASSERT_NE(Module::get().handle, nullptr) << Module::get().error

// A setup record as the host stores it, starting from the editor's defaults.
struct SetupRecord {
  std::vector<unsigned char> bytes = std::vector<unsigned char>(kSetupRecordSize, 0);
  SetupRecord() {
    writeField<int16_t>(bytes.data(), kSetupObjectWidth, 32);
    writeField<int16_t>(bytes.data(), kSetupObjectHeight, 32);
    set(kSetupDimensionCount, 2).set(kSetupXBoundary, 10).set(kSetupYBoundary, 10);
    delimiter(",");
  }
  SetupRecord& set(std::size_t offset, int32_t value) {
    writeField(bytes.data(), offset, value);
    return *this;
  }
  SetupRecord& delimiter(const char* text) {
    std::memset(bytes.data() + kSetupListDelimiter, 0, kSetupListDelimiterSize);
    std::memcpy(bytes.data() + kSetupListDelimiter, text, std::strlen(text));
    return *this;
  }
  void* data() { return bytes.data(); }
};
inline SetupRecord oneD() {
  return SetupRecord().set(kSetupDimensionCount, 1);
}

// An action or expression argument: a number or a text.
struct Arg {
  Arg() = default;
  Arg(int32_t n) : number(n) {}  // NOLINT: arguments read naturally as literals
  Arg(const char* t) : text(t), isText(true) {}
  Arg(const std::string& t) : text(t), isText(true) {}
  HostWord word() const {
    return isText ? reinterpret_cast<HostWord>(text.c_str()) : static_cast<HostWord>(number);
  }
  int32_t number = 0;
  std::string text;
  bool isText = false;
};

struct FetchCall {
  bool first;
  int32_t typeFlag;
  HostWord token;
};

inline constexpr HostWord kToken = 0x5EED;

class Instance {
 public:
  explicit Instance(SetupRecord setup = SetupRecord(), bool createNow = true)
      : setup_(std::move(setup)) {
    const auto dataSize = entry<GetRunObjectDataSizeFn>("GetRunObjectDataSize")(0, 0);
    record_.assign(static_cast<std::size_t>(dataSize), 0);
    header_.assign(kRunHeaderMinSize, 0);
    writeField<Instance*>(record_.data(), 0, this);  // host-owned bytes: find the instance back
    writeField<void*>(record_.data(), kRunHeader, header_.data());
    writeField<FetchParameterService>(header_.data(), kFetchFirstParameter, &fetchFirst);
    writeField<FetchParameterService>(header_.data(), kFetchNextParameter, &fetchNext);
    writeField<AllocateResultStringService>(header_.data(), kAllocateResultString, &allocate);
    if (createNow) create();
  }
  void create() {
    created_ = true;
    entry<CreateRunObjectFn>("CreateRunObject")(record_.data(), setup_.data(), 0);
  }
  ~Instance() {
    if (created_) entry<DestroyRunObjectFn>("DestroyRunObject")(record_.data(), 0);
  }
  Instance(const Instance&) = delete;
  Instance& operator=(const Instance&) = delete;

  void* record() { return record_.data(); }
  uint16_t flags() const { return readField<uint16_t>(record_.data(), kRunHostFlags); }
  void setFlags(uint16_t value) { writeField(record_.data(), kRunHostFlags, value); }
  void* elementArray() const { return readField<void*>(record_.data(), kRunElementArray); }
  int32_t betweenColumn() const { return readField<int32_t>(record_.data(), kRunBetweenColumn); }

  int16_t action(int code, const Arg& p1 = Arg(), const Arg& p2 = Arg()) {
    return actionRoutines()[code](record_.data(), p1.word(), p2.word());
  }
  HostWord expression(int code, std::vector<Arg> params = {}) {
    params_ = std::move(params);
    next_ = 0;
    fetches.clear();
    allocations.clear();
    return expressionRoutines()[code](record_.data(), kToken);
  }
  // A number result: the string flag must stay as it was.
  int32_t number(int code, std::vector<Arg> params = {}) {
    setFlags(0x0001);
    const HostWord result = expression(code, std::move(params));
    EXPECT_EQ(flags(), 0x0001) << "expression " << code;
    return static_cast<int32_t>(result);
  }
  // A text result: flag set, buffer of exactly the text's size.
  std::string text(int code, std::vector<Arg> params = {}) {
    setFlags(0);
    const HostWord result = expression(code, std::move(params));
    EXPECT_EQ(flags(), kResultIsString) << "expression " << code;
    if (result == 0 || allocations.size() != 1) {
      ADD_FAILURE() << "expression " << code << " gave no text";
      return "<none>";
    }
    std::string value(reinterpret_cast<const char*>(result));
    EXPECT_EQ(allocations[0], static_cast<int32_t>(value.size() + 1));
    return value;
  }
  // No text: the number 0, flag untouched, nothing allocated.
  bool noText(int code, std::vector<Arg> params = {}) {
    setFlags(0);
    const HostWord result = expression(code, std::move(params));
    return result == 0 && flags() == 0 && allocations.empty();
  }

  std::vector<FetchCall> fetches;
  std::vector<int32_t> allocations;

 private:
  static Instance* owner(void* record) { return readField<Instance*>(record, 0); }
  static HostWord QUORREL_CALL fetchFirst(void* record, int32_t flag, HostWord token) {
    owner(record)->next_ = 0;
    return owner(record)->fetch(true, flag, token);
  }
  static HostWord QUORREL_CALL fetchNext(void* record, int32_t flag, HostWord token) {
    return owner(record)->fetch(false, flag, token);
  }
  static char* QUORREL_CALL allocate(void* record, int32_t count, int32_t reserved) {
    Instance* self = owner(record);
    EXPECT_EQ(reserved, 0);
    self->allocations.push_back(count);
    self->buffers_.emplace_back(static_cast<std::size_t>(count), '\x7f');
    return self->buffers_.back().data();
  }
  HostWord fetch(bool first, int32_t flag, HostWord token) {
    fetches.push_back({first, flag, token});
    if (next_ >= params_.size()) return 0;
    const Arg& arg = params_[next_++];
    if (flag == kFetchText) return reinterpret_cast<HostWord>(arg.isText ? arg.text.c_str() : "");
    return static_cast<HostWord>(arg.number);
  }

  SetupRecord setup_;
  bool created_ = false;
  std::vector<unsigned char> record_, header_;
  std::vector<Arg> params_;
  std::size_t next_ = 0;
  std::deque<std::vector<char>> buffers_;
};

// Arguments for an expression's declared parameter types.
inline std::vector<Arg> argsFor(const char* types, int32_t number, const char* text) {
  std::vector<Arg> args;
  for (int i = 0; i < 2; ++i) {
    if (types[i] == 'I') args.emplace_back(number);
    if (types[i] == 'T') args.emplace_back(text);
  }
  return args;
}

}  // namespace testhost
