// `quorrel inspect` and `quorrel convert`: a file is loaded into a fresh instance
// through the load actions and read back through the expressions, as a host would.
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <sstream>

#include "array_files.h"
#include "commands.h"

namespace quorrel::tool {
namespace {

constexpr int kMaxListedElements = 40;
constexpr int kMaxTableRows = 20;
constexpr int kMaxTableColumns = 8;
constexpr size_t kMaxCellWidth = 24;

// Expression codes the inspection reads.
constexpr int32_t kSize = 0;
constexpr int32_t kGetString = 2;
constexpr int32_t kKeyString = 4;
constexpr int32_t kDim = 26;
constexpr int32_t kBoundary = 27;
constexpr int32_t kGetLabel = 43;

std::optional<std::string> readFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return std::nullopt;
  return std::string(std::istreambuf_iterator<char>(in), {});
}

std::string readFileOrFail(const std::string& path) {
  auto bytes = readFile(path);
  if (!bytes) throw FileError("cannot read " + path + ": " + std::strerror(errno));
  return *bytes;
}

ArrayFormat recogniseOrFail(const std::string& path, std::string_view bytes) {
  const auto format = recogniseFormat(bytes);
  if (!format) throw FileError(path + " is not a native array, host array, CSV or INI file");
  return *format;
}

Argument number(int32_t value) {
  return {false, value, {}};
}
Argument text(const std::string& value) {
  return {true, 0, value};
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

// A one-dimensional instance takes a file as the file says; the CSV and native loads
// set their own dimensions.
std::unique_ptr<Instance> loadInto(const Module& module, ArrayFormat format,
                                   const std::string& path) {
  SetupFields setup;
  setup.dims = 1;
  auto instance = std::make_unique<Instance>(module, setup);
  instance->callAction(formatInfo(format).loadAction, {text(path)});
  return instance;
}

// The element types, taken from a native snapshot of the instance.
std::vector<ElementTypes> snapshotTypes(Instance& instance) {
  std::error_code error;
  std::string pattern = (std::filesystem::temp_directory_path(error) / "quorrel-XXXXXX").string();
  if (error) pattern = "/tmp/quorrel-XXXXXX";
  std::vector<char> name(pattern.begin(), pattern.end());
  name.push_back('\0');
  const int fd = mkstemp(name.data());
  if (fd < 0) return {};
  close(fd);
  instance.callAction(formatInfo(ArrayFormat::Native).saveAction, {text(name.data())});
  const auto bytes = readFile(name.data());
  std::remove(name.data());
  return bytes ? readNativeElementTypes(*bytes) : std::vector<ElementTypes>{};
}

// Plain text stays as it is; anything a reader could mistake is quoted.
std::string displayText(const std::string& value) {
  const bool plain =
      !value.empty() && value.front() != ' ' && value.back() != ' ' && value.front() != '"' &&
      std::all_of(value.begin(), value.end(), [](char c) { return c >= 0x20 && c <= 0x7E; });
  std::string shown = plain ? value : quoteText(value);
  if (shown.size() > kMaxCellWidth) shown = shown.substr(0, kMaxCellWidth - 3) + "...";
  return shown;
}

void printRows(const std::vector<std::vector<std::string>>& rows, std::ostream& out) {
  std::vector<size_t> widths;
  for (const auto& row : rows) {
    widths.resize(std::max(widths.size(), row.size()), 0);
    for (size_t c = 0; c < row.size(); ++c) widths[c] = std::max(widths[c], row[c].size());
  }
  for (const auto& row : rows) {
    std::string line = " ";
    for (size_t c = 0; c < row.size(); ++c) {
      line += ' ' + row[c];
      if (c + 1 < row.size()) line += std::string(widths[c] - row[c].size(), ' ');
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

std::string plural(int count, const char* noun) {
  return std::to_string(count) + ' ' + noun + (count == 1 ? "" : "s");
}

void printTable(Instance& instance, int32_t size, int32_t columns, std::ostream& out) {
  const int32_t rows = size / columns + (size % columns ? 1 : 0);
  const int32_t shownColumns = std::min(columns, kMaxTableColumns);
  const int32_t shownRows = std::min(rows, kMaxTableRows);
  out << "table       " << plural(rows, "row") << " x " << plural(columns, "column") << '\n';
  std::vector<std::vector<std::string>> lines(1, {"row"});
  for (int32_t c = 0; c < shownColumns; ++c) {
    const auto label = askText(instance, kGetLabel, {number(c)});
    lines[0].push_back(label && !label->empty() ? displayText(*label)
                                                : joined("#", std::to_string(c)));
  }
  for (int32_t r = 0; r < shownRows; ++r) {
    lines.push_back({std::to_string(r)});
    for (int32_t c = 0; c < shownColumns; ++c) {
      const int32_t index = r * columns + c;
      const auto cell =
          index < size ? askText(instance, kGetString, {number(index)}) : std::nullopt;
      lines.back().push_back(cell ? displayText(*cell) : "");
    }
  }
  printRows(lines, out);
  if (rows > shownRows) out << "  ... " << plural(rows - shownRows, "more row") << " not shown\n";
  if (columns > shownColumns) {
    out << "  ... " << plural(columns - shownColumns, "more column") << " not shown\n";
  }
}

void printList(Instance& instance, int32_t size, std::ostream& out) {
  const auto types = snapshotTypes(instance);
  const int32_t shown = std::min(size, kMaxListedElements);
  std::vector<std::vector<std::string>> lines(1, {"index", "type", "key", "text"});
  for (int32_t i = 0; i < shown; ++i) {
    const ElementTypes element = i < static_cast<int32_t>(types.size()) ? types[i] : ElementTypes{};
    const auto key = askText(instance, kKeyString, {number(i)});
    const auto value = askText(instance, kGetString, {number(i)});
    std::string shownText = value ? displayText(*value) : "";
    if (element.type == 3) shownText = joined("(", plural(element.size, "byte")) + ")";
    lines.push_back({std::to_string(i), elementTypeName(element.type),
                     key ? displayText(*key) : "-", shownText});
  }
  printRows(lines, out);
  if (size > shown) out << "  ... " << plural(size - shown, "more element") << " not shown\n";
}

}  // namespace

int inspectCommand(const Module& module, const std::string& path) {
  const std::string bytes = readFileOrFail(path);
  const ArrayFormat format = recogniseOrFail(path, bytes);
  auto instance = loadInto(module, format, path);
  std::ostream& out = std::cout;
  const int32_t dims = askNumber(*instance, kDim);
  const int32_t size = askNumber(*instance, kSize);
  out << "file        " << path << '\n';
  out << "format      " << formatInfo(format).description << " (" << bytes.size() << " bytes)\n";
  out << "dimensions  " << dims << '\n';
  out << "boundaries ";
  static constexpr const char* kAxes[] = {"X", "Y", "Z"};
  for (int32_t d = 1; d <= std::max(dims, 1); ++d) {
    const std::string axis = d <= 3 ? kAxes[d - 1] : joined("D", std::to_string(d));
    out << ' ' << axis << ' ' << askNumber(*instance, kBoundary, {number(d)});
  }
  out << '\n';
  out << "elements    " << size << '\n';
  const int32_t columns = askNumber(*instance, kBoundary, {number(1)});
  if (dims == 2 && columns > 0 && size > 0) {
    printTable(*instance, size, columns, out);
  } else if (size > 0) {
    printList(*instance, size, out);
  }
  return 0;
}

int convertCommand(const Module& module, const std::string& in, const std::string& out,
                   const std::string& to) {
  const std::string bytes = readFileOrFail(in);
  const ArrayFormat from = recogniseOrFail(in, bytes);
  const ArrayFormat target = to.empty() ? formatOfOutputPath(out) : *formatOfName(to);
  auto instance = loadInto(module, from, in);
  // The save action reports nothing: make sure beforehand that the file can be written.
  if (!std::ofstream(out, std::ios::binary | std::ios::app)) {
    throw FileError("cannot write " + out + ": " + std::strerror(errno));
  }
  instance->callAction(formatInfo(target).saveAction, {text(out)});
  std::cout << in << " (" << formatInfo(from).name << ") -> " << out << " ("
            << formatInfo(target).name << "): " << plural(askNumber(*instance, kSize), "element")
            << '\n';
  return 0;
}

}  // namespace quorrel::tool
