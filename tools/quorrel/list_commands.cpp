// `quorrel list`: every action and expression with its code, name, parameters and menu
// path, or the help page's description of one of them.
#include <iostream>
#include <map>
#include <sstream>

#include "catalog.h"
#include "commands.h"

namespace quorrel::tool {
namespace {

// Command ids of the resource script's menus: the base plus the code.
constexpr int32_t kActionMenuBase = 25000;
constexpr int32_t kExpressionMenuBase = 27000;

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

std::optional<Entry> find(const Module& module, std::string_view what) {
  if (const auto code = actionCodeOfName(what)) return Entry{true, *code};
  if (const auto code = module.expressionCodeOfName(what)) return Entry{false, *code};
  // An expression name may be given without its "(".
  if (const auto code = module.expressionCodeOfName(std::string(what) + "(")) {
    return Entry{false, *code};
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
    for (int32_t code = 0; code < count; ++code) {
      const Entry e{action, code};
      const auto path = paths.find(code);
      out << (action ? 'A' : 'E') << code << ' ' << nameOf(module, e)
          << parameters(module, e, describe(action, code)) << "  ["
          << (path == paths.end() ? "no menu" : path->second) << "]\n";
    }
  }
}

bool printDescription(const Module& module, std::string_view what, std::ostream& out) {
  if (looksLikeInteger(what)) {
    // A bare code names both an action and an expression.
    bool found = false;
    for (const char kind : {'A', 'E'}) {
      if (const auto e = find(module, kind + std::string(what))) {
        if (found) out << '\n';
        printOne(module, *e, out);
        found = true;
      }
    }
    return found;
  }
  const auto e = find(module, what);
  if (e) printOne(module, *e, out);
  return e.has_value();
}

int listCommand(const Module& module, const std::string& what) {
  if (what.empty() || what == "actions" || what == "expressions") {
    printCatalog(module, what, std::cout);
    return 0;
  }
  if (!printDescription(module, what, std::cout)) {
    throw UsageError("no action or expression is called " + what +
                     " (quorrel list shows every name)");
  }
  return 0;
}

}  // namespace quorrel::tool
