// Builds the help page from the data the extension itself uses: the menu trees and
// strings as the editor receives them (printed by `quorrel menu` and `quorrel strings`),
// the parameters of each row of host/table.inc, and the prose of descriptions.txt. It
// refuses to build a page that misses a code or describes one that does not exist, so
// the page can never drift from the module.
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <initializer_list>
#include <iostream>
#include <map>
#include <memory>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

namespace {

struct Description {
  std::vector<std::string> prose;
  std::string bad;
};

struct MenuNode {
  int depth = 0;
  enum Kind { Command, Submenu, Separator } kind = Command;
  int id = 0;
  std::string text;
};

struct CodeStrings {
  std::string display;  // display string or expression name
  std::string title;
};

[[noreturn]] void fail(const std::string& message) {
  std::cerr << "helpgen: " << message << "\n";
  std::exit(1);
}

std::string readFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) fail("cannot read " + path);
  std::ostringstream out;
  out << in.rdbuf();
  return out.str();
}

std::vector<std::string> lines(const std::string& text) {
  std::vector<std::string> result;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    result.push_back(line);
  }
  return result;
}

// Reads one quoted string of the quorrel command's output, undoing its escapes.
std::optional<std::string> parseQuoted(const std::string& line, std::size_t& pos) {
  if (pos >= line.size() || line[pos] != '"') return std::nullopt;
  std::string out;
  for (++pos; pos < line.size(); ++pos) {
    char c = line[pos];
    if (c == '"') {
      ++pos;
      return out;
    }
    if (c != '\\' || pos + 1 >= line.size()) {
      out += c;
      continue;
    }
    char e = line[++pos];
    if (e == 'n')
      out += '\n';
    else if (e == 'r')
      out += '\r';
    else if (e == 't')
      out += '\t';
    else if (e == 'x' && pos + 2 < line.size()) {
      out += static_cast<char>(std::stoi(line.substr(pos + 1, 2), nullptr, 16));
      pos += 2;
    } else {
      out += e;
    }
  }
  return std::nullopt;
}

std::vector<MenuNode> parseMenu(const std::string& path) {
  std::vector<MenuNode> nodes;
  for (const std::string& line : lines(readFile(path))) {
    if (line.empty()) continue;
    std::size_t indent = line.find_first_not_of(' ');
    MenuNode node;
    node.depth = static_cast<int>(indent / 2);
    std::size_t pos = indent;
    if (line[pos] == '-') {
      node.kind = MenuNode::Separator;
    } else if (line[pos] == '"') {
      node.kind = MenuNode::Submenu;
      auto text = parseQuoted(line, pos);
      if (!text) fail("bad menu line in " + path + ": " + line);
      node.text = *text;
    } else {
      node.kind = MenuNode::Command;
      std::size_t space = line.find(' ', pos);
      if (space == std::string::npos) fail("bad menu line in " + path + ": " + line);
      node.id = std::stoi(line.substr(pos, space - pos));
      pos = space + 1;
      auto text = parseQuoted(line, pos);
      if (!text) fail("bad menu line in " + path + ": " + line);
      node.text = *text;
    }
    nodes.push_back(node);
  }
  return nodes;
}

std::map<int, CodeStrings> parseStrings(const std::string& path) {
  std::map<int, CodeStrings> result;
  for (const std::string& line : lines(readFile(path))) {
    if (line.empty()) continue;
    std::size_t space = line.find(' ');
    if (space == std::string::npos) fail("bad strings line in " + path + ": " + line);
    int code = std::stoi(line.substr(0, space));
    std::size_t pos = space + 1;
    auto display = parseQuoted(line, pos);
    ++pos;
    auto title = parseQuoted(line, pos);
    if (!display || !title) fail("bad strings line in " + path + ": " + line);
    result[code] = {*display, *title};
  }
  return result;
}

// "== A6" / "== E12" blocks; see the head of descriptions.txt.
std::map<std::string, Description> parseDescriptions(const std::string& path) {
  std::map<std::string, Description> result;
  Description* current = nullptr;
  int number = 0;
  for (const std::string& line : lines(readFile(path))) {
    ++number;
    if (line.empty() || line[0] == '#') continue;
    if (line.rfind("== ", 0) == 0) {
      std::string key = line.substr(3);
      if (result.count(key)) fail(path + ":" + std::to_string(number) + ": " + key + " twice");
      current = &result[key];
    } else if (current == nullptr) {
      fail(path + ":" + std::to_string(number) + ": text before the first block");
    } else if (line.rfind("param:", 0) == 0) {
      fail(path + ":" + std::to_string(number) + ": parameters are described in host/table.inc");
    } else if (line.rfind("bad: ", 0) == 0) {
      current->bad = line.substr(5);
    } else {
      current->prose.push_back(line);
    }
  }
  return result;
}

// A parameter as the page names it: its type, then what it is.
struct Param {
  const char* type;
  const char* meaning;
};
using Params = std::vector<std::vector<Param>>;  // per code

// The host's names of the types: an action takes numbers, an expression integers.
std::vector<Param> params(const char* numberName, std::initializer_list<Param> declared) {
  std::vector<Param> result;
  for (Param p : declared) {
    if (std::string(p.type) == "Number") result.push_back({numberName, p.meaning});
    if (std::string(p.type) == "Text") result.push_back({"text", p.meaning});
  }
  return result;
}

const Params kActionParams = {
#define ACTION(code, name, param1, param2, file, meaning1, meaning2) \
  params("number", {{#param1, meaning1}, {#param2, meaning2}}),
#include "host/table.inc"
};
const Params kExpressionParams = {
#define EXPRESSION(code, name, routine, param1, param2, meaning1, meaning2) \
  params("integer", {{#param1, meaning1}, {#param2, meaning2}}),
#include "host/table.inc"
};

std::string escape(const std::string& text) {
  std::string out;
  for (char c : text) {
    switch (c) {
      case '&':
        out += "&amp;";
        break;
      case '<':
        out += "&lt;";
        break;
      case '>':
        out += "&gt;";
        break;
      case '"':
        out += "&quot;";
        break;
      default:
        out += c;
    }
  }
  return out;
}

struct Kind {
  char letter;         // 'A' or 'E'
  const char* anchor;  // "a" or "e"
  int firstId;         // command id of code 0
  int count;
};

struct Generated {
  std::string body;
  std::string toc;
};

// The contents as nested lists: each menu level is named once, its groups beneath it,
// so that a narrow column does not repeat "Recordset (2D Array) › Rows (Records) ›".
class Contents {
 public:
  // A group of entries under `path`, headed by the element with id `id`; a level
  // opened here links to the first group beneath it.
  void add(const std::vector<std::string>& path, const std::string& id) {
    std::size_t common = 0;
    while (common < open_.size() && common < path.size() && open_[common].text == path[common]) {
      ++common;
    }
    // A group directly under a level whose subgroups came first needs no entry of its
    // own: it follows them on the page, and the level's entry is already listed.
    closeTo(common);
    for (std::size_t i = open_.size(); i < path.size(); ++i) {
      if (!open_.empty() && !open_.back().hasList) {
        html_ += "\n<ul>\n";
        open_.back().hasList = true;
      }
      html_ += "<li><a href=\"#" + id + "\">" + escape(path[i]) + "</a>";
      open_.push_back({path[i], false});
    }
  }

  std::string finish() {
    closeTo(0);
    return html_ + "</ul>\n";
  }

 private:
  struct Level {
    std::string text;
    bool hasList;
  };

  void closeTo(std::size_t depth) {
    while (open_.size() > depth) {
      html_ += open_.back().hasList ? "</ul></li>\n" : "</li>\n";
      open_.pop_back();
    }
  }

  std::vector<Level> open_;
  std::string html_ = "<ul>\n";
};

Generated render(const Kind& kind, const std::vector<MenuNode>& menu,
                 const std::map<int, CodeStrings>& strings, const Params& params,
                 const std::map<std::string, Description>& descriptions) {
  Generated out;
  std::vector<std::string> path;
  std::vector<bool> seen(static_cast<std::size_t>(kind.count), false);
  std::string currentGroup;
  int groupNumber = 0;
  Contents contents;
  for (const MenuNode& node : menu) {
    path.resize(static_cast<std::size_t>(node.depth));
    if (node.kind == MenuNode::Separator) continue;
    if (node.kind == MenuNode::Submenu) {
      path.push_back(node.text);
      continue;
    }
    int code = node.id - kind.firstId;
    if (code < 0 || code >= kind.count) fail("menu id " + std::to_string(node.id) + " has no code");
    seen[static_cast<std::size_t>(code)] = true;
    std::string group;
    for (std::size_t i = 0; i < path.size(); ++i) group += (i ? " › " : "") + path[i];
    if (group.empty()) group = "Top level";
    if (group != currentGroup) {
      currentGroup = group;
      std::string id = std::string(kind.anchor) + "-group-" + std::to_string(++groupNumber);
      out.body += "<h4 class=\"menu\" id=\"" + id + "\">" + escape(group) + "</h4>\n";
      contents.add(path.empty() ? std::vector<std::string>{group} : path, id);
    }
    std::string key = std::string(1, kind.letter) + std::to_string(code);
    auto found = descriptions.find(key);
    if (found == descriptions.end()) fail("no description for " + key);
    const Description& d = found->second;
    const std::vector<Param>& declared = params[static_cast<std::size_t>(code)];
    auto s = strings.find(code);
    if (s == strings.end()) fail("no display string for " + key);
    out.body +=
        "<div class=\"entry\" id=\"" + std::string(kind.anchor) + std::to_string(code) + "\">\n";
    out.body += "<h5>" + escape(node.text) + "</h5>\n";
    out.body += "<div class=\"meta\">" + std::string(kind.letter == 'A' ? "Action" : "Expression") +
                " " + std::to_string(code) + " · menu: " + escape(group) + " › " +
                escape(node.text) + " · " + (kind.letter == 'A' ? "display string " : "name ") +
                "<code>" + escape(s->second.display) + "</code></div>\n";
    if (!declared.empty()) {
      out.body += "<ol class=\"params\">\n";
      for (const Param& p : declared) {
        out.body += "<li><i>" + std::string(p.type) + "</i>: " + escape(p.meaning) + "</li>\n";
      }
      out.body += "</ol>\n";
    }
    for (const std::string& p : d.prose) out.body += "<p>" + escape(p) + "</p>\n";
    if (!d.bad.empty()) out.body += "<p class=\"bad\">Bad input: " + escape(d.bad) + "</p>\n";
    out.body += "</div>\n";
  }
  out.toc = contents.finish();
  for (int code = 0; code < kind.count; ++code) {
    if (!seen[static_cast<std::size_t>(code)]) {
      fail("code " + std::to_string(code) + " of kind " + kind.letter + " is in no menu");
    }
  }
  return out;
}

void checkNoStrayDescriptions(const std::map<std::string, Description>& descriptions, int actions,
                              int expressions) {
  for (const auto& [key, unused] : descriptions) {
    char letter = key.empty() ? '?' : key[0];
    int limit = letter == 'A' ? actions : letter == 'E' ? expressions : -1;
    int code = -1;
    try {
      std::size_t used = 0;
      code = std::stoi(key.substr(1), &used);
      if (used != key.size() - 1) code = -1;
    } catch (...) {
      code = -1;
    }
    if (limit < 0 || code < 0 || code >= limit) fail("description " + key + " names no code");
  }
}

void replace(std::string& text, const std::string& placeholder, const std::string& value) {
  std::size_t at = text.find(placeholder);
  if (at == std::string::npos) fail("template lacks " + placeholder);
  text.replace(at, placeholder.size(), value);
}

// Every internal link of the page must name an id that exists.
void checkLinks(const std::string& page) {
  std::vector<std::string> ids;
  for (std::size_t at = page.find(" id=\""); at != std::string::npos;
       at = page.find(" id=\"", at + 1)) {
    std::size_t start = at + 5;
    ids.push_back(page.substr(start, page.find('"', start) - start));
  }
  for (std::size_t at = page.find("href=\"#"); at != std::string::npos;
       at = page.find("href=\"#", at + 1)) {
    std::size_t start = at + 7;
    std::string target = page.substr(start, page.find('"', start) - start);
    bool found = false;
    for (const std::string& id : ids) found = found || id == target;
    if (!found) fail("broken internal link #" + target);
  }
}

}  // namespace

int main(int argc, char** argv) {
  std::map<std::string, std::string> args;
  for (int i = 1; i + 1 < argc; i += 2) args[argv[i]] = argv[i + 1];
  for (const char* required :
       {"--descriptions", "--template", "--out", "--menu-actions", "--menu-expressions",
        "--strings-actions", "--strings-expressions"}) {
    if (!args.count(required)) fail(std::string("missing ") + required);
  }
  const int kActions = static_cast<int>(kActionParams.size());
  const int kExpressions = static_cast<int>(kExpressionParams.size());
  auto descriptions = parseDescriptions(args["--descriptions"]);
  checkNoStrayDescriptions(descriptions, kActions, kExpressions);
  Generated actions = render({'A', "a", 25000, kActions}, parseMenu(args["--menu-actions"]),
                             parseStrings(args["--strings-actions"]), kActionParams, descriptions);
  Generated expressions =
      render({'E', "e", 27000, kExpressions}, parseMenu(args["--menu-expressions"]),
             parseStrings(args["--strings-expressions"]), kExpressionParams, descriptions);
  std::string page = readFile(args["--template"]);
  replace(page, "@@VERSION@@", args.count("--version") ? args["--version"] : "");
  replace(page, "@@TOC_ACTIONS@@", actions.toc);
  replace(page, "@@TOC_EXPRESSIONS@@", expressions.toc);
  replace(page, "@@ACTIONS@@", actions.body);
  replace(page, "@@EXPRESSIONS@@", expressions.body);
  checkLinks(page);
  std::ofstream out(args["--out"], std::ios::binary);
  out << page;
  if (!out) fail("cannot write " + args["--out"]);
  return 0;
}
