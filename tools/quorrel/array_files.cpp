#include "array_files.h"

#include <climits>
#include <cstring>

#include "array/element_array.h"
#include "ascii_case.h"
#include "io/host_array_file.h"
#include "text_formats.h"

namespace quorrel::tool {
namespace {

const FormatInfo kFormats[] = {
    {"native", "native array file", "loadFromFile", "saveToFile", true},
    {"host", "host array file", "loadFromHostArray", "saveToHostArray", true},
    {"csv", "CSV file", "loadFromCsv", "saveToCsv", false},
    {"ini", "INI file", "loadFromIni", "saveToIni", false},
    {"csv-rfc4180", "RFC 4180 CSV file", nullptr, nullptr, false},
    {"json", "JSON file", nullptr, nullptr, false},
};
constexpr int kFormatCount = static_cast<int>(std::size(kFormats));

struct Extension {
  const char* suffix;
  ArrayFormat format;
};
constexpr Extension kExtensions[] = {
    {".arr", ArrayFormat::Native}, {".mmf", ArrayFormat::Host},  {".csv", ArrayFormat::Csv},
    {".ini", ArrayFormat::Ini},    {".json", ArrayFormat::Json},
};

bool sameNoCase(std::string_view a, std::string_view b) {
  return lowerCase(a) == lowerCase(b);
}

// The first line that is neither blank nor a comment (//, ; or #), leading blanks
// skipped.
std::string_view firstMeaningfulLine(std::string_view text) {
  while (!text.empty()) {
    const size_t end = text.find_first_of("\r\n");
    std::string_view line = text.substr(0, end);
    text = end == std::string_view::npos ? std::string_view{} : text.substr(end + 1);
    const size_t start = line.find_first_not_of(" \t");
    if (start == std::string_view::npos) continue;
    line.remove_prefix(start);
    if (!line.starts_with("//") && !line.starts_with(";") && !line.starts_with("#")) return line;
  }
  return {};
}

// Records the parts for walkNativeFile's caller.
class HeaderVisitor : public NativeFileVisitor {
 public:
  HeaderVisitor(NativeHeader& header, const ElementVisit& element)
      : header_(header), element_(element) {}
  void header(int32_t dimensions, const int32_t* boundaries) override {
    header_.dimensions = dimensions;
    header_.boundaries.assign(boundaries, boundaries + std::max(dimensions, 0));
  }
  void label(const char* text, int32_t length) override {
    if (text == nullptr) {
      header_.labels.emplace_back();
    } else {
      header_.labels.emplace_back(std::string(text, static_cast<size_t>(length)));
    }
  }
  bool element(const NativeHalf& value, const NativeHalf& key) override {
    return element_(value, key);
  }

 private:
  NativeHeader& header_;
  const ElementVisit& element_;
};

NativeHalf stringHalf(const std::string& value) {
  return {kStringType, static_cast<int32_t>(value.size() + 1), 0, value};
}

void appendJsonHalf(std::string& out, const NativeHalf& half) {
  if (half.type == kValueType) {
    out += std::to_string(half.number);
  } else if (half.type == kStringType && isUtf8(textBytes(half))) {
    appendJsonString(out, textBytes(half));
  } else if (half.type == kStringType) {
    out += "{\"base64\": \"" + base64(textBytes(half)) + "\"}";
  } else if (half.type != 0) {
    out += "{\"file\": \"" + base64(half.bytes) + "\"}";
  } else {
    out += "null";
  }
}

int32_t jsonInt32(const JsonValue* v, const char* what) {
  if (!v || !v->integer || *v->integer < INT32_MIN || *v->integer > INT32_MAX) {
    throw JsonMistake(std::string(what) + " must be a 32-bit integer");
  }
  return static_cast<int32_t>(*v->integer);
}

// One element or key half from its JSON form; `held` keeps the bytes it points to.
NativeHalf halfOfJson(const JsonValue& v, std::string& held) {
  switch (v.kind) {
    case JsonValue::Kind::Null:
      return {};
    case JsonValue::Kind::Number:
      return {kValueType, 4, jsonInt32(&v, "a value"), {}};
    case JsonValue::Kind::String:
      held = v.text;
      return stringHalf(held);
    default:
      break;
  }
  const JsonValue* text = v.find("base64");
  const JsonValue* file = v.find("file");
  const JsonValue* encoded = text ? text : file;
  const auto bytes = encoded && encoded->kind == JsonValue::Kind::String ? fromBase64(encoded->text)
                                                                         : std::nullopt;
  if (!bytes) {
    throw JsonMistake(
        "an element is null, a number, a string, or an object with \"element\", "
        "\"base64\" or \"file\" (base64 text)");
  }
  held = *bytes;
  if (text) return stringHalf(held);
  return {kFileType, static_cast<int32_t>(held.size()), 0, held};
}

ElementValue operandOf(const NativeHalf& half, std::string& text) {
  switch (static_cast<ElementType>(half.type)) {
    case ElementType::None:
      return {};
    case ElementType::Value:
      return ElementValue::ofValue(half.number);
    case ElementType::String:
      text = textOf(half);
      return ElementValue::ofText(text.c_str());
    default:
      return ElementValue::ofBytes(half.bytes.data(), static_cast<int32_t>(half.bytes.size()));
  }
}

}  // namespace

const FormatInfo& formatInfo(ArrayFormat format) {
  return kFormats[static_cast<int>(format)];
}

std::optional<ArrayFormat> formatOfName(std::string_view name) {
  for (int i = 0; i < kFormatCount; ++i) {
    if (sameNoCase(name, kFormats[i].name)) return static_cast<ArrayFormat>(i);
  }
  return std::nullopt;
}

std::string formatNames() {
  std::string names;
  for (const FormatInfo& format : kFormats) {
    if (!names.empty()) names += ", ";
    names += format.name;
  }
  return names;
}

// JSON's first character, and for "[" what may follow it: a value, or "]". An INI
// section such as [names] goes on with a letter.
bool looksLikeJson(std::string_view text) {
  const size_t first = text.find_first_not_of(" \t\r\n");
  if (first == std::string_view::npos) return false;
  if (text[first] == '{') return true;
  if (text[first] != '[') return false;
  const size_t next = text.find_first_not_of(" \t\r\n", first + 1);
  if (next == std::string_view::npos) return true;
  const std::string_view rest = text.substr(next);
  return std::string_view("[{\"-0123456789]").find(rest[0]) != std::string_view::npos ||
         rest.starts_with("true") || rest.starts_with("false") || rest.starts_with("null");
}

std::optional<ArrayFormat> recogniseFormat(std::string_view start,
                                           std::optional<ArrayFormat> hint) {
  if (start.starts_with(kNativeFileMagic)) return ArrayFormat::Native;
  if (start.starts_with(kHostFileHeader)) return ArrayFormat::Host;
  if (start.find('\0') != std::string_view::npos) return std::nullopt;
  if (hint == ArrayFormat::Json) return ArrayFormat::Json;
  const std::string_view line = firstMeaningfulLine(start);
  const bool section = line.starts_with("[") && line.find(']') != std::string_view::npos;
  if (section && hint == ArrayFormat::Ini) return ArrayFormat::Ini;
  if (looksLikeJson(start)) return ArrayFormat::Json;
  return section ? ArrayFormat::Ini : ArrayFormat::Csv;
}

std::optional<ArrayFormat> formatOfExtension(std::string_view path) {
  const size_t dot = path.find_last_of("./\\");
  if (dot == std::string_view::npos || path[dot] != '.') return std::nullopt;
  for (const Extension& extension : kExtensions) {
    if (sameNoCase(path.substr(dot), extension.suffix)) return extension.format;
  }
  return std::nullopt;
}

const char* elementTypeName(uint16_t type) {
  static constexpr const char* kNames[] = {"none", "value", "string", "file"};
  return type < std::size(kNames) ? kNames[type] : "?";
}

FileExtent walkNativeFile(std::string_view bytes, NativeHeader& header,
                          const ElementVisit& element) {
  HeaderVisitor visitor(header, element);
  return scanNativeFile(bytes, visitor);
}

std::string textOf(const NativeHalf& half) {
  if (half.type == kValueType) return std::to_string(half.number);
  if (half.type != kStringType) return {};
  return std::string(textBytes(half));
}

struct NativeFileBuilder::Parts {
  ElementArray array;
  std::string valueText, keyText;
};

NativeFileBuilder::NativeFileBuilder() : parts_(std::make_unique<Parts>()) {}
NativeFileBuilder::~NativeFileBuilder() = default;

void NativeFileBuilder::setShape(int32_t dimensions, const std::vector<int32_t>& boundaries) {
  ElementArray& array = parts_->array;
  array.setDimensions(dimensions);
  for (size_t d = 0; d < boundaries.size(); ++d) {
    array.setBoundary(static_cast<int32_t>(d + 1), boundaries[d]);
  }
}

void NativeFileBuilder::setLabels(const std::vector<std::optional<std::string>>& labels) {
  // The list as it is, so that the file holds the same records.
  parts_->array.labels = LabelList(labels.begin(), labels.end());
}

void NativeFileBuilder::append(const NativeHalf& value, const NativeHalf& key) {
  ElementArray& array = parts_->array;
  const int32_t index = array.size();
  array.insertElement(operandOf(value, parts_->valueText), index);
  if (key.type != 0) array.setKey(operandOf(key, parts_->keyText), index);
}

bool NativeFileBuilder::save(const std::string& path) {
  return saveNativeFile(parts_->array, path.c_str(), FileModeTruncate).ok();
}

std::string_view textBytes(const NativeHalf& half) {
  return half.bytes.substr(0, half.bytes.find('\0'));
}

void buildFromRecords(NativeFileBuilder& builder, const CsvRows& rows, bool header) {
  size_t columns = 0;
  for (const auto& row : rows) columns = std::max(columns, row.size());
  builder.setShape(2, {static_cast<int32_t>(columns), 0});
  const size_t first = header && !rows.empty() ? 1 : 0;
  if (first == 1) {
    builder.setLabels(std::vector<std::optional<std::string>>(rows[0].begin(), rows[0].end()));
  }
  const std::string empty;
  for (size_t r = first; r < rows.size(); ++r) {
    for (size_t c = 0; c < columns; ++c) {
      builder.append(stringHalf(c < rows[r].size() ? rows[r][c] : empty), {});
    }
  }
}

void appendJsonElement(std::string& out, const NativeHalf& value, const NativeHalf& key) {
  if (key.type == 0) return appendJsonHalf(out, value);
  out += "{\"element\": ";
  appendJsonHalf(out, value);
  out += ", \"key\": ";
  appendJsonHalf(out, key);
  out += '}';
}

void appendJsonHeader(std::string& out, const NativeHeader& header) {
  out += "{\n  \"dimensions\": " + std::to_string(header.dimensions) + ",\n  \"boundaries\": [";
  for (size_t d = 0; d < header.boundaries.size(); ++d) {
    out += (d ? ", " : "") + std::to_string(header.boundaries[d]);
  }
  out += "],\n  \"labels\": [";
  for (size_t c = 0; c < header.labels.size(); ++c) {
    if (c) out += ", ";
    out += header.labels[c] ? jsonString(*header.labels[c]) : "null";
  }
  out += "],\n  \"elements\": [";
}

void appendJsonEnd(std::string& out, bool anyElement) {
  out += anyElement ? "\n  ]\n}\n" : "]\n}\n";
}

void buildFromJson(NativeFileBuilder& builder, const JsonValue& document) {
  const JsonValue* dims = document.find("dimensions");
  const JsonValue* boundaries = document.find("boundaries");
  const JsonValue* labels = document.find("labels");
  const JsonValue* elements = document.find("elements");
  if (!elements || elements->kind != JsonValue::Kind::Array) {
    throw JsonMistake("the document needs an \"elements\" list");
  }
  std::vector<int32_t> shape;
  if (boundaries) {
    for (const JsonValue& b : boundaries->items) shape.push_back(jsonInt32(&b, "a boundary"));
  }
  builder.setShape(dims ? jsonInt32(dims, "\"dimensions\"") : 1, shape);
  if (labels) {
    std::vector<std::optional<std::string>> list;
    for (const JsonValue& label : labels->items) {
      if (label.kind == JsonValue::Kind::String) {
        list.emplace_back(label.text);
      } else {
        list.emplace_back();
      }
    }
    builder.setLabels(list);
  }
  std::string valueBytes, keyBytes;
  for (const JsonValue& element : elements->items) {
    const JsonValue* keyed = element.find("element");
    const JsonValue* key = element.find("key");
    if (keyed && key) {
      builder.append(halfOfJson(*keyed, valueBytes), halfOfJson(*key, keyBytes));
    } else {
      builder.append(halfOfJson(element, valueBytes), {});
    }
  }
}

}  // namespace quorrel::tool
