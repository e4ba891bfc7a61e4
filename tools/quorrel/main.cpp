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

#include "commands.h"

namespace {

using quorrel::tool::UsageError;

constexpr const char* kMainHelp = R"(Usage: quorrel [--module PATH] COMMAND [ARGS]

Acts as the host of the Quorrel extension: loads the extension module and drives
it only through its exported entry points.

Commands:
  run FILE            run a script (FILE - reads standard input)
  shell               type script commands interactively
  inspect FILE        show what an array file holds (native, host, CSV, INI, JSON)
  convert IN OUT      convert an array file to another format
  list [WHAT]         list actions and expressions, or describe one (a name, A12, E12)
  menu KIND           print the editor menu tree: actions, expressions or conditions
  strings KIND        print display strings and titles: actions or expressions

Options:
  --module PATH       the extension module to load (default: the one installed or
                      built beside quorrel)
  --ascii             print every byte of a text that is not printable ASCII as
                      \xHH; by default valid UTF-8 prints as itself when LC_ALL,
                      LC_CTYPE or LANG (the first one set) names UTF-8
  -h, --help          show this help; 'quorrel COMMAND --help' for one command
  --version           print the version
)";

const std::map<std::string, const char*> kCommandHelp = {
    {"run", R"(Usage: quorrel run FILE
       quorrel run [--echo] [--no-warn-files] [--strict] [--no-notes]
                   [--notes-fail] FILE

Runs a script: one command per line; blank lines and lines starting with # are
ignored. FILE - reads the script from standard input. A UTF-8 byte-order mark at
the start is read past, with a note on standard error.

  new [FIELD=VALUE]...     replace the instance; fields dims, x, y, case, wildcard,
                           autoselect (integers) and delimiter (a quoted string);
                           a value the setup dialog never stores (dims=7, x=-5,
                           case=2) is kept, with a warning of what the module
                           makes of it
  A NAME|CODE [ARG [ARG]]  call an action by name (appendString) or code (0..78);
                           prints nothing
  E NAME|CODE [ARG [ARG]]  call expression CODE (0..59) or a name such as rowList$(
                           and print its result: -12 or "a,b,7"

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

  --echo           print each E line beside its result: 12: E size(  ->  3
                   (a Unicode arrow under a UTF-8 locale)
  --no-warn-files  no warnings about failed file actions (--warn-files, the
                   default, is still taken)
  --strict         exit with status 1 when a file action failed
  --no-notes       no notes
  --notes-fail     exit with status 3 when the module gave a note (unless an
                   error or --strict sets another status)

The module never reports a mistake to the host: a call on an index outside the
array, an unknown label or a row that is not visible does nothing or answers 0
or -1. The module the command loads says why, in a note on standard error:
FILE:LINE: note: labSum: no column is labelled "scroe" (labels: name, score);
column -1 was used [label-unknown]. A note given again (the same call with the
same values) is printed once, and at the end once more with its count. A text
expression with no text to give prints (no text), never a number.
Arguments that do not fit are errors that name the call as written:
setLabel "TEXT" NUMBER: argument 1 must be a quoted text; got name (add quotes).
)"},
    {"shell", R"(Usage: quorrel shell
       quorrel shell [--echo] [--no-warn-files] [--strict] [--no-notes]
                     [--notes-fail]

Reads script commands interactively, one per line, with line editing, history
(~/.quorrel_history) and Tab completion of commands and names on a terminal.
Errors are reported and the session goes on; when the input is not a terminal, the
exit status is then 2 (else 1 with --strict after a failed file action). Beside
the script commands:
help, help NAME|CODE, list, show (the current array), quit or exit. Ctrl-C
clears the line, Ctrl-D ends. File warnings are on; --no-warn-files turns them off.
The module's notes are printed as run prints them; --no-notes turns them off.
)"},
    {"inspect", R"(Usage: quorrel inspect FILE
       quorrel inspect [--rows N | --all] [--width N] [--keys]
                       [--from KIND] [--to KIND] [--header] [--lenient] FILE

Recognises a native array, host array, CSV, INI or JSON file (or reads it as
--from says), loads it into a fresh instance and prints its format, dimensions,
boundaries, labels and elements. FILE - reads standard input. A native file that
ends inside an element, or has bytes after its last one, is named in a warning
with the byte offset. A text file's UTF-8 byte-order mark is read past, with a
note. Exits with status 1 when FILE cannot be read.

  --rows N      show at most N table rows or list elements (default 20 and 40)
  --all         show every row, column and element
  --width N     cut cells at N characters, N at least 4 (default 24; 0 never
                cuts); a cut cell ends in ...
  --keys        list every element with its type and its key's type and key: a
                text is quoted ("" is an empty text), an empty element is blank
  --from KIND   read FILE as KIND (below) instead of recognising it
  --to KIND     show the array as it comes back from KIND, with convert's warnings
  --header      a CSV file's first row holds the column labels
  --lenient     broken RFC 4180 CSV: a warning and the records before the fault

KIND is native, host, csv, ini, csv-rfc4180 or json, in any case.
)"},
    {"convert", R"(Usage: quorrel convert IN OUT
       quorrel convert [--from KIND] [--to KIND] [--header] [--lenient] [--force]
                       [--] IN OUT

Loads IN (its format recognised as by inspect, or as --from says) and saves it as
OUT in the format --to names, or else OUT's extension: .arr native, .mmf host,
.csv, .ini, .json (any case); another extension needs --to. IN - reads standard
input, OUT - writes standard output (with --to). Exits with status 1 when IN
cannot be read or OUT cannot be written, 2 on misuse.

  --to KIND, --from KIND
               native, host, csv, ini, csv-rfc4180 or json, in any case
               csv-rfc4180: cells quoted when they hold a comma, a quote or a
               line break, so that they read back whole; broken quoting in IN is
               an error that names its line
               json: dimensions, boundaries, labels, and each element as null
               (empty), a number, a string, {"base64": ...} (text that is not
               UTF-8) or {"file": ...} (bytes), with {"element": ..., "key": ...}
               for a keyed one; it reads back exactly
  --header     write the column labels as a first CSV row; read a first row as
               the labels
  --lenient    broken RFC 4180 CSV: a warning and the records before the fault
  --force      allow OUT to be IN itself, and binary output to a terminal
  --           ends the options (for a file whose name starts with -)

A warning on standard error names each kind of content the target format loses.
A command that runs longer than 2 seconds shows its progress on standard error
when that is a terminal.
)"},
    {"list", R"(Usage: quorrel list [actions|expressions|NAME|CODE|WORD]

Without an operand, lists every action (A) and expression (E): code, name,
parameters with their types, and menu path. With a name in any case (setLabel,
labsum, labSum(), A12 or E12, or a bare code for both kinds) describes it in the
help page's words. Any other word lists every entry whose name, menu path,
parameters or description contains it, in any case: quorrel list sort. Exits
with status 2 when nothing matches, naming the nearest names.
)"},
    {"menu", R"(Usage: quorrel menu actions|expressions|conditions

Prints the menu tree the editor receives, two spaces of indentation per level:
a command as ID "Text", a submenu as "Text", a separator as -. A command or
submenu whose state differs from the plain one shows it after the text, for
example [grayed checked].

The object has no conditions, so its conditions menu is empty: menu conditions
prints nothing on standard output, says so on standard error and exits with
status 0.
)"},
    {"strings", R"(Usage: quorrel strings actions|expressions

Prints one line per code: CODE "display string or name" "title".
)"},
};

struct Options {
  std::string module;
  quorrel::tool::ConvertOptions convert;
  quorrel::tool::InspectOptions inspect;
  quorrel::tool::RunOptions run;
  bool noWarnFiles = false;
  bool help = false, version = false;
  bool ascii = false;
  std::vector<std::pair<std::string, std::string>> owned;  // option, the commands it needs
  std::vector<std::string> words;                          // the command and its operands
  std::string mistake;  // the first misuse found, reported once all is read
};

constexpr const char* kFileCommands = "inspect and convert";

std::optional<quorrel::tool::ArrayFormat> formatOption(const std::string& option,
                                                       const std::string& name) {
  const auto format = quorrel::tool::formatOfName(name);
  if (!format) {
    throw UsageError("unknown format '" + name + "' for " + option + " (one of " +
                     quorrel::tool::formatNames() + ")");
  }
  return format;
}

Options parseOptions(int argc, char** argv) {
  Options options;
  bool operandsOnly = false;
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    const std::string name = arg.substr(0, arg.find('='));
    auto value = [&]() -> std::string {
      if (name.size() < arg.size()) return arg.substr(name.size() + 1);
      if (i + 1 < argc) return argv[++i];
      if (options.mistake.empty()) options.mistake = name + " needs a value";
      return {};
    };
    auto belongs = [&](const char* command) { options.owned.emplace_back(name, command); };
    // Misuse is reported once all is read, so that --help still answers.
    auto noting = [&](auto&& take) {
      try {
        take();
      } catch (const UsageError& error) {
        if (options.mistake.empty()) options.mistake = error.what();
      }
    };
    if (operandsOnly || arg == "-" || arg.empty() || arg[0] != '-') {
      options.words.push_back(arg);
    } else if (arg == "--") {
      operandsOnly = true;
    } else if (arg == "--help" || arg == "-h") {
      options.help = true;
    } else if (arg == "--version") {
      options.version = true;
    } else if (arg == "--ascii") {
      options.ascii = true;
    } else if (name == "--module") {
      options.module = value();
    } else if (name == "--to" || name == "--from") {
      const std::string kind = value();
      noting([&] {
        auto& format = name == "--to" ? options.convert.to : options.convert.from;
        if (!kind.empty()) format = formatOption(name, kind);
      });
      belongs(kFileCommands);
    } else if (arg == "--header" || arg == "--lenient") {
      (arg == "--header" ? options.convert.header : options.convert.lenient) = true;
      belongs(kFileCommands);
    } else if (arg == "--force") {
      options.convert.force = true;
      belongs("convert");
    } else if (name == "--rows" || name == "--width" || arg == "--all" || arg == "--keys") {
      noting([&] {
        const auto next = [&]() -> std::optional<std::string> {
          if (i + 1 < argc) return std::string(argv[++i]);
          return std::nullopt;
        };
        quorrel::tool::takeViewOption(arg, next, options.inspect.view);
      });
      belongs("inspect");
    } else if (arg == "--echo") {
      options.run.echo = true;
      belongs("run");
    } else if (arg == "--warn-files") {
      belongs("run");
    } else if (arg == "--strict") {
      options.run.strict = true;
      belongs("run");
    } else if (arg == "--no-warn-files") {
      options.noWarnFiles = true;
      belongs("run");
    } else if (arg == "--no-notes" || arg == "--notes-fail") {
      (arg == "--no-notes" ? options.run.notes : options.run.notesFail) = arg == "--notes-fail";
      belongs("run");
    } else if (options.mistake.empty()) {
      options.mistake = "unknown option " + arg + " (-- ends the options, for a file named so)";
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

int dispatch(Options options) {
  const std::string& command = options.words[0];
  for (const auto& [option, owner] : options.owned) {
    // --echo and the file warnings' options serve the shell as well as run.
    const bool shared = (owner == "run" && command == "shell") ||
                        (owner == kFileCommands && (command == "inspect" || command == "convert"));
    if (owner != command && !shared) {
      throw UsageError(option + " belongs to " + (owner == "run" ? "run and shell" : owner));
    }
  }
  // Operands are checked before the module is loaded, so misuse is always status 2.
  if (command == "run") {
    expectOperands(options, 1, "a script file (or - for standard input)");
  } else if (command == "shell") {
    expectOperands(options, 0, "no operands");
  } else if (command == "inspect") {
    expectOperands(options, 1, "a file");
  } else if (command == "convert") {
    expectOperands(options, 2, "an input and an output file");
    options.convert.in = options.words[1];
    options.convert.out = options.words[2];
    expectOutputFormat(options.convert);
  } else if (command == "list") {
    if (options.words.size() > 2) throw UsageError("list takes at most one name or code");
  } else if (command == "menu") {
    expectOperands(options, 1, "actions, expressions or conditions");
    expectKind(options.words[1], {"actions", "expressions", "conditions"});
  } else if (command == "strings") {
    expectOperands(options, 1, "actions or expressions");
    expectKind(options.words[1], {"actions", "expressions"});
  } else {
    throw UsageError("unknown command " + command);
  }

  const quorrel::tool::ModuleLoader loader(
      options.module.empty() ? quorrel::tool::defaultModulePath() : options.module);
  const auto& words = options.words;
  options.run.warnFiles = !options.noWarnFiles;
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
  if (errno == EPIPE) return status;
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
  quorrel::tool::useBinaryStandardStreams();
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
      return 0;
    }
    if (options.help) {
      const auto help = kCommandHelp.find(command);
      std::cout << (help == kCommandHelp.end() ? kMainHelp : help->second);
      return 0;
    }
    if (options.words.empty()) throw UsageError("no command given");
    return checkedOutput(dispatch(std::move(options)));
  } catch (const UsageError& error) {
    std::cerr << "quorrel: " << error.what() << "\nTry 'quorrel "
              << (kCommandHelp.count(command) ? command + " " : "") << "--help'.\n";
    return 2;
  } catch (const quorrel::tool::FileError& error) {
    std::cerr << "quorrel: " << error.what() << '\n';
    return 1;
  } catch (const quorrel::tool::ModuleError& error) {
    std::cerr << "quorrel: " << error.what() << '\n' << whereModulesWereSought(moduleOption);
    return 1;
  }
}
