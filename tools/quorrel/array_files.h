// The array file formats as the command sees them: the four the extension loads and
// saves itself, and two the command adds (RFC 4180 CSV and JSON), which pass through a
// native file; recognising a file; and walking a native snapshot of an instance with
// the core's own reader, for what no expression tells (element and key types).
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "array/element.h"
#include "io/native_file.h"
#include "text_formats.h"

namespace quorrel::tool {

enum class ArrayFormat { Native, Host, Csv, Ini, CsvRfc4180, Json };

// The element type codes of a native file's records (0 is an empty element, or no key):
// the core's own.
inline constexpr uint16_t kValueType = static_cast<uint16_t>(ElementType::Value);
inline constexpr uint16_t kStringType = static_cast<uint16_t>(ElementType::String);
inline constexpr uint16_t kFileType = static_cast<uint16_t>(ElementType::File);

struct FormatInfo {
  const char* name;         // as --from and --to take it
  const char* description;  // as inspect prints it
  const char* loadAction;   // the actions' names, as scripts call them; null for the
  const char* saveAction;   // formats the command reads and writes itself
  bool binary;
};

const FormatInfo& formatInfo(ArrayFormat format);
// Any case; nothing for an unknown name.
std::optional<ArrayFormat> formatOfName(std::string_view name);
// "native, host, csv, ini, csv-rfc4180, json", for messages.
std::string formatNames();

// By magic or header, else by content with the name's format as a hint. JSON begins
// with "{", or "[" and a value; an INI file's first line that is not blank or a
// comment (//, ; or #) is a [section]; any other text is CSV. A name ending in .json
// or .csv makes any text that format, and one in .ini makes a [section] INI even
// where it could begin JSON. Bytes with a zero byte and no known header are none of them. `start`
// may be the beginning of a longer file.
std::optional<ArrayFormat> recogniseFormat(std::string_view start,
                                           std::optional<ArrayFormat> hint = std::nullopt);

// The format that a file name's extension asks for (.arr, .mmf, .csv, .ini, .json, any
// case), or nothing.
std::optional<ArrayFormat> formatOfExtension(std::string_view path);

const char* elementTypeName(uint16_t type);

// What comes before a native file's elements: dimensions, boundaries, label records.
struct NativeHeader {
  int32_t dimensions = 0;
  std::vector<int32_t> boundaries;                 // of dimensions 1..dimensions
  std::vector<std::optional<std::string>> labels;  // none: a record without text
  int32_t columns() const { return boundaries.empty() ? 0 : boundaries[0]; }
};

// Walks a native file's bytes: the header and labels first, then each element until
// `element` returns false.
using ElementVisit = std::function<bool(const NativeHalf& value, const NativeHalf& key)>;
FileExtent walkNativeFile(std::string_view bytes, NativeHeader& header,
                          const ElementVisit& element);

// The text an element or key reads as: a number in decimal, a string up to its
// first zero byte, nothing for the other types.
std::string textOf(const NativeHalf& half);
// A string half's text, up to its first zero byte.
std::string_view textBytes(const NativeHalf& half);

// Builds a native file from parts, with the core's own writer: for the formats the
// command reads itself, which the extension then loads from it.
class NativeFileBuilder {
 public:
  NativeFileBuilder();
  ~NativeFileBuilder();
  NativeFileBuilder(const NativeFileBuilder&) = delete;
  NativeFileBuilder& operator=(const NativeFileBuilder&) = delete;

  void setShape(int32_t dimensions, const std::vector<int32_t>& boundaries);
  void setLabels(const std::vector<std::optional<std::string>>& labels);
  // `value` and `key` as a record holds them; a key of type 0 is none.
  void append(const NativeHalf& value, const NativeHalf& key);
  // False when the file could not be written.
  bool save(const std::string& path);

 private:
  struct Parts;
  std::unique_ptr<Parts> parts_;
};

// JSON, which the command reads itself, becomes a native file first. Three documents
// map to an array:
// - The array document, which `convert` writes and which keeps all of an array: it
//   holds "dimensions", "boundaries", "labels" (null for a label record without text)
//   and "elements". An element (or key) is what says all of it: null for an empty
//   element, a number for a value, a string for a UTF-8 text; else {"base64": ...} for
//   a text that is not UTF-8 and {"file": ...} for file bytes, both base64. An element
//   with a key is {"element": ..., "key": ...}.
// - An array of flat records, as most tools write them: a two-dimensional table with
//   a column for each member name, in the order the names first appear, the names as
//   column labels. A 32-bit integer is a value; a string, another number, true and
//   false are texts as written; null and a missing member are empty texts.
// - A list of elements alone, as in "elements": a one-dimensional array.
// A document of another shape throws JsonMistake; broken JSON is returned as a problem.
struct JsonMistake : std::runtime_error {
  using std::runtime_error::runtime_error;
};
std::optional<TextProblem> buildFromJson(NativeFileBuilder& builder, std::string_view text);
// Written in three parts, so that a big array goes out in pieces.
void appendJsonHeader(std::string& out, const NativeHeader& header);
void appendJsonElement(std::string& out, const NativeHalf& value, const NativeHalf& key);
void appendJsonEnd(std::string& out, bool anyElement);

}  // namespace quorrel::tool
