#include "catalog.h"

#include <algorithm>
#include <numeric>
#include <stdexcept>

#include "ascii_case.h"
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
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2) \
  {#name, FileUse::file, pathParamOf(#param1)},
#include "host/table.inc"
};

const char* const kExpressionNames[abi::kExpressionCount] = {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) name,
#include "host/table.inc"
};

// Each row's two parameter slots; a slot of type None is not a parameter.
struct Slots {
  const char* type[2];
  const char* meaning[2];
};
const Slots kActionSlots[abi::kActionCount] = {
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2) \
  {{#param1, #param2}, {meaning1, meaning2}},
#include "host/table.inc"
};
const Slots kExpressionSlots[abi::kExpressionCount] = {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) \
  {{#param1, #param2}, {meaning1, meaning2}},
#include "host/table.inc"
};

// The meaning the table gives a parameter that the routine ignores.
constexpr std::string_view kUnused = "not used";

// A typed name reduced for comparison: lower case, without a trailing "()" or "(".
std::string comparable(std::string_view name) {
  if (name.ends_with("()")) name.remove_suffix(2);
  if (name.ends_with('(')) name.remove_suffix(1);
  return lowerCase(name);
}

size_t editDistance(std::string_view a, std::string_view b) {
  std::vector<size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), size_t{0});
  for (size_t i = 1; i <= a.size(); ++i) {
    size_t diagonal = row[0];
    row[0] = i;
    for (size_t j = 1; j <= b.size(); ++j) {
      const size_t above = row[j];
      row[j] = std::min({row[j] + 1, row[j - 1] + 1, diagonal + (a[i - 1] != b[j - 1])});
      diagonal = above;
    }
  }
  return row[b.size()];
}

int32_t countOf(bool action) {
  return action ? abi::kActionCount : abi::kExpressionCount;
}

bool validCode(bool action, int32_t code) {
  return code >= 0 && code < countOf(action);
}

std::string_view nextLine(std::string_view& text) {
  const size_t end = text.find('\n');
  std::string_view line = text.substr(0, end);
  text = end == std::string_view::npos ? std::string_view{} : text.substr(end + 1);
  if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
  return line;
}

// Whether `name` is a row's name, of either kind.
bool isRowName(std::string_view name) {
  return codeOfName(true, name) || codeOfName(false, name);
}

constexpr const char* kNoteIds[] = {
#define NOTE(kind, id, message) id,
#include "array/notes.inc"
#undef NOTE
};

// Splits "[note: a, b]" or "[no note]" off the end of a bad: line into block.notes;
// what is wrong with it, or nothing.
std::optional<std::string> takeNotes(Description& block, std::string_view& line) {
  constexpr std::string_view kNone = " [no note]";
  constexpr std::string_view kOpen = " [note: ";
  if (line.ends_with(kNone)) {
    line.remove_suffix(kNone.size());
    return std::nullopt;
  }
  const size_t open = line.rfind(kOpen);
  if (open == std::string_view::npos || !line.ends_with(']')) {
    return "a bad: line ends with the notes it leads to, [note: ID, ...], or [no note]";
  }
  std::string_view ids = line.substr(open + kOpen.size());
  ids.remove_suffix(1);
  line = line.substr(0, open);
  for (size_t start = 0; start <= ids.size();) {
    const size_t comma = std::min(ids.find(", ", start), ids.size());
    const std::string_view id = ids.substr(start, comma - start);
    if (std::find(std::begin(kNoteIds), std::end(kNoteIds), id) == std::end(kNoteIds)) {
      return "no note is called " + std::string(id);
    }
    block.notes.emplace_back(id);
    start = comma + 2;
  }
  return std::nullopt;
}

void addLine(Description& block, std::string_view line) {
  if (line.substr(0, 5) == "bad: ") {
    block.bad = line.substr(5);
  } else {
    if (!block.prose.empty()) block.prose += '\n';
    block.prose += line;
  }
}

}  // namespace

const ActionEntry& actionEntry(int32_t code) {
  return kActions[code];
}

std::optional<int32_t> codeOfName(bool action, std::string_view name) {
  for (int32_t code = 0; code < countOf(action); ++code) {
    if (name == nameOf(action, code)) return code;
  }
  return std::nullopt;
}

std::string_view nameOf(bool action, int32_t code) {
  return action ? kActions[code].name : kExpressionNames[code];
}

bool answersText(int32_t expressionCode) {
  const std::string_view name = nameOf(false, expressionCode);
  if (name == "keyStr(") return true;
  return name.ends_with("$(") && name != "keyVal$(" && name != "dimIndexOfIndex$(";
}

std::optional<int32_t> codeOfTypedName(bool action, std::string_view typed) {
  const std::string wanted = comparable(typed);
  if (wanted.empty()) return std::nullopt;
  if (const auto exact = codeOfName(action, typed)) return exact;
  for (int32_t code = 0; code < countOf(action); ++code) {
    if (comparable(nameOf(action, code)) == wanted) return code;
  }
  return std::nullopt;
}

int32_t expressionCode(std::string_view name) {
  if (const auto code = codeOfName(false, name)) return *code;
  throw std::logic_error("no expression " + std::string(name));
}

std::vector<std::string> nearestWords(std::string_view typed,
                                      std::span<const std::string_view> words) {
  const std::string wanted = comparable(typed);
  // A slip: about one key in three wrong, at least one.
  const size_t limit = std::max<size_t>(1, (wanted.size() + 1) / 3);
  std::vector<std::pair<size_t, std::string>> near;
  for (const std::string_view word : words) {
    const size_t distance = editDistance(wanted, comparable(word));
    if (distance <= limit) near.emplace_back(distance, word);
  }
  std::stable_sort(near.begin(), near.end(),
                   [](const auto& a, const auto& b) { return a.first < b.first; });
  std::vector<std::string> nearest;
  for (size_t i = 0; i < near.size() && i < 3; ++i) nearest.push_back(near[i].second);
  return nearest;
}

std::vector<std::string> nearestNames(std::string_view typed) {
  std::vector<std::string_view> names;
  for (const bool action : {true, false}) {
    for (int32_t code = 0; code < countOf(action); ++code) names.push_back(nameOf(action, code));
  }
  return nearestWords(typed, names);
}

std::string_view parameterMeaning(bool action, int32_t code, int param) {
  return (action ? kActionSlots[code] : kExpressionSlots[code]).meaning[param];
}

bool parameterUnused(bool action, int32_t code, int param) {
  return parameterMeaning(action, code, param) == kUnused;
}

std::vector<Parameter> parameters(bool action, int32_t code) {
  const Slots& slots = action ? kActionSlots[code] : kExpressionSlots[code];
  std::vector<Parameter> declared;
  for (int i = 0; i < 2; ++i) {
    if (std::string_view(slots.type[i]) != "None") {
      declared.push_back({std::string_view(slots.type[i]) == "Text", slots.meaning[i]});
    }
  }
  return declared;
}

Prose readProse(std::string_view text) {
  Prose prose;
  Description* block = nullptr;
  for (int number = 1; !text.empty(); ++number) {
    const std::string_view line = nextLine(text);
    const std::string where = std::to_string(number) + ": ";
    if (line.empty() || line.front() == '#') continue;
    if (line.substr(0, 3) == "== ") {
      const std::string_view name = line.substr(3);
      if (!isRowName(name)) prose.problems.push_back(where + std::string(name) + " names no row");
      const auto [at, added] = prose.blocks.try_emplace(std::string(name));
      if (!added) prose.problems.push_back(where + std::string(name) + " twice");
      block = &at->second;
    } else if (block == nullptr) {
      prose.problems.push_back(where + "text before the first block");
    } else if (line.substr(0, 6) == "param:") {
      prose.problems.push_back(where + "parameters are described in host/table.inc");
    } else if (line.starts_with("example: ")) {
      block->example.emplace_back(line.substr(9));
    } else {
      std::string_view text = line;
      if (text.substr(0, 5) == "bad: ") {
        if (const auto problem = takeNotes(*block, text))
          prose.problems.push_back(where + *problem);
      }
      addLine(*block, text);
    }
  }
  for (const char* id : kNoteIds) {
    const bool named = std::any_of(prose.blocks.begin(), prose.blocks.end(), [&](const auto& b) {
      return std::find(b.second.notes.begin(), b.second.notes.end(), id) != b.second.notes.end();
    });
    if (!named) prose.problems.push_back(std::string("no bad: line leads to note ") + id);
  }
  for (bool action : {true, false}) {
    for (int32_t code = 0; validCode(action, code); ++code) {
      if (!prose.blocks.count(nameOf(action, code))) {
        prose.problems.push_back("no description for " + std::string(nameOf(action, code)));
      }
    }
  }
  return prose;
}

std::optional<Description> describe(bool action, int32_t code) {
  if (!validCode(action, code)) return std::nullopt;
  static const Prose prose = readProse(kDescriptionsText);
  const auto found = prose.blocks.find(nameOf(action, code));
  if (found == prose.blocks.end()) return std::nullopt;
  Description description = found->second;
  for (const Parameter& parameter : parameters(action, code)) {
    description.params.emplace_back(parameter.meaning);
  }
  return description;
}

}  // namespace quorrel::tool
