// Lines read through libedit on a terminal: editing, history, completion, and a Ctrl-C
// that ends the line being typed without ending the program.
#include <editline/readline.h>
#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <utility>

#include "platform/line_editor.h"
#include "platform/terminal.h"

namespace quorrel {
namespace {

// The editor's callbacks are plain functions; the one editor alive answers them.
const LineEditor::Candidates* activeCandidates = nullptr;
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

// The editor's key reader: the next key, or Enter when Ctrl-C was pressed, which ends
// the line being typed; next() then drops it.
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

std::vector<std::string> matches;
size_t nextMatch = 0;

char* generate(const char* text, int state) {
  if (state == 0) {
    matches.clear();
    nextMatch = 0;
    const std::string prefix = text;
    const size_t start = static_cast<size_t>(rl_point) - prefix.size();
    if (activeCandidates != nullptr) {
      for (auto& word : (*activeCandidates)(rl_line_buffer, start)) {
        if (word.compare(0, prefix.size(), prefix) == 0) matches.push_back(std::move(word));
      }
    }
  }
  if (nextMatch >= matches.size()) return nullptr;
  return strdup(matches[nextMatch++].c_str());
}

char** complete(const char* text, int, int) {
  rl_attempted_completion_over = 1;  // no file names when no candidate fits
  return rl_completion_matches(text, generate);
}

}  // namespace

struct LineEditor::State {
  std::string prompt;
  std::string historyFile;
  Candidates candidates;
  bool interactive = false;
  struct sigaction previous {};
};

LineEditor::LineEditor(std::string prompt, const std::string& historyFile, Candidates candidates)
    : state_(std::make_unique<State>()) {
  state_->prompt = std::move(prompt);
  state_->candidates = std::move(candidates);
  state_->interactive = platform::isTerminal(stdin);
  if (!state_->interactive) return;
  // Set before the first call into the library (reading the history is one), which
  // initialises it: an editor that caught signals itself would redraw the abandoned
  // line after a Ctrl-C and take the next keys into it.
  rl_catch_signals = 0;
  activeCandidates = &state_->candidates;
  rl_basic_word_break_characters = " \t";
  rl_attempted_completion_function = complete;
  if (pipe(interruptPipe) == 0) {
    fcntl(interruptPipe[0], F_SETFL, O_NONBLOCK);
    fcntl(interruptPipe[1], F_SETFL, O_NONBLOCK);
    rl_getc_function = readKey;
  }
  state_->historyFile = historyFile;
  if (!historyFile.empty()) read_history(historyFile.c_str());
  struct sigaction action {};
  action.sa_handler = onInterrupt;
  sigemptyset(&action.sa_mask);
  action.sa_flags = 0;  // no SA_RESTART: the read under readline returns
  sigaction(SIGINT, &action, &state_->previous);
}

LineEditor::~LineEditor() {
  if (!state_->interactive) return;
  activeCandidates = nullptr;
  sigaction(SIGINT, &state_->previous, nullptr);
  if (!state_->historyFile.empty()) {
    write_history(state_->historyFile.c_str());
    history_truncate_file(state_->historyFile.c_str(), 1000);
  }
}

bool LineEditor::interactive() const {
  return state_->interactive;
}

std::optional<std::string> LineEditor::next() {
  if (!state_->interactive) {
    std::string line;
    if (!std::getline(std::cin, line)) return std::nullopt;
    return line;
  }
  for (;;) {
    // A Ctrl-C pressed while a command ran is not meant for the next line.
    if (interruptPipe[0] >= 0) drainInterrupts();
    interrupted = 0;
    char* raw = readline(state_->prompt.c_str());
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
}

}  // namespace quorrel
