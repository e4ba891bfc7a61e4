// Any bytes as a quorrel script: every line goes through the script parser, which may
// refuse it with a ScriptError but must never crash or hang. A parsed text survives
// being printed and parsed back. Lines that parse run against the module as the quorrel
// command would run them, except that file actions get paths inside the private folder.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz_host.h"
#include "script.h"

namespace {

using namespace quorrel::fuzz;
namespace tool = quorrel::tool;
namespace abi = quorrel::abi;
namespace hostsim = quorrel::hostsim;

constexpr int kMaxCalls = 200;
constexpr int32_t kMaxElements = 65536;

// A raw zero byte inside quotes is taken as it stands (the module then sees the text
// cut there), while its printed form \x00 is refused; such texts are not compared.
void checkRoundTrip(const std::string& text) {
  if (text.find('\0') != std::string::npos) return;
  if (tool::parseQuoted(tool::quoteText(text)) != text) __builtin_trap();
}

// The arguments as the host hands them over, when they fit the declared types.
bool hostArgs(const tool::Command& command, const abi::InfoEntry& info, uint16_t textType,
              int pathParameter, std::vector<HostArg>& out) {
  size_t declared = 0;
  while (declared < 2 && info.paramTypes[declared] != 0) ++declared;
  if (command.args.size() != declared) return false;
  for (size_t i = 0; i < declared; ++i) {
    const tool::Argument& arg = command.args[i];
    if (arg.isText != (info.paramTypes[i] == textType)) return false;
    HostArg host = arg;
    if (pathParameter == static_cast<int>(i) + 1) {
      host.text = FuzzFolder::get().path() + "/f" + std::to_string(arg.text.size() % 4);
    }
    out.push_back(std::move(host));
  }
  return true;
}

// Numbers under the array's cap that would make it materialise millions of elements are
// legitimate work, not faults: the run skips calls with such numbers, and stops once
// the array holds more than kMaxElements (each call can multiply the size by X). A
// boundary above 1024 is skipped whatever its size: in a table that wide, row indexes
// wrap in 32 bits and one row edit can land anywhere below the cap.
bool saneNumbers(const tool::Command& command) {
  const bool boundary =
      command.kind == tool::CommandKind::Action && (command.code == 30 || command.code == 31);
  for (const tool::Argument& arg : command.args) {
    if (!arg.isText && arg.number > 1024 &&
        (boundary || arg.number < quorrel::ElementArray::kMaxSize)) {
      return false;
    }
  }
  return true;
}

void run(const tool::Command& command, std::unique_ptr<FuzzInstance>& instance) {
  if (command.kind == tool::CommandKind::New) {
    const tool::SetupFields& s = command.setup;
    if (s.x > 1024 || s.y > 1024) return;
    instance.reset();
    instance = std::make_unique<FuzzInstance>(hostsim::SetupRecord(s));
    return;
  }
  if (command.code < 0 || !saneNumbers(command)) return;  // named expressions need the editor
  if (!instance) instance = std::make_unique<FuzzInstance>(hostsim::SetupRecord());
  std::vector<HostArg> args;
  if (command.kind == tool::CommandKind::Action) {
    if (!hostArgs(command, actionInfo(command.code), abi::kActionParamText,
                  filePathParameter(command.code), args)) {
      return;
    }
    args.resize(2);
    instance->action(command.code, args[0], args[1]);
  } else {
    if (!hostArgs(command, expressionInfo(command.code), abi::kExpressionParamText, 0, args)) {
      return;
    }
    instance->expression(command.code, std::move(args), 0);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  FuzzFolder::get().clear();
  const std::string_view script(reinterpret_cast<const char*>(data), size);
  std::unique_ptr<FuzzInstance> instance;
  int calls = 0;
  size_t start = 0;
  while (start <= script.size()) {
    size_t end = script.find('\n', start);
    if (end == std::string_view::npos) end = script.size();
    const std::string_view line = script.substr(start, end - start);
    start = end + 1;
    tool::Command command;
    try {
      command = tool::parseLine(line);
    } catch (const tool::ScriptError&) {
      continue;
    }
    for (const tool::Argument& arg : command.args) {
      if (arg.isText) checkRoundTrip(arg.text);
    }
    checkRoundTrip(command.setup.delimiter);
    if (command.kind == tool::CommandKind::Empty || calls++ >= kMaxCalls) continue;
    run(command, instance);
    if (instance && instance->array() && instance->array()->size() > kMaxElements) break;
  }
  instance.reset();
  FuzzFolder::get().checkWorkingDirectoryUnchanged();
  return 0;
}
