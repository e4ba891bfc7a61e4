// rcgen: the module's resources at build time, for every build.
//
//   rcgen script <template.rc> <output.rc>
//     writes the resource script: the template, with the editor's menus and display
//     strings made from host/table.inc in place of its line
//     #include "table_resources.rc".
//   rcgen tables <script.rc> <output.cpp>
//     turns that script into the C++ tables of platform/resource_data.h, so that
//     builds without a Windows resource compiler serve the very same menus, strings
//     and dialog.
//
// It reads the subset of the resource language the script keeps to: LANGUAGE,
// MENU (POPUP, MENUITEM, MENUITEM SEPARATOR), STRINGTABLE, DIALOG with STYLE,
// CAPTION and FONT and CONTROL statements, BITMAP and RCDATA (checked, not
// emitted); numeric ids, "|"-joined style constants, "//" comments and
// preprocessor lines (skipped). Anything else stops the build with a message.

#include <cstdint>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <map>
#include <optional>
#include <sstream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "table_resources.h"

namespace {

struct Token {
  enum Kind { Word, Number, Text, Comma, Bar, End } kind = End;
  std::string text;
  int64_t number = 0;
  int line = 0;
};

struct ParseError {
  std::string message;
};

// Windows constants the script may name.
const std::map<std::string, int64_t>& constants() {
  static const std::map<std::string, int64_t> table = {
      {"LANG_NEUTRAL", 0x00},
      {"LANG_ENGLISH", 0x09},
      {"SUBLANG_NEUTRAL", 0x00},
      {"SUBLANG_DEFAULT", 0x01},
      {"SUBLANG_ENGLISH_US", 0x01},
      {"WS_POPUP", 0x80000000},
      {"WS_CHILD", 0x40000000},
      {"WS_VISIBLE", 0x10000000},
      {"WS_DISABLED", 0x08000000},
      {"WS_CAPTION", 0x00C00000},
      {"WS_BORDER", 0x00800000},
      {"WS_DLGFRAME", 0x00400000},
      {"WS_VSCROLL", 0x00200000},
      {"WS_HSCROLL", 0x00100000},
      {"WS_SYSMENU", 0x00080000},
      {"WS_GROUP", 0x00020000},
      {"WS_TABSTOP", 0x00010000},
      {"DS_MODALFRAME", 0x80},
      {"DS_SETFONT", 0x40},
      {"DS_CENTER", 0x800},
      {"BS_PUSHBUTTON", 0x0},
      {"BS_DEFPUSHBUTTON", 0x1},
      {"BS_CHECKBOX", 0x2},
      {"BS_AUTOCHECKBOX", 0x3},
      {"BS_RADIOBUTTON", 0x4},
      {"BS_GROUPBOX", 0x7},
      {"BS_AUTORADIOBUTTON", 0x9},
      {"ES_LEFT", 0x0},
      {"ES_CENTER", 0x1},
      {"ES_RIGHT", 0x2},
      {"ES_AUTOHSCROLL", 0x80},
      {"ES_NUMBER", 0x2000},
      {"SS_LEFT", 0x0},
      {"SS_CENTER", 0x1},
      {"SS_RIGHT", 0x2},
  };
  return table;
}

class Lexer {
 public:
  explicit Lexer(std::string source) : source_(std::move(source)) {}

  std::vector<Token> tokens() {
    std::vector<Token> out;
    while (true) {
      skipBlanksAndComments();
      Token token;
      token.line = line_;
      if (pos_ >= source_.size()) break;
      char c = source_[pos_];
      if (c == '"') {
        token.kind = Token::Text;
        token.text = quoted();
      } else if (c == ',' || c == '|') {
        token.kind = c == ',' ? Token::Comma : Token::Bar;
        ++pos_;
      } else if (c == '{' || c == '}') {
        token.kind = Token::Word;
        token.text = c == '{' ? "BEGIN" : "END";
        ++pos_;
      } else if (isDigit(c) ||
                 (c == '-' && pos_ + 1 < source_.size() && isDigit(source_[pos_ + 1]))) {
        token.kind = Token::Number;
        token.number = number();
      } else if (isWordChar(c)) {
        token.kind = Token::Word;
        while (pos_ < source_.size() && isWordChar(source_[pos_])) token.text += source_[pos_++];
      } else {
        throw ParseError{"line " + std::to_string(line_) + ": unexpected character '" +
                         std::string(1, c) + "'"};
      }
      out.push_back(token);
    }
    out.push_back(Token{Token::End, "", 0, line_});
    return out;
  }

 private:
  static bool isDigit(char c) { return c >= '0' && c <= '9'; }
  static bool isWordChar(char c) {
    return isDigit(c) || c == '_' || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
  }

  void skipBlanksAndComments() {
    while (pos_ < source_.size()) {
      char c = source_[pos_];
      if (c == '\n') {
        ++line_;
        ++pos_;
      } else if (c == ' ' || c == '\t' || c == '\r') {
        ++pos_;
      } else if (c == '/' && pos_ + 1 < source_.size() && source_[pos_ + 1] == '/') {
        skipLine();
      } else if (c == '#' && atLineStart()) {
        skipLine();
      } else {
        return;
      }
    }
  }

  bool atLineStart() const {
    for (std::size_t i = pos_; i > 0; --i) {
      char c = source_[i - 1];
      if (c == '\n') return true;
      if (c != ' ' && c != '\t') return false;
    }
    return true;
  }

  void skipLine() {
    while (pos_ < source_.size() && source_[pos_] != '\n') ++pos_;
  }

  // A resource string: "" is a quote, and the C escapes \\ \" \n \t \0 are read.
  std::string quoted() {
    std::string text;
    ++pos_;
    while (true) {
      if (pos_ >= source_.size() || source_[pos_] == '\n') {
        throw ParseError{"line " + std::to_string(line_) + ": unterminated string"};
      }
      char c = source_[pos_++];
      if (c == '"') {
        if (pos_ < source_.size() && source_[pos_] == '"') {
          text += '"';
          ++pos_;
          continue;
        }
        return text;
      }
      if (c == '\\' && pos_ < source_.size()) {
        char e = source_[pos_++];
        switch (e) {
          case 'n':
            text += '\n';
            break;
          case 't':
            text += '\t';
            break;
          case '0':
            text += '\0';
            break;
          default:
            text += e;
            break;
        }
        continue;
      }
      text += c;
    }
  }

  int64_t number() {
    bool negative = source_[pos_] == '-';
    if (negative) ++pos_;
    int base = 10;
    if (source_.compare(pos_, 2, "0x") == 0 || source_.compare(pos_, 2, "0X") == 0) {
      base = 16;
      pos_ += 2;
    }
    int64_t value = 0;
    while (pos_ < source_.size()) {
      char c = source_[pos_];
      int digit = isDigit(c)                           ? c - '0'
                  : base == 16 && c >= 'a' && c <= 'f' ? c - 'a' + 10
                  : base == 16 && c >= 'A' && c <= 'F' ? c - 'A' + 10
                                                       : -1;
      if (digit < 0) break;
      value = value * base + digit;
      ++pos_;
    }
    if (pos_ < source_.size() && (source_[pos_] == 'L' || source_[pos_] == 'l')) ++pos_;
    return negative ? -value : value;
  }

  std::string source_;
  std::size_t pos_ = 0;
  int line_ = 1;
};

struct MenuItem {
  uint16_t flags = 0;
  uint16_t id = 0;
  std::string text;
};

struct Control {
  std::string text;
  uint16_t id = 0;
  std::string className;
  uint32_t style = 0;
  int16_t x = 0, y = 0, cx = 0, cy = 0;
};

struct Dialog {
  uint16_t id = 0;
  uint32_t style = 0;
  int16_t x = 0, y = 0, cx = 0, cy = 0;
  std::string caption;
  uint16_t fontSize = 0;
  std::string fontName;
  std::vector<Control> controls;
};

struct Script {
  uint16_t language = 0;
  std::map<uint16_t, std::vector<MenuItem>> menus;
  std::map<uint16_t, std::string> strings;
  std::vector<Dialog> dialogs;
};

class Parser {
 public:
  explicit Parser(std::vector<Token> tokens) : tokens_(std::move(tokens)) {}

  Script parse() {
    while (peek().kind != Token::End) statement();
    return std::move(script_);
  }

 private:
  const Token& peek() const { return tokens_[pos_]; }
  const Token& take() { return tokens_[pos_ < tokens_.size() - 1 ? pos_++ : pos_]; }

  [[noreturn]] void fail(const std::string& what) const {
    throw ParseError{"line " + std::to_string(peek().line) + ": " + what};
  }

  bool atWord(const char* word) const { return peek().kind == Token::Word && peek().text == word; }
  void expectWord(const char* word) {
    if (!atWord(word)) fail(std::string("expected ") + word);
    take();
  }
  void expectComma() {
    if (peek().kind != Token::Comma) fail("expected ','");
    take();
  }
  std::string text() {
    if (peek().kind != Token::Text) fail("expected a quoted string");
    return take().text;
  }

  // A number, a named constant, or several of them joined with '|'.
  int64_t value() {
    int64_t result = term();
    while (peek().kind == Token::Bar) {
      take();
      result |= term();
    }
    return result;
  }
  int64_t term() {
    if (peek().kind == Token::Number) return take().number;
    if (peek().kind == Token::Word) {
      auto found = constants().find(peek().text);
      if (found != constants().end()) {
        take();
        return found->second;
      }
    }
    fail("expected a number or a known constant");
  }
  uint16_t id() { return static_cast<uint16_t>(value()); }
  int16_t coordinate() { return static_cast<int16_t>(value()); }

  void statement() {
    if (atWord("LANGUAGE")) {
      take();
      int64_t primary = value();
      expectComma();
      int64_t sub = value();
      script_.language = static_cast<uint16_t>((sub << 10) | primary);
      return;
    }
    if (atWord("STRINGTABLE")) {
      take();
      stringTable();
      return;
    }
    if (peek().kind != Token::Number) fail("expected a resource id or statement");
    uint16_t resourceId = id();
    if (atWord("MENU")) {
      take();
      if (script_.menus.count(resourceId)) fail("menu id used twice");
      menuLevel(script_.menus[resourceId]);
    } else if (atWord("DIALOG")) {
      take();
      dialog(resourceId);
    } else if (atWord("BITMAP")) {
      take();
      text();
    } else if (atWord("RCDATA")) {
      take();
      expectWord("BEGIN");
      while (!atWord("END")) {
        if (peek().kind == Token::Comma)
          take();
        else if (peek().kind == Token::Number || peek().kind == Token::Text)
          take();
        else
          fail("unexpected data item");
      }
      take();
    } else {
      fail("unsupported resource type");
    }
  }

  void stringTable() {
    expectWord("BEGIN");
    while (!atWord("END")) {
      uint16_t stringId = id();
      if (peek().kind == Token::Comma) take();
      if (script_.strings.count(stringId)) fail("string id used twice");
      script_.strings[stringId] = text();
    }
    take();
  }

  // One BEGIN ... END level; the last item of the level gets the end flag.
  void menuLevel(std::vector<MenuItem>& items) {
    expectWord("BEGIN");
    std::size_t last = items.size();
    bool any = false;
    while (!atWord("END")) {
      last = items.size();
      any = true;
      if (atWord("POPUP")) {
        take();
        items.push_back(MenuItem{0x10, 0, text()});
        menuLevel(items);
      } else if (atWord("MENUITEM")) {
        take();
        if (atWord("SEPARATOR")) {
          take();
          items.push_back(MenuItem{});
        } else {
          MenuItem item;
          item.text = text();
          expectComma();
          item.id = id();
          while (peek().kind == Token::Comma) {
            take();
            item.flags |= menuOption();
          }
          items.push_back(item);
        }
      } else {
        fail("expected POPUP, MENUITEM or END");
      }
    }
    take();
    if (!any) fail("empty menu level");
    items[last].flags |= 0x80;
  }

  uint16_t menuOption() {
    static const std::map<std::string, uint16_t> options = {{"GRAYED", 0x1},
                                                            {"INACTIVE", 0x2},
                                                            {"CHECKED", 0x8},
                                                            {"MENUBARBREAK", 0x20},
                                                            {"MENUBREAK", 0x40}};
    if (peek().kind == Token::Word) {
      auto found = options.find(peek().text);
      if (found != options.end()) {
        take();
        return found->second;
      }
    }
    fail("unknown menu item option");
  }

  void dialog(uint16_t dialogId) {
    Dialog d;
    d.id = dialogId;
    d.x = coordinate();
    expectComma();
    d.y = coordinate();
    expectComma();
    d.cx = coordinate();
    expectComma();
    d.cy = coordinate();
    while (!atWord("BEGIN")) {
      if (atWord("STYLE")) {
        take();
        d.style = static_cast<uint32_t>(value());
      } else if (atWord("CAPTION")) {
        take();
        d.caption = text();
      } else if (atWord("FONT")) {
        take();
        d.fontSize = id();
        expectComma();
        d.fontName = text();
      } else {
        fail("expected STYLE, CAPTION, FONT or BEGIN");
      }
    }
    // A dialog with a font carries DS_SETFONT, as the resource compiler sets it.
    if (!d.fontName.empty()) d.style |= 0x40;
    take();
    while (!atWord("END")) {
      expectWord("CONTROL");
      Control c;
      c.text = text();
      expectComma();
      c.id = id();
      expectComma();
      c.className = text();
      expectComma();
      c.style = static_cast<uint32_t>(value());
      expectComma();
      c.x = coordinate();
      expectComma();
      c.y = coordinate();
      expectComma();
      c.cx = coordinate();
      expectComma();
      c.cy = coordinate();
      d.controls.push_back(c);
    }
    take();
    script_.dialogs.push_back(d);
  }

  std::vector<Token> tokens_;
  std::size_t pos_ = 0;
  Script script_;
};

std::string literal(const std::string& text) {
  std::string out = "\"";
  for (unsigned char c : text) {
    if (c == '"' || c == '\\') {
      out += '\\';
      out += static_cast<char>(c);
    } else if (c >= 0x20 && c < 0x7F) {
      out += static_cast<char>(c);
    } else {
      char octal[8];
      std::snprintf(octal, sizeof octal, "\\%03o", c);
      out += octal;
    }
  }
  return out + "\"";
}

std::string emit(const Script& script) {
  std::ostringstream out;
  out << "// Generated by rcgen from the resource script. Do not edit.\n"
      << "#include \"platform/resource_data.h\"\n\n"
      << "namespace quorrel::platform {\nnamespace {\n\n";
  for (const auto& [menuId, items] : script.menus) {
    out << "const MenuTemplateItem menu" << menuId << "[] = {\n";
    for (const MenuItem& item : items) {
      out << "    {0x" << std::hex << item.flags << std::dec << ", " << item.id << ", "
          << literal(item.text) << "},\n";
    }
    out << "};\n\n";
  }
  out << "const MenuResource menus[] = {\n";
  for (const auto& entry : script.menus) {
    out << "    {" << entry.first << ", menu" << entry.first << "},\n";
  }
  out << "};\n\nconst StringResource strings[] = {\n";
  for (const auto& [stringId, text] : script.strings) {
    out << "    {" << stringId << ", " << literal(text) << "},\n";
  }
  out << "};\n\n";
  for (const Dialog& d : script.dialogs) {
    out << "const DialogControlTemplate dialog" << d.id << "Controls[] = {\n";
    for (const Control& c : d.controls) {
      out << "    {0x" << std::hex << c.style << std::dec << ", " << c.x << ", " << c.y << ", "
          << c.cx << ", " << c.cy << ", " << c.id << ", " << literal(c.className) << ", "
          << literal(c.text) << "},\n";
    }
    out << "};\n\n";
  }
  out << "const DialogResource dialogs[] = {\n";
  for (const Dialog& d : script.dialogs) {
    out << "    {" << d.id << ", 0x" << std::hex << d.style << std::dec << ", " << d.x << ", "
        << d.y << ", " << d.cx << ", " << d.cy << ", " << literal(d.caption) << ", " << d.fontSize
        << ", " << literal(d.fontName) << ", dialog" << d.id << "Controls},\n";
  }
  out << "};\n\n}  // namespace\n\n"
      << "const ResourceData& moduleResources() {\n"
      << "  static const ResourceData data{" << script.language << ", menus, strings, dialogs};\n"
      << "  return data;\n}\n\n}  // namespace quorrel::platform\n";
  return out.str();
}

}  // namespace

namespace {

std::optional<std::string> readFile(const char* path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return std::nullopt;
  std::stringstream text;
  text << in.rdbuf();
  return text.str();
}

// Leaves an unchanged output alone so that nothing rebuilds needlessly.
bool writeIfChanged(const char* path, const std::string& text) {
  if (readFile(path) == text) return true;
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out << text;
  return static_cast<bool>(out);
}

constexpr std::string_view kTableLine = "#include \"table_resources.rc\"";

std::string scriptFromTemplate(const std::string& source) {
  const size_t at = source.find(kTableLine);
  if (at == std::string::npos) {
    throw ParseError{"no line " + std::string(kTableLine) + " for the table's resources"};
  }
  try {
    return source.substr(0, at) + rcgen::tableResources() + source.substr(at + kTableLine.size());
  } catch (const std::runtime_error& error) {
    throw ParseError{std::string("host/table.inc: ") + error.what()};
  }
}

std::string tablesFromScript(const std::string& source) {
  Script script = Parser(Lexer(source).tokens()).parse();
  if (script.dialogs.empty() || script.menus.empty() || script.strings.empty()) {
    throw ParseError{"the script lacks menus, strings or a dialog"};
  }
  return emit(script);
}

}  // namespace

int main(int argc, char** argv) {
  const std::string mode = argc == 4 ? argv[1] : "";
  if (mode != "script" && mode != "tables") {
    std::cerr << "usage: rcgen script <template.rc> <output.rc>\n"
                 "       rcgen tables <script.rc> <output.cpp>\n";
    return 2;
  }
  const std::optional<std::string> source = readFile(argv[2]);
  if (!source) {
    std::cerr << "rcgen: cannot read " << argv[2] << "\n";
    return 1;
  }
  try {
    const std::string output =
        mode == "script" ? scriptFromTemplate(*source) : tablesFromScript(*source);
    if (!writeIfChanged(argv[3], output)) {
      std::cerr << "rcgen: cannot write " << argv[3] << "\n";
      return 1;
    }
  } catch (const ParseError& error) {
    std::cerr << argv[2] << ": " << error.message << "\n";
    return 1;
  }
  return 0;
}
