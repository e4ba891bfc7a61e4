#include "session.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <tuple>

#include "command_line.h"
#include "commands.h"

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

// "; did you mean: size(, sum(" for a name that is close to real ones.
std::string suggestion(std::string_view typed) {
  const std::vector<std::string> near = nearestNames(typed);
  if (near.empty()) return "";
  std::string text = "; did you mean:";
  for (size_t i = 0; i < near.size(); ++i) text += (i == 0 ? " " : ", ") + near[i];
  return text;
}

int32_t codeOfName(bool action, const std::string& typed) {
  if (const auto code = codeOfTypedName(action, typed)) return *code;
  if (const auto other = codeOfTypedName(!action, typed)) {
    throw ScriptError(std::string(nameOf(!action, *other)) + " is " +
                      (action ? "an expression: E " : "an action: A ") +
                      std::string(nameOf(!action, *other)));
  }
  throw ScriptError((action ? "unknown action " : "unknown expression ") + quoteText(typed) +
                    suggestion(typed) + " (quorrel list " + (action ? "actions" : "expressions") +
                    " shows every name)");
}

// Parameters the routine ignores may be left out at the end; they are passed as 0.
std::vector<Argument> withUnusedFilled(bool action, int32_t code, const Signature& signature,
                                       std::vector<Argument> args, uint16_t textType) {
  for (int i = static_cast<int>(args.size()); i < signature.paramCount; ++i) {
    if (!parameterUnused(action, code, i)) break;
    Argument zero;
    zero.isText = signature.paramTypes[i] == textType;
    args.push_back(zero);
  }
  return args;
}

// Editors on Windows like to begin a UTF-8 file with a byte-order mark; it is not a
// command. A UTF-16 script cannot be read as lines of bytes at all.
void skipByteOrderMark(std::string& line, const std::string& name, std::ostream& err) {
  constexpr std::string_view kUtf8Mark = "\xEF\xBB\xBF";
  if (line.starts_with(kUtf8Mark)) {
    line.erase(0, kUtf8Mark.size());
    err << name << ": note: the script begins with a UTF-8 byte-order mark, read past\n";
  } else if (line.starts_with("\xFF\xFE") || line.starts_with("\xFE\xFF")) {
    throw ScriptError("the script is UTF-16 text; save it as UTF-8");
  }
}

// What the module makes of a setup field the setup dialog never stores; empty when
// the dialog could have stored it.
std::vector<std::string> oddSetupFields(const SetupFields& setup) {
  std::vector<std::string> odd;
  if (setup.dims < 1 || setup.dims > 3) {
    odd.push_back("dims=" + std::to_string(setup.dims) +
                  ": the setup dialog stores 1, 2 or 3; the module makes the array "
                  "one-dimensional");
  }
  for (const auto& [name, value] : {std::pair{"x", setup.x}, {"y", setup.y}}) {
    if (value < 0) {
      odd.push_back(std::string(name) + '=' + std::to_string(value) +
                    ": the setup dialog stores no boundary below 0; the module leaves it 0");
    }
  }
  for (const auto& [name, value, means] : {std::tuple{"case", setup.caseSensitive, "on"},
                                           {"wildcard", setup.wildcard, "on"},
                                           {"autoselect", setup.autoSelect, "off"}}) {
    if (value != 0 && value != 1) {
      odd.push_back(std::string(name) + '=' + std::to_string(value) +
                    ": the setup dialog stores 0 or 1; the module takes it as " + means);
    }
  }
  return odd;
}

// show takes inspect's view options and marks the selected rows.
ViewOptions showOptions(std::string_view rest) {
  std::vector<std::string> words;
  for (auto [word, more] = firstWord(rest); !word.empty(); std::tie(word, more) = firstWord(more)) {
    words.emplace_back(word);
  }
  ViewOptions view;
  view.selection = true;
  for (size_t i = 0; i < words.size(); ++i) {
    const auto next = [&]() -> std::optional<std::string> {
      if (i + 1 < words.size()) return words[++i];
      return std::nullopt;
    };
    try {
      if (!takeViewOption(words[i], next, view)) {
        throw ScriptError("show takes " + cli::synopsisOptions(cli::sets::Show) + ", not " +
                          words[i]);
      }
    } catch (const UsageError& error) {
      throw ScriptError(error.what());
    }
  }
  return view;
}

}  // namespace

std::pair<std::string_view, std::string_view> firstWord(std::string_view line) {
  const size_t start = line.find_first_not_of(" \t\r");
  if (start == std::string_view::npos) return {};
  line.remove_prefix(start);
  const size_t end = line.find_first_of(" \t\r");
  std::string_view rest = end == std::string_view::npos ? "" : line.substr(end);
  const size_t restStart = rest.find_first_not_of(" \t\r");
  rest = restStart == std::string_view::npos ? "" : rest.substr(restStart);
  rest = rest.substr(0, rest.find_last_not_of(" \t\r") + 1);
  return {line.substr(0, end), rest};
}

void Session::run(std::string_view line, std::ostream& out, const Where& where) {
  const auto [word, rest] = firstWord(line);
  if (word == "show") {
    printArray(instance(), showOptions(rest), out);
  } else {
    execute(parseLine(line), out, where);
  }
}

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

void Session::checkFileAction(int32_t code, const std::vector<Argument>& args, const Where& where) {
  const ActionEntry& entry = actionEntry(code);
  if (entry.file == FileUse::None) return;
  const auto status = module_.get().fileStatus();
  if (!status || status->first == 0) return;
  fileActionFailed_ = true;
  if (!options_.warnFiles || !warnings_) return;
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
      // A stored record may hold anything and the module absorbs it, which is worth
      // running; the setup dialog would not have written such a value.
      for (const std::string& odd : oddSetupFields(command.setup)) {
        if (warnings_)
          *warnings_ << where.file << ':' << where.line << ": warning: " << odd << '\n';
      }
      replaceInstance(command.setup);
      return;
    case CommandKind::Action: {
      const int32_t code = command.name.empty() ? command.code : codeOfName(true, command.name);
      const Signature signature = module_.get().actionSignature(code);
      const std::vector<Argument> args =
          withUnusedFilled(true, code, signature, command.args, abi::kActionParamText);
      checkArguments(signature, args, "action " + std::to_string(code), abi::kActionParamText);
      instance().callAction(code, args);
      checkFileAction(code, args, where);
      return;
    }
    case CommandKind::Expression: {
      const int32_t code = command.name.empty() ? command.code : codeOfName(false, command.name);
      const Signature signature = module_.get().expressionSignature(code);
      const std::vector<Argument> args =
          withUnusedFilled(false, code, signature, command.args, abi::kExpressionParamText);
      checkArguments(signature, args, "expression " + std::to_string(code),
                     abi::kExpressionParamText);
      const ExpressionResult result = instance().callExpression(code, args);
      if (options_.echo) {
        std::string_view text = where.text;
        text.remove_prefix(std::min(text.size(), text.find_first_not_of(" \t")));
        text = text.substr(0, text.find_last_not_of(" \t\r") + 1);
        out << where.line << ": " << text
            << (textForm() == TextForm::Utf8 ? "  \xe2\x86\x92  " : "  ->  ");
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
      if (lineNumber == 1) skipByteOrderMark(line, name, err);
      session.run(line, out, {name, lineNumber, line});
    } catch (const ScriptError& error) {
      out.flush();
      err << name << ':' << lineNumber << ": error: " << error.what() << '\n';
      return 2;
    }
    if (!out) return 1;
  }
  return options.strict && session.fileActionFailed() ? 1 : 0;
}

}  // namespace quorrel::tool
