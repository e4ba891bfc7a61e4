// `quorrel menu` and `quorrel strings`: what the editor receives from the module.
#include <iostream>

#include "commands.h"

namespace quorrel::tool {

int menuCommand(const Module& module, const std::string& which) {
  std::string out;
  module.printMenu(which, out);
  std::cout << out;
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
