#include "array_files.h"

#include <climits>
#include <cstring>
#include <fstream>
#include <unordered_map>

#include "array/element_array.h"
#include "ascii_case.h"
#include "io/host_array_file.h"
#include "temp_file.h"
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
  // Any text is CSV, and a .json name asks for JSON whatever follows.
  if (hint == ArrayFormat::Json || hint == ArrayFormat::Csv) return hint;
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

// The records go to a scratch file as they come, so that a big array is never held:
// save() writes the header, then copies them after it.
struct NativeFileBuilder::Parts {
  int32_t dimensions = 1;
  std::vector<int32_t> boundaries;
  std::vector<std::optional<std::string>> labels;
  TempFile records;
  std::ofstream out{records.path(), std::ios::binary | std::ios::trunc};
  std::string pending;
  int64_t count = 0;

  void flush() {
    out.write(pending.data(), static_cast<std::streamsize>(pending.size()));
    pending.clear();
  }
};

NativeFileBuilder::NativeFileBuilder() : parts_(std::make_unique<Parts>()) {}
NativeFileBuilder::~NativeFileBuilder() = default;

void NativeFileBuilder::setShape(int32_t dimensions, const std::vector<int32_t>& boundaries) {
  parts_->dimensions = dimensions;
  parts_->boundaries = boundaries;
}

void NativeFileBuilder::setLabels(const std::vector<std::optional<std::string>>& labels) {
  parts_->labels = labels;
}

void NativeFileBuilder::append(const NativeHalf& value, const NativeHalf& key) {
  appendNativeRecord(parts_->pending, value, key);
  ++parts_->count;
  if (parts_->pending.size() >= (size_t{1} << 20)) parts_->flush();
}

bool NativeFileBuilder::save(const std::string& path) {
  Parts& p = *parts_;
  p.flush();
  if (!p.out.flush() || p.count > ElementArray::kMaxSize) return false;
  p.out.close();
  std::vector<int32_t> boundaries(static_cast<size_t>(std::max(p.dimensions, 0)), 0);
  std::copy_n(p.boundaries.begin(), std::min(p.boundaries.size(), boundaries.size()),
              boundaries.begin());
  const std::string head =
      nativeFileHead(p.dimensions, boundaries.data(), p.labels, static_cast<int32_t>(p.count));
  std::ofstream file(path, std::ios::binary | std::ios::trunc);
  file.write(head.data(), static_cast<std::streamsize>(head.size()));
  std::ifstream records(p.records.path(), std::ios::binary);
  file << records.rdbuf();
  return static_cast<bool>(file.flush());
}

std::string_view textBytes(const NativeHalf& half) {
  return half.bytes.substr(0, half.bytes.find('\0'));
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

namespace {

constexpr const char* kExpectedDocument =
    "expected an array of records, a list of elements, or an object with an \"elements\" "
    "list";

// The array document: its lists read as they come, "elements" a piece at a time.
void buildFromArrayDocument(NativeFileBuilder& builder, JsonReader& json) {
  std::optional<int32_t> dimensions;
  std::vector<int32_t> shape;
  bool elementsSeen = false;
  std::string valueBytes, keyBytes;
  json.enter('{');
  for (bool first = true; json.next(first, '}');) {
    const std::string name = json.name();
    if (name != "elements") {
      const JsonValue v = json.value();
      if (name == "dimensions") dimensions = jsonInt32(&v, "\"dimensions\"");
      if (name == "boundaries") {
        for (const JsonValue& b : v.items) shape.push_back(jsonInt32(&b, "a boundary"));
      }
      if (name == "labels") {
        std::vector<std::optional<std::string>> list;
        for (const JsonValue& label : v.items) {
          list.push_back(label.kind == JsonValue::Kind::String ? std::optional(label.text)
                                                               : std::nullopt);
        }
        builder.setLabels(list);
      }
      continue;
    }
    elementsSeen = json.enter('[');
    for (bool item = true; json.next(item, ']');) {
      const JsonValue element = json.value();
      const JsonValue* keyed = element.find("element");
      const JsonValue* key = element.find("key");
      if (keyed && key) {
        builder.append(halfOfJson(*keyed, valueBytes), halfOfJson(*key, keyBytes));
      } else {
        builder.append(halfOfJson(element, valueBytes), {});
      }
    }
  }
  if (json.problem()) return;
  if (!elementsSeen) throw JsonMistake(kExpectedDocument);
  if (dimensions && (*dimensions < 1 || *dimensions > ElementArray::kBoundaryCount)) {
    throw JsonMistake("\"dimensions\" must be 1 to " +
                      std::to_string(ElementArray::kBoundaryCount));
  }
  builder.setShape(dimensions.value_or(1), shape);
}

// A cell of a record: an integer as a value, null as an empty text, other numbers and
// true and false as their text.
NativeHalf cellOfJson(const JsonValue& v, size_t record, const std::string& name) {
  if (v.kind == JsonValue::Kind::Array || v.kind == JsonValue::Kind::Object) {
    throw JsonMistake("record " + std::to_string(record) + ": \"" + name +
                      "\" holds a list or object; a record's values are numbers, strings, "
                      "true, false or null");
  }
  if (v.kind == JsonValue::Kind::Number && v.integer && *v.integer >= INT32_MIN &&
      *v.integer <= INT32_MAX) {
    return {kValueType, 4, static_cast<int32_t>(*v.integer), {}};
  }
  return {kStringType, static_cast<int32_t>(v.text.size() + 1), 0, v.text};
}

// Most records name their members in the same order: the m-th member's column is
// then found without hashing its name.
bool sameColumn(const std::vector<std::string>& names, size_t m, const std::string& name) {
  return m < names.size() && names[m] == name;
}

// An array of flat records: a table with a column for each name, in the order they
// first appear. The names are gathered in a first pass, the cells written in a second.
std::optional<TextProblem> buildFromRecords(NativeFileBuilder& builder, std::string_view text) {
  std::vector<std::string> names;
  std::unordered_map<std::string, size_t> columnOf;
  size_t records = 0;
  {
    JsonReader json(text);
    json.enter('[');
    for (bool first = true; json.next(first, ']'); ++records) {
      if (json.peek() != '{' && !json.problem()) {
        throw JsonMistake("an array of records holds objects only; item " +
                          std::to_string(records + 1) + " is not one");
      }
      json.enter('{');
      size_t m = 0;
      for (bool firstMember = true; json.next(firstMember, '}'); ++m) {
        std::string name = json.name();
        json.skip();
        if (!sameColumn(names, m, name) && columnOf.emplace(name, names.size()).second) {
          names.push_back(std::move(name));
        }
      }
    }
    json.end();
    if (json.problem()) return json.problem();
  }
  builder.setShape(2, {static_cast<int32_t>(names.size()), 0});
  builder.setLabels({names.begin(), names.end()});
  JsonReader json(text);
  std::vector<JsonValue> row(names.size());
  json.enter('[');
  records = 0;
  for (bool first = true; json.next(first, ']'); ++records) {
    JsonValue record = json.value();
    for (JsonValue& cell : row) cell = JsonValue{};
    for (size_t m = 0; m < record.members.size(); ++m) {
      JsonMember& member = record.members[m];
      const size_t column = sameColumn(names, m, member.name) ? m : columnOf[member.name];
      row[column] = std::move(member.value);
    }
    for (size_t c = 0; c < row.size(); ++c)
      builder.append(cellOfJson(row[c], records + 1, names[c]), {});
  }
  return json.problem();
}

}  // namespace

std::optional<TextProblem> buildFromJson(NativeFileBuilder& builder, std::string_view text) {
  JsonReader json(text);
  const char first = json.peek();
  if (first == '{') {
    buildFromArrayDocument(builder, json);
  } else if (first == '[' && JsonReader(text.substr(text.find('[') + 1)).peek() == '{') {
    return buildFromRecords(builder, text);
  } else if (first == '[') {
    // A list of elements alone: a one-dimensional array.
    std::string valueBytes;
    json.enter('[');
    for (bool item = true; json.next(item, ']');) {
      builder.append(halfOfJson(json.value(), valueBytes), {});
    }
  } else if (!json.problem()) {
    json.value();
    if (!json.problem()) throw JsonMistake(kExpectedDocument);
  }
  json.end();
  return json.problem();
}

}  // namespace quorrel::tool
