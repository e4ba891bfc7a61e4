// The quorrel script language: one command per line, parsed without the module.
// Checks that need the module (declared parameter counts and types, expression
// names) happen when the command runs; see session.h.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "hostsim/records.h"

namespace quorrel::tool {

// A mistake in one script line; the text is what follows "error: ".
struct ScriptError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// The setup record fields a `new` command can set and the arguments of a call are
// the host simulator's own.
using hostsim::Argument;
using hostsim::kMaxDelimiterLength;
using hostsim::SetupFields;

enum class CommandKind { Empty, New, Action, Expression };

struct Command {
  CommandKind kind = CommandKind::Empty;
  SetupFields setup;           // New
  int32_t code = -1;           // Action, Expression; -1 when named
  std::string name;            // Action or Expression given by name
  std::vector<Argument> args;  // typed by their form, checked against the tables when run
  // Per argument, an unquoted word that is not an integer as written (else empty): a
  // text without its quotes or a mistyped number, said when the parameter is known.
  std::vector<std::string> unread;
};

// Splits a line at blanks; a quoted string is one token even with blanks inside.
std::vector<std::string> splitTokens(std::string_view line);

bool isQuotedToken(std::string_view token);
bool looksLikeInteger(std::string_view token);

// Literals: optional sign and decimal digits within int32; "..." with escapes.
int32_t parseInteger(std::string_view token);
std::string parseQuoted(std::string_view token);

// How quoteText prints what is not printable ASCII: every such byte as \xHH, or valid
// UTF-8 as itself (control characters and invalid bytes are still escaped).
enum class TextForm { Escaped, Utf8 };

// Utf8 when the first of LC_ALL, LC_CTYPE and LANG that is set names UTF-8, as a
// terminal's locale does; only the variables are read, so the answer is the same
// wherever the program runs.
TextForm textFormOfEnvironment();
// The form of every quoteText in the process; Escaped until set.
void setTextForm(TextForm form);
TextForm textForm();

// The printed form of a text result: "..." with non-printing bytes escaped.
std::string quoteText(std::string_view bytes);

// The terminal columns of printed text: a UTF-8 sequence counts as one, or two for an
// East Asian wide or fullwidth character.
size_t printedWidth(std::string_view printed);
// Printed text cut to at most `width` columns, the last three "..." when cut;
// a width of 0 never cuts, and the cut never splits a character.
std::string cutToWidth(std::string_view printed, size_t width);
// The narrowest width cutToWidth cuts at: room for a character and the "...".
inline constexpr size_t kMinimumCutWidth = 4;

// Parses one line; blank lines and comments give CommandKind::Empty.
Command parseLine(std::string_view line);

}  // namespace quorrel::tool
