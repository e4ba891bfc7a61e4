// Builds the help page from what the extension itself gives: the menu trees and display
// strings as the editor receives them from the module (through the host simulator), the
// parameters of each row of host/table.inc and the prose of descriptions.txt (both
// through the quorrel command's catalog). It refuses to build a page that misses a row
// or describes one that does not exist, so the page can never drift from the module.
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <map>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "dialog_picture.h"
#include "examples.h"
#include "hostsim/host_simulator.h"
#include "html.h"
#include "pictures.h"
#include "quorrel/catalog.h"
#include "scratch_folder.h"

namespace {

using quorrel::tool::Description;

struct MenuNode {
  int depth = 0;
  enum Kind { Command, Submenu, Separator } kind = Command;
  int id = 0;
  std::string text;
};

// Thrown rather than exiting at once, so that the examples' scratch folder goes too.
[[noreturn]] void fail(const std::string& message) {
  throw std::runtime_error(message);
}

std::string readFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) fail("cannot read " + path);
  std::ostringstream out;
  out << in.rdbuf();
  return out.str();
}

// The module's menu tree as a list of nodes in menu order, each with its depth.
void flatten(const std::vector<quorrel::hostsim::MenuItem>& items, int depth,
             std::vector<MenuNode>& nodes) {
  for (const auto& item : items) {
    if (item.popup) {
      nodes.push_back({depth, MenuNode::Submenu, 0, item.text});
      flatten(item.items, depth + 1, nodes);
    } else {
      nodes.push_back({depth, item.id == 0 ? MenuNode::Separator : MenuNode::Command,
                       static_cast<int>(item.id), item.text});
    }
  }
}

std::map<std::string, Description, std::less<>> readDescriptions(const std::string& path) {
  quorrel::tool::Prose prose = quorrel::tool::readProse(readFile(path));
  if (!prose.problems.empty()) fail(path + ":" + prose.problems.front());
  return std::move(prose.blocks);
}

std::string escape(const std::string& text) {
  return quorrel::help::escapeHtml(text);
}

struct Kind {
  char letter;         // 'A' or 'E'
  const char* anchor;  // "a" or "e"
  int firstId;         // command id of code 0
  int count;
};

struct Examples {
  const quorrel::tool::ModuleLoader& module;
  const quorrel::help::EditorWords& words;
};

struct Generated {
  std::string body;
  std::string toc;
  // For each note id, links to the entries whose bad input gives it.
  std::map<std::string, std::vector<std::string>> noteGivers;
};

using Descriptions = std::map<std::string, Description, std::less<>>;

// One line per paragraph.
std::vector<std::string> paragraphs(const std::string& prose) {
  std::vector<std::string> result;
  std::istringstream in(prose);
  for (std::string line; std::getline(in, line);) result.push_back(line);
  return result;
}

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

// The row's example, run; it must call the row it stands under.
std::string example(const Kind& kind, int code, const Description& d, const Examples& examples) {
  const bool action = kind.letter == 'A';
  const std::string name(quorrel::tool::nameOf(action, code));
  if (d.example.empty()) fail("no example for " + name);
  std::vector<quorrel::help::ExampleLine> lines;
  for (const std::string& text : d.example) lines.push_back(quorrel::help::parseExampleLine(text));
  if (!quorrel::help::callsRow(lines, action, code))
    fail("the example of " + name + " does not call it");
  return quorrel::help::exampleHtml(
      quorrel::help::runExample("the example of " + name, lines, examples.module, examples.words));
}

Generated render(const Kind& kind, const Examples& examples, const Descriptions& descriptions) {
  const quorrel::hostsim::Module& module = examples.module.get();
  const bool action = kind.letter == 'A';
  std::vector<MenuNode> menu;
  flatten(module.menu(action ? "actions" : "expressions"), 0, menu);
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
    const std::string name(quorrel::tool::nameOf(action, code));
    const auto found = descriptions.find(name);
    if (found == descriptions.end()) fail("no description for " + name);
    const Description& d = found->second;
    const std::string display = action ? module.actionString(code) : module.expressionString(code);
    if (display.empty()) fail("no display string for " + name);
    out.body += "<div class=\"entry\" id=\"" + std::string(kind.anchor) + std::to_string(code) +
                "\" data-path=\"" + escape(group) + "\">\n";
    out.body += "<h5>" + escape(node.text) + "</h5>\n";
    out.body += "<div class=\"meta\">" + std::string(kind.letter == 'A' ? "Action" : "Expression") +
                " " + std::to_string(code) + " · menu: " + escape(group) + " › " +
                escape(node.text) + " · " + (kind.letter == 'A' ? "display string " : "name ") +
                "<code>" + escape(display) + "</code> · script <code>" + kind.letter + ' ' +
                escape(name) + "</code></div>\n";
    const auto declared = quorrel::tool::parameters(action, code);
    if (!declared.empty()) {
      out.body += "<ol class=\"params\">\n";
      for (const auto& p : declared) {
        // The host's names of the types: an action takes numbers, an expression integers.
        const char* type = p.isText ? "text" : action ? "number" : "integer";
        out.body += "<li><i>" + std::string(type) + "</i>: " + escape(p.meaning) + "</li>\n";
      }
      out.body += "</ol>\n";
    }
    for (const std::string& p : paragraphs(d.prose)) out.body += "<p>" + escape(p) + "</p>\n";
    out.body += example(kind, code, d, examples);
    if (!d.bad.empty()) {
      const std::string anchor = std::string(kind.anchor) + std::to_string(code);
      out.body += "<p class=\"bad\">Bad input: " + escape(d.bad);
      for (std::size_t i = 0; i < d.notes.size(); ++i) {
        out.body += std::string(i ? ", " : " Note: ") + "<a href=\"#note-" + d.notes[i] +
                    "\"><code>" + d.notes[i] + "</code></a>";
        out.noteGivers[d.notes[i]].push_back("<a href=\"#" + anchor + "\">" + escape(name) +
                                             "</a>");
      }
      out.body += "</p>\n";
    }
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

// Every kind of note with the words it says ("…" for each value) and the entries that
// give it, so that a note's id in a log leads here and on to their paragraphs.
std::string noteKinds(const Generated& actions, const Generated& expressions) {
  struct Kind {
    const char* id;
    const char* message;
  };
  static constexpr Kind kKinds[] = {
#define NOTE(kind, id, message) {id, message},
#include "array/notes.inc"
#undef NOTE
  };
  std::string html = "<dl class=\"notes\">\n";
  for (const Kind& kind : kKinds) {
    std::string words = kind.message;
    for (std::size_t at = words.find("{}"); at != std::string::npos; at = words.find("{}", at)) {
      words.replace(at, 2, "\xE2\x80\xA6");
    }
    std::vector<std::string> givers = {};
    for (const Generated* part : {&actions, &expressions}) {
      const auto found = part->noteGivers.find(kind.id);
      if (found != part->noteGivers.end()) {
        givers.insert(givers.end(), found->second.begin(), found->second.end());
      }
    }
    if (givers.empty()) fail(std::string("no entry gives the note ") + kind.id);
    html += "<dt id=\"note-" + std::string(kind.id) + "\"><code>[" + kind.id + "]</code></dt><dd>" +
            escape(words) + ". Given by ";
    for (std::size_t i = 0; i < givers.size(); ++i) html += (i ? ", " : "") + givers[i];
    html += ".</dd>\n";
  }
  return html + "</dl>\n";
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

// The template's worked examples, "<!--example TITLE" and script lines up to "-->",
// run and shown as every row's example is.
void runWorkedExamples(std::string& page, const Examples& examples) {
  const std::string open = "<!--example ", close = "-->";
  for (std::size_t at = page.find(open); at != std::string::npos; at = page.find(open, at)) {
    const std::size_t end = page.find(close, at);
    if (end == std::string::npos) fail("the template's example is not closed");
    std::istringstream text(page.substr(at + open.size(), end - at - open.size()));
    std::string title, line;
    std::getline(text, title);
    std::vector<quorrel::help::ExampleLine> lines;
    while (std::getline(text, line)) {
      if (!line.empty()) lines.push_back(quorrel::help::parseExampleLine(line));
    }
    const std::string html = quorrel::help::exampleHtml(quorrel::help::runExample(
        "the worked example " + title, lines, examples.module, examples.words));
    page.replace(at, end + close.size() - at, html);
    at += html.size();
  }
}

}  // namespace

int main(int argc, char** argv) {
  std::map<std::string, std::string> args;
  for (int i = 1; i + 1 < argc; i += 2) args[argv[i]] = argv[i + 1];
  try {
    // Paths as given, before the examples make a scratch folder the current one.
    for (const char* path : {"--module", "--descriptions", "--template", "--out"}) {
      if (!args.count(path)) fail(std::string("missing ") + path);
      args[path] = std::filesystem::absolute(args[path]).string();
    }
    const quorrel::tool::ModuleLoader module(args["--module"]);
    const quorrel::help::EditorWords words(module.get());
    const Examples examples{module, words};
    const Descriptions descriptions = readDescriptions(args["--descriptions"]);
    const quorrel::help::ScratchFolder scratch;
    const Generated actions =
        render({'A', "a", quorrel::abi::kActionCommandBase, quorrel::abi::kActionCount}, examples,
               descriptions);
    const Generated expressions =
        render({'E', "e", quorrel::abi::kExpressionCommandBase, quorrel::abi::kExpressionCount},
               examples, descriptions);
    std::string page = readFile(args["--template"]);
    runWorkedExamples(page, examples);
    replace(page, "@@PICTURE_SETUP_DIALOG@@", quorrel::help::setupDialogPicture());
    for (const auto& [name, html] : quorrel::help::drawPictures(module)) {
      replace(page, "@@PICTURE_" + name + "@@", html);
    }
    replace(page, "@@VERSION@@", args.count("--version") ? args["--version"] : "");
    replace(page, "@@TOC_ACTIONS@@", actions.toc);
    replace(page, "@@TOC_EXPRESSIONS@@", expressions.toc);
    replace(page, "@@ACTIONS@@", actions.body);
    replace(page, "@@EXPRESSIONS@@", expressions.body);
    replace(page, "@@NOTE_KINDS@@", noteKinds(actions, expressions));
    checkLinks(page);
    std::ofstream out(args["--out"], std::ios::binary);
    out << page;
    if (!out) fail("cannot write " + args["--out"]);
  } catch (const std::exception& error) {
    std::cerr << "helpgen: " << error.what() << "\n";
    return 1;
  }
  return 0;
}
