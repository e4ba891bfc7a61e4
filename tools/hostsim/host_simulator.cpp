#include "hostsim/host_simulator.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <string>
#include <type_traits>

#include "platform/windows_services.h"

namespace quorrel::hostsim {
namespace {

using abi::readField;
using abi::writeField;

template <typename T>
uint32_t asWord(T value) {
  if constexpr (std::is_pointer_v<T>) {
    return static_cast<uint32_t>(reinterpret_cast<uintptr_t>(value));
  } else {
    return static_cast<uint32_t>(value);
  }
}

// Calls ROUTINE (KIND CODE) with ARGS as the host does. Where the host calls routines
// stdcall, the call is made by hand and a routine that does not remove exactly its own
// arguments is a breach: a game would not survive the stack pointer it leaves, while a
// plain C++ call would hide it (the caller soon restores its frame).
template <typename Routine, typename... Args>
auto callAsHost(const char* kind, int32_t code, Routine routine, Args... args) {
  using Answer = decltype(routine(args...));
  if constexpr (platform::kRoutinesAreStdcall) {
    const uint32_t words[3] = {asWord(args)...};
    const uint32_t argumentBytes = 4 * sizeof...(Args);
    uint32_t bytesLeft = 0;
    const uint32_t answer = platform::callStdcall(reinterpret_cast<const void*>(routine), words[0],
                                                  words[1], words[2], &bytesLeft);
    if (bytesLeft != 12 - argumentBytes) {
      throw ContractError(kind + (" " + std::to_string(code)) + " removed " +
                          std::to_string(12 - bytesLeft) + " of its " +
                          std::to_string(argumentBytes) +
                          " argument bytes from the stack (not stdcall)");
    }
    return static_cast<Answer>(answer);
  } else {
    (void)kind, (void)code;
    return routine(args...);
  }
}

template <typename Fn>
Fn optional(const Module& module, const char* name) {
  return reinterpret_cast<Fn>(module.symbol(name));
}

Signature signatureOf(const abi::InfoEntry* entry) {
  Signature signature;
  if (!entry) return signature;
  for (int i = 0; i < 2 && entry->paramTypes[i] != 0; ++i) {
    signature.paramTypes[i] = entry->paramTypes[i];
    signature.paramCount = i + 1;
  }
  return signature;
}

std::string loadText(abi::GetStringFn get, int32_t code) {
  if (!get) return {};
  char buffer[1024] = {};
  get(nullptr, code, buffer, sizeof buffer);
  return buffer;
}

}  // namespace

// ---------------------------------------------------------------------------------
// Loading
Module::Module(std::string path, platform::Library library)
    : path_(std::move(path)), library_(std::move(library)) {}

Module::~Module() = default;

namespace {
// Every entry point with its ordinal.
struct EntryOrdinal {
  const char* name;
  uint16_t ordinal;
};
constexpr EntryOrdinal kEntryOrdinals[] = {
#define QUORREL_ENTRY_POINT(name, ordinal, ...) {#name, ordinal},
#include "host/entry_points.inc"
#undef QUORREL_ENTRY_POINT
};
}  // namespace

std::unique_ptr<Module> Module::open(const std::string& path) {
  std::optional<platform::Library> library;
  try {
    library.emplace(platform::Library::open(path));
  } catch (const std::runtime_error& error) {
    throw ModuleError(std::string("cannot load module: ") + error.what());
  }
  for (const auto& entry : kEntryOrdinals) {
    if (library->symbol(entry.name) && !library->entryPoint(entry.name, entry.ordinal)) {
      throw ModuleError("cannot load module: " + path + ": " + entry.name +
                        " is not exported at ordinal " + std::to_string(entry.ordinal));
    }
  }
  return std::unique_ptr<Module>(new Module(path, std::move(*library)));
}

std::unique_ptr<Module> Module::linked() {
  try {
    return std::unique_ptr<Module>(new Module("(linked in)", platform::Library::self()));
  } catch (const std::runtime_error& error) {
    throw ModuleError(std::string("cannot read this program's symbols: ") + error.what());
  }
}

void* Module::symbol(const char* name) const {
  for (const auto& entry : kEntryOrdinals) {
    if (std::strcmp(entry.name, name) == 0) return library_.entryPoint(name, entry.ordinal);
  }
  return library_.symbol(name);
}

Signature Module::actionSignature(int32_t code) const {
  return signatureOf(entry<abi::GetInfoEntryFn>("GetActionInfos")(nullptr, code));
}

Signature Module::expressionSignature(int32_t code) const {
  return signatureOf(entry<abi::GetInfoEntryFn>("GetExpressionInfos")(nullptr, code));
}

std::optional<int32_t> Module::expressionCodeOfName(std::string_view name) const {
  const auto get = optional<abi::GetStringFn>(*this, "GetExpressionString");
  for (int32_t code = 0; get && code < abi::kExpressionCount; ++code) {
    if (loadText(get, code) == name) return code;
  }
  return std::nullopt;
}

std::string Module::actionString(int32_t code) const {
  return loadText(entry<abi::GetStringFn>("GetActionString"), code);
}

std::string Module::expressionString(int32_t code) const {
  return loadText(entry<abi::GetStringFn>("GetExpressionString"), code);
}

std::string Module::actionTitle(int32_t code, int param) const {
  char buffer[1024] = {};
  entry<abi::GetParamTitleFn>("GetActionTitle")(nullptr, code, param, buffer, sizeof buffer);
  return buffer;
}

std::string Module::expressionTitle(int32_t code) const {
  char buffer[1024] = {};
  entry<abi::GetExpressionTitleFn>("GetExpressionTitle")(nullptr, code, buffer, sizeof buffer);
  return buffer;
}

// The platform menu services the module exports for its hosts (on Windows these
// are the system's own).
namespace menus {
using Menu = void*;
using ItemCountFn = int(WINAPI*)(Menu);
using ItemIdFn = unsigned(WINAPI*)(Menu, int);
using ItemTextFn = int(WINAPI*)(Menu, unsigned, char*, int, unsigned);
using SubMenuFn = Menu(WINAPI*)(Menu, int);
using StateFn = unsigned(WINAPI*)(Menu, unsigned, unsigned);
using DestroyFn = int(WINAPI*)(Menu);
constexpr unsigned kByPosition = 0x400;

struct Services {
  ItemCountFn count;
  ItemIdFn id;
  ItemTextFn text;
  SubMenuFn subMenu;
  StateFn state;
};

std::vector<MenuItem> walk(const Services& services, Menu menu) {
  std::vector<MenuItem> items;
  const int count = services.count(menu);
  for (int position = 0; position < count; ++position) {
    MenuItem item;
    char text[256] = {};
    services.text(menu, static_cast<unsigned>(position), text, sizeof text, kByPosition);
    item.text = text;
    item.state = services.state(menu, static_cast<unsigned>(position), kByPosition) & 0xFF;
    if (Menu sub = services.subMenu(menu, position)) {
      item.popup = true;
      item.items = walk(services, sub);
    } else {
      item.id = services.id(menu, position);
    }
    items.push_back(std::move(item));
  }
  return items;
}
}  // namespace menus

std::vector<MenuItem> Module::menu(std::string_view which) const {
  const char* name = which == "actions"       ? "GetActionMenu"
                     : which == "expressions" ? "GetExpressionMenu"
                                              : "GetConditionMenu";
  void* menu = entry<abi::GetMenuFn>(name)(0, 0, 0);
  if (!menu) return {};
  // The system's menu services where it has them (the module built the menu with
  // them), else the ones the module exports.
  const std::optional<platform::Library> system = platform::Library::systemMenus();
  const auto service = [&](const char* serviceName) {
    void* address = system ? system->symbol(serviceName) : symbol(serviceName);
    if (!address) throw ModuleError(path_ + ": no menu service " + serviceName);
    return address;
  };
  const menus::Services services{reinterpret_cast<menus::ItemCountFn>(service("GetMenuItemCount")),
                                 reinterpret_cast<menus::ItemIdFn>(service("GetMenuItemID")),
                                 reinterpret_cast<menus::ItemTextFn>(service("GetMenuStringA")),
                                 reinterpret_cast<menus::SubMenuFn>(service("GetSubMenu")),
                                 reinterpret_cast<menus::StateFn>(service("GetMenuState"))};
  std::vector<MenuItem> items = menus::walk(services, menu);
  // The host owns the menu it was handed.
  reinterpret_cast<menus::DestroyFn>(service("DestroyMenu"))(menu);
  return items;
}

const RoutineTables& Module::routines() const {
  if (routines_) return *routines_;
  alignas(8) unsigned char info[abi::kRunInfoWrittenSize + 64] = {};
  entry<abi::GetRunObjectInfosFn>("GetRunObjectInfos")(0, info);
  const auto actionCount = readField<uint16_t>(info, abi::kInfoActionCount);
  const auto expressionCount = readField<uint16_t>(info, abi::kInfoExpressionCount);
  if (actionCount != abi::kActionCount || expressionCount != abi::kExpressionCount) {
    throw ModuleError(path_ + " announces " + std::to_string(actionCount) + " actions and " +
                      std::to_string(expressionCount) + " expressions");
  }
  routines_ =
      RoutineTables{readField<const abi::ActionRoutine*>(info, abi::kInfoActionRoutines),
                    readField<const abi::ExpressionRoutine*>(info, abi::kInfoExpressionRoutines)};
  return *routines_;
}

std::optional<std::pair<int32_t, int32_t>> Module::fileStatus() const {
  const auto status = optional<abi::FileStatusFn>(*this, "QuorrelFileStatus");
  if (!status) return std::nullopt;
  int32_t error = 0;
  const int32_t step = status(&error);
  return std::make_pair(step, error);
}

// ---------------------------------------------------------------------------------
// The host side of one instance: its run record, the run-time header holding the
// services, and the buffers of the last expression's text results.
Instance::Instance(const Module& module, SetupRecord setup, bool createNow)
    : module_(module), setup_(std::move(setup)) {
  module.routines();  // a module with the wrong tables fails before any instance exists
  const auto size = module.entry<abi::GetRunObjectDataSizeFn>("GetRunObjectDataSize")(0, 0);
  // The host allocates just the size the module asks for; the guard bytes after it show
  // a module that writes past its record (a field placed for the other pointer width).
  recordSize_ = std::max<size_t>(static_cast<uint16_t>(size), abi::kRunHostPartSize);
  runRecord_.assign(recordSize_ + kRecordGuardBytes, kRecordGuard);
  std::fill_n(runRecord_.begin(), recordSize_, 0);
  runHeader_.assign(abi::kRunHeaderMinSize, 0);
  writeField(runHeader_.data(), abi::kFetchFirstParameter,
             static_cast<abi::FetchParameterService>(&fetchFirst));
  writeField(runHeader_.data(), abi::kFetchNextParameter,
             static_cast<abi::FetchParameterService>(&fetchNext));
  writeField(runHeader_.data(), abi::kAllocateResultString,
             static_cast<abi::AllocateResultStringService>(&allocate));
  writeField(runRecord_.data(), abi::kRunHeader, static_cast<void*>(runHeader_.data()));
  // The host's own part of the record is the host's to use: it finds the instance there.
  writeField(runRecord_.data(), 0, this);
  if (createNow) create();
}

void Instance::create() {
  created_ = true;
  module_.entry<abi::CreateRunObjectFn>("CreateRunObject")(record(), setup_.data(), 0);
  checkRecordEnd();
}

void Instance::checkRecordEnd() const {
  const auto guard = runRecord_.begin() + static_cast<std::ptrdiff_t>(recordSize_);
  if (std::any_of(guard, runRecord_.end(), [](unsigned char b) { return b != kRecordGuard; })) {
    throw ContractError("the module wrote past its run record of " + std::to_string(recordSize_) +
                        " bytes");
  }
}

void Instance::destroy() {
  if (!created_) return;
  created_ = false;
  if (const auto destroyFn = optional<abi::DestroyRunObjectFn>(module_, "DestroyRunObject")) {
    destroyFn(record(), 0);
  }
}

Instance::~Instance() {
  destroy();
}

namespace {
// Brackets one host service for the instance's observer.
class ServiceCall {
 public:
  explicit ServiceCall(Instance::ServiceObserver* observer) : observer_(observer) {
    if (observer_) observer_->enterService();
  }
  ~ServiceCall() {
    if (observer_) observer_->leaveService();
  }
  ServiceCall(const ServiceCall&) = delete;
  ServiceCall& operator=(const ServiceCall&) = delete;

 private:
  Instance::ServiceObserver* observer_;
};
}  // namespace

Instance& Instance::of(void* runRecord) {
  return *readField<Instance*>(runRecord, 0);
}

abi::HostWord Instance::fetch(bool first, int32_t typeFlag, abi::HostWord token) {
  const ServiceCall service(serviceObserver);
  fetches.push_back({first, typeFlag, token});
  if (first) nextParameter_ = 0;
  if (nextParameter_ >= pending_.size()) return 0;
  const Argument& arg = pending_[nextParameter_++];
  if (typeFlag == abi::kFetchText) {
    return reinterpret_cast<abi::HostWord>(arg.isText ? arg.text.c_str() : "");
  }
  return static_cast<abi::HostWord>(arg.number);
}

abi::HostWord QUORREL_CALL Instance::fetchFirst(void* runRecord, int32_t typeFlag,
                                                abi::HostWord token) {
  return of(runRecord).fetch(true, typeFlag, token);
}

abi::HostWord QUORREL_CALL Instance::fetchNext(void* runRecord, int32_t typeFlag,
                                               abi::HostWord token) {
  return of(runRecord).fetch(false, typeFlag, token);
}

char* QUORREL_CALL Instance::allocate(void* runRecord, int32_t byteCount, int32_t reserved) {
  Instance& self = of(runRecord);
  const ServiceCall service(self.serviceObserver);
  self.allocations.emplace_back(byteCount, reserved);
  // Filled with a marker, not zeros, so that a text that is not terminated shows.
  self.results_.emplace_back(static_cast<size_t>(std::max(byteCount, 1)), '\x7f');
  return self.results_.back().data();
}

int16_t Instance::callAction(int32_t code, const std::vector<Argument>& args) {
  const Argument none;
  const Argument& first = args.size() > 0 ? args[0] : none;
  const Argument& second = args.size() > 1 ? args[1] : none;
  const abi::ActionRoutine routine = module_.routines().actions[code];
  const int16_t answer = callAsHost("action", code, routine, record(), first.word(), second.word());
  checkRecordEnd();
  return answer;
}

abi::HostWord Instance::callExpressionRaw(int32_t code, std::vector<Argument> args,
                                          abi::HostWord token) {
  pending_ = std::move(args);
  nextParameter_ = 0;
  fetches.clear();
  allocations.clear();
  results_.clear();
  const abi::ExpressionRoutine routine = module_.routines().expressions[code];
  const abi::HostWord answer = callAsHost("expression", code, routine, record(), token);
  checkRecordEnd();
  return answer;
}

ExpressionResult Instance::callExpression(int32_t code, const std::vector<Argument>& args) {
  // A token the module has no reason to invent, so that one it does not pass on shows.
  constexpr abi::HostWord kToken = 0x5EED;
  const uint16_t before = flags() & ~abi::kResultIsString;
  setFlags(before);
  const abi::HostWord answer = callExpressionRaw(code, args, kToken);
  checkExpression(code, answer, before, kToken);
  ExpressionResult result;
  if (flags() & abi::kResultIsString) {
    result.isText = true;
    if (const char* text = reinterpret_cast<const char*>(answer)) result.text = text;
  } else {
    result.number = static_cast<int32_t>(answer);
  }
  return result;
}

void Instance::checkExpression(int32_t code, abi::HostWord answer, uint16_t flagsBefore,
                               abi::HostWord token) const {
  const auto broken = [code](const std::string& what) {
    return ContractError("expression " + std::to_string(code) + " " + what);
  };
  const Signature declared = module_.expressionSignature(code);
  if (fetches.size() != static_cast<size_t>(declared.paramCount)) {
    throw broken("fetched " + std::to_string(fetches.size()) + " parameters and declares " +
                 std::to_string(declared.paramCount));
  }
  for (size_t i = 0; i < fetches.size(); ++i) {
    const bool text = declared.paramTypes[i] == abi::kExpressionParamText;
    if (fetches[i].first != (i == 0) || fetches[i].token != token ||
        fetches[i].typeFlag != (text ? abi::kFetchText : abi::kFetchInteger)) {
      throw broken("fetched parameter " + std::to_string(i + 1) +
                   " out of order, as the wrong type or without the host's token");
    }
  }
  const uint16_t after = flags();
  const bool wasText = (flagsBefore & abi::kResultIsString) != 0;
  const bool isText = (after & abi::kResultIsString) != 0;
  if ((after | abi::kResultIsString) != (flagsBefore | abi::kResultIsString) ||
      (wasText && !isText)) {
    throw broken("changed a host flag other than setting the string bit");
  }
  if (results_.empty() && (wasText || !isText)) return;  // a number
  if (!isText) throw broken("asked for a text buffer and answered a number");
  if (results_.size() != 1) {
    throw broken("answered a text with " + std::to_string(results_.size()) + " buffers");
  }
  const std::vector<char>& buffer = results_.front();
  const auto [size, reserved] = allocations.front();
  const auto length =
      static_cast<size_t>(std::find(buffer.begin(), buffer.end(), '\0') - buffer.begin());
  if (answer != reinterpret_cast<abi::HostWord>(buffer.data()) || reserved != 0 ||
      length + 1 != static_cast<size_t>(size)) {
    throw broken("did not answer its text in one buffer of the text's size (" +
                 std::to_string(size) + " bytes for " + std::to_string(length) + ")");
  }
}

// ---------------------------------------------------------------------------------
std::vector<std::string> defaultModulePlaces() {
  namespace fs = std::filesystem;
  const fs::path dir = fs::path(platform::programPath()).parent_path();
  const char* const name = platform::kModuleFileName;
  std::vector<std::string> paths;
  for (const fs::path& place :
       {dir / name, dir / ".." / name, dir / "../src/host" / name, dir / "../lib" / name}) {
    paths.push_back(place.lexically_normal().string());
  }
  return paths;
}

std::string defaultModulePath() {
  std::error_code error;
  const std::vector<std::string> places = defaultModulePlaces();
  for (const std::string& place : places) {
    if (std::filesystem::exists(place, error)) return place;
  }
  return places.front();
}

}  // namespace quorrel::hostsim
