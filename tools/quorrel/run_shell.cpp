// `quorrel run` and `quorrel shell`.

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <optional>
#include <tuple>

#include "catalog.h"
#include "commands.h"
#include "platform/line_editor.h"
#include "session.h"

namespace quorrel::tool {
namespace {

constexpr const char* kPrompt = "quorrel> ";

constexpr const char* kShellHelp = R"(Commands, one per line:
  new [FIELD=VALUE]...   replace the instance (dims, x, y, case, wildcard,
                         autoselect, delimiter="...")
  A NAME|CODE [ARG...]   call an action, e.g. A appendString "ann"
  E NAME|CODE [ARG...]   call an expression and print its result, e.g. E size(
  show [--rows N | --all] [--width N] [--keys]
                         print the current array as inspect does, the selected
                         rows marked *
  list [actions|expressions]   every action and expression with its parameters
  help NAME|CODE         what one action or expression does (A12 or E12 for one kind)
  quit, exit             end the shell (so does Ctrl-D); Ctrl-C clears the line
Arguments are integers or quoted strings with the escapes \\ \" \n \r \t \xHH.
)";

// The shell's own words, the first word of a line.
constexpr const char* kShellWords[] = {"new", "A", "E", "show", "list", "help", "quit", "exit"};

// Candidates for the word being completed, by the line's first word; expression names
// come from the module when it could be loaded.
std::vector<std::string> candidates(const Module* module, std::string_view line, size_t start) {
  std::vector<std::string> words;
  const std::string_view before = line.substr(0, start);
  const size_t first = before.find_first_not_of(" \t");
  if (first == std::string_view::npos) {
    for (const char* word : kShellWords) words.emplace_back(word);
    return words;
  }
  const std::string_view verb = before.substr(first, before.find_first_of(" \t", first) - first);
  if (before.find_first_not_of(" \t", first + verb.size()) != std::string_view::npos) return words;
  if (verb == "A" || verb == "help") {
    for (int32_t code = 0; code < abi::kActionCount; ++code)
      words.emplace_back(actionEntry(code).name);
  }
  if ((verb == "E" || verb == "help") && module) {
    for (int32_t code = 0; code < abi::kExpressionCount; ++code) {
      words.push_back(module->expressionString(code));
    }
  }
  if (verb == "list") words = {"actions", "expressions"};
  return words;
}

// The shell keeps its history in the home folder.
std::string historyFile() {
  const char* home = std::getenv("HOME");
  return home && *home ? std::string(home) + "/.quorrel_history" : std::string();
}

// The first word and the rest of a shell line.
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
        throw ScriptError("show takes --rows N, --width N, --all and --keys, not " + words[i]);
      }
    } catch (const UsageError& error) {
      throw ScriptError(error.what());
    }
  }
  return view;
}

}  // namespace

int runCommand(const ModuleLoader& module, const std::string& path, const RunOptions& options) {
  if (path == "-") return runScript(module, std::cin, "<stdin>", std::cout, std::cerr, options);
  std::error_code error;
  if (std::filesystem::is_directory(path, error)) {
    throw FileError("cannot read " + path + ": it is a directory");
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) throw FileError("cannot read " + path + ": " + std::strerror(errno));
  return runScript(module, in, path, std::cout, std::cerr, options);
}

int shellCommand(const ModuleLoader& module, const RunOptions& options) {
  Session session(module, options, &std::cerr);
  const Module* completion = nullptr;
  LineEditor reader(kPrompt, historyFile(), [&completion](std::string_view line, size_t start) {
    return candidates(completion, line, start);
  });
  if (reader.interactive()) {
    try {
      completion = &module.get();
    } catch (const ModuleError&) {
    }
    std::cout << "Quorrel shell. Type help for the commands; quit or Ctrl-D ends.\n";
  }
  bool hadError = false;
  for (int lineNumber = 1;; ++lineNumber) {
    const auto line = reader.next();
    if (!line) break;
    const auto [word, rest] = firstWord(*line);
    try {
      if (word == "quit" || word == "exit") break;
      if (word == "help" && rest.empty()) {
        std::cout << kShellHelp;
      } else if (word == "help") {
        if (!printDescription(module.get(), rest, std::cout)) {
          throw ScriptError("no action or expression is called " + std::string(rest) +
                            " (list shows every name)");
        }
      } else if (word == "list") {
        printCatalog(module.get(), rest, std::cout);
      } else if (word == "show") {
        printArray(session.instance(), showOptions(rest), std::cout);
      } else {
        session.execute(parseLine(*line), std::cout, {"<shell>", lineNumber, *line});
      }
    } catch (const ScriptError& error) {
      std::cout.flush();
      std::cerr << "<shell>:" << lineNumber << ": error: " << error.what() << '\n';
      hadError = true;
    }
    std::cout.flush();
  }
  if (reader.interactive()) std::cout << '\n';
  session.printRepeatedNotes();
  // Typed mistakes were answered on the spot; piped ones must reach the caller.
  if (reader.interactive()) return 0;
  return hadError ? 2 : session.status();
}

}  // namespace quorrel::tool
