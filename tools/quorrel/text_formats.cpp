#include "text_formats.h"

#include <algorithm>
#include <charconv>
#include <cstring>

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

Rfc4180Read readRfc4180(std::string_view text) {
  Rfc4180Read read;
  std::vector<std::string> row;
  std::string field;
  size_t line = 1;
  bool quoted = false;  // the current field was quoted, and its quote closed
  const auto fail = [&](size_t at, const char* what) {
    read.problem = TextProblem{at, what};
    return std::move(read);
  };
  const auto endField = [&] {
    row.push_back(std::move(field));
    field.clear();
    quoted = false;
  };
  size_t i = 0;
  while (i < text.size()) {
    const char c = text[i];
    if (c == ',') {
      endField();
      ++i;
    } else if (c == '\r' || c == '\n') {
      i += c == '\r' && i + 1 < text.size() && text[i + 1] == '\n' ? 2 : 1;
      endField();
      read.rows.push_back(std::move(row));
      row.clear();
      ++line;
    } else if (quoted) {
      return fail(line, "text after a closing quote");
    } else if (c != '"') {
      field += c;
      ++i;
    } else if (!field.empty()) {
      return fail(line, "a quote inside an unquoted field");
    } else {
      // A quoted field: up to the quote that is not doubled.
      const size_t opened = line;
      for (++i;; ++i) {
        if (i == text.size()) return fail(opened, "a quoted field is not closed");
        if (text[i] == '"' && i + 1 < text.size() && text[i + 1] == '"') {
          field += '"';
          ++i;
        } else if (text[i] == '"') {
          ++i;
          break;
        } else {
          // A CR LF inside the field is one line break, as outside.
          const bool lineEnd =
              text[i] == '\n' || (text[i] == '\r' && (i + 1 == text.size() || text[i + 1] != '\n'));
          line += lineEnd;
          field += text[i];
        }
      }
      quoted = true;
    }
  }
  if (!text.empty() && text.back() != '\n' && text.back() != '\r') {
    endField();
    read.rows.push_back(std::move(row));
  }
  return read;
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

// A recursive-descent reader; `problem` is set at the first mistake.
class JsonReader {
 public:
  explicit JsonReader(std::string_view text) : text_(text) {}

  JsonRead read() {
    JsonRead result;
    result.value = value(0);
    skipBlanks();
    if (!problem_ && pos_ < text_.size()) fail("text after the document");
    result.problem = std::move(problem_);
    return result;
  }

 private:
  static constexpr int kMaxDepth = 64;

  void fail(const char* what) {
    if (problem_) return;
    const size_t at = std::min(pos_, text_.size());
    problem_ = TextProblem{
        1 + static_cast<size_t>(std::count(text_.begin(), text_.begin() + at, '\n')), what};
  }
  void skipBlanks() {
    while (pos_ < text_.size() &&
           std::string_view(" \t\r\n").find(text_[pos_]) != std::string_view::npos) {
      ++pos_;
    }
  }
  bool take(char c) {
    skipBlanks();
    if (pos_ < text_.size() && text_[pos_] == c) return ++pos_, true;
    return false;
  }
  bool word(std::string_view w) {
    if (text_.substr(pos_, w.size()) != w) return false;
    pos_ += w.size();
    return true;
  }

  JsonValue value(int depth) {
    JsonValue v;
    skipBlanks();
    if (problem_ || depth > kMaxDepth || pos_ >= text_.size()) {
      fail(depth > kMaxDepth ? "nested too deeply" : "a value is missing");
      return v;
    }
    const char c = text_[pos_];
    if (c == '{') {
      object(v, depth);
    } else if (c == '[') {
      array(v, depth);
    } else if (c == '"') {
      v.kind = JsonValue::Kind::String;
      v.text = string();
    } else if (word("true") || word("false")) {
      v.kind = JsonValue::Kind::Boolean;
      v.boolean = c == 't';
    } else if (!word("null")) {
      number(v);
    }
    return v;
  }

  void object(JsonValue& v, int depth) {
    v.kind = JsonValue::Kind::Object;
    ++pos_;
    if (take('}')) return;
    do {
      skipBlanks();
      if (pos_ >= text_.size() || text_[pos_] != '"') return fail("a member name is missing");
      std::string name = string();
      if (!take(':')) return fail("a colon is missing");
      v.members.push_back({std::move(name), value(depth + 1)});
    } while (!problem_ && take(','));
    if (!take('}')) fail("a closing brace is missing");
  }

  void array(JsonValue& v, int depth) {
    v.kind = JsonValue::Kind::Array;
    ++pos_;
    if (take(']')) return;
    do {
      v.items.push_back(value(depth + 1));
    } while (!problem_ && take(','));
    if (!take(']')) fail("a closing bracket is missing");
  }

  void number(JsonValue& v) {
    const size_t start = pos_;
    while (pos_ < text_.size() &&
           std::string_view("+-0123456789.eE").find(text_[pos_]) != std::string_view::npos) {
      ++pos_;
    }
    const std::string_view digits = text_.substr(start, pos_ - start);
    if (digits.empty()) return fail("not a JSON value");
    v.kind = JsonValue::Kind::Number;
    int64_t n = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), n);
    if (error == std::errc{} && end == digits.data() + digits.size()) v.integer = n;
  }

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

  uint32_t hex4() {
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

  std::string string() {
    std::string out;
    for (++pos_; pos_ < text_.size() && !problem_;) {
      const char c = text_[pos_++];
      if (c == '"') return out;
      if (c != '\\') {
        out += c;
        continue;
      }
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

  std::string_view text_;
  size_t pos_ = 0;
  std::optional<TextProblem> problem_;
};

}  // namespace

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
  return JsonReader(text).read();
}

}  // namespace quorrel::tool
