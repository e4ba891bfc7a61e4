// Lines read plainly, where the line-editing library is missing (or on Windows).
#include <cstdio>
#include <iostream>

#include "platform/line_editor.h"
#include "platform/terminal.h"

namespace quorrel {

struct LineEditor::State {
  std::string prompt;
  bool interactive = false;
};

LineEditor::LineEditor(std::string prompt, const std::string&, Candidates)
    : state_(std::make_unique<State>(State{std::move(prompt), platform::isTerminal(stdin)})) {}

LineEditor::~LineEditor() = default;

bool LineEditor::interactive() const {
  return state_->interactive;
}

std::optional<std::string> LineEditor::next() {
  if (state_->interactive) std::cout << state_->prompt << std::flush;
  std::string line;
  if (!std::getline(std::cin, line)) return std::nullopt;
  return line;
}

}  // namespace quorrel
