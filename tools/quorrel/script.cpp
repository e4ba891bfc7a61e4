#include "script.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cstdlib>
#include <iterator>
#include <utility>

#include "ascii_case.h"

namespace quorrel::tool {
namespace {

bool isBlank(char c) {
  return c == ' ' || c == '\t' || c == '\r';
}

int hexDigit(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

// Index just past the closing quote of the string opening at `open`.
size_t skipQuoted(std::string_view line, size_t open) {
  size_t i = open + 1;
  while (i < line.size() && line[i] != '"') i += line[i] == '\\' ? 2 : 1;
  if (i >= line.size()) throw ScriptError("unterminated string");
  return i + 1;
}

char decodeEscape(std::string_view token, size_t& i) {
  const char c = token[i + 1];
  i += 2;
  switch (c) {
    case '\\':
      return '\\';
    case '"':
      return '"';
    case 'n':
      return '\n';
    case 'r':
      return '\r';
    case 't':
      return '\t';
    case 'x': {
      const int high = i < token.size() ? hexDigit(token[i]) : -1;
      const int low = i + 1 < token.size() ? hexDigit(token[i + 1]) : -1;
      if (high < 0 || low < 0) throw ScriptError("\\x needs two hex digits");
      i += 2;
      if (high == 0 && low == 0) throw ScriptError("\\x00 is not allowed in a string");
      return static_cast<char>(high * 16 + low);
    }
    default:
      throw ScriptError(std::string("unknown escape \\") + c + " in string");
  }
}

int32_t parseField(std::string_view name, std::string_view value) {
  if (isQuotedToken(value)) {
    throw ScriptError("field " + std::string(name) + " of new must be an integer");
  }
  return parseInteger(value);
}

void applyNewField(SetupFields& setup, std::string_view token) {
  const size_t eq = token.find('=');
  if (eq == std::string_view::npos || eq == 0 || isQuotedToken(token)) {
    throw ScriptError("new expects FIELD=VALUE, got " + quoteText(token));
  }
  const std::string_view name = token.substr(0, eq);
  const std::string_view value = token.substr(eq + 1);
  if (name == "dims") {
    setup.dims = parseField(name, value);
  } else if (name == "x") {
    setup.x = parseField(name, value);
  } else if (name == "y") {
    setup.y = parseField(name, value);
  } else if (name == "case") {
    setup.caseSensitive = parseField(name, value);
  } else if (name == "wildcard") {
    setup.wildcard = parseField(name, value);
  } else if (name == "autoselect") {
    setup.autoSelect = parseField(name, value);
  } else if (name == "delimiter") {
    if (!isQuotedToken(value)) throw ScriptError("field delimiter of new must be a quoted string");
    std::string text = parseQuoted(value);
    if (text.size() > kMaxDelimiterLength) {
      throw ScriptError("delimiter of " + std::to_string(text.size()) +
                        " bytes is longer than 1023 bytes");
    }
    setup.delimiter = std::move(text);
  } else {
    throw ScriptError("unknown field " + quoteText(name) + " in new");
  }
}

// An action name: letters and digits with at least three letters, so that a
// mistyped number such as x1 is still reported as a malformed integer.
bool looksLikeName(std::string_view token) {
  int letters = 0;
  for (char c : token) {
    if (std::isalpha(static_cast<unsigned char>(c))) {
      ++letters;
    } else if (!std::isdigit(static_cast<unsigned char>(c))) {
      return false;
    }
  }
  return letters >= 3;
}

TextForm gTextForm = TextForm::Escaped;

bool isContinuation(unsigned char byte) {
  return (byte & 0xC0) == 0x80;
}

// The length of the valid UTF-8 sequence at the start of `bytes` that prints as a
// character (not a C1 control), or 0.
size_t printableUtf8Length(std::string_view bytes) {
  const auto lead = static_cast<unsigned char>(bytes[0]);
  const size_t length = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : lead >= 0xC2 ? 2 : 0;
  if (length == 0 || lead > 0xF4 || bytes.size() < length) return 0;
  uint32_t code = lead & (0x7F >> length);
  for (size_t i = 1; i < length; ++i) {
    const auto byte = static_cast<unsigned char>(bytes[i]);
    if (!isContinuation(byte)) return 0;
    code = code << 6 | (byte & 0x3F);
  }
  static constexpr uint32_t kShortest[] = {0, 0, 0x80, 0x800, 0x10000};
  const bool valid = code >= kShortest[length] && code <= 0x10FFFF &&
                     !(code >= 0xD800 && code <= 0xDFFF) && !(code >= 0x80 && code <= 0x9F);
  return valid ? length : 0;
}

bool namesUtf8(std::string_view locale) {
  const std::string lower = lowerCase(locale);
  return lower.find("utf-8") != std::string::npos || lower.find("utf8") != std::string::npos;
}

}  // namespace

TextForm textFormOfEnvironment() {
  for (const char* variable : {"LC_ALL", "LC_CTYPE", "LANG"}) {
    const char* value = std::getenv(variable);
    if (value && *value) return namesUtf8(value) ? TextForm::Utf8 : TextForm::Escaped;
  }
  return TextForm::Escaped;
}

void setTextForm(TextForm form) {
  gTextForm = form;
}

TextForm textForm() {
  return gTextForm;
}

namespace {

// East Asian Wide and Fullwidth characters, which a terminal draws two columns wide:
// the blocks that hold nearly all of them.
constexpr std::pair<uint32_t, uint32_t> kWideRanges[] = {
    {0x1100, 0x115F},   {0x2E80, 0x303E},   {0x3041, 0x33FF},   {0x3400, 0x4DBF},
    {0x4E00, 0x9FFF},   {0xA000, 0xA4CF},   {0xAC00, 0xD7A3},   {0xF900, 0xFAFF},
    {0xFE30, 0xFE4F},   {0xFF00, 0xFF60},   {0xFFE0, 0xFFE6},   {0x1F300, 0x1F64F},
    {0x1F900, 0x1F9FF}, {0x20000, 0x2FFFD}, {0x30000, 0x3FFFD},
};

// The columns of the character that starts at `at`, and its length in bytes.
std::pair<size_t, size_t> characterAt(std::string_view printed, size_t at) {
  const auto lead = static_cast<unsigned char>(printed[at]);
  size_t length = 1;
  while (at + length < printed.size() &&
         isContinuation(static_cast<unsigned char>(printed[at + length]))) {
    ++length;
  }
  if (lead < 0xE1) return {1, length};  // nothing below U+1000 is wide
  uint32_t code = lead & (lead >= 0xF0 ? 0x07 : 0x0F);
  for (size_t i = 1; i < length; ++i) code = code << 6 | (printed[at + i] & 0x3F);
  const bool wide = std::any_of(std::begin(kWideRanges), std::end(kWideRanges),
                                [&](const auto& r) { return code >= r.first && code <= r.second; });
  return {wide ? 2 : 1, length};
}

}  // namespace

size_t printedWidth(std::string_view printed) {
  size_t width = 0;
  for (size_t at = 0; at < printed.size();) {
    const auto [columns, length] = characterAt(printed, at);
    width += columns;
    at += length;
  }
  return width;
}

std::string cutToWidth(std::string_view printed, size_t width) {
  if (width < kMinimumCutWidth || printedWidth(printed) <= width) return std::string(printed);
  // Keep the characters that fit in width - 3 columns.
  size_t end = 0;
  for (size_t used = 0; end < printed.size();) {
    const auto [columns, length] = characterAt(printed, end);
    if (used + columns > width - 3) break;
    used += columns;
    end += length;
  }
  return std::string(printed.substr(0, end)) + "...";
}

std::vector<std::string> splitTokens(std::string_view line) {
  std::vector<std::string> tokens;
  size_t i = 0;
  while (i < line.size()) {
    if (isBlank(line[i])) {
      ++i;
      continue;
    }
    const size_t start = i;
    while (i < line.size() && !isBlank(line[i])) i = line[i] == '"' ? skipQuoted(line, i) : i + 1;
    tokens.emplace_back(line.substr(start, i - start));
  }
  return tokens;
}

bool isQuotedToken(std::string_view token) {
  return !token.empty() && token.front() == '"';
}

bool looksLikeInteger(std::string_view token) {
  if (!token.empty() && (token.front() == '-' || token.front() == '+')) token.remove_prefix(1);
  if (token.empty()) return false;
  for (char c : token) {
    if (c < '0' || c > '9') return false;
  }
  return true;
}

int32_t parseInteger(std::string_view token) {
  if (!looksLikeInteger(token)) throw ScriptError("malformed integer " + quoteText(token));
  std::string_view digits = token;
  if (digits.front() == '+') digits.remove_prefix(1);
  int64_t value = 0;
  const auto [end, status] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
  if (status != std::errc{} || end != digits.data() + digits.size() || value < INT32_MIN ||
      value > INT32_MAX) {
    throw ScriptError("integer " + std::string(token) + " is out of range -2147483648..2147483647");
  }
  return static_cast<int32_t>(value);
}

std::string parseQuoted(std::string_view token) {
  if (!isQuotedToken(token)) throw ScriptError("malformed string " + quoteText(token));
  const size_t end = skipQuoted(token, 0);
  if (end != token.size()) throw ScriptError("malformed string " + quoteText(token));
  std::string text;
  size_t i = 1;
  while (i + 1 < end) {
    if (token[i] == '\\') {
      text += decodeEscape(token, i);
    } else if (token[i] == '\0') {
      // A text reaches the extension as a zero-terminated string, so it would stop here.
      throw ScriptError("a zero byte is not allowed in a string");
    } else {
      text += token[i++];
    }
  }
  return text;
}

std::string quoteText(std::string_view bytes) {
  static constexpr char kHex[] = "0123456789abcdef";
  std::string out = "\"";
  for (size_t i = 0; i < bytes.size(); ++i) {
    const char c = bytes[i];
    const auto byte = static_cast<unsigned char>(c);
    if (byte >= 0x80 && gTextForm == TextForm::Utf8) {
      if (const size_t length = printableUtf8Length(bytes.substr(i))) {
        out += bytes.substr(i, length);
        i += length - 1;
        continue;
      }
    }
    switch (c) {
      case '"':
        out += "\\\"";
        break;
      case '\\':
        out += "\\\\";
        break;
      case '\n':
        out += "\\n";
        break;
      case '\r':
        out += "\\r";
        break;
      case '\t':
        out += "\\t";
        break;
      default:
        if (byte >= 0x20 && byte <= 0x7E) {
          out += c;
        } else {
          out += "\\x";
          out += kHex[byte >> 4];
          out += kHex[byte & 15];
        }
    }
  }
  out += '"';
  return out;
}

namespace {

// Adds one argument; an unquoted word that is not an integer is kept as written.
void addArgument(Command& command, std::string_view token) {
  Argument arg;
  std::string unread;
  arg.isText = isQuotedToken(token);
  if (arg.isText) {
    arg.text = parseQuoted(token);
  } else if (looksLikeInteger(token)) {
    arg.number = parseInteger(token);
  } else {
    unread = token;
  }
  command.args.push_back(std::move(arg));
  command.unread.push_back(std::move(unread));
}

std::string_view trimmed(std::string_view text) {
  const size_t start = text.find_first_not_of(" \t\r");
  if (start == std::string_view::npos) return {};
  return text.substr(start, text.find_last_not_of(" \t\r") - start + 1);
}

// The length of `text` when its last character closes it, a ")" outside any string;
// otherwise npos.
size_t closedCallLength(std::string_view text) {
  size_t i = 0;
  while (i < text.size() && !(text[i] == ')' && i + 1 == text.size())) {
    i = text[i] == '"' ? skipQuoted(text, i) : i + 1;
  }
  return i < text.size() ? i : std::string_view::npos;
}

// "1, 2" or "\"x\"": arguments between commas outside strings, each one token.
void parseArgumentList(Command& command, std::string_view list) {
  if (trimmed(list).empty()) return;
  for (size_t start = 0, i = 0;; ++i) {
    if (i < list.size() && list[i] == '"') i = skipQuoted(list, i) - 1;
    if (i < list.size() && list[i] != ',') continue;
    const std::string_view piece = trimmed(list.substr(start, i - start));
    const std::vector<std::string> tokens = splitTokens(piece);
    if (tokens.size() != 1) {
      throw ScriptError(
          "argument " + std::to_string(command.args.size() + 1) +
          (tokens.empty() ? " is missing" : " is more than one word: " + quoteText(piece)));
    }
    addArgument(command, tokens[0]);
    if (i >= list.size()) return;
    start = i + 1;
  }
}

// After the name: blank-separated arguments, or a list in parentheses, as in
// labSum("qty") or getFromColumnRow(1, 2).
void parseArguments(Command& command, std::string_view rest) {
  if (!rest.empty() && rest.front() == '(') {
    rest.remove_prefix(1);
    const std::string_view call = trimmed(rest);
    const size_t close = closedCallLength(call);
    if (close != std::string_view::npos) return parseArgumentList(command, call.substr(0, close));
  }
  for (const std::string& token : splitTokens(rest)) addArgument(command, token);
}

void setCodeOrName(Command& command, std::string_view word, bool isAction) {
  if (looksLikeInteger(word) || (isAction && !looksLikeName(word))) {
    command.code = parseInteger(word);
    const int32_t count = isAction ? abi::kActionCount : abi::kExpressionCount;
    if (command.code < 0 || command.code >= count) {
      throw ScriptError((isAction ? "action code " : "expression code ") + std::string(word) +
                        " is out of range 0.." + std::to_string(count - 1));
    }
  } else {
    command.name = word;
  }
}

}  // namespace

Command parseLine(std::string_view line) {
  const size_t first = line.find_first_not_of(" \t\r");
  if (first == std::string_view::npos || line[first] == '#') return {};
  Command command;
  line.remove_prefix(first);
  const std::string_view verb = line.substr(0, line.find_first_of(" \t\r"));
  std::string_view rest = line.substr(verb.size());
  if (verb == "new") {
    command.kind = CommandKind::New;
    for (const std::string& token : splitTokens(rest)) applyNewField(command.setup, token);
    return command;
  }
  if (verb != "A" && verb != "E") throw ScriptError("unknown command " + quoteText(verb));
  const bool isAction = verb == "A";
  command.kind = isAction ? CommandKind::Action : CommandKind::Expression;
  rest = rest.substr(std::min(rest.size(), rest.find_first_not_of(" \t\r")));
  const std::string_view word = rest.substr(0, rest.find_first_of(" \t\r("));
  if (word.empty()) {
    throw ScriptError(isAction ? "A needs an action code" : "E needs an expression code or name");
  }
  setCodeOrName(command, word, isAction);
  parseArguments(command, rest.substr(word.size()));
  return command;
}

}  // namespace quorrel::tool
