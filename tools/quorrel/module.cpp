#include "module.h"

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

namespace quorrel::tool {
namespace {

using abi::readField;
using abi::writeField;

template <typename Fn>
Fn required(const Module& module, const char* name) {
  void* address = module.symbol(name);
  if (!address) throw ModuleError(module.path() + " does not export " + name);
  return reinterpret_cast<Fn>(address);
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

// The routine tables that GetRunObjectInfos announces, checked against the counts.
struct RoutineTables {
  const abi::ActionRoutine* actions = nullptr;
  const abi::ExpressionRoutine* expressions = nullptr;
};

RoutineTables routineTables(const Module& module) {
  alignas(8) unsigned char info[abi::kRunInfoWrittenSize + 64] = {};
  required<abi::GetRunObjectInfosFn>(module, "GetRunObjectInfos")(0, info);
  const auto actionCount = readField<uint16_t>(info, abi::kInfoActionCount);
  const auto expressionCount = readField<uint16_t>(info, abi::kInfoExpressionCount);
  if (actionCount != abi::kActionCount || expressionCount != abi::kExpressionCount) {
    throw ModuleError(module.path() + " announces " + std::to_string(actionCount) +
                      " actions and " + std::to_string(expressionCount) + " expressions");
  }
  return {readField<const abi::ActionRoutine*>(info, abi::kInfoActionRoutines),
          readField<const abi::ExpressionRoutine*>(info, abi::kInfoExpressionRoutines)};
}

std::vector<unsigned char> setupRecord(const SetupFields& fields) {
  std::vector<unsigned char> record(abi::kSetupRecordSize, 0);
  writeField(record.data(), abi::kSetupObjectWidth, abi::kDefaultObjectWidth);
  writeField(record.data(), abi::kSetupObjectHeight, abi::kDefaultObjectHeight);
  writeField(record.data(), abi::kSetupDimensionCount, fields.dims);
  writeField(record.data(), abi::kSetupXBoundary, fields.x);
  writeField(record.data(), abi::kSetupYBoundary, fields.y);
  writeField(record.data(), abi::kSetupCaseSensitive, fields.caseSensitive);
  writeField(record.data(), abi::kSetupWildcardSearch, fields.wildcard);
  writeField(record.data(), abi::kSetupAutoSelectRows, fields.autoSelect);
  const size_t length = std::min(fields.delimiter.size(), abi::kSetupListDelimiterSize - 1);
  std::memcpy(record.data() + abi::kSetupListDelimiter, fields.delimiter.data(), length);
  return record;
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

void* Module::symbol(const char* name) const {
  return dlsym(handle_, name);
}

void useBinaryStandardStreams() {}

#endif

Signature Module::actionSignature(int32_t code) const {
  return signatureOf(required<abi::GetInfoEntryFn>(*this, "GetActionInfos")(nullptr, code));
}

Signature Module::expressionSignature(int32_t code) const {
  return signatureOf(required<abi::GetInfoEntryFn>(*this, "GetExpressionInfos")(nullptr, code));
}

std::optional<int32_t> Module::expressionCodeOfName(std::string_view name) const {
  const auto get = optional<abi::GetStringFn>(*this, "GetExpressionString");
  for (int32_t code = 0; get && code < abi::kExpressionCount; ++code) {
    if (loadText(get, code) == name) return code;
  }
  return std::nullopt;
}

std::string Module::actionString(int32_t code) const {
  return loadText(required<abi::GetStringFn>(*this, "GetActionString"), code);
}

std::string Module::expressionString(int32_t code) const {
  return loadText(required<abi::GetStringFn>(*this, "GetExpressionString"), code);
}

std::string Module::actionTitle(int32_t code, int param) const {
  char buffer[1024] = {};
  required<abi::GetParamTitleFn>(*this, "GetActionTitle")(nullptr, code, param, buffer,
                                                          sizeof buffer);
  return buffer;
}

std::string Module::expressionTitle(int32_t code) const {
  char buffer[1024] = {};
  required<abi::GetExpressionTitleFn>(*this, "GetExpressionTitle")(nullptr, code, buffer,
                                                                   sizeof buffer);
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
using DestroyFn = int (*)(Menu);
constexpr unsigned kByPosition = 0x400;

struct Services {
  ItemCountFn count;
  ItemIdFn id;
  ItemTextFn text;
  SubMenuFn subMenu;
};

void walk(const Services& services, Menu menu, int depth, std::string& out) {
  const int count = services.count(menu);
  for (int position = 0; position < count; ++position) {
    out.append(2 * depth, ' ');
    char text[256] = {};
    services.text(menu, static_cast<unsigned>(position), text, sizeof text, kByPosition);
    if (Menu sub = services.subMenu(menu, position)) {
      out += quoteText(text) + '\n';
      walk(services, sub, depth + 1, out);
    } else if (const unsigned id = services.id(menu, position); id == 0) {
      out += "-\n";
    } else {
      out += std::to_string(id) + ' ' + quoteText(text) + '\n';
    }
  }
}
}  // namespace menus

void Module::printMenu(std::string_view which, std::string& out) const {
  const char* entry = which == "actions"       ? "GetActionMenu"
                      : which == "expressions" ? "GetExpressionMenu"
                                               : "GetConditionMenu";
  void* menu = required<abi::GetMenuFn>(*this, entry)(0, 0, 0);
  if (!menu) return;
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
      }};
  menus::walk(services, menu, 0, out);
  DestroyMenu(static_cast<HMENU>(menu));  // the host owns the menu it was handed
#else
  const menus::Services services{required<menus::ItemCountFn>(*this, "GetMenuItemCount"),
                                 required<menus::ItemIdFn>(*this, "GetMenuItemID"),
                                 required<menus::ItemTextFn>(*this, "GetMenuStringA"),
                                 required<menus::SubMenuFn>(*this, "GetSubMenu")};
  menus::walk(services, menu, 0, out);
  // The host owns the menu it was handed.
  if (const auto destroy = optional<menus::DestroyFn>(*this, "DestroyMenu")) destroy(menu);
#endif
}

// ---------------------------------------------------------------------------------
// The host side of one instance: its run record, the run-time header holding the
// services, and the buffer of the last text result.
struct Instance::State {
  const Module& module;
  RoutineTables tables;
  std::vector<unsigned char> runRecord;
  std::vector<unsigned char> runHeader;
  std::vector<Argument> pending;  // parameters of the expression being called
  size_t nextParameter = 0;
  std::vector<char> result;

  explicit State(const Module& m) : module(m), tables(routineTables(m)) {}

  static State& of(void* runRecord) {
    return *readField<State*>(runRecord, abi::kRunHostPartSize - sizeof(State*));
  }

  static abi::HostWord QUORREL_CALL fetch(void* runRecord, int32_t typeFlag, abi::HostWord) {
    State& state = of(runRecord);
    if (state.nextParameter >= state.pending.size()) return 0;
    const Argument& arg = state.pending[state.nextParameter++];
    if (typeFlag == abi::kFetchText) {
      return reinterpret_cast<abi::HostWord>(arg.isText ? arg.text.c_str() : "");
    }
    return arg.number;
  }
  static abi::HostWord QUORREL_CALL fetchFirst(void* runRecord, int32_t typeFlag,
                                               abi::HostWord token) {
    of(runRecord).nextParameter = 0;
    return fetch(runRecord, typeFlag, token);
  }
  static char* QUORREL_CALL allocate(void* runRecord, int32_t byteCount, int32_t) {
    State& state = of(runRecord);
    state.result.assign(static_cast<size_t>(std::max(byteCount, 1)), '\0');
    return state.result.data();
  }
};

Instance::Instance(const Module& module, const SetupFields& setup)
    : state_(std::make_unique<State>(module)) {
  State& s = *state_;
  const auto size = required<abi::GetRunObjectDataSizeFn>(module, "GetRunObjectDataSize")(0, 0);
  s.runRecord.assign(std::max<size_t>(static_cast<uint16_t>(size), abi::kRunRecordSize), 0);
  s.runHeader.assign(abi::kRunHeaderMinSize, 0);
  writeField(s.runHeader.data(), abi::kFetchFirstParameter,
             static_cast<abi::FetchParameterService>(&State::fetchFirst));
  writeField(s.runHeader.data(), abi::kFetchNextParameter,
             static_cast<abi::FetchParameterService>(&State::fetch));
  writeField(s.runHeader.data(), abi::kAllocateResultString,
             static_cast<abi::AllocateResultStringService>(&State::allocate));
  writeField(s.runRecord.data(), abi::kRunHeader, static_cast<void*>(s.runHeader.data()));
  // The host's own part of the record is the host's to use: it finds its state there.
  writeField(s.runRecord.data(), abi::kRunHostPartSize - sizeof(State*), &s);
  auto record = setupRecord(setup);
  required<abi::CreateRunObjectFn>(module, "CreateRunObject")(s.runRecord.data(), record.data(), 0);
}

Instance::~Instance() {
  const auto destroy = optional<abi::DestroyRunObjectFn>(state_->module, "DestroyRunObject");
  if (destroy) destroy(state_->runRecord.data(), 0);
}

void Instance::callAction(int32_t code, const std::vector<Argument>& args) {
  abi::HostWord params[2] = {0, 0};
  for (size_t i = 0; i < args.size() && i < 2; ++i) {
    params[i] = args[i].isText ? reinterpret_cast<abi::HostWord>(args[i].text.c_str())
                               : static_cast<abi::HostWord>(args[i].number);
  }
  state_->tables.actions[code](state_->runRecord.data(), params[0], params[1]);
}

ExpressionResult Instance::callExpression(int32_t code, const std::vector<Argument>& args) {
  State& s = *state_;
  s.pending = args;
  s.nextParameter = 0;
  s.result.clear();
  auto* record = s.runRecord.data();
  const auto flags = readField<uint16_t>(record, abi::kRunHostFlags);
  writeField<uint16_t>(record, abi::kRunHostFlags, flags & ~abi::kResultIsString);
  const abi::HostWord answer = s.tables.expressions[code](record, 0);
  ExpressionResult result;
  if (readField<uint16_t>(record, abi::kRunHostFlags) & abi::kResultIsString) {
    result.isText = true;
    const char* text = reinterpret_cast<const char*>(answer);
    if (text) result.text = text;
  } else {
    result.number = static_cast<int32_t>(answer);
  }
  return result;
}

// ---------------------------------------------------------------------------------
std::string defaultModulePath() {
  namespace fs = std::filesystem;
  std::error_code error;
#ifdef _WIN32
  char self[MAX_PATH] = {};
  const DWORD length = GetModuleFileNameA(nullptr, self, sizeof self);
  if (length == 0 || length >= sizeof self) return "quorrel.dll";
  const fs::path dir = fs::path(self).parent_path();
  for (const fs::path& candidate : {dir / "quorrel.dll", dir / "../quorrel.dll"}) {
    if (fs::exists(candidate, error)) return candidate.lexically_normal().string();
  }
  return (dir / "quorrel.dll").string();
#else
  const fs::path self = fs::read_symlink("/proc/self/exe", error);
  if (error) return "libquorrel.so";
  const fs::path dir = self.parent_path();
  for (const fs::path& candidate :
       {dir / "libquorrel.so", dir / "../src/host/libquorrel.so", dir / "../lib/libquorrel.so"}) {
    if (fs::exists(candidate, error)) return candidate.lexically_normal().string();
  }
  return (dir / "../src/host/libquorrel.so").lexically_normal().string();
#endif
}

}  // namespace quorrel::tool
