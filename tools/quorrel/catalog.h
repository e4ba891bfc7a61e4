// What a person needs to call an action or expression by name: the action names, the
// file each file action opens and what each parameter is (all from host/table.inc),
// and the help page's prose.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quorrel::tool {

// How a file action uses the path in its parameter `pathParam` (0 or 1).
enum class FileUse { None, Read, Write, Extend };

struct ActionEntry {
  const char* name;
  FileUse file = FileUse::None;
  int pathParam = 0;
};

const ActionEntry& actionEntry(int32_t code);
std::optional<int32_t> actionCodeOfName(std::string_view name);

// The help page's words on one action or expression.
struct Description {
  std::vector<std::string> params;  // what each parameter is, in order
  std::string prose;                // paragraphs joined by line breaks
  std::string bad;                  // what bad input does; may be empty
};
std::optional<Description> describe(bool action, int32_t code);

}  // namespace quorrel::tool
