// `quorrel inspect` and `quorrel convert`: a file is loaded into a fresh instance
// through the load actions and read back through the expressions, as a host would.
#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>

#include "array_files.h"
#include "catalog.h"
#include "commands.h"
#include "temp_file.h"
#include "text_formats.h"

namespace quorrel::tool {
namespace {

constexpr int kMaxTableColumns = 8;

// Expression codes the inspection reads.
constexpr int32_t kSize = 0;
constexpr int32_t kGetString = 2;
constexpr int32_t kGetValue = 3;
constexpr int32_t kKeyString = 4;
constexpr int32_t kKeyValue = 5;
constexpr int32_t kDim = 26;
constexpr int32_t kBoundary = 27;
constexpr int32_t kGetLabel = 43;
constexpr int32_t kAppendString = 8;

ArrayFormat recogniseOrFail(const std::string& path, std::string_view bytes) {
  const auto format = recogniseFormat(bytes);
  if (!format) throw FileError(path + " is not a native array, host array, CSV or INI file");
  return *format;
}

Argument number(int32_t value) {
  return Argument(value);
}
Argument text(const std::string& value) {
  return Argument(value);
}

int32_t askNumber(Instance& instance, int32_t code, std::vector<Argument> args = {}) {
  const ExpressionResult result = instance.callExpression(code, args);
  return result.isText ? 0 : result.number;
}

std::optional<std::string> askText(Instance& instance, int32_t code, std::vector<Argument> args) {
  ExpressionResult result = instance.callExpression(code, args);
  if (!result.isText) return std::nullopt;
  return std::move(result.text);
}

// A file operand: its bytes, and a path the extension can open (a copy of standard
// input for "-").
struct Input {
  std::string name;
  std::string bytes;
  std::unique_ptr<TempFile> copy;
  std::string path() const { return copy ? copy->path() : name; }
};

Input readInput(const std::string& name) {
  Input input{name, {}, nullptr};
  if (name == "-") {
    input.name = "<stdin>";
    input.bytes = readStandardInput();
    input.copy = std::make_unique<TempFile>();
    writeWholeFile(input.copy->path(), input.bytes);
  } else {
    input.bytes = readWholeFile(name);
  }
  return input;
}

// A one-dimensional instance takes a file as the file says; the CSV and native loads
// set their own dimensions.
std::unique_ptr<Instance> loadInto(const Module& module, ArrayFormat format,
                                   const std::string& path) {
  SetupFields setup;
  setup.dims = 1;
  auto instance = std::make_unique<Instance>(module, setup);
  instance->callAction(actionCodeOfName(formatInfo(format).loadAction).value(), {text(path)});
  return instance;
}

// The element types, taken from a native snapshot of the instance.
std::vector<ElementTypes> snapshotTypes(Instance& instance) {
  try {
    const TempFile snapshot;
    instance.callAction(actionCodeOfName(formatInfo(ArrayFormat::Native).saveAction).value(),
                        {text(snapshot.path())});
    return readNativeElementTypes(snapshot.path());
  } catch (const FileError&) {
    return {};
  }
}

// Everything the expressions tell of an instance, read once.
struct ArrayContents {
  int32_t dims = 0;
  int32_t size = 0;
  std::vector<int32_t> boundaries;               // of dimensions 1..max(dims, 1)
  std::vector<std::string> labels;               // of columns 0..X-1, empty when unlabelled
  std::vector<ElementTypes> types;               // per element
  std::vector<std::string> texts;                // per element
  std::vector<std::optional<std::string>> keys;  // per element, none without a key
  int32_t columns() const { return boundaries.empty() ? 0 : boundaries[0]; }
};

ArrayContents readContents(Instance& instance) {
  ArrayContents a;
  a.dims = askNumber(instance, kDim);
  a.size = askNumber(instance, kSize);
  for (int32_t d = 1; d <= std::max(a.dims, 1); ++d) {
    a.boundaries.push_back(askNumber(instance, kBoundary, {number(d)}));
  }
  for (int32_t c = 0; c < a.columns() && a.dims >= 2; ++c) {
    a.labels.push_back(askText(instance, kGetLabel, {number(c)}).value_or(""));
  }
  a.types = snapshotTypes(instance);
  a.types.resize(static_cast<size_t>(std::max(a.size, 0)));
  for (int32_t i = 0; i < a.size; ++i) {
    a.texts.push_back(askText(instance, kGetString, {number(i)}).value_or(""));
    if (a.types[i].keyType == 0) {
      a.keys.emplace_back();
    } else {
      a.keys.push_back(askText(instance, kKeyString, {number(i)}).value_or(""));
    }
  }
  return a;
}

// Plain text stays as it is; anything a reader could mistake is quoted.
std::string displayText(const std::string& value, size_t width) {
  const bool plain =
      !value.empty() && value.front() != ' ' && value.back() != ' ' && value.front() != '"' &&
      std::all_of(value.begin(), value.end(), [](char c) { return c >= 0x20 && c <= 0x7E; });
  return cutToWidth(plain ? value : quoteText(value), width);
}

void printRows(const std::vector<std::vector<std::string>>& rows, std::ostream& out) {
  std::vector<size_t> widths;
  for (const auto& row : rows) {
    widths.resize(std::max(widths.size(), row.size()), 0);
    for (size_t c = 0; c < row.size(); ++c) widths[c] = std::max(widths[c], printedWidth(row[c]));
  }
  for (const auto& row : rows) {
    std::string line = " ";
    for (size_t c = 0; c < row.size(); ++c) {
      line += ' ' + row[c];
      if (c + 1 < row.size()) line += std::string(widths[c] - printedWidth(row[c]), ' ');
    }
    line.erase(line.find_last_not_of(' ') + 1);
    out << line << '\n';
  }
}

// head + tail by appending: GCC 12 at -O3 reports a false -Wrestrict overlap in
// "literal" + std::string&& (its insert-at-front path), which -Werror turns fatal.
std::string joined(const char* head, const std::string& tail) {
  std::string text = head;
  text += tail;
  return text;
}

std::string plural(int64_t count, const char* noun) {
  return std::to_string(count) + ' ' + noun + (count == 1 ? "" : "s");
}

int32_t limit(int32_t count, int32_t most) {
  return most < 0 ? count : std::min(count, most);
}

void printTable(Instance& instance, int32_t size, int32_t columns, const ViewOptions& view,
                std::ostream& out) {
  const int32_t rows = size / columns + (size % columns ? 1 : 0);
  const int32_t shownColumns = limit(columns, view.all ? -1 : kMaxTableColumns);
  const int32_t shownRows = limit(rows, view.all ? -1 : view.rows.value_or(20));
  out << "table       " << plural(rows, "row") << " x " << plural(columns, "column") << '\n';
  std::vector<std::vector<std::string>> lines(1, {"row"});
  for (int32_t c = 0; c < shownColumns; ++c) {
    const auto label = askText(instance, kGetLabel, {number(c)});
    lines[0].push_back(label && !label->empty() ? displayText(*label, view.width)
                                                : joined("#", std::to_string(c)));
  }
  for (int32_t r = 0; r < shownRows; ++r) {
    lines.push_back({std::to_string(r)});
    for (int32_t c = 0; c < shownColumns; ++c) {
      const int32_t index = r * columns + c;
      const auto cell =
          index < size ? askText(instance, kGetString, {number(index)}) : std::nullopt;
      lines.back().push_back(cell ? displayText(*cell, view.width) : "");
    }
  }
  printRows(lines, out);
  if (rows > shownRows) out << "  ... " << plural(rows - shownRows, "more row") << " not shown\n";
  if (columns > shownColumns) {
    out << "  ... " << plural(columns - shownColumns, "more column") << " not shown\n";
  }
}

void printList(Instance& instance, int32_t size, const ViewOptions& view, std::ostream& out) {
  const auto types = snapshotTypes(instance);
  const int32_t shown = limit(size, view.all ? -1 : view.rows.value_or(40));
  std::vector<std::vector<std::string>> lines(1, {"index", "type", "key", "text"});
  for (int32_t i = 0; i < shown; ++i) {
    const ElementTypes element = i < static_cast<int32_t>(types.size()) ? types[i] : ElementTypes{};
    const auto key = askText(instance, kKeyString, {number(i)});
    const auto value = askText(instance, kGetString, {number(i)});
    std::string shownText = value ? displayText(*value, view.width) : "";
    if (element.type == 3) shownText = joined("(", plural(element.size, "byte")) + ")";
    lines.push_back({std::to_string(i), elementTypeName(element.type),
                     key ? displayText(*key, view.width) : "-", shownText});
  }
  printRows(lines, out);
  if (size > shown) out << "  ... " << plural(size - shown, "more element") << " not shown\n";
}

// ---------------------------------------------------------------------------------
// Loss warnings: what the target format cannot carry, said once per kind.

// Whether an INI line written for this key and text reads back as the same entry.
bool iniKeepsEntry(const std::optional<std::string>& key, const std::string& value) {
  const std::string k = key.value_or("");
  if (k.size() + 1 + value.size() < 2) return false;  // a one-character line is skipped
  if (k.find_first_of("=\r\n") != std::string::npos) return false;
  if (value.find_first_of("\r\n") != std::string::npos) return false;
  const size_t start = k.find_first_not_of(" \t");
  if (start != 0 && !(k.empty() && start == std::string::npos)) return false;
  return !(k.rfind("[", 0) == 0 || k.rfind("//", 0) == 0);
}

// `quoted`: CSV written by the RFC 4180 writer, which keeps commas and line breaks.
void warnLosses(const ArrayContents& a, ArrayFormat target, bool quoted, std::ostream& err) {
  if (target == ArrayFormat::Native) return;
  const char* name = formatInfo(target).description;
  auto warn = [&](const std::string& what) { err << "quorrel: warning: " << what << '\n'; };

  const auto labelled = std::count_if(a.labels.begin(), a.labels.end(),
                                      [](const std::string& l) { return !l.empty(); });
  if (labelled > 0) warn(plural(labelled, "column label") + " dropped: the " + name + " has none");

  if (target != ArrayFormat::Ini) {
    const auto keyed = std::count_if(a.keys.begin(), a.keys.end(),
                                     [](const auto& key) { return key.has_value(); });
    if (keyed > 0) warn(plural(keyed, "key") + " dropped: the " + name + " has none");
  }

  int64_t values = 0, files = 0;
  for (const auto& t : a.types) {
    values += t.type == 1;
    files += t.type == 3;
  }
  int64_t valueKeys = 0;
  for (const auto& t : a.types) valueKeys += target == ArrayFormat::Ini && t.keyType == 1;
  if (values > 0) warn(plural(values, "value element") + " will read back as text");
  if (files > 0) warn(plural(files, "file element") + " written as empty text");
  if (valueKeys > 0) warn(plural(valueKeys, "value key") + " will read back as text");

  const int32_t x = std::max(a.columns(), 1);
  if (target == ArrayFormat::Host) {
    const int32_t y = a.boundaries.size() > 1 ? std::max(a.boundaries[1], 1) : 1;
    const int64_t cells = int64_t{x} * y * (a.size / (int64_t{x} * y) + 1);
    if (a.dims != 3 || cells != a.size) {
      warn(std::to_string(a.dims) + "-D array of " + plural(a.size, "element") + " becomes 3-D " +
           std::to_string(x) + " x " + std::to_string(y) + " x " +
           std::to_string(cells / (int64_t{x} * y)) + " (" + plural(cells, "cell") + ")");
    }
  } else if (target == ArrayFormat::Csv) {
    const int32_t columns = a.dims > 1 && a.columns() > 0 ? a.columns() : a.size;
    const bool padded = columns > 0 && a.size % columns != 0;
    const int64_t rows = columns > 0 ? (a.size + columns - 1) / columns : 0;
    if (a.dims != 2) {
      warn(std::to_string(a.dims) + "-D array becomes 2-D: " + plural(rows, "row") + " x " +
           plural(columns, "column"));
    } else if (padded) {
      warn("the last row is padded: " + plural(a.size, "element") + " become " +
           plural(rows * columns, "cell"));
    }
    const auto split = std::count_if(a.texts.begin(), a.texts.end(), [](const std::string& t) {
      return t.find_first_of(",\r\n") != std::string::npos;
    });
    if (split > 0 && !quoted) {
      warn(plural(split, "cell") + " holding a comma, CR or LF will read back split into more " +
           "cells or rows (--to csv-rfc4180 quotes them)");
    }
  } else if (target == ArrayFormat::Ini) {
    if (a.dims > 1) {
      warn(std::to_string(a.dims) + "-D array becomes a list: the INI file keeps no dimensions");
    }
    int64_t lost = 0;
    for (int32_t i = 0; i < a.size; ++i) lost += !iniKeepsEntry(a.keys[i], a.texts[i]);
    if (lost > 0) {
      warn(plural(lost, "element") +
           " will not read back as written (an empty entry, a key with =, [ or //, a line break)");
    }
  }
}

// The instance's cells as CSV rows, laid out as the extension's CSV save lays them out.
CsvRows rowsOf(const ArrayContents& a) {
  const int32_t columns = a.dims > 1 && a.columns() > 0 ? a.columns() : a.size;
  CsvRows rows;
  if (columns <= 0) return rows;
  for (int32_t i = 0; i < a.size; i += columns) {
    rows.emplace_back();
    for (int32_t c = 0; c < columns; ++c) {
      rows.back().push_back(i + c < a.size ? a.texts[i + c] : std::string{});
    }
  }
  return rows;
}

std::string toJson(Instance& instance, const ArrayContents& a) {
  std::string out = "{\n  \"dimensions\": " + std::to_string(a.dims) + ",\n  \"boundaries\": [";
  for (size_t d = 0; d < a.boundaries.size(); ++d) {
    out += (d ? ", " : "") + std::to_string(a.boundaries[d]);
  }
  out += "],\n  \"labels\": [";
  for (size_t c = 0; c < a.labels.size(); ++c) out += (c ? ", " : "") + jsonString(a.labels[c]);
  out += "],\n  \"elements\": [";
  for (int32_t i = 0; i < a.size; ++i) {
    const ElementTypes& t = a.types[i];
    out += i ? ",\n    " : "\n    ";
    out += "{\"type\": \"" + std::string(elementTypeName(t.type)) + '"';
    if (t.type == 1) {
      out += ", \"value\": " + std::to_string(askNumber(instance, kGetValue, {number(i)}));
    } else if (t.type == 2) {
      out += ", \"text\": " + jsonString(a.texts[i]);
    } else if (t.type == 3) {
      out += ", \"bytes\": " + std::to_string(t.size);
    }
    if (t.keyType == 1) {
      out += ", \"key\": " + std::to_string(askNumber(instance, kKeyValue, {number(i)}));
    } else if (a.keys[i]) {
      out += ", \"key\": " + jsonString(*a.keys[i]);
    }
    out += '}';
  }
  out += a.size ? "\n  ]\n}\n" : "]\n}\n";
  return out;
}

// An RFC 4180 file read into a two-dimensional instance of string cells.
std::unique_ptr<Instance> loadRfc4180(const Module& module, std::string_view bytes) {
  const CsvRows rows = readRfc4180(bytes);
  SetupFields setup;
  setup.dims = 2;
  setup.x = 0;
  for (const auto& row : rows) setup.x = std::max(setup.x, static_cast<int32_t>(row.size()));
  auto instance = std::make_unique<Instance>(module, setup);
  for (const auto& row : rows) {
    for (int32_t c = 0; c < setup.x; ++c) {
      const std::string cell = c < static_cast<int32_t>(row.size()) ? row[c] : std::string{};
      // The extension takes texts up to their first zero byte.
      instance->callAction(kAppendString, {text(cell.substr(0, cell.find('\0')))});
    }
  }
  return instance;
}

bool sameFile(const std::string& a, const std::string& b) {
  std::error_code error;
  return std::filesystem::equivalent(a, b, error) && !error;
}

}  // namespace

void printArray(Instance& instance, const ViewOptions& view, std::ostream& out) {
  const int32_t dims = askNumber(instance, kDim);
  const int32_t size = askNumber(instance, kSize);
  out << "dimensions  " << dims << '\n';
  out << "boundaries ";
  static constexpr const char* kAxes[] = {"X", "Y", "Z"};
  for (int32_t d = 1; d <= std::max(dims, 1); ++d) {
    const std::string axis = d <= 3 ? kAxes[d - 1] : joined("D", std::to_string(d));
    out << ' ' << axis << ' ' << askNumber(instance, kBoundary, {number(d)});
  }
  out << '\n';
  out << "elements    " << size << '\n';
  const int32_t columns = askNumber(instance, kBoundary, {number(1)});
  if (dims == 2 && columns > 0 && size > 0) {
    printTable(instance, size, columns, view, out);
  } else if (size > 0) {
    printList(instance, size, view, out);
  }
}

int inspectCommand(const Module& module, const std::string& path, const ViewOptions& view) {
  const Input input = readInput(path);
  const ArrayFormat format = recogniseOrFail(input.name, input.bytes);
  auto instance = loadInto(module, format, input.path());
  std::cout << "file        " << input.name << '\n';
  std::cout << "format      " << formatInfo(format).description << " (" << input.bytes.size()
            << " bytes)\n";
  printArray(*instance, view, std::cout);
  return 0;
}

int convertCommand(const Module& module, const ConvertOptions& options) {
  const std::string& out = options.out;
  if (out != "-" && options.in != "-" && !options.force && sameFile(options.in, out)) {
    throw UsageError("convert would overwrite its input " + out + "; add --force to do so");
  }
  if (out != "-" && std::filesystem::is_directory(out)) {
    throw FileError("cannot write " + out + ": it is a directory");
  }
  const Input input = readInput(options.in);
  std::unique_ptr<Instance> instance;
  std::string fromName;
  if (options.from == "csv-rfc4180") {
    instance = loadRfc4180(module, input.bytes);
    fromName = options.from;
  } else {
    const ArrayFormat from = recogniseOrFail(input.name, input.bytes);
    instance = loadInto(module, from, input.path());
    fromName = formatInfo(from).name;
  }

  std::string toName = options.to;
  std::string bytes;
  const ArrayContents contents = readContents(*instance);
  if (toName == "csv-rfc4180") {
    bytes = writeRfc4180(rowsOf(contents));
    warnLosses(contents, ArrayFormat::Csv, true, std::cerr);
  } else if (toName == "json") {
    bytes = toJson(*instance, contents);
    const auto files = std::count_if(contents.types.begin(), contents.types.end(),
                                     [](const ElementTypes& t) { return t.type == 3; });
    if (files > 0) {
      std::cerr << "quorrel: warning: " << plural(files, "file element")
                << " written as a byte count only\n";
    }
  } else {
    const ArrayFormat target =
        toName.empty() ? formatOfOutputPath(out == "-" ? "" : out) : *formatOfName(toName);
    toName = formatInfo(target).name;
    warnLosses(contents, target, false, std::cerr);
    // The save action reports nothing: make sure beforehand that the file can be written.
    const TempFile staging;
    instance->callAction(actionCodeOfName(formatInfo(target).saveAction).value(),
                         {text(staging.path())});
    bytes = readWholeFile(staging.path());
  }
  if (out == "-") {
    writeStandardOutput(bytes);
  } else {
    writeWholeFile(out, bytes);
  }
  (out == "-" ? std::cerr : std::cout)
      << input.name << " (" << fromName << ") -> " << (out == "-" ? "<stdout>" : out) << " ("
      << toName << "): " << plural(contents.size, "element") << '\n';
  return 0;
}

}  // namespace quorrel::tool
