#include "session.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>

namespace quorrel::tool {
namespace {

std::string argumentCount(int count) {
  if (count == 0) return "no arguments";
  return std::to_string(count) + (count == 1 ? " argument" : " arguments");
}

// The arguments must match the declared parameters in number and type.
void checkArguments(const Signature& signature, const std::vector<Argument>& args,
                    const std::string& what, uint16_t textType) {
  if (static_cast<int>(args.size()) != signature.paramCount) {
    throw ScriptError(what + " takes " + argumentCount(signature.paramCount) + ", " +
                      std::to_string(args.size()) + " given");
  }
  for (size_t i = 0; i < args.size(); ++i) {
    const bool wantsText = signature.paramTypes[i] == textType;
    if (args[i].isText != wantsText) {
      throw ScriptError("argument " + std::to_string(i + 1) + " of " + what + " must be " +
                        (wantsText ? "a quoted string" : "an integer"));
    }
  }
}

}  // namespace

Instance& Session::instance() {
  if (!instance_) instance_ = std::make_unique<Instance>(module_.get(), SetupFields{});
  return *instance_;
}

void Session::replaceInstance(const SetupFields& setup) {
  instance_.reset();
  instance_ = std::make_unique<Instance>(module_.get(), setup);
}

// The steps of a file action that can fail, as the module numbers them.
constexpr const char* kFailedSteps[] = {"",
                                        "could not open it",
                                        "could not read it",
                                        "could not write it",
                                        "could not flush it to the disk",
                                        "could not put the new file in place",
                                        "ran out of memory",
                                        "wrote nothing (no such element, or more cells "
                                        "than the format holds)"};

const char* failedFileStep(int32_t step) {
  const auto index = static_cast<size_t>(step);
  return step > 0 && index < std::size(kFailedSteps) ? kFailedSteps[index] : "failed";
}

void Session::warnAboutFile(int32_t code, const std::vector<Argument>& args, const Where& where) {
  const ActionEntry& entry = actionEntry(code);
  if (entry.file == FileUse::None || !warnings_) return;
  const auto status = module_.get().fileStatus();
  if (!status || status->first == 0) return;
  *warnings_ << where.file << ':' << where.line << ": warning: " << entry.name << ' '
             << quoteText(args[entry.pathParam].text) << ": " << failedFileStep(status->first);
  if (status->second != 0) *warnings_ << " (" << std::strerror(status->second) << ')';
  *warnings_ << '\n';
}

void Session::execute(const Command& command, std::ostream& out, const Where& where) {
  switch (command.kind) {
    case CommandKind::Empty:
      return;
    case CommandKind::New:
      replaceInstance(command.setup);
      return;
    case CommandKind::Action: {
      int32_t code = command.code;
      if (!command.name.empty()) {
        const auto named = actionCodeOfName(command.name);
        if (!named) {
          throw ScriptError("unknown action " + quoteText(command.name) +
                            " (quorrel list actions shows every name)");
        }
        code = *named;
      }
      const std::string what = "action " + std::to_string(code);
      checkArguments(module_.get().actionSignature(code), command.args, what,
                     abi::kActionParamText);
      instance().callAction(code, command.args);
      if (options_.warnFiles) warnAboutFile(code, command.args, where);
      return;
    }
    case CommandKind::Expression: {
      int32_t code = command.code;
      if (!command.name.empty()) {
        const auto named = module_.get().expressionCodeOfName(command.name);
        if (!named) throw ScriptError("unknown expression " + quoteText(command.name));
        code = *named;
      }
      const std::string what = "expression " + std::to_string(code);
      checkArguments(module_.get().expressionSignature(code), command.args, what,
                     abi::kExpressionParamText);
      const ExpressionResult result = instance().callExpression(code, command.args);
      if (options_.echo) {
        std::string_view text = where.text;
        text.remove_prefix(std::min(text.size(), text.find_first_not_of(" \t")));
        text = text.substr(0, text.find_last_not_of(" \t\r") + 1);
        out << where.line << ": " << text << "  \xe2\x86\x92  ";
      }
      out << (result.isText ? quoteText(result.text) : std::to_string(result.number)) << '\n';
      return;
    }
  }
}

int runScript(const ModuleLoader& module, std::istream& in, const std::string& name,
              std::ostream& out, std::ostream& err, const RunOptions& options) {
  Session session(module, options, &err);
  std::string line;
  for (int lineNumber = 1; std::getline(in, line); ++lineNumber) {
    try {
      session.execute(parseLine(line), out, {name, lineNumber, line});
    } catch (const ScriptError& error) {
      out.flush();
      err << name << ':' << lineNumber << ": error: " << error.what() << '\n';
      return 2;
    }
  }
  return 0;
}

}  // namespace quorrel::tool
