#include "table_resources.h"

#include <map>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "host/abi.h"

namespace rcgen {
namespace {

using quorrel::abi::kActionCommandBase;
using quorrel::abi::kActionMenuId;
using quorrel::abi::kExpressionCommandBase;
using quorrel::abi::kExpressionMenuId;
constexpr int kActionDisplayBase = quorrel::abi::kActionStringBase;
constexpr int kExpressionNameBase = quorrel::abi::kExpressionStringBase;

struct Row {
  int code;
  std::string name;
  std::string menuText;
  std::string display;  // actions only
  int params;
};

// One step of a menu's layout, in the table's order.
struct Step {
  enum Kind { Menu, Popup, Item, Separator, End } kind;
  std::string text;  // the menu's kind, the popup's text or the item's name
};

int countParams(std::string_view param1, std::string_view param2) {
  return (param1 != "None") + (param2 != "None");
}

const std::vector<Row> kActions = {
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2) \
  {code, #name, menuText, display, countParams(#param1, #param2)},
#include "host/table.inc"
};

const std::vector<Row> kExpressions = {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) \
  {code, name, menuText, "", countParams(#param1, #param2)},
#include "host/table.inc"
};

const std::vector<Step> kLayout = {
#define MENU(kind) {Step::Menu, #kind},
#define MENU_POPUP(text) {Step::Popup, text},
#define MENU_ITEM(name) {Step::Item, name},
#define MENU_SEPARATOR() {Step::Separator, ""},
#define MENU_END() {Step::End, ""},
#include "host/table.inc"
};

// A resource script literal: quotes are doubled.
std::string quoted(std::string_view text) {
  std::string out = "\"";
  for (char c : text) out += c == '"' ? std::string("\"\"") : std::string(1, c);
  return out + "\"";
}

int placeholders(std::string_view text) {
  int count = 0;
  for (size_t at = text.find("%s"); at != std::string_view::npos; at = text.find("%s", at + 2)) {
    ++count;
  }
  return count;
}

void checkRows(const std::vector<Row>& rows, bool actions) {
  const std::string kind = actions ? "action " : "expression ";
  for (size_t i = 0; i < rows.size(); ++i) {
    const Row& row = rows[i];
    const std::string what = kind + std::to_string(row.code) + " (" + row.name + ")";
    if (row.code != static_cast<int>(i)) throw std::runtime_error(what + " is out of code order");
    if (row.menuText.empty()) throw std::runtime_error(what + " has no menu text");
    if (actions && placeholders(row.display) != row.params + 1) {
      throw std::runtime_error(what + ": its display needs one %s for the object and one for " +
                               "each parameter");
    }
  }
}

// The steps of one menu, from its MENU line up to the next.
std::vector<Step> menuSteps(std::string_view kind) {
  std::vector<Step> steps;
  bool inside = false;
  for (const Step& step : kLayout) {
    if (step.kind == Step::Menu) {
      inside = step.text == kind;
    } else if (inside) {
      steps.push_back(step);
    }
  }
  return steps;
}

class MenuWriter {
 public:
  MenuWriter(const std::vector<Row>& rows, int commandBase)
      : rows_(rows), commandBase_(commandBase), placed_(rows.size(), false) {}

  std::string write(int menuId, const std::vector<Step>& steps) {
    out_ = std::to_string(menuId) + " MENU\nBEGIN\n  POPUP \"\"\n  BEGIN\n";
    int depth = 2;
    for (const Step& step : steps) depth = writeStep(step, depth);
    if (depth != 2) throw std::runtime_error("a MENU_POPUP has no MENU_END");
    for (size_t code = 0; code < rows_.size(); ++code) {
      if (!placed_[code]) throw std::runtime_error(rows_[code].name + " has no menu item");
    }
    return out_ + "  END\nEND\n";
  }

 private:
  int writeStep(const Step& step, int depth) {
    const std::string indent(2 * depth, ' ');
    switch (step.kind) {
      case Step::Popup:
        out_ += indent + "POPUP " + quoted(step.text) + "\n" + indent + "BEGIN\n";
        return depth + 1;
      case Step::End:
        if (depth == 2) throw std::runtime_error("a MENU_END closes no MENU_POPUP");
        out_ += std::string(2 * (depth - 1), ' ') + "END\n";
        return depth - 1;
      case Step::Separator:
        out_ += indent + "MENUITEM SEPARATOR\n";
        return depth;
      case Step::Item:
        out_ +=
            indent + "MENUITEM " + quoted(itemText(step.text)) + ", " + itemId(step.text) + "\n";
        return depth;
      case Step::Menu:
        break;
    }
    return depth;
  }

  size_t codeOf(const std::string& name) const {
    for (size_t code = 0; code < rows_.size(); ++code) {
      if (rows_[code].name == name) return code;
    }
    throw std::runtime_error("MENU_ITEM(\"" + name + "\") names no row of its menu");
  }
  const std::string& itemText(const std::string& name) {
    const size_t code = codeOf(name);
    if (placed_[code]) throw std::runtime_error(name + " has two menu items");
    placed_[code] = true;
    return rows_[code].menuText;
  }
  std::string itemId(const std::string& name) const {
    return std::to_string(commandBase_ + static_cast<int>(codeOf(name)));
  }

  const std::vector<Row>& rows_;
  int commandBase_;
  std::vector<bool> placed_;
  std::string out_;
};

std::string stringTable(const std::string& comment, const std::vector<std::string>& lines) {
  std::string out = comment + "STRINGTABLE\nBEGIN\n";
  for (const std::string& line : lines) out += "  " + line + "\n";
  return out + "END\n";
}

std::string actionStrings() {
  std::vector<std::string> lines;
  for (const Row& row : kActions) {
    // The host reads "10" before a display without parameters and "11" before one with.
    const std::string text = (row.params == 0 ? "10" : "11") + row.display;
    lines.push_back(std::to_string(kActionDisplayBase + row.code) + " " + quoted(text));
  }
  return stringTable(
      "// Action display strings: 28200 + action code. \"10\" marks an action without\n"
      "// parameters, \"11\" one with parameters; the host fills the placeholders.\n",
      lines);
}

std::string expressionStrings() {
  std::vector<std::string> lines;
  for (const Row& row : kExpressions) {
    lines.push_back(std::to_string(kExpressionNameBase + row.code) + " " + quoted(row.name));
  }
  return stringTable("// Expression names: 28400 + expression code.\n", lines);
}

}  // namespace

std::string tableResources() {
  checkRows(kActions, true);
  checkRows(kExpressions, false);
  return "// Action menu: command id 25000 + action code.\n" +
         MenuWriter(kActions, kActionCommandBase).write(kActionMenuId, menuSteps("Action")) +
         "\n// Expression menu: command id 27000 + expression code.\n" +
         MenuWriter(kExpressions, kExpressionCommandBase)
             .write(kExpressionMenuId, menuSteps("Expression")) +
         "\n" + actionStrings() + "\n" + expressionStrings();
}

}  // namespace rcgen
