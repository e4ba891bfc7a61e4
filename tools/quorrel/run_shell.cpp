// `quorrel run` and `quorrel shell`.
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iostream>
#include <optional>

#include "catalog.h"
#include "commands.h"
#include "session.h"

#ifdef QUORREL_HAVE_LIBEDIT
#include <editline/readline.h>
#include <fcntl.h>
#include <poll.h>
#include <signal.h>

#include <cerrno>
#endif

namespace quorrel::tool {
namespace {

constexpr const char* kPrompt = "quorrel> ";

constexpr const char* kShellHelp = R"(Commands, one per line:
  new [FIELD=VALUE]...   replace the instance (dims, x, y, case, wildcard,
                         autoselect, delimiter="...")
  A NAME|CODE [ARG...]   call an action, e.g. A appendString "ann"
  E NAME|CODE [ARG...]   call an expression and print its result, e.g. E size(
  show                   print the current array as inspect does
  list [actions|expressions]   every action and expression with its parameters
  help NAME|CODE         what one action or expression does (A12 or E12 for one kind)
  quit, exit             end the shell (so does Ctrl-D); Ctrl-C clears the line
Arguments are integers or quoted strings with the escapes \\ \" \n \r \t \xHH.
)";

// The shell's own words, the first word of a line.
constexpr const char* kShellWords[] = {"new", "A", "E", "show", "list", "help", "quit", "exit"};

#ifdef QUORREL_HAVE_LIBEDIT
const Module* completionModule = nullptr;
volatile sig_atomic_t interrupted = 0;
// Ctrl-C reaches the key reader through a pipe as well as the flag: a signal that
// arrives between two reads, when no read is there to interrupt, is not lost.
int interruptPipe[2] = {-1, -1};

void onInterrupt(int) {
  interrupted = 1;
  const char byte = 0;
  if (write(interruptPipe[1], &byte, 1) < 0) {
    // The pipe is full: an interrupt is already waiting.
  }
}

void drainInterrupts() {
  char drained[16];
  while (read(interruptPipe[0], drained, sizeof drained) > 0) {
  }
}

// The line editor's key reader: the next key, or Enter when Ctrl-C was pressed, which
// ends the line being typed; the shell then drops it.
int readKey(FILE*) {
  for (;;) {
    pollfd sources[2] = {{STDIN_FILENO, POLLIN, 0}, {interruptPipe[0], POLLIN, 0}};
    if (poll(sources, 2, -1) < 0) {
      if (errno == EINTR) continue;
      return EOF;
    }
    if (sources[1].revents & POLLIN) {
      drainInterrupts();
      return '\r';
    }
    unsigned char key;
    const ssize_t count = read(STDIN_FILENO, &key, 1);
    if (count == 1) return key;
    if (count < 0 && errno == EINTR) continue;
    return EOF;
  }
}

// Candidates for the word being completed, by the line's first word.
std::vector<std::string> candidates(std::string_view line, size_t start) {
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
  if ((verb == "E" || verb == "help") && completionModule) {
    for (int32_t code = 0; code < abi::kExpressionCount; ++code) {
      words.push_back(completionModule->expressionString(code));
    }
  }
  if (verb == "list") words = {"actions", "expressions"};
  return words;
}

std::vector<std::string> matches;
size_t nextMatch = 0;

char* generate(const char* text, int state) {
  if (state == 0) {
    matches.clear();
    nextMatch = 0;
    const std::string prefix = text;
    const size_t start = static_cast<size_t>(rl_point) - prefix.size();
    for (auto& word : candidates(rl_line_buffer, start)) {
      if (word.compare(0, prefix.size(), prefix) == 0) matches.push_back(std::move(word));
    }
  }
  if (nextMatch >= matches.size()) return nullptr;
  return strdup(matches[nextMatch++].c_str());
}

char** complete(const char* text, int, int) {
  rl_attempted_completion_over = 1;  // no file names when no command or name fits
  return rl_completion_matches(text, generate);
}
#endif

// Reads one line of the shell: with line editing, history kept in the home folder
// and completion on a terminal; Ctrl-C there abandons the line being typed.
class LineReader {
 public:
  LineReader() : interactive_(isatty(STDIN_FILENO) != 0) {
#ifdef QUORREL_HAVE_LIBEDIT
    if (!interactive_) return;
    if (const char* home = std::getenv("HOME"); home && *home) {
      historyPath_ = std::string(home) + "/.quorrel_history";
      read_history(historyPath_.c_str());
    }
    rl_basic_word_break_characters = " \t";
    rl_attempted_completion_function = complete;
    if (pipe(interruptPipe) == 0) {
      fcntl(interruptPipe[0], F_SETFL, O_NONBLOCK);
      fcntl(interruptPipe[1], F_SETFL, O_NONBLOCK);
      rl_getc_function = readKey;
      rl_catch_signals = 0;  // the handler above sees Ctrl-C first, not the editor
    }
    struct sigaction action {};
    action.sa_handler = onInterrupt;
    sigemptyset(&action.sa_mask);
    action.sa_flags = 0;  // no SA_RESTART: the read under readline returns
    sigaction(SIGINT, &action, &previous_);
#endif
  }
  ~LineReader() {
#ifdef QUORREL_HAVE_LIBEDIT
    if (!interactive_) return;
    sigaction(SIGINT, &previous_, nullptr);
    if (!historyPath_.empty()) {
      write_history(historyPath_.c_str());
      history_truncate_file(historyPath_.c_str(), 1000);
    }
#endif
  }
  LineReader(const LineReader&) = delete;
  LineReader& operator=(const LineReader&) = delete;

  bool interactive() const {
    return interactive_;
  }

  std::optional<std::string> next() {
#ifdef QUORREL_HAVE_LIBEDIT
    while (interactive_) {
      // A Ctrl-C pressed while a command ran is not meant for the next line.
      if (interruptPipe[0] >= 0) drainInterrupts();
      interrupted = 0;
      char* raw = readline(kPrompt);
      if (interrupted) {
        std::free(raw);
        continue;
      }
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
#ifdef QUORREL_HAVE_LIBEDIT
  std::string historyPath_;
  struct sigaction previous_ {};
#endif
};

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

}  // namespace

int runCommand(const ModuleLoader& module, const std::string& path, const RunOptions& options) {
  if (path == "-") return runScript(module, std::cin, "<stdin>", std::cout, std::cerr, options);
  std::ifstream in(path, std::ios::binary);
  if (!in) throw FileError("cannot read " + path + ": " + std::strerror(errno));
  return runScript(module, in, path, std::cout, std::cerr, options);
}

int shellCommand(const ModuleLoader& module, const RunOptions& options) {
  Session session(module, options, &std::cerr);
  LineReader reader;
  if (reader.interactive()) {
#ifdef QUORREL_HAVE_LIBEDIT
    try {
      completionModule = &module.get();
    } catch (const ModuleError&) {
    }
#endif
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
        printArray(session.instance(), ViewOptions{}, std::cout);
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
  // Typed mistakes were answered on the spot; piped ones must reach the caller.
  return hadError && !reader.interactive() ? 2 : 0;
}

}  // namespace quorrel::tool
