// `quorrel run` and `quorrel shell`.

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <optional>
#include <sstream>
#include <tuple>

#include "catalog.h"
#include "command_line.h"
#include "commands.h"
#include "platform/line_editor.h"
#include "session.h"

namespace quorrel::tool {
namespace {

constexpr const char* kPrompt = "quorrel> ";

// Candidates for the word being completed: the shell's words first, then what the
// line's first word takes; show takes its options anywhere.
std::vector<std::string> candidates(std::string_view line, size_t start) {
  const auto [verb, rest] = firstWord(line.substr(0, start));
  if (verb.empty()) {
    std::vector<std::string> words;
    for (const cli::ShellWord& word : cli::shellWords()) words.emplace_back(word.name);
    return words;
  }
  for (const cli::ShellWord& word : cli::shellWords()) {
    if (verb != word.name) continue;
    if (word.id == cli::ShellWordId::Show) {
      std::vector<std::string> options;
      for (const cli::Option& option : cli::options()) {
        if (option.commands & cli::sets::Show) options.emplace_back(option.longName);
      }
      return options;
    }
    if (rest.empty()) return cli::completionWords(word.completes);
  }
  return {};
}

// The shell keeps its history in the home folder.
std::string historyFile() {
  const char* home = std::getenv("HOME");
  return home && *home ? std::string(home) + "/.quorrel_history" : std::string();
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

int runLinesCommand(const ModuleLoader& module, const std::vector<std::string>& lines,
                    const RunOptions& options) {
  std::string script;
  for (const std::string& line : lines) script += line + '\n';
  std::istringstream in(script);
  return runScript(module, in, "-e", std::cout, std::cerr, options);
}

int shellCommand(const ModuleLoader& module, const RunOptions& options) {
  Session session(module, options, &std::cerr);
  LineEditor reader(kPrompt, historyFile(), candidates);
  if (reader.interactive()) {
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
        std::cout << cli::shellHelp();
      } else if (word == "help") {
        if (!printDescription(module.get(), rest, std::cout)) {
          throw ScriptError("no action or expression is called " + std::string(rest) +
                            " (list shows every name)");
        }
      } else if (word == "list") {
        printCatalog(module.get(), rest, std::cout);
      } else {
        session.run(*line, std::cout, {"<shell>", lineNumber, *line});
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
