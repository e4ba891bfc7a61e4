#include "command_line.h"

#include <algorithm>
#include <cstring>
#include <vector>

#include "catalog.h"
#include "host/abi.h"

namespace quorrel::tool::cli {
namespace {

using namespace sets;

constexpr Command kCommands[] = {
#define QUORREL_COMMAND(id, name, operands, completes, summary) \
  {CommandId::id, name, operands, completes, summary},
#include "command_line.inc"
};

constexpr ShellWord kShellWords[] = {
#define QUORREL_SHELL_WORD(id, name, operands, completes, summary) \
  {ShellWordId::id, name, operands, completes, summary},
#include "command_line.inc"
};

constexpr Option kOptions[] = {
#define QUORREL_OPTION(id, long, short, value, completes, commands, help) \
  {OptionId::id, long, short, value, completes, commands, help},
#include "command_line.inc"
};

constexpr size_t kLineWidth = 80;
constexpr size_t kWidestLabelColumn = 24;

// Where the word at the start of `text` ends: at a blank outside brackets, so that a
// synopsis keeps "[--rows N]" on one line.
size_t wordEnd(std::string_view text) {
  int depth = 0;
  for (size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '[') ++depth;
    if (text[i] == ']') --depth;
    if (text[i] == ' ' && depth <= 0) return i;
  }
  return std::string_view::npos;
}

// `text` wrapped within kLineWidth, every line after the first indented to `indent`;
// the first starts at column `column`.
std::string wrapped(std::string_view text, size_t indent, size_t column) {
  std::string out;
  bool lineStart = true;
  while (!text.empty()) {
    const size_t end = wordEnd(text);
    const std::string_view word = text.substr(0, end);
    if (!lineStart && column + 1 + word.size() > kLineWidth) {
      out += '\n' + std::string(indent, ' ');
      column = indent;
    } else if (!lineStart) {
      out += ' ';
      ++column;
    }
    out += word;
    column += word.size();
    lineStart = false;
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
  }
  return out;
}

std::string optionRows(CommandSet set) {
  std::vector<Row> rows;
  for (const Option& option : kOptions) {
    if (selected(option, set)) rows.push_back({optionLabel(option), option.help});
  }
  return listing(rows);
}

}  // namespace

std::span<const Command> commands() {
  return kCommands;
}

std::span<const ShellWord> shellWords() {
  return kShellWords;
}

std::span<const Option> options() {
  return kOptions;
}

const Command* findCommand(std::string_view name) {
  for (const Command& command : kCommands) {
    if (name == command.name) return &command;
  }
  return nullptr;
}

const Option* findOption(std::string_view name) {
  for (const Option& option : kOptions) {
    if (!name.empty() && (name == option.longName || name == option.shortName)) return &option;
  }
  return nullptr;
}

CommandSet setOf(CommandId id) {
  return 1u << static_cast<int>(id);
}

bool selected(const Option& option, CommandSet set) {
  if (set == Every) return option.commands == Every;
  return (option.commands & set) && option.commands != Every;
}

bool answersAlone(const Option& option) {
  return option.id == OptionId::Help || option.id == OptionId::Version;
}

bool repeats(const Option& option) {
  return option.id == OptionId::Line;
}

std::string optionLabel(const Option& option) {
  std::string label = option.shortName;
  if (*option.longName) label += (label.empty() ? "" : ", ") + std::string(option.longName);
  if (*option.value) label += ' ' + std::string(option.value);
  return label;
}

std::string commandNames(CommandSet set) {
  std::vector<std::string> names;
  for (const Command& command : kCommands) {
    if (set & setOf(command.id)) names.emplace_back(command.name);
  }
  if (set & Show) names.emplace_back("show");
  std::string text;
  for (size_t i = 0; i < names.size(); ++i) {
    text += (i == 0 ? "" : i + 1 == names.size() ? " and " : ", ") + names[i];
  }
  return text;
}

std::string synopsisOptions(CommandSet set) {
  std::string text;
  for (const Option& option : kOptions) {
    if (!selected(option, set) || answersAlone(option)) continue;
    const std::string name = *option.longName ? option.longName : option.shortName;
    text += (text.empty() ? "[" : " [") + name + (*option.value ? " " : "") + option.value + "]";
    if (repeats(option)) text += "...";
  }
  return text;
}

std::string synopsis(const Command& command) {
  std::string text = std::string("quorrel ") + command.name;
  const std::string options = synopsisOptions(setOf(command.id));
  if (!options.empty()) text += ' ' + options;
  if (*command.operands) text += std::string(" ") + command.operands;
  return text;
}

std::string synopsis(const ShellWord& word) {
  std::string text = word.name;
  const std::string options = word.id == ShellWordId::Show ? synopsisOptions(Show) : "";
  if (!options.empty()) text += ' ' + options;
  if (*word.operands) text += std::string(" ") + word.operands;
  return text;
}

std::vector<std::string> completionWords(std::string_view completes) {
  std::vector<std::string> words;
  while (!completes.empty()) {
    const size_t end = completes.find(' ');
    const std::string_view word = completes.substr(0, end);
    completes.remove_prefix(end == std::string_view::npos ? completes.size() : end + 1);
    for (const bool action : {true, false}) {
      if (word == "<name>" || word == (action ? "<action>" : "<expression>")) {
        for (int32_t code = 0; code < (action ? abi::kActionCount : abi::kExpressionCount); ++code)
          words.emplace_back(nameOf(action, code));
      }
    }
    if (!word.starts_with('<')) words.emplace_back(word);
  }
  return words;
}

std::string listing(std::span<const Row> rows) {
  size_t widest = 0;
  for (const Row& row : rows) widest = std::max(widest, row.label.size());
  const size_t column = std::min(widest + 4, kWidestLabelColumn);
  std::string out;
  for (const Row& row : rows) {
    out += "  " + row.label;
    if (2 + row.label.size() + 2 > column) {
      out += '\n' + std::string(column, ' ');
    } else {
      out += std::string(column - 2 - row.label.size(), ' ');
    }
    out += wrapped(row.text, column, column) + '\n';
  }
  return out;
}

std::string mainHelp() {
  std::vector<Row> commandRows;
  for (const Command& command : kCommands) {
    commandRows.push_back(
        {std::string(command.name) + (*command.operands ? " " : "") + command.operands,
         command.summary});
  }
  return "Usage: quorrel " + synopsisOptions(Every) +
         " COMMAND [ARGS]\n"
         "\n"
         "Acts as the host of the Quorrel extension: loads the extension module and drives\n"
         "it only through its exported entry points.\n"
         "\n"
         "Commands:\n" +
         listing(commandRows) + "\nOptions:\n" + optionRows(Every);
}

std::string commandHelp(const Command& command, std::string_view prose) {
  std::string text = std::string("Usage: quorrel ") + command.name +
                     (*command.operands ? " " : "") + command.operands + '\n';
  const std::string options = optionRows(setOf(command.id));
  // Continued lines start under the first option.
  const size_t indent = std::string_view("       quorrel  ").size() + strlen(command.name);
  if (!options.empty()) text += "       " + wrapped(synopsis(command), indent, 7) + '\n';
  text += '\n' + std::string(prose);
  if (!options.empty()) text += '\n' + options;
  return text;
}

std::string shellHelp() {
  std::vector<Row> rows;
  for (const ShellWord& word : kShellWords) rows.push_back({synopsis(word), word.summary});
  return "Commands, one per line:\n" + listing(rows) +
         "Arguments are integers or quoted strings with the escapes \\\\ \\\" \\n \\r \\t "
         "\\xHH.\n";
}

}  // namespace quorrel::tool::cli
