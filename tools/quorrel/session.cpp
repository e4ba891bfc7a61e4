#include "session.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <tuple>

#include "command_line.h"
#include "commands.h"
#include "platform/files.h"

namespace quorrel::tool {
namespace {

std::string argumentCount(int count) {
  if (count == 0) return "no arguments";
  return std::to_string(count) + (count == 1 ? " argument" : " arguments");
}

// How a call is written in a script: setLabel "TEXT" NUMBER, labSum( "TEXT".
std::string scriptForm(bool action, int32_t code, const Signature& signature, uint16_t textType) {
  std::string form(nameOf(action, code));
  for (int i = 0; i < signature.paramCount; ++i) {
    form += signature.paramTypes[i] == textType ? " \"TEXT\"" : " NUMBER";
  }
  return form;
}

// What was wrong with one argument for a parameter of the other kind, or that was
// not read at all.
std::string argumentProblem(const Argument& arg, const std::string& unread, bool wantsText) {
  const std::string got = !unread.empty() ? unread
                          : arg.isText    ? quoteText(arg.text)
                                          : std::to_string(arg.number);
  if (!wantsText) return "must be an integer; got " + got;
  const std::string_view hint = unread.empty()           ? ""
                                : unread.front() == '\'' ? " (quote texts with double quotes)"
                                                         : " (add quotes)";
  return "must be a quoted text; got " + got + std::string(hint);
}

// The arguments must match the declared parameters in number and type. Runs before
// every call, so it builds nothing unless it has a mistake to name.
void checkArguments(bool action, int32_t code, const Signature& signature,
                    const std::vector<Argument>& args, const std::vector<std::string>& unread,
                    uint16_t textType) {
  if (static_cast<int>(args.size()) != signature.paramCount) {
    throw ScriptError(scriptForm(action, code, signature, textType) + ": takes " +
                      argumentCount(signature.paramCount) + ", " + std::to_string(args.size()) +
                      " given");
  }
  static const std::string kRead;
  for (size_t i = 0; i < args.size(); ++i) {
    const bool wantsText = signature.paramTypes[i] == textType;
    const std::string& unreadText = i < unread.size() ? unread[i] : kRead;
    if (!unreadText.empty() || args[i].isText != wantsText) {
      throw ScriptError(scriptForm(action, code, signature, textType) + ": argument " +
                        std::to_string(i + 1) + ' ' +
                        argumentProblem(args[i], unreadText, wantsText));
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

Session::~Session() {
  if (listening_) module_.get().entry<abi::ListenNotesFn>("QuorrelListenNotes")(nullptr, nullptr);
}

Instance& Session::instance() {
  if (!instance_) {
    listenToNotes();
    instance_ = std::make_unique<Instance>(module_.get(), SetupFields{});
  }
  return *instance_;
}

void Session::replaceInstance(const SetupFields& setup) {
  listenToNotes();
  instance_.reset();
  instance_ = std::make_unique<Instance>(module_.get(), setup);
}

// A module built without notes does not export the listener; it then says nothing.
void Session::listenToNotes() {
  if (listening_ || !options_.notes) return;
  void* listen = module_.get().symbol("QuorrelListenNotes");
  if (listen == nullptr) return;
  reinterpret_cast<abi::ListenNotesFn>(listen)(&Session::onNote, this);
  listening_ = true;
}

void QUORREL_CALL Session::onNote(void* context, const char* id, const char* call,
                                  const char* message) {
  auto& session = *static_cast<Session*>(context);
  session.pending_.emplace_back(id, std::string(call) + ": " + message);
}

// A note is printed the first time; the same note again (a loop, a repeated line) is
// only counted, and printRepeatedNotes gives the count at the end.
void Session::printNotes(const Where& where) {
  for (auto& [id, text] : pending_) {
    const std::string full = text + " [" + id + ']';
    const auto [seen, first] = noteIndex_.try_emplace(full, notes_.size());
    if (!first) {
      ++notes_[seen->second].count;
      continue;
    }
    const std::string place = std::string(where.file) + ':' + std::to_string(where.line);
    notes_.push_back({place, full, 1});
    // A failed file action is already named in a warning, with the same words.
    if (id == "file-failed" && options_.warnFiles) continue;
    if (warnings_) *warnings_ << place << ": note: " << full << '\n';
  }
  pending_.clear();
}

void Session::printRepeatedNotes() {
  for (const Note& n : notes_) {
    if (n.count > 1 && warnings_) {
      *warnings_ << n.where << ": note: " << n.text << " (" << n.count << " times in all)\n";
    }
  }
}

int Session::status() const {
  if (options_.strict && fileActionFailed_) return 1;
  return options_.notesFail && notesGiven() ? kNotesGiven : 0;
}

void Session::checkFileAction(int32_t code, const std::vector<Argument>& args, const Where& where) {
  const ActionEntry& entry = actionEntry(code);
  if (entry.file == FileUse::None) return;
  const auto status = module_.get().fileStatus();
  if (!status || status->first == 0) return;
  fileActionFailed_ = true;
  if (!options_.warnFiles || !warnings_) return;
  *warnings_ << where.file << ':' << where.line << ": warning: " << entry.name << ' '
             << quoteText(args[entry.pathParam].text) << ": " << failedStepWords(status->first);
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
      checkArguments(true, code, signature, args, command.unread, abi::kActionParamText);
      instance().callAction(code, args);
      checkFileAction(code, args, where);
      printNotes(where);
      return;
    }
    case CommandKind::Expression: {
      const int32_t code = command.name.empty() ? command.code : codeOfName(false, command.name);
      const Signature signature = module_.get().expressionSignature(code);
      const std::vector<Argument> args =
          withUnusedFilled(false, code, signature, command.args, abi::kExpressionParamText);
      checkArguments(false, code, signature, args, command.unread, abi::kExpressionParamText);
      const ExpressionResult result = instance().callExpression(code, args);
      if (options_.echo) {
        std::string_view text = where.text;
        text.remove_prefix(std::min(text.size(), text.find_first_not_of(" \t")));
        text = text.substr(0, text.find_last_not_of(" \t\r") + 1);
        out << where.line << ": " << text
            << (textForm() == TextForm::Utf8 ? "  \xe2\x86\x92  " : "  ->  ");
      }
      // A text expression that has no text answers the number 0; shown as that, it
      // would pass for the number or the text "0".
      const bool noText = !result.isText && answersText(code);
      out << (noText          ? std::string(kNoText)
              : result.isText ? quoteText(result.text)
                              : std::to_string(result.number))
          << '\n';
      printNotes(where);
      return;
    }
  }
}

int runScript(const ModuleLoader& module, std::istream& in, const std::string& name,
              std::ostream& out, std::ostream& err, const RunOptions& options) {
  Session session(module, options, &err);
  // A note, warning or error follows the answers of the lines before it when both streams
  // go to one place, without a flush (a system call) after every line.
  struct Tie {
    std::ostream& err;
    std::ostream* const before;
    ~Tie() { err.tie(before); }
  } tie{err, err.tie(&out)};
  std::string line;
  for (int lineNumber = 1; std::getline(in, line); ++lineNumber) {
    try {
      if (lineNumber == 1) skipByteOrderMark(line, name, err);
      session.run(line, out, {name, lineNumber, line});
    } catch (const ScriptError& error) {
      err << name << ':' << lineNumber << ": error: " << error.what() << '\n';
      return 2;
    }
    if (!out) return 1;
  }
  session.printRepeatedNotes();
  return session.status();
}

}  // namespace quorrel::tool
