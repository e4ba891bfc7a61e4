// `quorrel inspect` and `quorrel convert`: a file is loaded into a fresh instance
// through the load actions and read back through the expressions, as a host would.
// What no expression tells (element and key types, every element of a big array in
// one pass) comes from a native snapshot the instance saves, walked with the core's
// own reader.
#include <algorithm>
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <mutex>
#include <thread>

#include "array_files.h"
#include "catalog.h"
#include "commands.h"
#include "io/file_handle.h"
#include "io/host_array_file.h"
#include "temp_file.h"
#include "text_formats.h"

namespace quorrel::tool {
namespace {

constexpr int32_t kMaxTableColumns = 12;

// Expression codes the views read.
constexpr int32_t kSize = 0;
constexpr int32_t kGetString = 2;
constexpr int32_t kDim = 26;
constexpr int32_t kBoundary = 27;
constexpr int32_t kNumberOfRows = 40;
constexpr int32_t kRowList = 41;
constexpr int32_t kGetLabel = 43;
constexpr int32_t kDelimiter = 51;

constexpr uint16_t kValue = 1, kString = 2, kFile = 3;

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

void warn(const std::string& what) {
  std::cerr << "quorrel: warning: " << what << '\n';
}

// The steps of a file action that can fail, as the module numbers them.
const char* failedStep(int32_t step) {
  static constexpr const char* kSteps[] = {"done",
                                           "cannot open it",
                                           "cannot read it",
                                           "cannot write it",
                                           "cannot flush it to the disk",
                                           "cannot put the new file in place",
                                           "out of memory",
                                           "nothing written"};
  return step >= 0 && step < static_cast<int32_t>(std::size(kSteps)) ? kSteps[step] : "failed";
}

// Runs a file action and turns a failure the module reports into a FileError.
void fileAction(const Module& module, Instance& instance, const char* action,
                const std::string& path, const std::string& shownPath) {
  instance.callAction(actionCodeOfName(action).value(), {text(path)});
  const auto status = module.fileStatus();
  if (!status || status->first == 0) return;
  const bool load = std::string_view(action).starts_with("load");
  throw FileError(std::string(load ? "cannot read " : "cannot write ") + shownPath + ": " +
                  (status->second ? std::strerror(status->second) : failedStep(status->first)));
}

// ---------------------------------------------------------------------------------
// A note on standard error while a long command runs, when it is a terminal.

class ProgressNote {
 public:
  explicit ProgressNote(std::string what) : what_(std::move(what)) {
    if (!isTerminal(stderr)) return;
    ticker_ = std::thread([this] { tick(); });
  }
  ~ProgressNote() {
    if (!ticker_.joinable()) return;
    {
      const std::lock_guard lock(mutex_);
      done_ = true;
    }
    wake_.notify_one();
    ticker_.join();
  }
  ProgressNote(const ProgressNote&) = delete;
  ProgressNote& operator=(const ProgressNote&) = delete;

 private:
  static constexpr auto kQuiet = std::chrono::seconds(2);

  void tick() {
    std::unique_lock lock(mutex_);
    const auto start = std::chrono::steady_clock::now();
    if (wake_.wait_for(lock, kQuiet, [this] { return done_; })) return;
    bool shown = false;
    do {
      const auto seconds =
          std::chrono::duration_cast<std::chrono::seconds>(std::chrono::steady_clock::now() - start)
              .count();
      std::fprintf(stderr, "\rquorrel: %s... %llds", what_.c_str(),
                   static_cast<long long>(seconds));
      std::fflush(stderr);
      shown = true;
    } while (!wake_.wait_for(lock, std::chrono::seconds(1), [this] { return done_; }));
    if (shown) std::fprintf(stderr, "\r\033[K");
  }

  std::string what_;
  std::thread ticker_;
  std::mutex mutex_;
  std::condition_variable wake_;
  bool done_ = false;
};

// ---------------------------------------------------------------------------------
// Input: a path the extension can open (a copy of standard input for "-") and its
// format.

constexpr size_t kRecognitionBytes = 64 * 1024;

struct Input {
  std::string name;  // as messages show it
  std::string path;
  ArrayFormat format = ArrayFormat::Native;
  std::unique_ptr<TempFile> copy;
};

Input openInput(const std::string& operand, std::optional<ArrayFormat> from) {
  Input input{operand, operand, ArrayFormat::Native, nullptr};
  if (operand == "-") {
    input.name = "<stdin>";
    input.copy = std::make_unique<TempFile>();
    input.path = input.copy->path();
    copyStandardInputTo(input.path);
  }
  const std::string start = readFileStart(input.path, kRecognitionBytes);
  if (from) {
    input.format = *from;
    return input;
  }
  const auto format = recogniseFormat(start);
  if (!format) {
    throw FileError(input.name + " is not a native array, host array, CSV, INI or JSON file");
  }
  input.format = *format;
  return input;
}

// ---------------------------------------------------------------------------------
// Native snapshots: the instance saved with its own action, walked with the core's
// reader.

// The save reports nothing here (the shell's show has no module at hand); a snapshot
// that could not be written reads as an unusable file.
struct Snapshot {
  TempFile file;
  explicit Snapshot(Instance& instance) {
    instance.callAction(actionCodeOfName(formatInfo(ArrayFormat::Native).saveAction).value(),
                        {text(file.path())});
  }
};

// A snapshot's bytes, read as the extension's loaders read a file.
ByteBuffer readSnapshot(const std::string& path) {
  FileStatus status;
  std::optional<ByteBuffer> bytes = readFileBytes(path.c_str(), 0, status);
  if (!bytes)
    throw FileError("cannot read a snapshot of the array: " +
                    std::string(std::strerror(status.error)));
  return std::move(*bytes);
}

// A native file made by the command, loaded by a fresh one-dimensional instance (the
// load sets the dimensions the file holds).
std::unique_ptr<Instance> loadBuilt(const Module& module, NativeFileBuilder& builder) {
  const TempFile built;
  if (!builder.save(built.path())) throw FileError("cannot write " + built.path());
  SetupFields setup;
  setup.dims = 1;
  auto instance = std::make_unique<Instance>(module, setup);
  fileAction(module, *instance, formatInfo(ArrayFormat::Native).loadAction, built.path(),
             built.path());
  return instance;
}

std::string problemText(const std::string& name, const TextProblem& problem) {
  return name + ':' + std::to_string(problem.line) + ": " + problem.what;
}

// A broken text file is an error, or with --lenient a warning and what came before.
void reportProblem(const std::string& name, const std::optional<TextProblem>& problem, bool lenient,
                   const char* kept) {
  if (!problem) return;
  if (!lenient) throw FileError(problemText(name, *problem) + " (--lenient keeps " + kept + ")");
  warn(problemText(name, *problem) + "; " + kept + " kept");
}

NativeHalf stringHalf(const std::string& value) {
  return {kString, static_cast<int32_t>(value.size() + 1), 0, value};
}

// RFC 4180 records as a table of string cells, short records padded.
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

// ---- JSON, both ways. An element (or key) is what says all of it: null for an empty
// element, a number for a value, a string for a UTF-8 text; else {"base64": ...} for a
// text that is not UTF-8 and {"file": ...} for file bytes, both base64. An element with
// a key is {"element": ..., "key": ...}.

// A string half's text, up to its first zero byte.
std::string_view textBytes(const NativeHalf& half) {
  return half.bytes.substr(0, half.bytes.find('\0'));
}

void appendJsonHalf(std::string& out, const NativeHalf& half) {
  if (half.type == kValue) {
    out += std::to_string(half.number);
  } else if (half.type == kString && isUtf8(textBytes(half))) {
    appendJsonString(out, textBytes(half));
  } else if (half.type == kString) {
    out += "{\"base64\": \"" + base64(textBytes(half)) + "\"}";
  } else if (half.type != 0) {
    out += "{\"file\": \"" + base64(half.bytes) + "\"}";
  } else {
    out += "null";
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

struct JsonMistake : std::runtime_error {
  using std::runtime_error::runtime_error;
};

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
      return {kValue, 4, jsonInt32(&v, "a value"), {}};
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
  return {kFile, static_cast<int32_t>(held.size()), 0, held};
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

// The first table row becomes the labels: the array is rebuilt without it.
std::unique_ptr<Instance> takeHeaderRow(const Module& module, Instance& instance) {
  const Snapshot snapshot(instance);
  const ByteBuffer bytes = readSnapshot(snapshot.file.path());
  NativeHeader header;
  NativeFileBuilder builder;
  std::vector<std::optional<std::string>> labels;
  walkNativeFile(bytes.view(), header, [&](const NativeHalf& value, const NativeHalf& key) {
    if (labels.size() < static_cast<size_t>(std::max(header.columns(), 0))) {
      labels.emplace_back(textOf(value));
    } else {
      builder.append(value, key);
    }
    return true;
  });
  builder.setShape(header.dimensions, header.boundaries);
  builder.setLabels(labels);
  return loadBuilt(module, builder);
}

struct LoadOptions {
  std::optional<ArrayFormat> from;
  bool header = false;
  bool lenient = false;
};

std::unique_ptr<Instance> loadInput(const Module& module, const Input& input,
                                    const LoadOptions& options) {
  if (input.format == ArrayFormat::CsvRfc4180 || input.format == ArrayFormat::Json) {
    const std::string bytes = readWholeFile(input.path);
    NativeFileBuilder builder;
    if (input.format == ArrayFormat::CsvRfc4180) {
      const Rfc4180Read read = readRfc4180(bytes);
      reportProblem(input.name, read.problem, options.lenient, "the records before it");
      buildFromRecords(builder, read.rows, options.header);
    } else {
      const JsonRead read = readJson(bytes);
      reportProblem(input.name, read.problem, false, "");
      try {
        buildFromJson(builder, read.value);
      } catch (const JsonMistake& mistake) {
        throw FileError(input.name + ": " + mistake.what());
      }
    }
    return loadBuilt(module, builder);
  }
  SetupFields setup;
  setup.dims = 1;
  auto instance = std::make_unique<Instance>(module, setup);
  fileAction(module, *instance, formatInfo(input.format).loadAction, input.path, input.name);
  if (options.header && input.format == ArrayFormat::Csv) return takeHeaderRow(module, *instance);
  return instance;
}

// ---------------------------------------------------------------------------------
// Damage: a native file that ends inside an element or goes on after its last one.

void warnAboutDamage(const std::string& name, const std::string& path, ArrayFormat format) {
  const std::string bytes = readWholeFile(path);
  NativeHeader header;
  const FileExtent extent =
      format == ArrayFormat::Host
          ? measureHostFile(bytes)
          : walkNativeFile(bytes, header,
                           [](const NativeHalf&, const NativeHalf&) { return true; });
  const char* record = format == ArrayFormat::Host ? "cell" : "element";
  if (!extent.usable) return;
  if (extent.endsInsideRecord) {
    warn(name + " ends inside " + record + ' ' + std::to_string(extent.read - 1) +
         " (which starts at byte " + std::to_string(extent.lastRecordStart) + ", the file has " +
         plural(static_cast<int64_t>(bytes.size()), "byte") + "); it declares " +
         plural(extent.declared, record));
  } else if (extent.read < extent.declared) {
    warn(name + " ends at byte " + std::to_string(extent.end) + " after " +
         plural(extent.read, record) + "; it declares " + std::to_string(extent.declared));
  } else if (extent.end < bytes.size()) {
    warn(name + " has " + plural(static_cast<int64_t>(bytes.size() - extent.end), "byte") +
         " after its last " + record + ", from byte " + std::to_string(extent.end));
  }
}

// ---------------------------------------------------------------------------------
// The views of inspect and the shell's show.

// Plain text stays as it is; anything a reader could mistake is quoted.
std::string displayText(const std::string& value, size_t width) {
  const bool plain =
      !value.empty() && value.front() != ' ' && value.back() != ' ' && value.front() != '"' &&
      std::all_of(value.begin(), value.end(), [](char c) { return c >= 0x20 && c <= 0x7E; });
  std::string shown = plain ? value : quoteText(value);
  if (width >= 4 && shown.size() > width) shown = shown.substr(0, width - 3) + "...";
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

// Which of the first `count` table rows are selected. No expression answers it: the
// visible rows (rowList$) are matched in order against the table rows' texts, so of
// identical rows the first ones count as the selected ones.
std::vector<bool> selectedRows(Instance& instance, int32_t count, int32_t columns, int32_t size) {
  const int32_t visible = askNumber(instance, kNumberOfRows);
  const std::string delimiter = askText(instance, kDelimiter, {}).value_or(",");
  std::vector<bool> selected(static_cast<size_t>(count), false);
  int32_t next = 0;
  for (int32_t r = 0; r < count && next < visible; ++r) {
    std::string row;
    for (int32_t c = 0; c < columns; ++c) {
      const int32_t index = r * columns + c;
      if (c) row += delimiter;
      row += index < size ? askText(instance, kGetString, {number(index)}).value_or("") : "";
    }
    if (askText(instance, kRowList, {number(next)}) == row) {
      selected[static_cast<size_t>(r)] = true;
      ++next;
    }
  }
  return selected;
}

void printTable(Instance& instance, int32_t size, int32_t columns, const ViewOptions& view,
                std::ostream& out) {
  const int32_t rows = size / columns + (size % columns ? 1 : 0);
  const int32_t shownColumns = limit(columns, view.all ? -1 : kMaxTableColumns);
  const int32_t shownRows = limit(rows, view.all ? -1 : view.rows.value_or(20));
  out << "table       " << plural(rows, "row") << " x " << plural(columns, "column") << '\n';
  std::vector<bool> selected;
  if (view.selection) {
    out << "selected    " << askNumber(instance, kNumberOfRows) << " of " << plural(rows, "row")
        << " (marked *)\n";
    selected = selectedRows(instance, shownRows, columns, size);
  }
  std::vector<std::vector<std::string>> lines(1, {"row"});
  for (int32_t c = 0; c < shownColumns; ++c) {
    const auto label = askText(instance, kGetLabel, {number(c)});
    lines[0].push_back(label && !label->empty() ? displayText(*label, view.width)
                                                : joined("#", std::to_string(c)));
  }
  for (int32_t r = 0; r < shownRows; ++r) {
    const bool marked = !selected.empty() && selected[static_cast<size_t>(r)];
    lines.push_back({(marked ? "*" : "") + std::to_string(r)});
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

// A value, a string (always quoted, so that "" is an empty text) or a file's size.
std::string halfText(const NativeHalf& half, size_t width) {
  if (half.type == 0) return "";
  if (half.type == kValue) return std::to_string(half.number);
  if (half.type != kString) {
    return joined("(", plural(static_cast<int64_t>(half.bytes.size()), "byte")) + ")";
  }
  std::string shown = quoteText(textOf(half));
  if (width >= 4 && shown.size() > width) shown = shown.substr(0, width - 3) + "...";
  return shown;
}

// Every element with its type and key, from a snapshot.
void printList(Instance& instance, int32_t size, const ViewOptions& view, std::ostream& out) {
  const int32_t shown = limit(size, view.all ? -1 : view.rows.value_or(40));
  std::vector<std::vector<std::string>> lines(1, {"index", "type", "value", "key type", "key"});
  const Snapshot snapshot(instance);
  const ByteBuffer bytes = readSnapshot(snapshot.file.path());
  NativeHeader header;
  walkNativeFile(bytes.view(), header, [&](const NativeHalf& value, const NativeHalf& key) {
    if (static_cast<int32_t>(lines.size()) - 1 >= shown) return false;
    lines.push_back({std::to_string(lines.size() - 1), elementTypeName(value.type),
                     halfText(value, view.width), key.type ? elementTypeName(key.type) : "-",
                     halfText(key, view.width)});
    return true;
  });
  printRows(lines, out);
  if (size > shown) out << "  ... " << plural(size - shown, "more element") << " not shown\n";
}

// ---------------------------------------------------------------------------------
// Output: a file or standard output, written in large pieces.

class Output {
 public:
  explicit Output(const std::string& path) : name_(path == "-" ? "standard output" : path) {
    if (path != "-") {
      file_.open(path, std::ios::binary | std::ios::trunc);
      if (!file_) throw FileError("cannot write " + path + ": " + std::strerror(errno));
    }
  }
  void write(std::string_view bytes) {
    if (file_.is_open()) {
      file_.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    } else {
      writeStandardOutput(bytes);
    }
  }
  // Writes `pending` once it has grown large, and empties it.
  void drain(std::string& pending, bool force = false) {
    if (!force && pending.size() < (size_t{1} << 20)) return;
    write(pending);
    pending.clear();
  }
  void copyFrom(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::string chunk(size_t{1} << 20, '\0');
    while (in.read(chunk.data(), static_cast<std::streamsize>(chunk.size())) || in.gcount() > 0) {
      write(std::string_view(chunk.data(), static_cast<size_t>(in.gcount())));
    }
  }
  void finish() {
    if (file_.is_open() && !file_.flush()) throw FileError("cannot write " + name_);
  }

 private:
  std::string name_;
  std::ofstream file_;
};

// ---------------------------------------------------------------------------------
// Loss warnings: what the target format cannot carry, said once per kind.

// Whether an INI line written for this key and text reads back as the same entry.
bool iniKeepsEntry(std::string_view k, std::string_view value) {
  if (k.size() + 1 + value.size() < 2) return false;  // a one-character line is skipped
  if (k.find_first_of("=\r\n") != std::string_view::npos) return false;
  if (value.find_first_of("\r\n") != std::string_view::npos) return false;
  const size_t start = k.find_first_not_of(" \t");
  if (start != 0 && !(k.empty() && start == std::string_view::npos)) return false;
  return !(k.starts_with("[") || k.starts_with("//"));
}

// What the walk of a snapshot counts for the warnings about `target`.
struct Tally {
  ArrayFormat target;
  int64_t elements = 0, keys = 0, values = 0, files = 0, valueKeys = 0, split = 0, iniLost = 0;
  void count(const NativeHalf& value, const NativeHalf& key) {
    ++elements;
    keys += key.type != 0;
    values += value.type == kValue;
    files += value.type == kFile;
    valueKeys += key.type == kValue;
    if (target == ArrayFormat::Csv && value.type == kString) {
      split += textBytes(value).find_first_of(",\r\n") != std::string_view::npos;
    }
    if (target == ArrayFormat::Ini) {
      iniLost += !iniKeepsEntry(key.type ? textOf(key) : std::string(), textOf(value));
    }
  }
};

int32_t csvColumns(const NativeHeader& h, int64_t size) {
  return h.dimensions > 1 && h.columns() > 0 ? h.columns() : static_cast<int32_t>(size);
}

void warnHostShape(const NativeHeader& h, int64_t size) {
  const int64_t x = std::max(h.columns(), 1);
  const int64_t y = h.boundaries.size() > 1 ? std::max(h.boundaries[1], 1) : 1;
  const int64_t z = size / (x * y) + 1;
  if (h.dimensions == 3 && x * y * z == size) return;
  std::string what = std::to_string(h.dimensions) + "-D array of " + plural(size, "element") +
                     " becomes 3-D " + std::to_string(x) + " x " + std::to_string(y) + " x " +
                     std::to_string(z) + " (" + plural(x * y * z, "cell") + ")";
  // The format's rule: one layer more than the elements fill, even a full last one.
  if (size % (x * y) == 0) {
    what += ": the host array format always adds a layer, which reads back as " +
            plural(x * y, "empty element");
  }
  warn(what);
}

void warnLosses(const NativeHeader& h, const Tally& t, ArrayFormat target, bool header) {
  if (target == ArrayFormat::Native || target == ArrayFormat::Json) return;  // both keep all
  const char* name = formatInfo(target).description;
  const bool csv = target == ArrayFormat::Csv || target == ArrayFormat::CsvRfc4180;
  const auto labelled = std::count_if(h.labels.begin(), h.labels.end(),
                                      [](const auto& l) { return l && !l->empty(); });
  if (labelled > 0 && !(csv && header)) {
    warn(plural(labelled, "column label") + " dropped: the " + name + " has none" +
         (csv ? " (--header writes them as a first row)" : ""));
  }
  if (target != ArrayFormat::Ini && t.keys > 0) {
    warn(plural(t.keys, "key") + " dropped: the " + name + " has none");
  }
  if (t.values > 0) warn(plural(t.values, "value element") + " will read back as text");
  if (t.files > 0) warn(plural(t.files, "file element") + " written as empty text");
  if (target == ArrayFormat::Ini && t.valueKeys > 0) {
    warn(plural(t.valueKeys, "value key") + " will read back as text");
  }
  if (target == ArrayFormat::Host) warnHostShape(h, t.elements);
  if (csv) {
    const int64_t columns = csvColumns(h, t.elements);
    const int64_t rows = columns > 0 ? (t.elements + columns - 1) / columns : 0;
    if (h.dimensions != 2) {
      warn(std::to_string(h.dimensions) + "-D array becomes 2-D: " + plural(rows, "row") + " x " +
           plural(columns, "column"));
    } else if (columns > 0 && t.elements % columns != 0) {
      warn("the last row is padded: " + plural(t.elements, "element") + " become " +
           plural(rows * columns, "cell"));
    }
    if (t.split > 0 && target == ArrayFormat::Csv) {
      warn(plural(t.split, "cell") + " holding a comma, CR or LF will read back split into more " +
           "cells or rows (--to csv-rfc4180 quotes them)");
    }
  }
  if (target == ArrayFormat::Ini) {
    if (h.dimensions > 1) {
      warn(std::to_string(h.dimensions) +
           "-D array becomes a list: the INI file keeps no dimensions");
    }
    if (t.iniLost > 0) {
      warn(plural(t.iniLost, "element") +
           " will not read back as written (an empty entry, a key with =, [ or //, a line break)");
    }
  }
}

// ---------------------------------------------------------------------------------
// Writing the formats the command makes itself while walking a snapshot.

std::vector<std::string> labelRow(const NativeHeader& h, int32_t columns) {
  std::vector<std::string> row;
  for (int32_t c = 0; c < columns; ++c) {
    const auto& label = static_cast<size_t>(c) < h.labels.size() ? h.labels[c] : std::nullopt;
    row.push_back(label.value_or(""));
  }
  return row;
}

// A label row as the extension's own CSV writes a row: no quoting, "" for empty cells.
std::string plainCsvRow(const std::vector<std::string>& row) {
  std::string line;
  for (size_t c = 0; c < row.size(); ++c) {
    if (c) line += ',';
    line += row[c].empty() ? "\"\"" : row[c];
  }
  return line + "\r\n";
}

struct ConvertPlan {
  ArrayFormat target;
  bool header;
  Output* out;  // for the formats the command writes; null otherwise
};

// Walks the snapshot once: counts for the warnings, and the command's own formats.
Tally writeFromSnapshot(std::string_view snapshot, const ConvertPlan& plan, NativeHeader& h) {
  Tally tally{plan.target};
  std::string pending;
  std::vector<std::string> record;  // of RFC 4180 CSV; a one-dimensional array is one
  bool begun = false;
  const auto begin = [&] {
    begun = true;
    if (plan.target == ArrayFormat::Json) appendJsonHeader(pending, h);
    if (plan.target == ArrayFormat::CsvRfc4180 && plan.header && h.dimensions > 1) {
      appendRfc4180Record(labelRow(h, csvColumns(h, 0)), pending);
    }
  };
  walkNativeFile(snapshot, h, [&](const NativeHalf& value, const NativeHalf& key) {
    if (!begun) begin();
    tally.count(value, key);
    if (plan.target == ArrayFormat::Json) {
      pending += tally.elements > 1 ? ",\n    " : "\n    ";
      appendJsonElement(pending, value, key);
    } else if (plan.target == ArrayFormat::CsvRfc4180) {
      record.push_back(textOf(value));
      if (h.dimensions > 1 && static_cast<int32_t>(record.size()) == csvColumns(h, 0)) {
        appendRfc4180Record(record, pending);
        record.clear();
      }
    }
    if (plan.out) plan.out->drain(pending);
    return true;
  });
  if (!begun) begin();
  if (plan.target == ArrayFormat::Json) pending += tally.elements ? "\n  ]\n}\n" : "]\n}\n";
  if (plan.target == ArrayFormat::CsvRfc4180 && !record.empty()) {
    // The last row padded, as the extension's CSV save pads it.
    if (h.dimensions > 1) record.resize(static_cast<size_t>(csvColumns(h, 0)));
    appendRfc4180Record(record, pending);
  }
  if (plan.out) plan.out->drain(pending, true);
  return tally;
}

bool sameFile(const std::string& a, const std::string& b) {
  std::error_code error;
  return std::filesystem::equivalent(a, b, error) && !error;
}

}  // namespace

bool takeViewOption(std::string_view arg, const std::function<std::optional<std::string>()>& next,
                    ViewOptions& view) {
  const std::string_view name = arg.substr(0, arg.find('='));
  const auto count = [&]() -> size_t {
    const std::optional<std::string> value =
        name.size() < arg.size() ? std::optional<std::string>(arg.substr(name.size() + 1)) : next();
    if (!value) throw UsageError(std::string(name) + " needs a value");
    if (!looksLikeInteger(*value) || (*value)[0] == '-' || value->size() > 9) {
      throw UsageError(std::string(name) + " needs a count, not '" + *value + "'");
    }
    return static_cast<size_t>(std::stoi(*value));
  };
  if (name == "--rows") {
    view.rows = static_cast<int32_t>(count());
  } else if (name == "--width") {
    view.width = count();
  } else if (arg == "--all") {
    view.all = true;
  } else if (arg == "--keys") {
    view.keys = true;
  } else {
    return false;
  }
  if (view.all && view.rows) throw UsageError("--rows and --all exclude each other");
  return true;
}

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
  if (dims == 2 && columns > 0 && size > 0 && !view.keys) {
    printTable(instance, size, columns, view, out);
  } else if (size > 0) {
    printList(instance, size, view, out);
  }
}

int inspectCommand(const Module& module, const std::string& path, const InspectOptions& options) {
  const ProgressNote progress("inspecting " + path);
  std::optional<TempFile> converted;
  if (options.to) {
    // What the array becomes in that format: converted, then inspected as such.
    converted.emplace();
    convertCommand(module, {path, converted->path(), options.to, options.from, options.header,
                            options.lenient, true, false});
  }
  Input input =
      openInput(converted ? converted->path() : path, converted ? options.to : options.from);
  if (converted) input.name = path + " as " + formatInfo(input.format).name;
  auto instance = loadInput(module, input, {options.from, options.header, options.lenient});
  std::cout << "file        " << input.name << '\n';
  std::cout << "format      " << formatInfo(input.format).description << " ("
            << std::filesystem::file_size(input.path) << " bytes)\n";
  printArray(*instance, options.view, std::cout);
  std::cout.flush();
  instance.reset();
  if (formatInfo(input.format).binary) warnAboutDamage(input.name, input.path, input.format);
  return 0;
}

// The format of OUT, once it is clear that OUT may be written.
ArrayFormat checkedTarget(const ConvertOptions& options) {
  const std::string& out = options.out;
  const bool toStdout = out == "-";
  if (!toStdout && options.in != "-" && !options.force && sameFile(options.in, out)) {
    throw UsageError("convert would overwrite its input " + out + "; add --force to do so");
  }
  if (!toStdout && std::filesystem::is_directory(out)) {
    throw FileError("cannot write " + out + ": it is a directory");
  }
  const ArrayFormat target = options.to ? *options.to : formatOfExtension(out).value();
  if (toStdout && formatInfo(target).binary && !options.force && isTerminal(stdout)) {
    throw UsageError(std::string("convert will not write a ") + formatInfo(target).description +
                     " to a terminal; redirect it or add --force");
  }
  return target;
}

int convertCommand(const Module& module, const ConvertOptions& options) {
  const ArrayFormat target = checkedTarget(options);
  const std::string& out = options.out;
  const bool toStdout = out == "-";
  const ProgressNote progress("converting " + options.in);
  const Input input = openInput(options.in, options.from);
  auto instance = loadInput(module, input, {options.from, options.header, options.lenient});
  const int32_t elements = askNumber(*instance, kSize);

  // The extension writes its own formats, into OUT when nothing goes before them.
  const bool ownFormat = formatInfo(target).saveAction != nullptr;
  const bool direct = ownFormat && !toStdout && !(target == ArrayFormat::Csv && options.header);
  std::optional<TempFile> staging;
  if (ownFormat && !direct) staging.emplace();
  const std::string written = direct ? out : staging ? staging->path() : std::string();
  if (ownFormat) fileAction(module, *instance, formatInfo(target).saveAction, written, out);
  // A native file loses nothing, so it needs no walk; every other target does.
  std::optional<Snapshot> snapshot;
  if (target != ArrayFormat::Native) snapshot.emplace(*instance);
  instance.reset();  // the module's copy goes before the snapshot is read

  std::optional<Output> output;
  if (!direct) output.emplace(out);
  NativeHeader header;
  if (snapshot) {
    const ByteBuffer bytes = readSnapshot(snapshot->file.path());
    const Tally tally = writeFromSnapshot(
        bytes.view(), {target, options.header, ownFormat ? nullptr : &*output}, header);
    warnLosses(header, tally, target, options.header);
  }
  if (output && ownFormat) {
    if (options.header) output->write(plainCsvRow(labelRow(header, csvColumns(header, elements))));
    output->copyFrom(written);
  }
  if (output) output->finish();
  if (!options.report) return 0;
  (toStdout ? std::cerr : std::cout)
      << input.name << " (" << formatInfo(input.format).name << ") -> "
      << (toStdout ? "<stdout>" : out) << " (" << formatInfo(target).name
      << "): " << plural(elements, "element") << '\n';
  return 0;
}

}  // namespace quorrel::tool
