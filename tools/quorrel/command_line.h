// The quorrel command's interface as data (command_line.inc) and what is written from
// it: synopses, option lists and the help texts.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace quorrel::tool::cli {

enum class CommandId {
#define QUORREL_COMMAND(id, name, operands, completes, summary) id,
#include "command_line.inc"
};
enum class ShellWordId {
#define QUORREL_SHELL_WORD(id, name, operands, completes, summary) id,
#include "command_line.inc"
};
enum class OptionId {
#define QUORREL_OPTION(id, long, short, value, completes, commands, help) id,
#include "command_line.inc"
};

// A set of commands, and the shell's show, as bits.
using CommandSet = uint32_t;
namespace sets {
enum : CommandSet {
#define QUORREL_COMMAND(id, name, operands, completes, summary) \
  id = 1u << static_cast<int>(CommandId::id),
#include "command_line.inc"
  Show = 1u << 16,
  Every = Show - 1,
};
}  // namespace sets

// A command of the command line or a word of the shell: a row of its table.
template <class Id>
struct Verb {
  Id id;
  const char* name;
  const char* operands;
  const char* completes;
  const char* summary;
};
using Command = Verb<CommandId>;
using ShellWord = Verb<ShellWordId>;

struct Option {
  OptionId id;
  const char* longName;  // may be empty
  const char* shortName;
  const char* value;
  const char* completes;
  CommandSet commands;
  const char* help;
};

std::span<const Command> commands();
std::span<const ShellWord> shellWords();
std::span<const Option> options();

const Command* findCommand(std::string_view name);
// By its long or short name.
const Option* findOption(std::string_view name);
CommandSet setOf(CommandId id);

// Every: the options of every command, which come before the command; otherwise the
// options of the commands in `set`.
bool selected(const Option& option, CommandSet set);
// Help and version answer on their own, so no synopsis shows them.
bool answersAlone(const Option& option);
// An option given more than once adds up (the script lines of -e).
bool repeats(const Option& option);

// "--rows", "-h, --help"; with the value: "--rows N".
std::string optionLabel(const Option& option);
// "run and shell", "run, inspect and convert".
std::string commandNames(CommandSet set);

// "[--echo] [-e LINE]... FILE" for a command or the shell's show.
std::string synopsisOptions(CommandSet set);
std::string synopsis(const Command& command);
std::string synopsis(const ShellWord& word);

// The words `completes` offers: its plain words, and for <action>, <expression> and
// <name> the names of that kind (an expression's with its "("); none for <file>.
std::vector<std::string> completionWords(std::string_view completes);

// Indented label-and-text lines, the text wrapped within 80 columns.
struct Row {
  std::string label, text;
};
std::string listing(std::span<const Row> rows);

// quorrel --help, the lines of quorrel COMMAND --help (with `prose` between its usage
// and its options), and the shell's help.
std::string mainHelp();
std::string commandHelp(const Command& command, std::string_view prose);
std::string shellHelp();

}  // namespace quorrel::tool::cli
