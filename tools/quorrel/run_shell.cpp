// `quorrel run` and `quorrel shell`.
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iostream>
#include <optional>

#include "commands.h"
#include "session.h"

#ifdef QUORREL_HAVE_LIBEDIT
#include <editline/readline.h>
#endif

namespace quorrel::tool {
namespace {

constexpr const char* kPrompt = "quorrel> ";

// Reads one line of the shell: with line editing and history on a terminal.
class LineReader {
 public:
  LineReader() : interactive_(isatty(STDIN_FILENO) != 0) {}

  bool interactive() const { return interactive_; }

  std::optional<std::string> next() {
#ifdef QUORREL_HAVE_LIBEDIT
    if (interactive_) {
      char* raw = readline(kPrompt);
      if (!raw) return std::nullopt;
      std::string line = raw;
      std::free(raw);
      if (line.find_first_not_of(" \t") != std::string::npos) add_history(line.c_str());
      return line;
    }
#endif
    if (interactive_) std::cout << kPrompt << std::flush;
    std::string line;
    if (!std::getline(std::cin, line)) return std::nullopt;
    return line;
  }

 private:
  bool interactive_;
};

}  // namespace

int runCommand(const ModuleLoader& module, const std::string& path) {
  if (path == "-") return runScript(module, std::cin, "<stdin>", std::cout, std::cerr);
  std::ifstream in(path, std::ios::binary);
  if (!in) throw FileError("cannot read " + path + ": " + std::strerror(errno));
  return runScript(module, in, path, std::cout, std::cerr);
}

int shellCommand(const ModuleLoader& module) {
  Session session(module);
  LineReader reader;
  if (reader.interactive()) {
    std::cout << "Quorrel shell. Commands: new, A CODE ..., E CODE ...; Ctrl-D ends.\n";
  }
  for (int lineNumber = 1;; ++lineNumber) {
    const auto line = reader.next();
    if (!line) break;
    try {
      session.execute(parseLine(*line), std::cout);
    } catch (const ScriptError& error) {
      std::cout.flush();
      std::cerr << "<shell>:" << lineNumber << ": error: " << error.what() << '\n';
    }
    std::cout.flush();
  }
  if (reader.interactive()) std::cout << '\n';
  return 0;
}

}  // namespace quorrel::tool
