#include "array_files.h"

#include <cctype>
#include <cstring>

namespace quorrel::tool {
namespace {

constexpr std::string_view kNativeMagic{"ZUBARRAY", 8};
constexpr std::string_view kHostHeader{"CNC ARRAY\0", 10};

const FormatInfo kFormats[] = {
    {"native", "native array file", 3, 0},
    {"host", "host array file", 4, 1},
    {"csv", "CSV file", 5, 2},
    {"ini", "INI file", 59, 58},
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

// Walks the records of a native file; a file that ends early ends the walk.
class NativeReader {
 public:
  explicit NativeReader(std::string_view bytes) : bytes_(bytes) {}

  template <typename T>
  T read() {
    T value{};
    if (pos_ + sizeof value <= bytes_.size())
      std::memcpy(&value, bytes_.data() + pos_, sizeof value);
    pos_ += sizeof value;
    return value;
  }
  void skip(int64_t count) {
    if (count > 0) pos_ += static_cast<size_t>(count);
  }
  void skipData(uint16_t type, int32_t size) { skip(type == 1 ? 4 : size); }
  bool atEnd() const { return pos_ >= bytes_.size(); }

 private:
  std::string_view bytes_;
  size_t pos_ = 0;
};

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
  if (startsWith(bytes, kNativeMagic)) return ArrayFormat::Native;
  if (startsWith(bytes, kHostHeader)) return ArrayFormat::Host;
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

std::vector<ElementTypes> readNativeElementTypes(std::string_view bytes) {
  NativeReader reader(bytes);
  reader.skip(8 + 2);
  const auto dimensions = reader.read<int32_t>();
  if (dimensions > 0) reader.skip(4 * int64_t{dimensions});
  const auto labelCount = reader.read<int32_t>();
  for (int32_t i = 0; i < labelCount && !reader.atEnd(); ++i) reader.skip(reader.read<int32_t>());
  const auto elementCount = reader.read<int32_t>();
  std::vector<ElementTypes> types;
  for (int32_t i = 0; i < elementCount && !reader.atEnd(); ++i) {
    ElementTypes element;
    element.type = reader.read<uint16_t>();
    element.size = reader.read<int32_t>();
    reader.skipData(element.type, element.size);
    element.keyType = reader.read<uint16_t>();
    reader.skipData(element.keyType, reader.read<int32_t>());
    types.push_back(element);
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
