// The host simulator: the extension module as a host sees it, a library opened by path
// (dlopen, or LoadLibrary with every entry point found by its ordinal) and reached only
// through its exported entry points; its instances, with the host services a run-time
// header offers; and its menus. The quorrel command, the host tests, the fuzzers and
// the 32-bit layout test all drive the module through it.
#pragma once

#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "hostsim/records.h"
#include "platform/library.h"

namespace quorrel::hostsim {

// The module cannot be opened or lacks an entry point the command needs.
struct ModuleError : std::runtime_error {
  using std::runtime_error::runtime_error;
};
// An expression broke a rule of the host interface, so that a real host would misread
// its parameters or its answer.
struct ContractError : ModuleError {
  using ModuleError::ModuleError;
};

// What the script needs to know of one action or expression.
struct Signature {
  int paramCount = 0;
  uint16_t paramTypes[2] = {0, 0};
};

struct ExpressionResult {
  bool isText = false;
  int32_t number = 0;
  std::string text;
};

// One item of a menu tree: a command (id not 0), a separator (id 0) or a popup.
struct MenuItem {
  std::string text;
  unsigned id = 0;
  bool popup = false;
  // What the editor would show of the item besides its text: the low byte of its
  // state (grayed 0x01, disabled 0x02, checked 0x08, popup 0x10).
  unsigned state = 0;
  std::vector<MenuItem> items;
};

// The routine tables GetRunObjectInfos announces.
struct RoutineTables {
  const abi::ActionRoutine* actions = nullptr;
  const abi::ExpressionRoutine* expressions = nullptr;
};

class Module {
 public:
  // Opens the library; throws ModuleError when it or a run-side entry point is missing.
  static std::unique_ptr<Module> open(const std::string& path);
  // The module linked into this program, whose entry points it exports (the fuzzers
  // link it in so that coverage and the sanitizers see all of it).
  static std::unique_ptr<Module> linked();
  ~Module();
  Module(const Module&) = delete;
  Module& operator=(const Module&) = delete;

  const std::string& path() const { return path_; }
  Signature actionSignature(int32_t code) const;
  Signature expressionSignature(int32_t code) const;

  // Editor side: names, display strings, titles; empty when the module has no such entry.
  std::optional<int32_t> expressionCodeOfName(std::string_view name) const;
  std::string actionString(int32_t code) const;
  std::string expressionString(int32_t code) const;
  std::string actionTitle(int32_t code, int param) const;
  std::string expressionTitle(int32_t code) const;
  // The menu tree of "actions", "expressions" or "conditions", walked with the menu
  // services and then handed back (the host owns the menus it is given).
  std::vector<MenuItem> menu(std::string_view which) const;

  // What the last file action did: the failed step (0: done) and the system's error
  // number, from the module's QuorrelFileStatus; nothing when the module has none.
  std::optional<std::pair<int32_t, int32_t>> fileStatus() const;

  // Looks up an exported symbol; null when absent.
  void* symbol(const char* name) const;
  // An entry point by name; throws ModuleError when it is not exported.
  template <typename Fn>
  Fn entry(const char* name) const {
    void* address = symbol(name);
    if (!address) throw ModuleError(path_ + " does not export " + name);
    return reinterpret_cast<Fn>(address);
  }
  // Read once; throws ModuleError when the counts are not the module's.
  const RoutineTables& routines() const;

 private:
  Module(std::string path, platform::Library library);
  std::string path_;
  platform::Library library_;
  mutable std::optional<RoutineTables> routines_;
};

// Opens the module on first use, so that a script's own mistakes are reported
// without it.
class ModuleLoader {
 public:
  explicit ModuleLoader(std::string path) : path_(std::move(path)) {}
  const Module& get() const {
    if (!module_) module_ = Module::open(path_);
    return *module_;
  }

 private:
  std::string path_;
  mutable std::unique_ptr<Module> module_;
};

// One service call an expression made through the run-time header.
struct FetchCall {
  bool first;
  int32_t typeFlag;
  abi::HostWord token;
};

// One run-time instance: a run record created from a setup record (at once, or when
// create() is called), destroyed with the object. The host services record every call.
class Instance {
 public:
  explicit Instance(const Module& module, SetupRecord setup = {}, bool createNow = true);
  ~Instance();
  Instance(const Instance&) = delete;
  Instance& operator=(const Instance&) = delete;

  void create();
  // DestroyRunObject, once; the destructor calls it when it has not been.
  void destroy();
  void* record() { return runRecord_.data(); }
  uint16_t flags() const { return abi::readField<uint16_t>(runRecord_.data(), abi::kRunHostFlags); }
  void setFlags(uint16_t value) { abi::writeField(runRecord_.data(), abi::kRunHostFlags, value); }

  int16_t callAction(int32_t code, const std::vector<Argument>& args);
  // The routine's raw answer; the host flags stay as the caller set them.
  abi::HostWord callExpressionRaw(int32_t code, std::vector<Argument> args,
                                  abi::HostWord token = 0);
  // The answer read as the host reads it: a text when the routine set the string flag.
  // Checked as checkExpression says.
  ExpressionResult callExpression(int32_t code, const std::vector<Argument>& args);
  // Throws ContractError unless the last expression kept the host's rules: it fetched
  // exactly its declared parameters, in order, of their types, with the host's token;
  // it changed no host flag but the string bit, and that only from clear to set; and a
  // text answer is the one buffer it asked for, of exactly its text's size.
  void checkExpression(int32_t code, abi::HostWord answer, uint16_t flagsBefore,
                       abi::HostWord token) const;

  // The services' calls during the last expression: fetches, and the byte count and
  // reserved word of each result buffer asked for, and the buffers handed out.
  std::vector<FetchCall> fetches;
  std::vector<std::pair<int32_t, int32_t>> allocations;
  const std::deque<std::vector<char>>& results() const { return results_; }

  // Told when a host service starts and ends, so that a test can tell the module's
  // own work (and allocations) from the host's.
  struct ServiceObserver {
    virtual ~ServiceObserver() = default;
    virtual void enterService() = 0;
    virtual void leaveService() = 0;
  };
  ServiceObserver* serviceObserver = nullptr;

 private:
  static Instance& of(void* runRecord);
  static abi::HostWord QUORREL_CALL fetchFirst(void* runRecord, int32_t typeFlag,
                                               abi::HostWord token);
  static abi::HostWord QUORREL_CALL fetchNext(void* runRecord, int32_t typeFlag,
                                              abi::HostWord token);
  static char* QUORREL_CALL allocate(void* runRecord, int32_t byteCount, int32_t reserved);
  abi::HostWord fetch(bool first, int32_t typeFlag, abi::HostWord token);
  // Throws ContractError when the module wrote past the record size it asked for.
  void checkRecordEnd() const;

  static constexpr size_t kRecordGuardBytes = 64;
  static constexpr unsigned char kRecordGuard = 0xA5;

  const Module& module_;
  SetupRecord setup_;
  bool created_ = false;
  size_t recordSize_ = 0;
  std::vector<unsigned char> runRecord_;  // the record, then guard bytes
  std::vector<unsigned char> runHeader_;
  std::vector<Argument> pending_;  // parameters of the expression being called
  size_t nextParameter_ = 0;
  std::deque<std::vector<char>> results_;  // the buffers of the last expression
};

// Where the module is looked for, in order: beside the executable, in the build tree
// and in the install layout.
std::vector<std::string> defaultModulePlaces();
// The first of those places that exists, else the first of them.
std::string defaultModulePath();

// Standard input, output and error carry bytes as they are (Windows would translate
// line ends otherwise), and output to a device that is no terminal is buffered; whether
// standard output's reader went away.
using platform::prepareStandardStreams;
using platform::standardOutputReaderGone;

}  // namespace quorrel::hostsim
