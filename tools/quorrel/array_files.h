// The four whole-array file formats as the command sees them: recognising a file,
// the actions that load and save each format, and a reader of the native file's
// element types (the one thing the expressions do not tell).
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quorrel::tool {

enum class ArrayFormat { Native, Host, Csv, Ini };

struct FormatInfo {
  const char* name;         // as --to takes it
  const char* description;  // as inspect prints it
  const char* loadAction;   // the actions' names, as scripts call them
  const char* saveAction;
};

const FormatInfo& formatInfo(ArrayFormat format);
std::optional<ArrayFormat> formatOfName(std::string_view name);

// By magic or header, else by content: an INI file's first line that is not blank
// or a comment is a [section]; any other text is CSV. Bytes with a zero byte and no
// known header are none of the four.
std::optional<ArrayFormat> recogniseFormat(std::string_view bytes);

// The output format that a file name implies: .csv, .ini, anything else native.
ArrayFormat formatOfOutputPath(std::string_view path);

// Type codes of each element and its key.
struct ElementTypes {
  uint16_t type = 0;
  int32_t size = 0;
  uint16_t keyType = 0;
};
// The types of every element and key of a native array file.
std::vector<ElementTypes> readNativeElementTypes(const std::string& path);

const char* elementTypeName(uint16_t type);

}  // namespace quorrel::tool
