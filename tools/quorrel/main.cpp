// quorrel: a host for the Quorrel extension module on the command line.
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <iostream>
#include <map>
#include <string>
#include <vector>

#include "catalog.h"
#include "command_line.h"
#include "commands.h"

namespace {

namespace cli = quorrel::tool::cli;
using quorrel::tool::UsageError;

// What quorrel COMMAND --help says between the usage and the options.
const std::map<std::string, const char*> kCommandProse = {
    {"run", R"(Runs a script: one command per line; blank lines and lines starting with # are
ignored. FILE - reads the script from standard input; -e LINE, as often as
needed, gives it on the command line instead. A UTF-8 byte-order mark at the
start is read past, with a note on standard error.

  new [FIELD=VALUE]...     replace the instance; fields dims, x, y, case, wildcard,
                           autoselect (integers) and delimiter (a quoted string);
                           a value the setup dialog never stores (dims=7, x=-5,
                           case=2) is kept, with a warning of what the module
                           makes of it
  A NAME|CODE [ARG [ARG]]  call an action by name (appendString) or code (0..78);
                           prints nothing
  E NAME|CODE [ARG [ARG]]  call expression CODE (0..59) or a name such as rowList$(
                           and print its result: -12 or "a,b,7"
  show [OPTION]...         print the current array as inspect does, with its view
                           options, the selected rows marked *

A name may be typed in any case, with or without its "(", and its arguments may
follow in parentheses, separated by commas: E labSum("qty"), E size,
E getFromColumnRow(1, 2), A setLabel("qty", 1). An argument that the routine does
not use (the second of findStr( ) may be left out. An unknown name is reported with
the nearest real ones.

'quorrel list' shows every name with its parameters; 'quorrel list NAME' says
what one does. Arguments are integers or quoted strings with the escapes
\\ \" \n \r \t \xHH. An error prints FILE:LINE: error: WHAT and exits with status 2.
Every expression call is checked against the host's rules (parameters fetched as
declared, host flags, one text buffer of the text's size); a module that breaks
one stops the run with status 1.

A file action that fails (a file that cannot be opened, read, written, flushed
or put in place) is named in a warning on standard error, with the step that
failed; output and exit status stay the same unless --strict. A script that is a
directory or cannot be read, and output that cannot be written, are errors with
status 1.

The module never reports a mistake to the host: a call on an index outside the
array, an unknown label or a row that is not visible does nothing or answers 0
or -1. The module the command loads says why, in a note on standard error:
FILE:LINE: note: labSum: no column is labelled "scroe" (labels: name, score);
column -1 was used [label-unknown]. A note given again (the same call with the
same values) is printed once, and at the end once more with its count. A text
expression with no text to give prints (no text), never a number. --notes-fail
exits with status 3 when the module gave a note (unless an error or --strict sets
another status). Arguments that do not fit are errors that name the call as
written: setLabel "TEXT" NUMBER: argument 1 must be a quoted text; got name (add
quotes).
)"},
    {"shell", R"(Reads script commands interactively, one per line, with line editing, history
(~/.quorrel_history) and Tab completion of commands and names on a terminal.
Errors are reported and the session goes on; when the input is not a terminal, the
exit status is then 2 (else 1 with --strict after a failed file action). The
module's notes are printed as run prints them; --no-notes turns them off.
)"},
    {"inspect", R"(Recognises a native array, host array, CSV, INI or JSON file by its content, the
name's extension as a hint (or reads it as --from says), loads it into a fresh
instance and prints its format, dimensions, boundaries, labels and elements.
FILE - reads standard input; a pipe or a device reads like a file. A native file
that ends inside an element, or has bytes after its last one, is named in a
warning with the byte offset. A text file's UTF-8 byte-order mark is read past,
with a note. Exits with status 1 when FILE cannot be read. KIND is native, host,
csv, ini, csv-rfc4180 or json, in any case.
)"},
    {"convert", R"(Loads IN (its format recognised as by inspect, or as --from says) and saves it as
OUT in the format --to names, or else OUT's extension: .arr native, .mmf host,
.csv, .ini, .json (any case); another extension needs --to. IN - reads standard
input, OUT - writes standard output (with --to). Exits with status 1 when IN
cannot be read or OUT cannot be written, 2 on misuse.

KIND is native, host, csv, ini, csv-rfc4180 or json, in any case. csv-rfc4180
quotes cells when they hold a comma, a quote or a line break, so that they read
back whole; broken quoting in IN is an error that names its line and column. json
holds the dimensions, boundaries, labels, and each element as null (empty), a
number, a string, {"base64": ...} (text that is not UTF-8) or {"file": ...}
(bytes), with {"element": ..., "key": ...} for a keyed one; it reads back exactly.
Read, an array of records ([{"id": 1, "name": "a"}, ...]) is a table labelled by
the names, and a list of elements alone a 1-D array.

A warning on standard error names each kind of content the target format loses.
A command that runs longer than 2 seconds shows on standard error, when that is a
terminal, the input's size and the seconds gone.
)"},
    {"list", R"(Without an operand, lists every action (A) and expression (E): code, name,
parameters with their types, and menu path. With a name in any case (setLabel,
labsum, labSum(), A12 or E12, or a bare code for both kinds) describes it in the
help page's words. Any other word lists every entry whose name, menu path,
parameters or description contains it, in any case: quorrel list sort. Exits
with status 2 when nothing matches, naming the nearest names.
)"},
    {"menu", R"(Prints the menu tree the editor receives, two spaces of indentation per level:
a command as ID "Text", a submenu as "Text", a separator as -. A command or
submenu whose state differs from the plain one shows it after the text, for
example [grayed checked].

The object has no conditions, so its conditions menu is empty: menu conditions
prints nothing on standard output, says so on standard error and exits with
status 0.
)"},
    {"strings", R"(Prints one line per code: CODE "display string or name" "title".
)"},
};

struct Options {
  std::string module;
  quorrel::tool::ConvertOptions convert;
  quorrel::tool::InspectOptions inspect;
  quorrel::tool::RunOptions run;
  std::vector<std::string> lines;  // the script given with -e
  bool noWarnFiles = false;
  bool help = false, version = false;
  bool ascii = false;
  bool operandsOnly = false;
  std::vector<std::pair<std::string, cli::CommandSet>> owned;  // option, the commands it needs
  std::vector<std::string> words;                              // the command and its operands
  std::string mistake;  // the first misuse found, reported once all is read
};

std::optional<quorrel::tool::ArrayFormat> formatOption(const std::string& option,
                                                       const std::string& name) {
  const auto format = quorrel::tool::formatOfName(name);
  if (!format) {
    throw UsageError("unknown format '" + name + "' for " + option + " (one of " +
                     quorrel::tool::formatNames() + ")");
  }
  return format;
}

// What an option does; `name` is as it was typed, `value` empty for a flag.
void applyOption(cli::OptionId id, const std::string& name, const std::string& value,
                 Options& options) {
  using cli::OptionId;
  switch (id) {
    case OptionId::Module:
      options.module = value;
      return;
    case OptionId::Ascii:
      options.ascii = true;
      return;
    case OptionId::Help:
      options.help = true;
      return;
    case OptionId::Version:
      options.version = true;
      return;
    case OptionId::Echo:
      options.run.echo = true;
      return;
    case OptionId::Line:
      // Each -e is one line, so that an error's line number names the -e.
      if (value.find_first_of("\r\n") != std::string::npos) {
        throw UsageError("-e takes one script line; give each line its own -e");
      }
      options.lines.push_back(value);
      return;
    case OptionId::WarnFiles:
      options.noWarnFiles = false;
      return;
    case OptionId::NoWarnFiles:
      options.noWarnFiles = true;
      return;
    case OptionId::Strict:
      options.run.strict = true;
      return;
    case OptionId::NoNotes:
      options.run.notes = false;
      return;
    case OptionId::NotesFail:
      options.run.notesFail = true;
      return;
    case OptionId::Rows:
    case OptionId::All:
    case OptionId::Width:
    case OptionId::Keys:
      quorrel::tool::takeViewOption(
          value.empty() ? name : name + '=' + value, [] { return std::nullopt; },
          options.inspect.view);
      return;
    case OptionId::From:
    case OptionId::To:
      (id == OptionId::To ? options.convert.to : options.convert.from) = formatOption(name, value);
      return;
    case OptionId::Header:
      options.convert.header = true;
      return;
    case OptionId::Lenient:
      options.convert.lenient = true;
      return;
    case OptionId::Force:
      options.convert.force = true;
      return;
    case OptionId::EndOfOptions:
      options.operandsOnly = true;
      return;
  }
}

Options parseOptions(int argc, char** argv) {
  Options options;
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    if (options.operandsOnly || arg == "-" || arg.empty() || arg[0] != '-') {
      options.words.push_back(arg);
      continue;
    }
    // --name=value; a short option's value is the next word.
    const std::string name = arg.starts_with("--") ? arg.substr(0, arg.find('=')) : arg;
    const cli::Option* option = cli::findOption(name);
    // Misuse is reported once all is read, so that --help still answers.
    try {
      if (!option) {
        throw UsageError("unknown option " + arg + " (-- ends the options, for a file named so)");
      }
      std::string value;
      if (!*option->value && name.size() < arg.size()) {
        throw UsageError(name + " takes no value");
      } else if (name.size() < arg.size()) {
        value = arg.substr(name.size() + 1);
      } else if (*option->value && i + 1 < argc) {
        value = argv[++i];
      } else if (*option->value) {
        throw UsageError(name + " needs a value");
      }
      if (option->commands != cli::sets::Every) options.owned.emplace_back(name, option->commands);
      applyOption(option->id, name, value, options);
    } catch (const UsageError& error) {
      if (options.mistake.empty()) options.mistake = error.what();
    }
  }
  options.inspect.from = options.convert.from;
  options.inspect.to = options.convert.to;
  options.inspect.header = options.convert.header;
  options.inspect.lenient = options.convert.lenient;
  return options;
}

void expectOperands(const Options& options, size_t count, const char* what) {
  const std::string needs = options.words[0] + " needs " + what;
  if (options.words.size() - 1 < count) throw UsageError(needs);
  if (options.words.size() - 1 > count)
    throw UsageError("unexpected operand " + options.words[count + 1] + ": " + needs);
}

void expectKind(const std::string& kind, std::initializer_list<const char*> allowed) {
  for (const char* name : allowed) {
    if (kind == name) return;
  }
  throw UsageError("unknown kind " + kind);
}

// Without --to, OUT's extension names the format.
void expectOutputFormat(const quorrel::tool::ConvertOptions& convert) {
  if (convert.to) return;
  if (convert.out == "-") {
    throw UsageError("--to is needed to write standard output (one of " +
                     quorrel::tool::formatNames() + ")");
  }
  if (!quorrel::tool::formatOfExtension(convert.out)) {
    throw UsageError("cannot tell the format of " + convert.out +
                     " from its extension (.arr, .mmf, .csv, .ini, .json); add --to with one of " +
                     quorrel::tool::formatNames());
  }
}

// "unknown command inpsect; did you mean: inspect", and --help for help.
UsageError unknownCommand(const std::string& typed) {
  std::vector<std::string_view> names;
  for (const cli::Command& command : cli::commands()) names.emplace_back(command.name);
  std::vector<std::string> near = quorrel::tool::nearestWords(typed, names);
  const cli::Option* option = cli::findOption("--" + typed);
  if (option && *option->longName) near.insert(near.begin(), option->longName);
  std::string text = "unknown command " + typed;
  for (size_t i = 0; i < near.size(); ++i) text += (i == 0 ? "; did you mean: " : ", ") + near[i];
  return UsageError(text);
}

int dispatch(Options options) {
  const std::string& command = options.words[0];
  const cli::Command* found = cli::findCommand(command);
  if (!found) throw unknownCommand(command);
  for (const auto& [option, owners] : options.owned) {
    if (!(owners & cli::setOf(found->id))) {
      throw UsageError(option + " belongs to " + cli::commandNames(owners));
    }
  }
  // Operands are checked before the module is loaded, so misuse is always status 2.
  using cli::CommandId;
  switch (found->id) {
    case CommandId::Run:
      if (options.lines.empty()) {
        expectOperands(options, 1, "a script file (or - for standard input, or -e LINE)");
      } else {
        expectOperands(options, 0, "no script file with -e");
      }
      break;
    case CommandId::Shell:
      expectOperands(options, 0, "no operands");
      break;
    case CommandId::Inspect:
      expectOperands(options, 1, "a file");
      break;
    case CommandId::Convert:
      expectOperands(options, 2, "an input and an output file");
      options.convert.in = options.words[1];
      options.convert.out = options.words[2];
      expectOutputFormat(options.convert);
      break;
    case CommandId::List:
      if (options.words.size() > 2) throw UsageError("list takes at most one name or code");
      break;
    case CommandId::Menu:
      expectOperands(options, 1, "actions, expressions or conditions");
      expectKind(options.words[1], {"actions", "expressions", "conditions"});
      break;
    case CommandId::Strings:
      expectOperands(options, 1, "actions or expressions");
      expectKind(options.words[1], {"actions", "expressions"});
      break;
  }

  const quorrel::tool::ModuleLoader loader(
      options.module.empty() ? quorrel::tool::defaultModulePath() : options.module);
  const auto& words = options.words;
  options.run.warnFiles = !options.noWarnFiles;
  if (command == "run" && !options.lines.empty()) {
    return quorrel::tool::runLinesCommand(loader, options.lines, options.run);
  }
  if (command == "run") return quorrel::tool::runCommand(loader, words[1], options.run);
  if (command == "shell") return quorrel::tool::shellCommand(loader, options.run);
  const auto& module = loader.get();
  if (command == "inspect") return quorrel::tool::inspectCommand(module, words[1], options.inspect);
  if (command == "convert") return quorrel::tool::convertCommand(module, options.convert);
  if (command == "list")
    return quorrel::tool::listCommand(module, words.size() > 1 ? words[1] : "");
  if (command == "menu") return quorrel::tool::menuCommand(module, words[1]);
  return quorrel::tool::stringsCommand(module, words[1]);
}

// What was printed must have reached standard output: a full disk is an error. A
// reader that went away (a closed pipe) is not.
int checkedOutput(int status) {
  std::cout.flush();
  errno = 0;
  if (std::cout.good() && std::fflush(stdout) == 0 && !std::ferror(stdout)) return status;
  if (quorrel::tool::standardOutputReaderGone(errno)) return status;
  std::cerr << "quorrel: cannot write standard output"
            << (errno ? std::string(": ") + std::strerror(errno) : std::string()) << '\n';
  return status == 0 ? 1 : status;
}

// A command copied away from its module finds none of the usual places; say which they
// were and how to name the module instead.
std::string whereModulesWereSought(const std::string& moduleOption) {
  if (!moduleOption.empty()) return "";
  std::error_code error;
  std::string places;
  for (const std::string& place : quorrel::tool::defaultModulePlaces()) {
    if (std::filesystem::exists(place, error)) return "";
    places += "\n  " + place;
  }
  return "quorrel: no module in the places looked at:" + places +
         "\nName the module with --module PATH.\n";
}

}  // namespace

int main(int argc, char** argv) {
  quorrel::tool::prepareStandardStreams();
  std::string command;
  std::string moduleOption;
  try {
    Options options = parseOptions(argc, argv);
    moduleOption = options.module;
    if (!options.words.empty()) command = options.words[0];
    if (!options.mistake.empty()) throw UsageError(options.mistake);
    quorrel::tool::setTextForm(options.ascii ? quorrel::tool::TextForm::Escaped
                                             : quorrel::tool::textFormOfEnvironment());
    if (options.version) {
      std::cout << "quorrel " QUORREL_VERSION "\n";
      return checkedOutput(0);
    }
    if (options.help) {
      const cli::Command* found = cli::findCommand(command);
      std::string prose = found ? kCommandProse.at(found->name) : "";
      // The shell's own help, the same the shell prints.
      if (found && found->id == cli::CommandId::Shell) prose += '\n' + cli::shellHelp();
      std::cout << (found ? cli::commandHelp(*found, prose) : cli::mainHelp());
      return checkedOutput(0);
    }
    if (options.words.empty()) throw UsageError("no command given");
    return checkedOutput(dispatch(std::move(options)));
  } catch (const UsageError& error) {
    std::cerr << "quorrel: " << error.what() << "\nTry 'quorrel "
              << (cli::findCommand(command) ? command + " " : "") << "--help'.\n";
    return 2;
  } catch (const quorrel::tool::FileError& error) {
    std::cerr << "quorrel: " << error.what() << '\n';
    return 1;
  } catch (const quorrel::tool::ModuleError& error) {
    std::cerr << "quorrel: " << error.what() << '\n' << whereModulesWereSought(moduleOption);
    return 1;
  }
}
