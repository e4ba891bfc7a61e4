// Writes the manual page and the bash completion from their templates, filling in
// what comes from the command's table (command_line.inc):
//   command_line_docs MAN_TEMPLATE MAN_PAGE BASH_TEMPLATE BASH_COMPLETION
// Run at build time, so that neither can disagree with the command.
#include <cctype>
#include <fstream>
#include <iostream>
#include <sstream>
#include <string>
#include <vector>

#include "command_line.h"

namespace cli = quorrel::tool::cli;

namespace {

// Text as roff prints it: backslashes and hyphens escaped, no line read as a request.
std::string roff(std::string_view text) {
  std::string out;
  for (const char c : text) {
    if (c == '\\') {
      out += "\\e";
    } else if (c == '-') {
      out += "\\-";
    } else {
      out += c;
    }
  }
  return out;
}

// A table's help line as a sentence of its own: "Print each E line ... locale)."
std::string sentence(std::string text) {
  text[0] = static_cast<char>(std::toupper(static_cast<unsigned char>(text[0])));
  return text.ends_with('.') ? text : text + '.';
}

std::string optionName(const cli::Option& option) {
  return *option.longName ? option.longName : option.shortName;
}

// One .B/.I pair per synopsis element.
std::string manSynopsisOptions(cli::CommandSet set) {
  std::string out;
  for (const cli::Option& option : cli::options()) {
    if (!cli::selected(option, set) || cli::answersAlone(option)) continue;
    const std::string tail = cli::repeats(option) ? " ]..." : " ]";
    if (*option.value) {
      out += ".RB [ " + roff(optionName(option)) + "\n.IR " + option.value + tail + '\n';
    } else {
      out += ".RB [ " + roff(optionName(option)) + tail + '\n';
    }
  }
  return out;
}

std::string manSynopsis() {
  std::string out =
      ".B quorrel\n" + manSynopsisOptions(cli::sets::Every) + ".I COMMAND\n.RI [ ARGS ]\n";
  for (const cli::Command& command : cli::commands()) {
    out += ".br\n.B quorrel " + std::string(command.name) + '\n' +
           manSynopsisOptions(cli::setOf(command.id));
    if (*command.operands) out += ".I \"" + roff(command.operands) + "\"\n";
  }
  return out;
}

// "(run, shell) " before the help of an option that only some commands take.
std::string owners(const cli::Option& option) {
  if (option.commands == cli::sets::Every) return "";
  std::string names = cli::commandNames(option.commands);
  for (size_t at = names.find(" and "); at != std::string::npos; at = names.find(" and ")) {
    names.replace(at, 5, ", ");
  }
  return "(" + names + ") ";
}

std::string manOptions() {
  std::string out;
  for (const cli::Option& option : cli::options()) {
    out += ".TP\n";
    if (*option.shortName) out += "\\fB" + roff(option.shortName) + "\\fR";
    if (*option.shortName && *option.longName) out += ", ";
    if (*option.longName) out += "\\fB" + roff(option.longName) + "\\fR";
    if (*option.value) out += " \\fI" + std::string(option.value) + "\\fR";
    out += '\n' + roff(owners(option) + sentence(option.help)) + '\n';
  }
  return out;
}

std::string manShellWords() {
  std::string out;
  for (const cli::ShellWord& word : cli::shellWords()) {
    out += ".TP\n.B \"" + roff(cli::synopsis(word)) + "\"\n" + roff(sentence(word.summary)) + '\n';
  }
  return out;
}

// The option's names, as bash sees them: "--help | -h".
std::string namesOf(const cli::Option& option) {
  std::string names = option.longName;
  if (*option.shortName) names += (names.empty() ? "" : " | ") + std::string(option.shortName);
  return names;
}

// The words Tab offers for `completes`, an expression's name without its "(".
std::string bashWords(std::string_view completes) {
  std::string out;
  for (std::string word : cli::completionWords(completes)) {
    if (word.ends_with('(')) word.pop_back();
    out += (out.empty() ? "" : " ") + word;
  }
  return out;
}

std::string bashValueCases() {
  std::string out;
  for (const cli::Option& option : cli::options()) {
    if (!*option.value) continue;
    const std::string_view completes = option.completes;
    out += "    " + namesOf(option) + ") ";
    if (completes == "<file>") {
      out += "COMPREPLY=($(compgen -f -- \"$cur\")); ";
    } else if (!completes.empty()) {
      out += "_quorrel_add '" + bashWords(completes) + "'; ";
    }
    out += "return ;;\n";
  }
  return out;
}

std::string bashOptions(cli::CommandSet set) {
  std::string out;
  for (const cli::Option& option : cli::options()) {
    if (!cli::selected(option, set) && option.commands != cli::sets::Every) continue;
    for (const char* name : {option.longName, option.shortName}) {
      if (*name) out += (out.empty() ? "" : " ") + std::string(name);
    }
  }
  return out;
}

std::string bashCommandCases() {
  std::string commands;
  for (const cli::Command& command : cli::commands()) {
    commands += (commands.empty() ? "" : " ") + std::string(command.name);
  }
  std::string out =
      "    \"\") options='" + bashOptions(cli::sets::Every) + "'; words='" + commands + "' ;;\n";
  for (const cli::Command& command : cli::commands()) {
    const std::string_view completes = command.completes;
    out += "    " + std::string(command.name) + ") options='" +
           bashOptions(cli::setOf(command.id)) + "'; words='" + bashWords(completes) + "'" +
           (completes.find("<file>") != std::string_view::npos ? "; files=1" : "") + " ;;\n";
  }
  return out;
}

std::string commandPattern() {
  std::string out;
  for (const cli::Command& command : cli::commands()) {
    out += (out.empty() ? "" : " | ") + std::string(command.name);
  }
  return out;
}

// The template with each @NAME@ replaced; a trailing line break of a value is dropped,
// since the template's line has its own.
bool fill(const char* from, const char* to,
          const std::vector<std::pair<std::string, std::string>>& values) {
  std::ifstream in(from, std::ios::binary);
  std::stringstream text;
  text << in.rdbuf();
  if (!in) {
    std::cerr << "command_line_docs: cannot read " << from << '\n';
    return false;
  }
  std::string out = text.str();
  for (auto [name, value] : values) {
    if (value.ends_with('\n')) value.pop_back();
    const size_t at = out.find(name);
    if (at == std::string::npos) {
      std::cerr << "command_line_docs: " << from << " has no " << name << '\n';
      return false;
    }
    out.replace(at, name.size(), value);
  }
  std::ofstream file(to, std::ios::binary);
  file << out;
  if (!file.flush()) std::cerr << "command_line_docs: cannot write " << to << '\n';
  return static_cast<bool>(file);
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 5) {
    std::cerr << "usage: command_line_docs MAN_TEMPLATE MAN_PAGE BASH_TEMPLATE BASH_COMPLETION\n";
    return 2;
  }
  const bool man = fill(argv[1], argv[2],
                        {{"@SYNOPSIS@", manSynopsis()},
                         {"@SHOW_OPTIONS@", roff(cli::synopsisOptions(cli::sets::Show))},
                         {"@OPTIONS@", manOptions()},
                         {"@SHELL_WORDS@", manShellWords()}});
  const bool bash = fill(argv[3], argv[4],
                         {{"@COMMAND_PATTERN@", commandPattern()},
                          {"@VALUE_CASES@", bashValueCases()},
                          {"@COMMAND_CASES@", bashCommandCases()}});
  return man && bash ? 0 : 1;
}
