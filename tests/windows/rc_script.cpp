#include "windows/rc_script.h"

#include <algorithm>
#include <cctype>
#include <cstring>
#include <set>
#include <stdexcept>
#include <utility>

namespace quorrel::rc {
namespace {

struct Token {
  enum Kind { End, Number, String, Word, Punct } kind = End;
  std::string text;
  uint32_t number = 0;
  bool isLong = false;  // a number written with the L suffix
  int line = 0;
};

std::string upper(std::string text) {
  for (char& c : text) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  return text;
}

class Lexer {
 public:
  explicit Lexer(const std::string& text) : text_(text) {}

  std::vector<Token> tokens() {
    std::vector<Token> out;
    for (;;) {
      skipSpaceAndDirectives();
      Token token;
      token.line = line_;
      if (at_ >= text_.size()) {
        out.push_back(token);
        return out;
      }
      const char c = text_[at_];
      if (c == '"') {
        token.kind = Token::String;
        token.text = quoted();
      } else if (std::isdigit(static_cast<unsigned char>(c))) {
        token.kind = Token::Number;
        number(token);
      } else if (std::isalpha(static_cast<unsigned char>(c)) || c == '_') {
        token.kind = Token::Word;
        while (at_ < text_.size() && (std::isalnum(static_cast<unsigned char>(text_[at_])) ||
                                      text_[at_] == '_' || text_[at_] == '.')) {
          token.text.push_back(text_[at_++]);
        }
        const std::string word = upper(token.text);
        if (word == "BEGIN") token = {Token::Punct, "{", 0, false, line_};
        if (word == "END") token = {Token::Punct, "}", 0, false, line_};
      } else {
        token.kind = Token::Punct;
        token.text = std::string(1, c);
        ++at_;
      }
      out.push_back(token);
    }
  }

 private:
  void skipSpaceAndDirectives() {
    while (at_ < text_.size()) {
      const char c = text_[at_];
      if (c == '\n') {
        ++line_;
        ++at_;
        atLineStart_ = true;
      } else if (std::isspace(static_cast<unsigned char>(c))) {
        ++at_;
      } else if (c == '#' && atLineStart_) {  // line markers and pragmas left by cpp
        const std::size_t end = std::min(text_.find('\n', at_), text_.size());
        lineMarker(text_.substr(at_, end - at_));
        at_ = end;
      } else if (inHeader_) {  // declarations from included C headers are not resources
        const std::size_t end = text_.find('\n', at_);
        at_ = end == std::string::npos ? text_.size() : end;
      } else if (text_.compare(at_, 2, "//") == 0) {
        while (at_ < text_.size() && text_[at_] != '\n') ++at_;
      } else if (text_.compare(at_, 2, "/*") == 0) {
        const auto close = text_.find("*/", at_ + 2);
        at_ = close == std::string::npos ? text_.size() : close + 2;
      } else {
        atLineStart_ = false;
        return;
      }
    }
  }

  // "# 12 "file.h" 2": what follows comes from that file. Like the resource compiler,
  // skip everything that comes from a C header.
  void lineMarker(const std::string& line) {
    const auto open = line.find('"');
    const auto close = line.rfind('"');
    if (open == std::string::npos || close <= open) return;
    const std::string file = line.substr(open + 1, close - open - 1);
    const auto endsWith = [&](const std::string& suffix) {
      return file.size() >= suffix.size() &&
             file.compare(file.size() - suffix.size(), suffix.size(), suffix) == 0;
    };
    inHeader_ = endsWith(".h") || endsWith(".hpp") || endsWith(".H");
  }

  std::string quoted() {
    std::string out;
    ++at_;
    while (at_ < text_.size()) {
      const char c = text_[at_++];
      if (c == '"') {
        if (at_ < text_.size() && text_[at_] == '"') {  // "" is a quote character
          out.push_back('"');
          ++at_;
          continue;
        }
        return out;
      }
      if (c == '\\' && at_ < text_.size()) {
        const char e = text_[at_++];
        switch (e) {
          case 'n':
            out.push_back('\n');
            break;
          case 't':
            out.push_back('\t');
            break;
          case 'r':
            out.push_back('\r');
            break;
          case 'a':
            out.push_back('\a');
            break;
          case '0':
            out.push_back('\0');
            break;
          default:
            out.push_back(e);
            break;
        }
        continue;
      }
      out.push_back(c);
    }
    throw std::runtime_error("unterminated string");
  }

  void number(Token& token) {
    std::size_t used = 0;
    token.number = static_cast<uint32_t>(std::stoul(text_.substr(at_), &used, 0));
    at_ += used;
    while (at_ < text_.size() && std::strchr("lLuU", text_[at_]) && text_[at_] != '\0') {
      if (text_[at_] == 'l' || text_[at_] == 'L') token.isLong = true;
      ++at_;
    }
  }

  const std::string& text_;
  std::size_t at_ = 0;
  int line_ = 1;
  bool atLineStart_ = true;
  bool inHeader_ = false;
};

constexpr uint32_t kBitmap = 2, kMenu = 4, kDialog = 5, kString = 6, kRcData = 10;

class Parser {
 public:
  explicit Parser(std::vector<Token> tokens) : tokens_(std::move(tokens)) {}

  Script parse() {
    while (peek().kind != Token::End) statement();
    for (const auto& [block, language] : stringBlocks_) {
      script_.resources.push_back({kString, block, language});
    }
    return script_;
  }

 private:
  const Token& peek(std::size_t ahead = 0) const {
    const std::size_t at = std::min(at_ + ahead, tokens_.size() - 1);
    return tokens_[at];
  }
  Token next() {
    Token token = peek();
    if (at_ < tokens_.size() - 1) ++at_;
    return token;
  }
  [[noreturn]] void fail(const std::string& what) const {
    throw std::runtime_error("line " + std::to_string(peek().line) + ": " + what + " near '" +
                             peek().text + "'");
  }
  bool isPunct(const char* p, std::size_t ahead = 0) const {
    return peek(ahead).kind == Token::Punct && peek(ahead).text == p;
  }
  bool isWord(const char* word, std::size_t ahead = 0) const {
    return peek(ahead).kind == Token::Word && upper(peek(ahead).text) == word;
  }
  void expect(const char* p) {
    if (!isPunct(p)) fail(std::string("expected ") + p);
    next();
  }
  bool accept(const char* p) {
    if (!isPunct(p)) return false;
    next();
    return true;
  }
  std::string string() {
    if (peek().kind != Token::String) fail("expected a string");
    std::string text = next().text;
    while (peek().kind == Token::String) text += next().text;  // adjacent strings join
    return text;
  }

  // Constant expressions as cpp leaves them: numbers, parentheses, unary - ~ NOT, and
  // the binary operators | & + -.
  uint32_t primary() {
    if (accept("(")) {
      const uint32_t value = expression();
      expect(")");
      return value;
    }
    if (accept("-")) return 0u - primary();
    if (accept("~")) return ~primary();
    if (isWord("NOT")) {
      next();
      return ~primary();
    }
    if (peek().kind != Token::Number) fail("expected a number");
    return next().number;
  }
  uint32_t expression() {
    uint32_t value = primary();
    for (;;) {
      if (accept("|")) {
        value |= primary();
      } else if (accept("&")) {
        value &= primary();
      } else if (accept("+")) {
        value += primary();
      } else if (accept("-")) {
        value -= primary();
      } else {
        return value;
      }
    }
  }

  void languageStatement() {
    next();
    const uint32_t primaryLanguage = expression();
    expect(",");
    const uint32_t sublanguage = expression();
    language_ = (sublanguage << 10) | primaryLanguage;
  }

  // Statements between the resource type and its body (memory flags, LANGUAGE, ...).
  // Returns the language the resource is declared in.
  uint32_t resourceOptions() {
    uint32_t language = language_;
    while (!isPunct("{") && peek().kind != Token::End) {
      if (isWord("LANGUAGE")) {
        const uint32_t saved = language_;
        languageStatement();
        language = language_;
        language_ = saved;
      } else {
        next();
      }
    }
    return language;
  }

  void statement() {
    if (isWord("LANGUAGE")) return languageStatement();
    if (isWord("STRINGTABLE")) return stringTable();
    if (peek().kind != Token::Number && peek().kind != Token::Word && !isPunct("(")) {
      fail("expected a resource");
    }
    uint32_t id = 0;  // a named resource keeps 0: the checks only use numbered ones
    if (peek().kind == Token::Word) {
      next();
    } else {
      id = expression();
    }
    if (peek().kind != Token::Word) fail("expected a resource type");
    const std::string type = upper(next().text);
    if (type == "MENU") return menu(id);
    if (type == "DIALOG" || type == "DIALOGEX") return dialog(id, type == "DIALOGEX");
    if (type == "BITMAP") {
      while (peek().kind == Token::Word) next();  // memory flags
      script_.bitmapFiles[id] = string();
      script_.resources.push_back({kBitmap, id, language_});
      return;
    }
    if (type == "RCDATA") return data(id);
    fail("resource type " + type + " is not read by this checker");
  }

  void stringTable() {
    next();
    const uint32_t language = resourceOptions();
    const uint32_t saved = language_;
    language_ = language;
    expect("{");
    while (!accept("}")) {
      const uint32_t id = expression();
      accept(",");
      script_.strings[id] = string();
      stringBlocks_.insert({id / 16 + 1, language});
    }
    language_ = saved;
  }

  static uint16_t menuOptionFlag(const Token& token) {
    if (token.kind != Token::Word) return 0;
    const std::string option = upper(token.text);
    if (option == "GRAYED") return 0x01;
    if (option == "INACTIVE") return 0x02;
    if (option == "CHECKED") return 0x08;
    if (option == "MENUBARBREAK") return 0x20;
    if (option == "MENUBREAK") return 0x40;
    if (option == "HELP") return 0x4000;
    return 0;
  }

  uint16_t menuOptions() {
    uint16_t flags = 0;
    for (;;) {
      if (isPunct(",") && menuOptionFlag(peek(1))) next();
      const uint16_t flag = menuOptionFlag(peek());
      if (!flag) return flags;
      flags |= flag;
      next();
    }
  }

  std::vector<pe::MenuItem> menuBody() {
    std::vector<pe::MenuItem> items;
    expect("{");
    while (!accept("}")) {
      pe::MenuItem item;
      if (isWord("POPUP")) {
        next();
        item.popup = true;
        item.text = string();
        item.flags = menuOptions();
        item.children = menuBody();
      } else if (isWord("MENUITEM")) {
        next();
        if (isWord("SEPARATOR")) {
          next();
        } else {
          item.text = string();
          expect(",");
          item.id = static_cast<uint16_t>(expression());
          item.flags = menuOptions();
        }
      } else {
        fail("expected POPUP or MENUITEM");
      }
      items.push_back(std::move(item));
    }
    return items;
  }

  void menu(uint32_t id) {
    const uint32_t language = resourceOptions();
    script_.menus[id] = menuBody();
    script_.resources.push_back({kMenu, id, language});
  }

  // One control line. Shorthand controls put the text first (except the edit-like ones,
  // which have none); CONTROL adds a class and a style before the rectangle.
  void control(pe::Dialog& dialog) {
    const std::string kind = upper(next().text);
    pe::DialogItem item;
    const bool noText =
        kind == "EDITTEXT" || kind == "COMBOBOX" || kind == "LISTBOX" || kind == "SCROLLBAR";
    if (!noText) {
      if (peek().kind == Token::String) {
        item.text = string();
      } else {
        expression();
      }
      expect(",");
    }
    item.id = static_cast<int32_t>(expression());
    expect(",");
    if (kind == "CONTROL") {
      if (peek().kind == Token::String) {
        item.className = string();
      } else {
        item.classAtom = static_cast<uint16_t>(expression());
      }
      expect(",");
      item.style = expression();
      expect(",");
    }
    item.x = static_cast<int16_t>(expression());
    expect(",");
    item.y = static_cast<int16_t>(expression());
    expect(",");
    item.cx = static_cast<int16_t>(expression());
    expect(",");
    item.cy = static_cast<int16_t>(expression());
    while (accept(",")) expression();  // style, extended style, help id
    dialog.items.push_back(std::move(item));
  }

  void dialog(uint32_t id, bool extended) {
    pe::Dialog dialog;
    dialog.extended = extended;
    while (peek().kind == Token::Word && !isWord("LANGUAGE")) next();  // memory flags
    dialog.x = static_cast<int16_t>(expression());
    expect(",");
    dialog.y = static_cast<int16_t>(expression());
    expect(",");
    dialog.cx = static_cast<int16_t>(expression());
    expect(",");
    dialog.cy = static_cast<int16_t>(expression());
    if (accept(",")) expression();  // help id
    uint32_t language = language_;
    while (!isPunct("{")) {
      const std::string word = upper(peek().text);
      if (word == "LANGUAGE") {
        const uint32_t saved = language_;
        languageStatement();
        language = language_;
        language_ = saved;
      } else if (word == "CAPTION") {
        next();
        dialog.title = string();
      } else if (word == "FONT") {
        next();
        dialog.pointSize = static_cast<uint16_t>(expression());
        expect(",");
        dialog.font = string();
        while (accept(",")) expression();
      } else if (word == "STYLE" || word == "EXSTYLE") {
        next();
        const uint32_t style = expression();
        if (word == "STYLE") dialog.style = style;
      } else if (word == "CLASS" || word == "MENU") {
        next();
        next();
      } else {
        fail("unknown dialog statement");
      }
    }
    expect("{");
    while (!accept("}")) {
      if (peek().kind != Token::Word) fail("expected a control");
      control(dialog);
    }
    script_.dialogs[id] = std::move(dialog);
    script_.resources.push_back({kDialog, id, language});
  }

  void data(uint32_t id) {
    const uint32_t language = resourceOptions();
    script_.resources.push_back({kRcData, id, language});
    if (peek().kind == Token::String) {
      script_.dataFiles[id] = string();
      return;
    }
    std::vector<uint8_t>& bytes = script_.inlineData[id];
    expect("{");
    while (!accept("}")) {
      if (accept(",")) continue;
      if (peek().kind == Token::String) {
        for (char c : next().text) bytes.push_back(static_cast<uint8_t>(c));
        continue;
      }
      const bool isLong = peek().isLong;
      const uint32_t value = expression();
      for (int i = 0; i < (isLong ? 4 : 2); ++i)
        bytes.push_back(static_cast<uint8_t>(value >> (8 * i)));
    }
  }

  std::vector<Token> tokens_;
  std::size_t at_ = 0;
  uint32_t language_ = 0x409;                             // the resource compiler's default
  std::set<std::pair<uint32_t, uint32_t>> stringBlocks_;  // block, language
  Script script_;
};

}  // namespace

std::optional<Script> parseScript(const std::string& text, std::string& error) {
  try {
    return Parser(Lexer(text).tokens()).parse();
  } catch (const std::exception& e) {
    error = e.what();
    return std::nullopt;
  }
}

}  // namespace quorrel::rc
