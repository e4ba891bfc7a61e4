// Text formats the command offers beside the extension's own: RFC 4180 CSV (quoted
// cells that may hold commas, quotes and line breaks) and JSON, with base64 for bytes
// that are not text. Plain functions on bytes, without the module, so that they can
// be tested and fuzzed alone.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quorrel::tool {

using CsvRows = std::vector<std::vector<std::string>>;

// Where a text breaks its format: the line and the column (both from 1, the column
// in bytes) and what is wrong there.
struct TextProblem {
  size_t line = 0;
  size_t column = 0;
  std::string what;
};

// What reading RFC 4180 CSV met besides its records.
struct Rfc4180Outcome {
  std::optional<TextProblem> problem;  // the first place that breaks the rules
  std::vector<size_t> keptQuoteLines;  // lenient: the lines of quotes kept as characters
};

// Receives the fields of each record, then its end. A record whose end never comes
// (reading stopped at a problem inside it) is to be left out.
class Rfc4180Sink {
 public:
  virtual ~Rfc4180Sink() = default;
  // `text` lasts until the next call. Only a `quoted` field holds a comma or a line
  // break.
  virtual void field(std::string_view text, bool quoted) = 0;
  virtual void endRecord() = 0;
};

// Reads RFC 4180 CSV: fields separated by commas, records by CR LF, LF or CR; a field
// in double quotes may hold commas, line breaks and doubled quotes. A final line
// break adds no record. A quote that is never closed stops the reading there. A quote
// inside an unquoted field, or text after a closing quote, stops it too, unless
// `lenient`: then such a quote is a character of the field, as most CSV readers keep
// it (37°36'37.8"N; "a"b reads as a"b).
Rfc4180Outcome readRfc4180(std::string_view text, Rfc4180Sink& sink, bool lenient);

struct Rfc4180Read {
  CsvRows rows;  // the records before the problem, if any
  std::optional<TextProblem> problem;
  std::vector<size_t> keptQuoteLines;
};
Rfc4180Read readRfc4180(std::string_view text, bool lenient = false);

// Appends one record with a CR LF, quoting only fields that need it.
void appendRfc4180Record(const std::vector<std::string>& fields, std::string& out);
std::string writeRfc4180(const CsvRows& rows);

// Whether the bytes are UTF-8 throughout (no overlong forms or surrogates).
bool isUtf8(std::string_view bytes);

// A JSON string literal of the bytes; a byte that is not part of valid UTF-8 is
// taken as the Latin-1 character of that value.
std::string jsonString(std::string_view bytes);
void appendJsonString(std::string& out, std::string_view bytes);

std::string base64(std::string_view bytes);
// Nothing when the text is not base64 (padding optional).
std::optional<std::string> fromBase64(std::string_view text);

// A JSON value read whole. Numbers keep an exact integer when they are one; numbers
// and booleans keep their text too.
struct JsonMember;
struct JsonValue {
  enum class Kind { Null, Boolean, Number, String, Array, Object };
  Kind kind = Kind::Null;
  bool boolean = false;
  std::optional<int64_t> integer;  // a number without fraction or exponent, in range
  std::string text;
  std::vector<JsonValue> items;
  std::vector<JsonMember> members;  // an object's, in the document's order
  // The member called `name` of an object, or null.
  const JsonValue* find(std::string_view name) const;
};
struct JsonMember {
  std::string name;
  JsonValue value;
};

struct JsonRead {
  JsonValue value;
  std::optional<TextProblem> problem;
};
JsonRead readJson(std::string_view text);

// Reads JSON a piece at a time, so that a big document's lists are never held whole:
// the caller steps into arrays and objects and reads the values inside them whole.
// After the first mistake every step fails and problem() tells where it was.
class JsonReader {
 public:
  explicit JsonReader(std::string_view text) : text_(text) {}

  // The first character of the next value, blanks skipped; 0 at the end.
  char peek();
  JsonValue value() { return value(0); }
  // Steps over the next value, building nothing of a string.
  void skip();
  // Steps into the array ('[') or object ('{') that comes next.
  bool enter(char open);
  // Inside an array or object: whether another item follows, taking the comma before
  // it; false once the closing bracket is taken. `first` starts true.
  bool next(bool& first, char close);
  // An object member's name, and the colon after it.
  std::string name();
  // Only blanks may follow.
  void end();
  void fail(const char* what);
  const std::optional<TextProblem>& problem() const { return problem_; }

 private:
  static constexpr int kMaxDepth = 64;

  JsonValue value(int depth);
  void skipBlanks();
  bool take(char c);
  bool word(std::string_view w);
  void number(JsonValue& v);
  uint32_t hex4();
  std::string string();

  std::string_view text_;
  size_t pos_ = 0;
  std::optional<TextProblem> problem_;
};

}  // namespace quorrel::tool
