#include "array_files.h"

#include <cctype>
#include <cstring>

#include "array/element_array.h"
#include "io/host_array_file.h"
#include "io/native_file.h"

namespace quorrel::tool {
namespace {

const FormatInfo kFormats[] = {
    {"native", "native array file", "loadFromFile", "saveToFile"},
    {"host", "host array file", "loadFromHostArray", "saveToHostArray"},
    {"csv", "CSV file", "loadFromCsv", "saveToCsv"},
    {"ini", "INI file", "loadFromIni", "saveToIni"},
};

bool startsWith(std::string_view text, std::string_view prefix) {
  return text.substr(0, prefix.size()) == prefix;
}

bool endsWithNoCase(std::string_view text, std::string_view suffix) {
  if (text.size() < suffix.size()) return false;
  text.remove_prefix(text.size() - suffix.size());
  for (size_t i = 0; i < suffix.size(); ++i) {
    if (std::tolower(static_cast<unsigned char>(text[i])) != suffix[i]) return false;
  }
  return true;
}

// The first line that is neither blank nor a "//" comment, leading blanks skipped.
std::string_view firstMeaningfulLine(std::string_view text) {
  while (!text.empty()) {
    const size_t end = text.find_first_of("\r\n");
    std::string_view line = text.substr(0, end);
    text = end == std::string_view::npos ? std::string_view{} : text.substr(end + 1);
    const size_t start = line.find_first_not_of(" \t");
    if (start == std::string_view::npos) continue;
    line.remove_prefix(start);
    if (!startsWith(line, "//")) return line;
  }
  return {};
}

}  // namespace

const FormatInfo& formatInfo(ArrayFormat format) {
  return kFormats[static_cast<int>(format)];
}

std::optional<ArrayFormat> formatOfName(std::string_view name) {
  for (int i = 0; i < 4; ++i) {
    if (name == kFormats[i].name) return static_cast<ArrayFormat>(i);
  }
  return std::nullopt;
}

std::optional<ArrayFormat> recogniseFormat(std::string_view bytes) {
  if (startsWith(bytes, kNativeFileMagic)) return ArrayFormat::Native;
  if (startsWith(bytes, kHostFileHeader)) return ArrayFormat::Host;
  if (bytes.find('\0') != std::string_view::npos) return std::nullopt;
  const std::string_view line = firstMeaningfulLine(bytes);
  if (startsWith(line, "[") && line.find(']') != std::string_view::npos) return ArrayFormat::Ini;
  return ArrayFormat::Csv;
}

ArrayFormat formatOfOutputPath(std::string_view path) {
  if (endsWithNoCase(path, ".csv")) return ArrayFormat::Csv;
  if (endsWithNoCase(path, ".ini")) return ArrayFormat::Ini;
  return ArrayFormat::Native;
}

std::vector<ElementTypes> readNativeElementTypes(const std::string& path) {
  // The module's own reader, linked in: no expression tells an element's type.
  ElementArray array;
  loadNativeFile(array, path.c_str(), LoadReplace);
  std::vector<ElementTypes> types;
  for (int32_t i = 0; i < array.size(); ++i) {
    const Element& element = array.at(i);
    const Element* key = element.key();
    types.push_back({static_cast<uint16_t>(element.type()), element.size(),
                     static_cast<uint16_t>(key ? key->type() : ElementType::None)});
  }
  return types;
}

const char* elementTypeName(uint16_t type) {
  switch (type) {
    case 0:
      return "none";
    case 1:
      return "value";
    case 2:
      return "string";
    case 3:
      return "file";
    default:
      return "?";
  }
}

}  // namespace quorrel::tool
