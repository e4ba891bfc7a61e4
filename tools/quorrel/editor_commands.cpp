// `quorrel menu` and `quorrel strings`: what the editor receives from the module.
#include <iostream>

#include "commands.h"

namespace quorrel::tool {

namespace {

// One line per item, indented two spaces a level: a popup's quoted title, a command's
// id and quoted title, or "-" for a separator.
void printMenu(const std::vector<MenuItem>& items, int depth) {
  for (const MenuItem& item : items) {
    std::cout << std::string(2 * depth, ' ');
    if (item.popup) {
      std::cout << quoteText(item.text) << '\n';
      printMenu(item.items, depth + 1);
    } else if (item.id == 0) {
      std::cout << "-\n";
    } else {
      std::cout << item.id << ' ' << quoteText(item.text) << '\n';
    }
  }
}

}  // namespace

int menuCommand(const Module& module, const std::string& which) {
  printMenu(module.menu(which), 0);
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
