// The page's examples: lines of the quorrel script language, each expression line with
// the result it must give ("E size → 3"). They run through the module when the page is
// built; a line that fails or gives another result stops the build, naming the example.
#pragma once

#include <map>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include "quorrel/module.h"

namespace quorrel::help {

struct ExampleError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// What the event editor shows of each action and expression: the module's own strings.
class EditorWords {
 public:
  explicit EditorWords(const hostsim::Module& module);
  // One script line in the author's words: the display string with the object's name
  // and the arguments, the expression's menu text and name, or the setup dialog's fields.
  std::string of(const std::string& line) const;

 private:
  std::vector<std::string> actionDisplay_;
  std::vector<std::string> expressionName_;
  std::map<int, std::string> expressionMenuText_;
};

// One example line, its result as `quorrel run --echo` prints it, and its words.
struct ExampleLine {
  std::string script;
  std::optional<std::string> expected;  // what an E line must print
  std::string words;
};

// Splits "E size → 3" into the script and the result it must print.
ExampleLine parseExampleLine(const std::string& text);

// Runs `lines` in a new session and checks each expression's result; throws
// ExampleError naming `title` and the line when a line fails or its result differs.
// Files the example writes land in the current folder.
std::vector<ExampleLine> runExample(const std::string& title, std::vector<ExampleLine> lines,
                                    const tool::ModuleLoader& module, const EditorWords& words);

// Whether one of the lines calls the action or expression `code`.
bool callsRow(const std::vector<ExampleLine>& lines, bool action, int32_t code);

// The example as HTML: the script lines (copied, they paste into `quorrel shell`), each
// result beside its line, and the same calls as the editor shows them.
std::string exampleHtml(const std::vector<ExampleLine>& lines);

}  // namespace quorrel::help
