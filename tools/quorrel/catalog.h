// What a person needs to call an action or expression by name: the names, the file each
// file action opens and each parameter's type and meaning (all from host/table.inc),
// and the help page's prose (help/descriptions.txt), read here for the quorrel command
// and the help page generator alike.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <span>
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
// The code of the action or expression with exactly this name.
std::optional<int32_t> codeOfName(bool action, std::string_view name);

// A declared parameter: a number (an integer, to an expression) or a text.
struct Parameter {
  bool isText;
  const char* meaning;
};
std::vector<Parameter> parameters(bool action, int32_t code);

// Whether an expression answers a text: those named NAME$(, but for keyVal$( and
// dimIndexOfIndex$( (numbers), and keyStr( (a text).
bool answersText(int32_t expressionCode);

// The table's name of an action (appendString) or an expression (size().
std::string_view nameOf(bool action, int32_t code);

// A name as people type it: in any case, with or without the expression's "(" or
// a "()" after it. Exact names are found first.
std::optional<int32_t> codeOfTypedName(bool action, std::string_view typed);

// The code of the expression with exactly this name; throws std::logic_error when the
// table has none (a mistake in the command itself).
int32_t expressionCode(std::string_view name);

// The words nearest to `typed` by edit distance, in any case, nearest first; only
// those near enough to be a slip of the keys, at most three.
std::vector<std::string> nearestWords(std::string_view typed,
                                      std::span<const std::string_view> words);
// The names of either kind nearest to `typed`, as nearestWords.
std::vector<std::string> nearestNames(std::string_view typed);

// What parameter `param` (0 or 1) is, from the table; empty when there is none.
std::string_view parameterMeaning(bool action, int32_t code, int param);
// A parameter the routine ignores, which a call may leave out.
bool parameterUnused(bool action, int32_t code, int param);

// The help page's words on one action or expression.
struct Description {
  // The example's script lines; an E line ends in " → " and the result it prints.
  std::vector<std::string> example;
  std::vector<std::string> params;  // what each parameter is, in order
  std::string prose;                // paragraphs joined by line breaks
  std::string bad;                  // what bad input does; may be empty
  std::vector<std::string> notes;   // the ids of the notes that bad input gives
};
std::optional<Description> describe(bool action, int32_t code);

// The prose of a descriptions text: one block per row, under "== NAME". A "bad:" line
// ends with the notes it leads to, "[note: label-unknown, not-2d]", or "[no note]"
// when what it describes is a plain answer. `problems` names, with line numbers, what
// keeps the text from describing exactly the table and every kind of note.
struct Prose {
  std::map<std::string, Description, std::less<>> blocks;
  std::vector<std::string> problems;
};
Prose readProse(std::string_view text);

}  // namespace quorrel::tool
