// Text formats the command offers beside the extension's own: RFC 4180 CSV (quoted
// cells that may hold commas, quotes and line breaks) and JSON. Plain functions on
// bytes, without the module, so that they can be tested and fuzzed alone.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quorrel::tool {

using CsvRows = std::vector<std::vector<std::string>>;

// Reads RFC 4180 CSV: fields separated by commas, records by CR LF, LF or CR; a field
// in double quotes may hold commas, line breaks and doubled quotes. A final line
// break adds no record. Lenient where the RFC is silent: text after a closing quote
// is kept, and an unterminated quote runs to the end of the input.
CsvRows readRfc4180(std::string_view text);

// Writes RFC 4180 CSV with CR LF line ends, quoting only fields that need it.
std::string writeRfc4180(const CsvRows& rows);

// A JSON string literal of the bytes; a byte that is not part of valid UTF-8 is
// taken as the Latin-1 character of that value.
std::string jsonString(std::string_view bytes);

}  // namespace quorrel::tool
