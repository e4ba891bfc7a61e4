// The shell's line reader. On a terminal with the line-editing library: editing,
// history kept in a file, Tab completion from the caller's candidates, and Ctrl-C
// abandoning the line being typed. Otherwise lines are read plainly from standard
// input. One implementation with the library (line_editor_libedit.cpp), one without
// (line_editor_plain.cpp); the build picks the one it can.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quorrel {

class LineEditor {
 public:
  // Words that may complete the word starting at `start` of `line`.
  using Candidates = std::function<std::vector<std::string>(std::string_view line, size_t start)>;

  // `historyFile` empty keeps no history.
  LineEditor(std::string prompt, const std::string& historyFile, Candidates candidates);
  ~LineEditor();
  LineEditor(const LineEditor&) = delete;
  LineEditor& operator=(const LineEditor&) = delete;

  // Whether standard input is a terminal, where a person types.
  bool interactive() const;
  // The next line without its end, or nothing at the end of the input.
  std::optional<std::string> next();

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace quorrel
