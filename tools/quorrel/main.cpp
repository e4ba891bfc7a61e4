// quorrel: a host for the Quorrel extension module on the command line.
#include <cstring>
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
  inspect FILE        show what a native array, host array, CSV or INI file holds
  convert IN OUT      convert an array file to another of the four formats
  menu KIND           print the editor menu tree: actions, expressions or conditions
  strings KIND        print display strings and titles: actions or expressions

Options:
  --module PATH       the extension module to load (default: the one built beside
                      quorrel)
  -h, --help          show this help; 'quorrel COMMAND --help' for one command
)";

const std::map<std::string, const char*> kCommandHelp = {
    {"run", R"(Usage: quorrel run FILE

Runs a script: one command per line; blank lines and lines starting with # are
ignored. FILE - reads the script from standard input.

  new [FIELD=VALUE]...   replace the instance; fields dims, x, y, case, wildcard,
                         autoselect (integers) and delimiter (a quoted string)
  A CODE [ARG [ARG]]     call action CODE (0..78); prints nothing
  E CODE [ARG [ARG]]     call expression CODE (0..59) or a name such as rowList$(
                         and print its result: -12 or "a,b,7"

Arguments are integers or quoted strings with the escapes \\ \" \n \r \t \xHH.
An error prints FILE:LINE: error: WHAT and exits with status 2.
)"},
    {"shell", R"(Usage: quorrel shell

Reads script commands interactively, one per line, with line editing and history
on a terminal. Errors are reported and the session goes on; end it with Ctrl-D.
)"},
    {"inspect", R"(Usage: quorrel inspect FILE

Recognises a native array file, a host array file, a CSV or an INI file, loads it
into a fresh instance and prints its format, dimensions, boundaries, labels and
elements. Exits with status 1 when FILE cannot be read.
)"},
    {"convert", R"(Usage: quorrel convert IN OUT [--to native|host|csv|ini]

Loads IN (its format recognised as by inspect) and saves it as OUT. Without --to
the format follows OUT's extension: .csv, .ini, anything else native. The host
array format needs --to host. Exits with status 1 when IN cannot be read or OUT
cannot be written.
)"},
    {"menu", R"(Usage: quorrel menu actions|expressions|conditions

Prints the menu tree the editor receives, two spaces of indentation per level:
a command as ID "Text", a submenu as "Text", a separator as -.
)"},
    {"strings", R"(Usage: quorrel strings actions|expressions

Prints one line per code: CODE "display string or name" "title".
)"},
};

struct Options {
  std::string module;
  std::string to;
  bool toGiven = false;
  bool help = false;
  std::vector<std::string> words;  // the command and its operands
  std::string mistake;             // the first misuse found, reported once all is read
};

Options parseOptions(int argc, char** argv) {
  Options options;
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    auto value = [&](const char* name) -> std::string {
      const std::string prefix = std::string(name) + "=";
      if (arg.rfind(prefix, 0) == 0) return arg.substr(prefix.size());
      if (i + 1 < argc) return argv[++i];
      if (options.mistake.empty()) options.mistake = std::string(name) + " needs a value";
      return {};
    };
    if (arg == "--help" || arg == "-h") {
      options.help = true;
    } else if (arg == "--module" || arg.rfind("--module=", 0) == 0) {
      options.module = value("--module");
    } else if (arg == "--to" || arg.rfind("--to=", 0) == 0) {
      options.to = value("--to");
      options.toGiven = true;
    } else if (arg.size() > 1 && arg[0] == '-') {
      if (options.mistake.empty()) options.mistake = "unknown option " + arg;
    } else {
      options.words.push_back(arg);
    }
  }
  return options;
}

void expectOperands(const Options& options, size_t count, const char* what) {
  if (options.words.size() - 1 != count) throw UsageError(options.words[0] + " needs " + what);
}

void expectKind(const std::string& kind, std::initializer_list<const char*> allowed) {
  for (const char* name : allowed) {
    if (kind == name) return;
  }
  throw UsageError("unknown kind " + kind);
}

int dispatch(const Options& options) {
  const std::string& command = options.words[0];
  if (options.toGiven && command != "convert") throw UsageError("--to belongs to convert");
  // Operands are checked before the module is loaded, so misuse is always status 2.
  if (command == "run") {
    expectOperands(options, 1, "a script file (or - for standard input)");
  } else if (command == "shell") {
    expectOperands(options, 0, "no operands");
  } else if (command == "inspect") {
    expectOperands(options, 1, "a file");
  } else if (command == "convert") {
    expectOperands(options, 2, "an input and an output file");
    if (options.toGiven) expectKind(options.to, {"native", "host", "csv", "ini"});
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
  if (command == "run") return quorrel::tool::runCommand(loader, words[1]);
  if (command == "shell") return quorrel::tool::shellCommand(loader);
  const auto& module = loader.get();
  if (command == "inspect") return quorrel::tool::inspectCommand(module, words[1]);
  if (command == "convert") {
    return quorrel::tool::convertCommand(module, words[1], words[2], options.to);
  }
  if (command == "menu") return quorrel::tool::menuCommand(module, words[1]);
  return quorrel::tool::stringsCommand(module, words[1]);
}

}  // namespace

int main(int argc, char** argv) {
  quorrel::tool::useBinaryStandardStreams();
  std::string command;
  try {
    const Options options = parseOptions(argc, argv);
    if (!options.words.empty()) command = options.words[0];
    if (!options.mistake.empty()) throw UsageError(options.mistake);
    if (options.help) {
      const auto help = kCommandHelp.find(command);
      std::cout << (help == kCommandHelp.end() ? kMainHelp : help->second);
      return 0;
    }
    if (options.words.empty()) throw UsageError("no command given");
    return dispatch(options);
  } catch (const UsageError& error) {
    std::cerr << "quorrel: " << error.what() << "\nTry 'quorrel "
              << (kCommandHelp.count(command) ? command + " " : "") << "--help'.\n";
    return 2;
  } catch (const quorrel::tool::FileError& error) {
    std::cerr << "quorrel: " << error.what() << '\n';
    return 1;
  } catch (const quorrel::tool::ModuleError& error) {
    std::cerr << "quorrel: " << error.what() << '\n';
    return 1;
  }
}
