#include "text_formats.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <utility>

namespace quorrel::tool {
namespace {

bool needsQuotes(std::string_view field) {
  return field.find_first_of(",\"\r\n") != std::string_view::npos;
}

// Length of the valid UTF-8 sequence at the start of `text`, or 0.
size_t utf8Length(std::string_view text) {
  const auto byte = [&](size_t i) { return static_cast<unsigned char>(text[i]); };
  const unsigned char lead = byte(0);
  size_t length = 0;
  uint32_t code = 0;
  if (lead >= 0xC2 && lead <= 0xDF) {
    length = 2, code = lead & 0x1F;
  } else if (lead >= 0xE0 && lead <= 0xEF) {
    length = 3, code = lead & 0x0F;
  } else if (lead >= 0xF0 && lead <= 0xF4) {
    length = 4, code = lead & 0x07;
  } else {
    return 0;
  }
  if (text.size() < length) return 0;
  for (size_t i = 1; i < length; ++i) {
    if ((byte(i) & 0xC0) != 0x80) return 0;
    code = code << 6 | (byte(i) & 0x3F);
  }
  // Overlong forms, surrogates and code points past U+10FFFF are not valid.
  static constexpr uint32_t kSmallest[] = {0, 0, 0x80, 0x800, 0x10000};
  if (code < kSmallest[length] || (code >= 0xD800 && code <= 0xDFFF) || code > 0x10FFFF) return 0;
  return length;
}

}  // namespace

namespace {

// The bytes that end an unquoted field's plain run: a separator, a line break, a quote.
struct StopBytes {
  bool stop[256] = {};
  constexpr StopBytes() {
    for (unsigned char c : std::string_view(",\r\n\"")) stop[c] = true;
  }
};
constexpr StopBytes kFieldStops;

class Rfc4180Reader {
 public:
  Rfc4180Reader(std::string_view text, Rfc4180Sink& sink, bool lenient)
      : text_(text), sink_(sink), lenient_(lenient) {}

  Rfc4180Outcome read() {
    if (text_.empty()) return std::move(outcome_);
    for (;;) {
      if (!field()) return std::move(outcome_);
      if (i_ == text_.size()) break;
      if (text_[i_] == ',') {
        ++i_;
        continue;
      }
      i_ += text_[i_] == '\r' && i_ + 1 < text_.size() && text_[i_ + 1] == '\n' ? 2 : 1;
      newLine();
      sink_.endRecord();
      if (i_ == text_.size()) return std::move(outcome_);  // a final line break adds none
    }
    sink_.endRecord();
    return std::move(outcome_);
  }

 private:
  // One field, up to the separator or line break after it.
  bool field() {
    if (i_ < text_.size() && text_[i_] == '"') return quotedField();
    const size_t begin = i_;
    if (!plainRun()) return false;
    sink_.field(text_.substr(begin, i_ - begin), false);
    return true;
  }

  // Unquoted text up to a separator or line break; a quote in it breaks the rules.
  bool plainRun() {
    skipPlain();
    while (i_ < text_.size() && text_[i_] == '"') {
      if (!keepQuote("a quote inside an unquoted field")) return false;
      ++i_;
      skipPlain();
    }
    return true;
  }

  bool quotedField() {
    const size_t open = i_, openLine = line_, openLineStart = lineStart_;
    scratch_.clear();
    for (++i_;;) {
      const size_t quote = text_.find('"', i_);
      if (quote == std::string_view::npos) {
        line_ = openLine, lineStart_ = openLineStart;
        return fail(open, "a quoted field is not closed");
      }
      countLineBreaks(quote);
      scratch_.append(text_.substr(i_, quote - i_));
      i_ = quote + 1;
      if (i_ < text_.size() && text_[i_] == '"') {
        scratch_ += '"';
        ++i_;
        continue;
      }
      if (i_ == text_.size() || text_[i_] == ',' || text_[i_] == '\r' || text_[i_] == '\n') break;
      // Text after the closing quote: kept, with the quote, up to the field's end.
      if (!keepQuote("text after a closing quote")) return false;
      const size_t after = i_;
      if (!plainRun()) return false;
      scratch_ += '"';
      scratch_.append(text_.substr(after, i_ - after));
      break;
    }
    sink_.field(scratch_, true);
    return true;
  }

  void skipPlain() {
    while (i_ < text_.size() && !kFieldStops.stop[static_cast<unsigned char>(text_[i_])]) ++i_;
  }

  // The line breaks of quoted text up to `end`: a CR LF is one, as outside.
  void countLineBreaks(size_t end) {
    for (size_t k = text_.find_first_of("\r\n", i_); k < end;
         k = text_.find_first_of("\r\n", k + 1)) {
      if (text_[k] == '\r' && k + 1 < text_.size() && text_[k + 1] == '\n') ++k;
      ++line_;
      lineStart_ = k + 1;
    }
  }

  void newLine() {
    ++line_;
    lineStart_ = i_;
  }

  // A quote where the rules allow none: kept as a character when lenient.
  bool keepQuote(const char* what) {
    if (!lenient_) return fail(i_, what);
    auto& lines = outcome_.keptQuoteLines;
    if (lines.empty() || lines.back() != line_) lines.push_back(line_);
    return true;
  }

  bool fail(size_t at, const char* what) {
    outcome_.problem = TextProblem{line_, at - lineStart_ + 1, what};
    return false;
  }

  std::string_view text_;
  Rfc4180Sink& sink_;
  bool lenient_;
  size_t i_ = 0, line_ = 1, lineStart_ = 0;
  std::string scratch_;  // a quoted field without its quotes
  Rfc4180Outcome outcome_;
};

// Keeps the records whole, an unfinished one left out.
struct RowsSink : Rfc4180Sink {
  CsvRows rows;
  std::vector<std::string> row;
  void field(std::string_view text, bool) override { row.emplace_back(text); }
  void endRecord() override { rows.push_back(std::exchange(row, {})); }
};

}  // namespace

Rfc4180Outcome readRfc4180(std::string_view text, Rfc4180Sink& sink, bool lenient) {
  return Rfc4180Reader(text, sink, lenient).read();
}

Rfc4180Read readRfc4180(std::string_view text, bool lenient) {
  RowsSink sink;
  Rfc4180Outcome outcome = readRfc4180(text, sink, lenient);
  return {std::move(sink.rows), std::move(outcome.problem), std::move(outcome.keptQuoteLines)};
}

void appendRfc4180Record(const std::vector<std::string>& fields, std::string& out) {
  for (size_t c = 0; c < fields.size(); ++c) {
    if (c > 0) out += ',';
    const std::string& field = fields[c];
    if (!needsQuotes(field)) {
      out += field;
      continue;
    }
    out += '"';
    for (char ch : field) {
      if (ch == '"') out += '"';
      out += ch;
    }
    out += '"';
  }
  out += "\r\n";
}

std::string writeRfc4180(const CsvRows& rows) {
  std::string out;
  for (const auto& row : rows) appendRfc4180Record(row, out);
  return out;
}

bool isUtf8(std::string_view bytes) {
  for (size_t i = 0; i < bytes.size();) {
    if (static_cast<unsigned char>(bytes[i]) < 0x80) {
      ++i;
    } else if (const size_t length = utf8Length(bytes.substr(i))) {
      i += length;
    } else {
      return false;
    }
  }
  return true;
}

std::string jsonString(std::string_view bytes) {
  std::string out;
  appendJsonString(out, bytes);
  return out;
}

void appendJsonString(std::string& out, std::string_view bytes) {
  static constexpr char kHex[] = "0123456789abcdef";
  const bool plain = std::all_of(bytes.begin(), bytes.end(), [](char c) {
    return c >= 0x20 && c < 0x7F && c != '"' && c != '\\';
  });
  out += '"';
  if (plain) {
    out.append(bytes);
    out += '"';
    return;
  }
  for (size_t i = 0; i < bytes.size();) {
    const auto byte = static_cast<unsigned char>(bytes[i]);
    if (byte >= 0x80) {
      if (const size_t length = utf8Length(bytes.substr(i))) {
        out.append(bytes.substr(i, length));
        i += length;
      } else {
        // Latin-1: U+0080..U+00FF in two bytes.
        out += static_cast<char>(0xC0 | byte >> 6);
        out += static_cast<char>(0x80 | (byte & 0x3F));
        ++i;
      }
      continue;
    }
    switch (byte) {
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
        if (byte < 0x20) {
          out += "\\u00";
          out += kHex[byte >> 4];
          out += kHex[byte & 15];
        } else {
          out += static_cast<char>(byte);
        }
    }
    ++i;
  }
  out += '"';
}

namespace {

constexpr char kBase64[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

void appendUtf8(uint32_t code, std::string& out) {
  if (code < 0x80) {
    out += static_cast<char>(code);
  } else if (code < 0x800) {
    out += static_cast<char>(0xC0 | code >> 6);
    out += static_cast<char>(0x80 | (code & 0x3F));
  } else if (code < 0x10000) {
    out += static_cast<char>(0xE0 | code >> 12);
    out += static_cast<char>(0x80 | (code >> 6 & 0x3F));
    out += static_cast<char>(0x80 | (code & 0x3F));
  } else {
    out += static_cast<char>(0xF0 | code >> 18);
    out += static_cast<char>(0x80 | (code >> 12 & 0x3F));
    out += static_cast<char>(0x80 | (code >> 6 & 0x3F));
    out += static_cast<char>(0x80 | (code & 0x3F));
  }
}

// The line and column (both from 1, the column in bytes) of an offset in a text.
TextProblem problemAt(std::string_view text, size_t at, std::string what) {
  const std::string_view before = text.substr(0, at);
  const size_t lineStart = before.find_last_of('\n') + 1;  // 0 on the first line
  return {1 + static_cast<size_t>(std::count(before.begin(), before.end(), '\n')),
          at - lineStart + 1, std::move(what)};
}

}  // namespace

char JsonReader::peek() {
  skipBlanks();
  return pos_ < text_.size() && !problem_ ? text_[pos_] : '\0';
}

void JsonReader::fail(const char* what) {
  if (!problem_) problem_ = problemAt(text_, std::min(pos_, text_.size()), what);
}

void JsonReader::skipBlanks() {
  while (pos_ < text_.size() && (text_[pos_] == ' ' || text_[pos_] == '\n' || text_[pos_] == '\r' ||
                                 text_[pos_] == '\t')) {
    ++pos_;
  }
}

bool JsonReader::take(char c) {
  skipBlanks();
  if (pos_ < text_.size() && text_[pos_] == c) return ++pos_, true;
  return false;
}

bool JsonReader::word(std::string_view w) {
  if (text_.substr(pos_, w.size()) != w) return false;
  pos_ += w.size();
  return true;
}

bool JsonReader::enter(char open) {
  if (problem_) return false;
  if (take(open)) return true;
  fail(open == '[' ? "an array is missing" : "an object is missing");
  return false;
}

bool JsonReader::next(bool& first, char close) {
  if (problem_) return false;
  if (take(close)) return false;
  if (!first && !take(',')) {
    fail(close == ']' ? "a comma or closing bracket is missing"
                      : "a comma or closing brace is missing");
    return false;
  }
  first = false;
  return true;
}

std::string JsonReader::name() {
  if (peek() != '"') {
    fail("a member name is missing");
    return {};
  }
  std::string name = string();
  if (!take(':')) fail("a colon is missing");
  return name;
}

void JsonReader::skip() {
  if (peek() != '"') {
    value();
    return;
  }
  // A string's end, its escapes left for the reading that keeps it to check.
  for (++pos_; pos_ < text_.size(); ++pos_) {
    if (text_[pos_] == '\\') {
      ++pos_;
    } else if (text_[pos_] == '"') {
      ++pos_;
      return;
    }
  }
  fail("a string is not closed");
}

void JsonReader::end() {
  if (peek() != '\0') fail("text after the document");
}

JsonValue JsonReader::value(int depth) {
  JsonValue v;
  const char c = peek();
  if (problem_ || depth > kMaxDepth || c == '\0') {
    fail(depth > kMaxDepth ? "nested too deeply" : "a value is missing");
    return v;
  }
  if (c == '{') {
    v.kind = JsonValue::Kind::Object;
    enter('{');
    for (bool first = true; next(first, '}');) {
      std::string member = name();
      v.members.push_back({std::move(member), value(depth + 1)});
    }
  } else if (c == '[') {
    v.kind = JsonValue::Kind::Array;
    enter('[');
    for (bool first = true; next(first, ']');) v.items.push_back(value(depth + 1));
  } else if (c == '"') {
    v.kind = JsonValue::Kind::String;
    v.text = string();
  } else if ((c == 't' && word("true")) || (c == 'f' && word("false"))) {
    v.kind = JsonValue::Kind::Boolean;
    v.boolean = c == 't';
    v.text = v.boolean ? "true" : "false";
  } else if (c != 'n' || !word("null")) {
    number(v);
  }
  return v;
}

void JsonReader::number(JsonValue& v) {
  const size_t start = pos_;
  while (pos_ < text_.size() &&
         std::string_view("+-0123456789.eE").find(text_[pos_]) != std::string_view::npos) {
    ++pos_;
  }
  const std::string_view digits = text_.substr(start, pos_ - start);
  if (digits.empty()) return fail("not a JSON value");
  v.kind = JsonValue::Kind::Number;
  v.text = digits;
  int64_t n = 0;
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), n);
  if (error == std::errc{} && end == digits.data() + digits.size()) v.integer = n;
}

uint32_t JsonReader::hex4() {
  uint32_t code = 0;
  const auto [end, error] = std::from_chars(
      text_.data() + pos_, text_.data() + std::min(pos_ + 4, text_.size()), code, 16);
  if (error != std::errc{} || end != text_.data() + pos_ + 4) {
    fail("a \\u escape needs four hex digits");
    return 0;
  }
  pos_ += 4;
  return code;
}

std::string JsonReader::string() {
  std::string out;
  ++pos_;
  while (pos_ < text_.size() && !problem_) {
    // The plain run up to the next quote or backslash in one piece.
    size_t stop = pos_;
    while (stop < text_.size() && text_[stop] != '"' && text_[stop] != '\\') ++stop;
    if (stop == text_.size()) break;
    out.append(text_.substr(pos_, stop - pos_));
    pos_ = stop + 1;
    if (text_[stop] == '"') return out;
    if (pos_ >= text_.size()) break;
    const char e = text_[pos_++];
    static constexpr std::string_view kFrom = "\"\\/bfnrt", kTo = "\"\\/\b\f\n\r\t";
    if (const size_t k = kFrom.find(e); k != std::string_view::npos) {
      out += kTo[k];
    } else if (e == 'u') {
      uint32_t code = hex4();
      if (code >= 0xD800 && code < 0xDC00 && word("\\u")) {
        code = 0x10000 + ((code - 0xD800) << 10) + (hex4() - 0xDC00);
      }
      appendUtf8(code, out);
    } else {
      fail("an unknown escape");
    }
  }
  fail("a string is not closed");
  return out;
}

std::string base64(std::string_view bytes) {
  std::string out;
  out.reserve((bytes.size() + 2) / 3 * 4);
  for (size_t i = 0; i < bytes.size(); i += 3) {
    const size_t n = std::min<size_t>(3, bytes.size() - i);
    uint32_t group = 0;
    for (size_t k = 0; k < 3; ++k) {
      group = group << 8 | (k < n ? static_cast<unsigned char>(bytes[i + k]) : 0u);
    }
    for (size_t k = 0; k < 4; ++k) {
      out += k <= n ? kBase64[group >> (18 - 6 * k) & 63] : '=';
    }
  }
  return out;
}

std::optional<std::string> fromBase64(std::string_view text) {
  while (!text.empty() && text.back() == '=') text.remove_suffix(1);
  if (text.size() % 4 == 1) return std::nullopt;
  std::string out;
  uint32_t group = 0;
  int bits = 0;
  for (char c : text) {
    const char* at = std::strchr(kBase64, c);
    if (c == '\0' || at == nullptr) return std::nullopt;
    group = group << 6 | static_cast<uint32_t>(at - kBase64);
    bits += 6;
    if (bits >= 8) {
      bits -= 8;
      out += static_cast<char>(group >> bits & 0xFF);
    }
  }
  return out;
}

const JsonValue* JsonValue::find(std::string_view name) const {
  for (const auto& [key, member] : members) {
    if (key == name) return &member;
  }
  return nullptr;
}

JsonRead readJson(std::string_view text) {
  JsonReader reader(text);
  JsonRead result;
  result.value = reader.value();
  reader.end();
  result.problem = reader.problem();
  return result;
}

}  // namespace quorrel::tool
