#include "hostsim/host_simulator.h"

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>

#include "platform/windows_services.h"
#else
#include <dlfcn.h>
#endif

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <string>

namespace quorrel::hostsim {
namespace {

using abi::readField;
using abi::writeField;

#if defined(_WIN32) && defined(__i386__)
// The host calls every routine as stdcall: the routine removes its own arguments. One
// built with another convention leaves the stack pointer where the host does not expect
// it, which a game would not survive, while a call made by C++ here would hide it (the
// caller soon restores its frame). So the call is made by hand: three words pushed, the
// routine called, and the bytes it left on the stack handed back.
extern "C" uint32_t quorrelCallStdcall(const void* routine, uint32_t first, uint32_t second,
                                       uint32_t third, uint32_t* bytesLeft);
asm(R"(
  .text
  .globl _quorrelCallStdcall
_quorrelCallStdcall:
  pushl %ebp
  movl %esp, %ebp
  pushl %esi
  movl %esp, %esi
  pushl 20(%ebp)
  pushl 16(%ebp)
  pushl 12(%ebp)
  call *8(%ebp)
  movl %esi, %ecx
  subl %esp, %ecx
  movl 24(%ebp), %edx
  movl %ecx, (%edx)
  movl %esi, %esp
  popl %esi
  popl %ebp
  ret
)");

// Calls ROUTINE (KIND CODE) with its arguments, ARGUMENT_BYTES of the three words, as the
// host does.
template <typename Routine>
uint32_t callAsHost(const char* kind, int32_t code, Routine routine, uint32_t argumentBytes,
                    uint32_t first, uint32_t second, uint32_t third) {
  uint32_t bytesLeft = 0;
  const uint32_t answer =
      quorrelCallStdcall(reinterpret_cast<const void*>(routine), first, second, third, &bytesLeft);
  if (bytesLeft != 12 - argumentBytes) {
    throw ContractError(kind + (" " + std::to_string(code)) + " removed " +
                        std::to_string(12 - bytesLeft) + " of its " +
                        std::to_string(argumentBytes) +
                        " argument bytes from the stack (not stdcall)");
  }
  return answer;
}
#endif

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
// Loading: the only platform-specific part of the command.
Module::Module(std::string path, void* handle) : path_(std::move(path)), handle_(handle) {}

#ifdef _WIN32

namespace {
// Every entry point with its ordinal, from entry_points.txt (WindowsDll.cmake).
struct EntryOrdinal {
  const char* name;
  WORD ordinal;
};
constexpr EntryOrdinal kEntryOrdinals[] = {
#define QUORREL_ENTRY_POINT(name, ordinal) {#name, ordinal},
#include "entry_point_ordinals.inc"
#undef QUORREL_ENTRY_POINT
};

void* procedure(void* handle, LPCSTR name) {
  return reinterpret_cast<void*>(GetProcAddress(static_cast<HMODULE>(handle), name));
}
}  // namespace

Module::~Module() {
  FreeLibrary(static_cast<HMODULE>(handle_));
}

std::unique_ptr<Module> Module::open(const std::string& path) {
  // A bare file name would make LoadLibrary search the system folders instead.
  const std::string usable = path.find_first_of("/\\") == std::string::npos ? "./" + path : path;
  std::string native = usable;
  std::replace(native.begin(), native.end(), '/', '\\');
  HMODULE handle = LoadLibraryA(native.c_str());
  if (!handle) {
    const DWORD code = GetLastError();
    // The same words as the dynamic loader's on Linux, so that a script's output does
    // not depend on the platform.
    const std::string why =
        code == ERROR_MOD_NOT_FOUND || code == ERROR_FILE_NOT_FOUND || code == ERROR_PATH_NOT_FOUND
            ? "cannot open shared object file: No such file or directory"
            : "Windows error " + std::to_string(code);
    throw ModuleError("cannot load module: " + usable + ": " + why);
  }
  std::unique_ptr<Module> module(new Module(path, handle));
  // A host finds the entry points by ordinal; the names must lead to the same code.
  for (const auto& entry : kEntryOrdinals) {
    void* byOrdinal = procedure(handle, MAKEINTRESOURCEA(entry.ordinal));
    if (!byOrdinal || byOrdinal != procedure(handle, entry.name)) {
      throw ModuleError("cannot load module: " + usable + ": " + entry.name +
                        " is not exported at ordinal " + std::to_string(entry.ordinal));
    }
  }
  return module;
}

void* Module::symbol(const char* name) const {
  for (const auto& entry : kEntryOrdinals) {
    if (std::strcmp(entry.name, name) == 0) {
      return procedure(handle_, MAKEINTRESOURCEA(entry.ordinal));
    }
  }
  return nullptr;
}

void useBinaryStandardStreams() {
  // Output is byte for byte what the Linux build writes: no CRLF translation.
  for (FILE* stream : {stdin, stdout, stderr}) _setmode(_fileno(stream), _O_BINARY);
}

#else

Module::~Module() {
  dlclose(handle_);
}

std::unique_ptr<Module> Module::open(const std::string& path) {
  // A bare file name would make dlopen search the library path instead of using it.
  const std::string usable = path.find('/') == std::string::npos ? "./" + path : path;
  void* handle = dlopen(usable.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (!handle) throw ModuleError(std::string("cannot load module: ") + dlerror());
  return std::unique_ptr<Module>(new Module(path, handle));
}

std::unique_ptr<Module> Module::linked() {
  void* self = dlopen(nullptr, RTLD_NOW);
  if (!self) throw ModuleError(std::string("cannot read this program's symbols: ") + dlerror());
  return std::unique_ptr<Module>(new Module("(linked in)", self));
}

void* Module::symbol(const char* name) const {
  return dlsym(handle_, name);
}

void useBinaryStandardStreams() {}

#endif

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
using ItemCountFn = int (*)(Menu);
using ItemIdFn = unsigned (*)(Menu, int);
using ItemTextFn = int (*)(Menu, unsigned, char*, int, unsigned);
using SubMenuFn = Menu (*)(Menu, int);
using StateFn = unsigned (*)(Menu, unsigned, unsigned);
using DestroyFn = int (*)(Menu);
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
#ifdef _WIN32
  // The system's menu services, on the menu the module built with them.
  const menus::Services services{
      [](menus::Menu m) { return GetMenuItemCount(static_cast<HMENU>(m)); },
      [](menus::Menu m, int position) {
        return static_cast<unsigned>(GetMenuItemID(static_cast<HMENU>(m), position));
      },
      [](menus::Menu m, unsigned item, char* text, int size, unsigned flags) {
        return GetMenuStringA(static_cast<HMENU>(m), item, text, size, flags);
      },
      [](menus::Menu m, int position) -> menus::Menu {
        return GetSubMenu(static_cast<HMENU>(m), position);
      },
      [](menus::Menu m, unsigned item, unsigned flags) {
        return static_cast<unsigned>(GetMenuState(static_cast<HMENU>(m), item, flags));
      }};
  std::vector<MenuItem> items = menus::walk(services, menu);
  DestroyMenu(static_cast<HMENU>(menu));  // the host owns the menu it was handed
  return items;
#else
  const menus::Services services{
      entry<menus::ItemCountFn>("GetMenuItemCount"), entry<menus::ItemIdFn>("GetMenuItemID"),
      entry<menus::ItemTextFn>("GetMenuStringA"), entry<menus::SubMenuFn>("GetSubMenu"),
      entry<menus::StateFn>("GetMenuState")};
  std::vector<MenuItem> items = menus::walk(services, menu);
  // The host owns the menu it was handed.
  if (const auto destroy = optional<menus::DestroyFn>(*this, "DestroyMenu")) destroy(menu);
  return items;
#endif
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
#if defined(_WIN32) && defined(__i386__)
  const auto answer = static_cast<int16_t>(callAsHost("action", code, routine, 12,
                                                      reinterpret_cast<uint32_t>(record()),
                                                      first.word(), second.word()));
#else
  const int16_t answer = routine(record(), first.word(), second.word());
#endif
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
#if defined(_WIN32) && defined(__i386__)
  const abi::HostWord answer =
      callAsHost("expression", code, routine, 8, reinterpret_cast<uint32_t>(record()), token, 0);
#else
  const abi::HostWord answer = routine(record(), token);
#endif
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
  std::error_code error;
#ifdef _WIN32
  char self[MAX_PATH] = {};
  const DWORD length = GetModuleFileNameA(nullptr, self, sizeof self);
  if (length == 0 || length >= sizeof self) return {"quorrel.dll"};
  const fs::path dir = fs::path(self).parent_path();
  const fs::path places[] = {dir / "quorrel.dll", dir / "../quorrel.dll"};
#else
  const fs::path self = fs::read_symlink("/proc/self/exe", error);
  if (error) return {"libquorrel.so"};
  const fs::path dir = self.parent_path();
  const fs::path places[] = {dir / "libquorrel.so", dir / "../src/host/libquorrel.so",
                             dir / "../lib/libquorrel.so"};
#endif
  std::vector<std::string> paths;
  for (const fs::path& place : places) paths.push_back(place.lexically_normal().string());
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
