#include "catalog.h"

#include "host/abi.h"

namespace quorrel::tool {

// The help page's prose (help/descriptions.txt), compiled in.
extern const char* const kDescriptionsText;

namespace {

// The first text parameter of a file action is its path.
constexpr int pathParamOf(std::string_view param1) {
  return param1 == "Text" ? 0 : 1;
}

const ActionEntry kActions[abi::kActionCount] = {
#define ACTION(code, name, param1, param2, file, meaning1, meaning2) \
  {#name, FileUse::file, pathParamOf(#param1)},
#include "host/table.inc"
};

// What each parameter is, by code; empty past the last one.
struct Meanings {
  const char* param[2];
};
const Meanings kActionMeanings[abi::kActionCount] = {
#define ACTION(code, name, param1, param2, file, meaning1, meaning2) {{meaning1, meaning2}},
#include "host/table.inc"
};
const Meanings kExpressionMeanings[abi::kExpressionCount] = {
#define EXPRESSION(code, name, routine, param1, param2, meaning1, meaning2) {{meaning1, meaning2}},
#include "host/table.inc"
};

// The text after a "name:" prefix, blanks before it skipped.
std::string afterPrefix(std::string_view line, size_t prefix) {
  line.remove_prefix(prefix);
  const size_t start = line.find_first_not_of(' ');
  return std::string(start == std::string_view::npos ? std::string_view{} : line.substr(start));
}

std::string_view nextLine(std::string_view& text) {
  const size_t end = text.find('\n');
  const std::string_view line = text.substr(0, end);
  text = end == std::string_view::npos ? std::string_view{} : text.substr(end + 1);
  return line;
}

}  // namespace

const ActionEntry& actionEntry(int32_t code) {
  return kActions[code];
}

std::optional<int32_t> actionCodeOfName(std::string_view name) {
  for (int32_t code = 0; code < abi::kActionCount; ++code) {
    if (name == kActions[code].name) return code;
  }
  return std::nullopt;
}

std::optional<Description> describe(bool action, int32_t code) {
  if (code < 0 || code >= (action ? abi::kActionCount : abi::kExpressionCount)) return std::nullopt;
  const std::string header = (action ? "== A" : "== E") + std::to_string(code);
  std::string_view text = kDescriptionsText;
  while (!text.empty() && nextLine(text) != header) {
  }
  if (text.empty()) return std::nullopt;
  Description description;
  const Meanings& meanings = action ? kActionMeanings[code] : kExpressionMeanings[code];
  for (const char* meaning : meanings.param) {
    if (*meaning != '\0') description.params.emplace_back(meaning);
  }
  while (!text.empty() && text.substr(0, 3) != "== ") {
    const std::string_view line = nextLine(text);
    if (line.substr(0, 4) == "bad:") {
      description.bad = afterPrefix(line, 4);
    } else if (!line.empty()) {
      if (!description.prose.empty()) description.prose += '\n';
      description.prose += line;
    }
  }
  return description;
}

}  // namespace quorrel::tool
