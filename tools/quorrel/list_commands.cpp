// `quorrel list`: every action and expression with its code, name, parameters and menu
// path, or the help page's description of one of them.
#include <iostream>
#include <map>
#include <sstream>

#include "ascii_case.h"
#include "catalog.h"
#include "commands.h"

namespace quorrel::tool {
namespace {

constexpr int32_t kActionMenuBase = abi::kActionCommandBase;
constexpr int32_t kExpressionMenuBase = abi::kExpressionCommandBase;

// Code -> "Top > Sub > Item", read from the menu tree as the editor receives it.
void addMenuPaths(const std::vector<MenuItem>& items, const std::string& prefix, int32_t base,
                  std::map<int32_t, std::string>& paths) {
  for (const MenuItem& item : items) {
    if (item.popup) {
      addMenuPaths(item.items, prefix + item.text + " > ", base, paths);
    } else if (item.id != 0) {
      paths[static_cast<int32_t>(item.id) - base] = prefix + item.text;
    }
  }
}

std::map<int32_t, std::string> menuPaths(const Module& module, bool actions) {
  std::map<int32_t, std::string> paths;
  addMenuPaths(module.menu(actions ? "actions" : "expressions"), "",
               actions ? kActionMenuBase : kExpressionMenuBase, paths);
  return paths;
}

struct Entry {
  bool action;
  int32_t code;
};

std::string nameOf(const Module& module, Entry e) {
  return e.action ? actionEntry(e.code).name : module.expressionString(e.code);
}

const char* typeName(const Module& module, Entry e, int param) {
  const Signature s =
      e.action ? module.actionSignature(e.code) : module.expressionSignature(e.code);
  const uint16_t text = e.action ? abi::kActionParamText : abi::kExpressionParamText;
  return s.paramTypes[param] == text ? "text" : "number";
}

int paramCount(const Module& module, Entry e) {
  return (e.action ? module.actionSignature(e.code) : module.expressionSignature(e.code))
      .paramCount;
}

// "(text: the label text, number: column index)"; an expression's name has the "(".
std::string parameters(const Module& module, Entry e, const std::optional<Description>& d) {
  std::string out = e.action ? "(" : "";
  for (int i = 0; i < paramCount(module, e); ++i) {
    if (i) out += ", ";
    out += typeName(module, e, i);
    if (d && i < static_cast<int>(d->params.size())) out += ": " + d->params[i];
  }
  return out + ")";
}

void wrap(std::string_view text, std::ostream& out) {
  constexpr size_t kWidth = 78;
  size_t column = 0;
  while (!text.empty()) {
    const size_t end = text.find_first_of(" \n");
    const std::string_view word = text.substr(0, end);
    if (column > 0 && column + 1 + word.size() > kWidth) {
      out << '\n';
      column = 0;
    } else if (column > 0) {
      out << ' ';
      ++column;
    }
    out << word;
    column += word.size();
    if (end == std::string_view::npos) break;
    if (text[end] == '\n') {
      out << "\n";
      column = 0;
    }
    text.remove_prefix(end + 1);
  }
  if (column > 0) out << '\n';
}

std::optional<Entry> find(std::string_view what) {
  for (const bool action : {true, false}) {
    if (const auto code = codeOfTypedName(action, what)) return Entry{action, *code};
  }
  if (what.size() > 1 && (what[0] == 'A' || what[0] == 'E') && looksLikeInteger(what.substr(1))) {
    const bool action = what[0] == 'A';
    try {
      const int32_t code = parseInteger(what.substr(1));
      if (code >= 0 && code < (action ? abi::kActionCount : abi::kExpressionCount)) {
        return Entry{action, code};
      }
    } catch (const ScriptError&) {
    }
  }
  return std::nullopt;
}

// The catalogue line of an action or expression: "A48 setLabel(text: ..., number: ...)  [menu]";
// a menu path that would take it past 120 columns goes on a line of its own.
std::string catalogLine(const Module& module, Entry e,
                        const std::map<int32_t, std::string>& paths) {
  constexpr size_t kWidth = 120;
  const auto path = paths.find(e.code);
  const std::string call = (e.action ? "A" : "E") + std::to_string(e.code) + ' ' +
                           nameOf(module, e) + parameters(module, e, describe(e.action, e.code));
  const std::string menu = "[" + (path == paths.end() ? "no menu" : path->second) + "]";
  const bool fits = printedWidth(call) + 2 + printedWidth(menu) <= kWidth;
  return call + (fits ? "  " : "\n    ") + menu;
}

// Every entry whose name, menu path, parameters or description holds `word`, in any
// case; returns whether there was one.
bool printMatches(const Module& module, std::string_view word, std::ostream& out) {
  const std::string wanted = lowerCase(word);
  bool found = false;
  for (const bool action : {true, false}) {
    const auto paths = menuPaths(module, action);
    for (int32_t code = 0; code < (action ? abi::kActionCount : abi::kExpressionCount); ++code) {
      const Entry e{action, code};
      const std::string line = catalogLine(module, e, paths);
      const auto d = describe(action, code);
      if (lowerCase(line + '\n' + (d ? d->prose + '\n' + d->bad : "")).find(wanted) ==
          std::string::npos) {
        continue;
      }
      out << line << '\n';
      found = true;
    }
  }
  return found;
}

void printOne(const Module& module, Entry e, std::ostream& out) {
  const auto paths = menuPaths(module, e.action);
  const auto d = describe(e.action, e.code);
  const std::string name = nameOf(module, e);
  out << (e.action ? "action " : "expression ") << e.code << "  " << name << '\n';
  const auto path = paths.find(e.code);
  if (path != paths.end()) out << "menu        " << path->second << '\n';
  const int count = paramCount(module, e);
  for (int i = 0; i < count; ++i) {
    out << "parameter " << i + 1 << " " << typeName(module, e, i);
    if (d && i < static_cast<int>(d->params.size())) out << ": " << d->params[i];
    out << '\n';
  }
  out << "script      " << (e.action ? "A " : "E ") << name;
  for (int i = 0; i < count; ++i) {
    out << (std::string_view(typeName(module, e, i)) == "text" ? " \"TEXT\"" : " NUMBER");
  }
  out << '\n';
  if (d) {
    out << '\n';
    wrap(d->prose, out);
    if (!d->bad.empty()) {
      out << '\n';
      wrap("Bad input: " + d->bad, out);
    }
  }
}

}  // namespace

void printCatalog(const Module& module, std::string_view which, std::ostream& out) {
  for (const bool action : {true, false}) {
    if (which == (action ? "expressions" : "actions")) continue;
    const auto paths = menuPaths(module, action);
    const int32_t count = action ? abi::kActionCount : abi::kExpressionCount;
    for (int32_t code = 0; code < count; ++code)
      out << catalogLine(module, {action, code}, paths) << '\n';
  }
}

bool printDescription(const Module& module, std::string_view what, std::ostream& out) {
  if (looksLikeInteger(what)) {
    // A bare code names both an action and an expression.
    bool found = false;
    for (const char kind : {'A', 'E'}) {
      if (const auto e = find(kind + std::string(what))) {
        if (found) out << '\n';
        printOne(module, *e, out);
        found = true;
      }
    }
    return found;
  }
  const auto e = find(what);
  if (e) printOne(module, *e, out);
  return e.has_value() || (!what.empty() && printMatches(module, what, out));
}

int listCommand(const Module& module, const std::string& what) {
  if (what.empty() || what == "actions" || what == "expressions") {
    printCatalog(module, what, std::cout);
    return 0;
  }
  if (!printDescription(module, what, std::cout)) {
    std::string near;
    for (const std::string& name : nearestNames(what)) near += (near.empty() ? " " : ", ") + name;
    throw UsageError("no action or expression is called " + what + " or mentions it" +
                     (near.empty() ? "" : "; did you mean:" + near) +
                     " (quorrel list shows every name)");
  }
  return 0;
}

}  // namespace quorrel::tool
