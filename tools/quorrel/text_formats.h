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

// Where a text breaks its format: the line (from 1) and what is wrong there.
struct TextProblem {
  size_t line = 0;
  std::string what;
};

struct Rfc4180Read {
  CsvRows rows;                        // the records before the problem, if any
  std::optional<TextProblem> problem;  // the first record that breaks the rules
};

// Reads RFC 4180 CSV: fields separated by commas, records by CR LF, LF or CR; a field
// in double quotes may hold commas, line breaks and doubled quotes. A final line
// break adds no record. A quote that is never closed, text after a closing quote and
// a quote inside an unquoted field break the rules: reading stops there.
Rfc4180Read readRfc4180(std::string_view text);

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

// A JSON document read whole. Numbers keep an exact integer when they are one.
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

}  // namespace quorrel::tool
