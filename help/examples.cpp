#include "examples.h"

#include <cctype>
#include <sstream>

#include "html.h"
#include "quorrel/catalog.h"
#include "quorrel/session.h"

namespace quorrel::help {
namespace {

// The name an author gives the object in the editor; the display strings' first %s.
constexpr const char* kObjectName = "Quorrel";
constexpr std::string_view kArrow = " \xe2\x86\x92 ";

// Every command id of a menu tree with the text of its item.
void collectItems(const std::vector<hostsim::MenuItem>& items, int firstId,
                  std::map<int, std::string>& texts) {
  for (const auto& item : items) {
    if (item.popup) {
      collectItems(item.items, firstId, texts);
    } else if (item.id != 0) {
      texts[static_cast<int>(item.id) - firstId] = item.text;
    }
  }
}

// An argument as the editor shows it: a text in double quotes, a number in decimal.
std::string shown(const tool::Argument& arg) {
  return arg.isText ? '"' + arg.text + '"' : std::to_string(arg.number);
}

std::vector<std::string> shownArguments(bool action, int32_t code,
                                        const std::vector<tool::Argument>& given) {
  std::vector<std::string> args;
  for (const tool::Argument& arg : given) args.push_back(shown(arg));
  // A parameter the routine ignores may be left out of the script; the editor shows 0.
  const size_t declared = tool::parameters(action, code).size();
  while (args.size() < declared) args.push_back("0");
  return args;
}

std::string setupWords(const tool::SetupFields& setup) {
  const tool::SetupFields defaults;
  std::string words = "Setup dialog: " + std::to_string(setup.dims) + "D";
  if (setup.dims >= 2) words += ", X " + std::to_string(setup.x);
  if (setup.dims >= 3) words += ", Y " + std::to_string(setup.y);
  if (setup.caseSensitive) words += ", case sensitive";
  if (setup.wildcard) words += ", wildcard search";
  if (setup.autoSelect) words += ", select new rows";
  if (setup.delimiter != defaults.delimiter) words += ", list delimiter \"" + setup.delimiter + '"';
  return words;
}

int32_t codeOf(const tool::Command& command, bool action) {
  if (command.name.empty()) return command.code;
  const auto code = tool::codeOfTypedName(action, command.name);
  if (!code) throw tool::ScriptError("unknown name " + command.name);
  return *code;
}

}  // namespace

EditorWords::EditorWords(const hostsim::Module& module) {
  for (int32_t code = 0; code < abi::kActionCount; ++code) {
    actionDisplay_.push_back(module.actionString(code));
  }
  for (int32_t code = 0; code < abi::kExpressionCount; ++code) {
    expressionName_.push_back(module.expressionString(code));
  }
  collectItems(module.menu("expressions"), abi::kExpressionCommandBase, expressionMenuText_);
}

std::string EditorWords::of(const std::string& line) const {
  const tool::Command command = tool::parseLine(line);
  switch (command.kind) {
    case tool::CommandKind::Empty:
      return "";
    case tool::CommandKind::New:
      return setupWords(command.setup);
    case tool::CommandKind::Action: {
      const int32_t code = codeOf(command, true);
      std::string text = actionDisplay_[static_cast<size_t>(code)];
      // The string starts with two digits that tell the editor how to draw it; it
      // shows the rest.
      if (text.size() >= 2 && std::isdigit(static_cast<unsigned char>(text[0])) &&
          std::isdigit(static_cast<unsigned char>(text[1]))) {
        text.erase(0, 2);
      }
      std::vector<std::string> args = shownArguments(true, code, command.args);
      args.insert(args.begin(), kObjectName);
      size_t at = 0;
      for (const std::string& arg : args) {
        at = text.find("%s", at);
        if (at == std::string::npos) break;
        text.replace(at, 2, arg);
        at += arg.size();
      }
      return text;
    }
    case tool::CommandKind::Expression: {
      const int32_t code = codeOf(command, false);
      std::string call = expressionName_[static_cast<size_t>(code)] + " \"" + kObjectName + '"';
      for (const std::string& arg : shownArguments(false, code, command.args)) call += ", " + arg;
      const auto menuText = expressionMenuText_.find(code);
      const std::string menu = menuText == expressionMenuText_.end() ? "" : menuText->second;
      return menu + ": " + call + " )";
    }
  }
  return "";
}

ExampleLine parseExampleLine(const std::string& text) {
  const size_t arrow = text.rfind(kArrow);
  if (arrow == std::string::npos) return {text, std::nullopt, ""};
  return {text.substr(0, arrow), text.substr(arrow + kArrow.size()), ""};
}

std::vector<ExampleLine> runExample(const std::string& title, std::vector<ExampleLine> lines,
                                    const tool::ModuleLoader& module, const EditorWords& words) {
  std::ostringstream warnings;
  tool::Session session(module, {}, &warnings);
  int number = 0;
  for (ExampleLine& line : lines) {
    const std::string where =
        title + ", line " + std::to_string(++number) + " (" + line.script + ")";
    try {
      const tool::Command command = tool::parseLine(line.script);
      const bool expression = command.kind == tool::CommandKind::Expression;
      if (expression && !line.expected) throw ExampleError(where + ": gives no result after →");
      if (!expression && line.expected) throw ExampleError(where + ": only an E line has a result");
      std::ostringstream out;
      session.execute(command, out, {title, number, line.script});
      std::string result = out.str();
      if (!result.empty() && result.back() == '\n') result.pop_back();
      if (expression && result != *line.expected) {
        throw ExampleError(where + ": gives " + result + ", the page says " + *line.expected);
      }
      line.words = words.of(line.script);
    } catch (const tool::ScriptError& error) {
      throw ExampleError(where + ": error: " + error.what());
    } catch (const hostsim::ModuleError& error) {
      throw ExampleError(where + ": " + error.what());
    }
  }
  return lines;
}

bool callsRow(const std::vector<ExampleLine>& lines, bool action, int32_t code) {
  const auto kind = action ? tool::CommandKind::Action : tool::CommandKind::Expression;
  for (const ExampleLine& line : lines) {
    try {
      const tool::Command command = tool::parseLine(line.script);
      if (command.kind == kind && codeOf(command, action) == code) return true;
    } catch (const tool::ScriptError&) {
      // runExample names the line.
    }
  }
  return false;
}

std::string exampleHtml(const std::vector<ExampleLine>& lines) {
  std::string script, said;
  for (const ExampleLine& line : lines) {
    script += "<span class=\"call\"";
    // The result is drawn beside its line but is not text of the block, so that a
    // copied example pastes into the shell as it is.
    if (line.expected) script += " data-result=\"" + escapeHtml(*line.expected) + '"';
    script += '>' + escapeHtml(line.script) + "</span>\n";
    said += "<li>" + escapeHtml(line.words);
    if (line.expected)
      said += " <span class=\"result\">→ " + escapeHtml(*line.expected) + "</span>";
    said += "</li>\n";
  }
  return "<div class=\"example\">\n<pre class=\"script\">" + script +
         "</pre>\n<ol class=\"words\" aria-label=\"In the event editor\">\n" + said +
         "</ol>\n</div>\n";
}

}  // namespace quorrel::help
