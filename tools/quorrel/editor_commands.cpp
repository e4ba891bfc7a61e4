// `quorrel menu` and `quorrel strings`: what the editor receives from the module.
#include <iostream>

#include "commands.h"

namespace quorrel::tool {

namespace {

// The state flags an item shows beyond what its line says, e.g. " [grayed checked]".
std::string unusualState(const MenuItem& item) {
  std::string flags;
  const unsigned expected = item.popup ? 0x10 : 0;
  for (auto [bit, name] :
       {std::pair{0x01u, "grayed"}, {0x02u, "disabled"}, {0x08u, "checked"}, {0x10u, "popup"}}) {
    if ((item.state & bit) != (expected & bit)) {
      flags += std::string(flags.empty() ? "" : " ") + ((item.state & bit) ? "" : "not ") + name;
    }
  }
  return flags.empty() ? flags : " [" + flags + "]";
}

// One line per item, indented two spaces a level: a popup's quoted title, a command's
// id and quoted title, or "-" for a separator; a popup or command then shows any
// unusual state.
void printMenu(const std::vector<MenuItem>& items, int depth) {
  for (const MenuItem& item : items) {
    std::cout << std::string(2 * depth, ' ');
    if (item.popup) {
      std::cout << quoteText(item.text) << unusualState(item) << '\n';
      printMenu(item.items, depth + 1);
    } else if (item.id == 0) {
      std::cout << "-\n";  // Windows reports separators grayed and disabled; nothing to see
    } else {
      std::cout << item.id << ' ' << quoteText(item.text) << unusualState(item) << '\n';
    }
  }
}

}  // namespace

int menuCommand(const Module& module, const std::string& which) {
  const std::vector<MenuItem> menu = module.menu(which);
  // Empty output alone would look like a failure to read the menu.
  if (menu.empty())
    std::cerr << "quorrel: the " << which << " menu is empty: the object has no " << which << '\n';
  printMenu(menu, 0);
  return 0;
}

int stringsCommand(const Module& module, const std::string& which) {
  const bool actions = which == "actions";
  const int32_t count = actions ? abi::kActionCount : abi::kExpressionCount;
  for (int32_t code = 0; code < count; ++code) {
    const std::string string = actions ? module.actionString(code) : module.expressionString(code);
    const std::string title = actions ? module.actionTitle(code, 0) : module.expressionTitle(code);
    std::cout << code << ' ' << quoteText(string) << ' ' << quoteText(title) << '\n';
  }
  return 0;
}

}  // namespace quorrel::tool
