// `quorrel inspect` and `quorrel convert`: a file is loaded into a fresh instance
// through the load actions and read back through the expressions, as a host would.
// What no expression tells (element and key types, every element of a big array in
// one pass) comes from a native snapshot the instance saves, walked with the core's
// own reader.
#include <algorithm>
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
#include "instance_reads.h"
#include "io/file_handle.h"
#include "io/host_array_file.h"
#include "platform/terminal.h"
#include "temp_file.h"
#include "text_formats.h"

namespace quorrel::tool {
namespace {

Argument text(const std::string& value) {
  return Argument(value);
}

void warn(const std::string& what) {
  std::cerr << "quorrel: warning: " << what << '\n';
}

// Runs a file action and turns a failure the module reports into a FileError.
void fileAction(const Module& module, Instance& instance, const char* action,
                const std::string& path, const std::string& shownPath) {
  instance.callAction(codeOfName(true, action).value(), {text(path)});
  const auto status = module.fileStatus();
  if (!status || status->first == 0) return;
  const bool load = std::string_view(action).starts_with("load");
  throw FileError(
      std::string(load ? "cannot read " : "cannot write ") + shownPath + ": " +
      (status->second ? std::strerror(status->second) : failedStepWords(status->first)));
}

// ---------------------------------------------------------------------------------
// A note on standard error while a long command runs, when it is a terminal.

class ProgressNote {
 public:
  explicit ProgressNote(std::string what) : what_(std::move(what)) {
    if (!platform::isTerminal(stderr)) return;
    ticker_ = std::thread([this] { tick(); });
  }
  ~ProgressNote() { stop(); }
  // Ends the note, clearing its line, before the command prints anything of its own.
  void stop() {
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
  // The input's size, once known, so that the note says how much there is to do.
  void setSize(uintmax_t bytes) {
    {
      const std::lock_guard lock(mutex_);
      bytes_ = bytes;
      redraw_ = true;
    }
    wake_.notify_one();
  }

 private:
  // Two seconds of quiet; QUORREL_PROGRESS_AFTER (whole seconds) lets a test see the note
  // without waiting.
  static std::chrono::seconds quietTime() {
    const char* after = std::getenv("QUORREL_PROGRESS_AFTER");
    return std::chrono::seconds(after && looksLikeInteger(after) ? std::atoi(after) : 2);
  }

  void tick() {
    std::unique_lock lock(mutex_);
    const auto start = std::chrono::steady_clock::now();
    // No quiet time shows the note at least once, however soon the command ends.
    const auto quiet = quietTime();
    if (quiet.count() > 0 && wake_.wait_for(lock, quiet, [this] { return done_; })) return;
    // A size that came just before the end is still shown once.
    for (;;) {
      const auto seconds =
          std::chrono::duration_cast<std::chrono::seconds>(std::chrono::steady_clock::now() - start)
              .count();
      std::fprintf(stderr, "\rquorrel: %s%s... %llds", what_.c_str(), sizeText().c_str(),
                   static_cast<long long>(seconds));
      std::fflush(stderr);
      redraw_ = false;
      wake_.wait_for(lock, std::chrono::seconds(1), [this] { return done_ || redraw_; });
      if (done_ && !redraw_) break;
    }
    std::fprintf(stderr, "\r\033[K");
  }

  std::string sizeText() const {
    if (bytes_ == 0) return "";
    char text[32];
    if (bytes_ < 1000000) {
      std::snprintf(text, sizeof text, " (%ju bytes)", bytes_);
    } else {
      std::snprintf(text, sizeof text, " (%.1f MB)", static_cast<double>(bytes_) / 1e6);
    }
    return text;
  }

  std::string what_;
  std::thread ticker_;
  std::mutex mutex_;
  std::condition_variable wake_;
  bool done_ = false;
  uintmax_t bytes_ = 0;
  bool redraw_ = false;  // the size came: show it without waiting for the next second
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
  uintmax_t bytes = 0;  // as given, a byte-order mark included
};

constexpr std::string_view kUtf8ByteOrderMark = "\xEF\xBB\xBF";

// A text file saved with a byte-order mark: the loaders get the text after it, which
// would otherwise begin the first cell, and the person is told.
void readPastByteOrderMark(Input& input) {
  auto copy = std::make_unique<TempFile>();
  copyFileFrom(input.path, kUtf8ByteOrderMark.size(), copy->path());
  input.copy = std::move(copy);
  input.path = input.copy->path();
  std::cerr << "quorrel: note: " << input.name << " begins with a UTF-8 byte-order mark, read past";
  if (input.format == ArrayFormat::Csv) {
    std::cerr << " (the extension's own loadFromCsv keeps it in the first cell, so that "
                 "column's label would not be found)";
  }
  std::cerr << '\n';
}

// A cell that begins with a quote and is not the empty cell "" in the first lines:
// RFC 4180 quoting, which the plain CSV reader keeps as text.
bool hasQuotedCells(std::string_view start) {
  for (size_t at = 0;; ++at) {
    const std::string_view cell = start.substr(at, start.find_first_of(",\r\n", at) - at);
    if (cell.starts_with('"') && cell != "\"\"") return true;
    at += cell.size();
    if (at >= start.size()) return false;
  }
}

Input openInput(const std::string& operand, std::optional<ArrayFormat> from) {
  Input input{operand, operand, ArrayFormat::Native, nullptr};
  std::string head;
  std::ifstream stream;
  const bool once = operand == "-" || isStreamFile(operand);
  if (once) {
    // Read once into a file the loaders can open by name, once its start is known as
    // an array file (a device such as /dev/zero never ends).
    if (operand == "-") input.name = "<stdin>";
    if (operand != "-") stream.open(operand, std::ios::binary);
    if (operand != "-" && !stream) {
      throw FileError("cannot read " + operand + ": " + std::strerror(errno));
    }
    head = readStreamStart(operand == "-" ? std::cin : stream, kRecognitionBytes);
  } else {
    head = readFileStart(input.path, kRecognitionBytes);
  }
  std::string_view start = head;
  const bool marked = start.starts_with(kUtf8ByteOrderMark);
  if (marked) start.remove_prefix(kUtf8ByteOrderMark.size());
  const auto format = from ? from : recogniseFormat(start, formatOfExtension(operand));
  if (!format) {
    throw FileError(input.name + " is not a native array, host array, CSV, INI or JSON file");
  }
  input.format = *format;
  if (once) {
    input.copy = std::make_unique<TempFile>();
    input.path = input.copy->path();
    copyStreamTo(operand == "-" ? std::cin : stream, head, input.path);
  }
  std::error_code unsized;
  input.bytes = std::filesystem::file_size(input.path, unsized);
  if (unsized) input.bytes = 0;
  if (marked && !formatInfo(input.format).binary) readPastByteOrderMark(input);
  if (!from && input.format == ArrayFormat::Csv && hasQuotedCells(start)) {
    std::cerr << "quorrel: note: " << input.name
              << " has quoted cells, which plain CSV splits at every comma; --from csv-rfc4180 "
                 "reads them whole\n";
  }
  return input;
}

std::string problemText(const std::string& name, const TextProblem& problem) {
  return name + ':' + std::to_string(problem.line) + ':' + std::to_string(problem.column) + ": " +
         problem.what;
}

std::unique_ptr<Instance> loadedInstance(const Module& module, ArrayFormat format,
                                         const std::string& path, const std::string& name) {
  SetupFields setup;
  setup.dims = 1;
  auto instance = std::make_unique<Instance>(module, setup);
  fileAction(module, *instance, formatInfo(format).loadAction, path, name);
  return instance;
}

void setStringAt(Instance& instance, const std::string& value, int32_t index) {
  static const int32_t kSetStringAt = codeOfName(true, "setStringAt").value();
  instance.callAction(kSetStringAt, {text(value), Argument(index)});
}

// The first table row becomes the labels, and goes.
void takeHeaderRow(Instance& instance) {
  static const int32_t kSetLabel = codeOfName(true, "setLabel").value();
  static const int32_t kDeleteAt = codeOfName(true, "deleteAt").value();
  const int32_t columns = askNumber(instance, kBoundary, {Argument(1)});
  const int32_t cells = std::min(columns, askNumber(instance, kSize));
  for (int32_t c = 0; c < cells; ++c) {
    const std::string label = askText(instance, kGetString, {Argument(c)}).value_or("");
    if (!label.empty()) instance.callAction(kSetLabel, {text(label), Argument(c)});
  }
  for (int32_t c = cells - 1; c >= 0; --c) instance.callAction(kDeleteAt, {Argument(c)});
}

// RFC 4180 records written as the extension's own CSV, which loads fastest: each field
// a cell, an empty one as "". A field that plain CSV cannot hold (a comma, a line
// break, a zero byte, or the text "" itself) goes in empty and is set by its index
// once loaded.
class PlainCsvWriter : public Rfc4180Sink {
 public:
  // The cells to set once loaded, and their texts one after another, each ended by a
  // zero byte (where the action's text would end anyway).
  struct Patches {
    std::vector<std::pair<int64_t, int32_t>> cells;  // row, column
    std::string texts;
  };

  // `zeros`: whether the text holds a zero byte, which would end the plain CSV there.
  PlainCsvWriter(const std::string& path, bool zeros)
      : out_(path, std::ios::binary | std::ios::trunc), zeros_(zeros) {}

  void field(std::string_view cell, bool quoted) override {
    if (column_ > 0) pending_ += ',';
    if (cell.empty() || ((quoted || zeros_) && !fitsPlainCsv(cell))) {
      if (!cell.empty()) {
        patches_.cells.emplace_back(row_, column_);
        patches_.texts.append(cell.substr(0, cell.find('\0'))) += '\0';
      }
      pending_ += "\"\"";
    } else {
      pending_ += cell;
    }
    ++column_;
  }
  void endRecord() override {
    pending_ += "\r\n";
    ++row_;
    column_ = 0;
    if (pending_.size() >= (size_t{1} << 20)) flush();
    recordEnd_ = pending_.size();
  }
  // Writes what is left but an unfinished record.
  Patches finish() {
    pending_.resize(recordEnd_);
    flush();
    if (!out_.flush()) throw FileError("cannot write a temporary file");
    return std::move(patches_);
  }

 private:
  static bool fitsPlainCsv(std::string_view cell) {
    for (const char c : cell) {
      if (c == ',' || c == '\r' || c == '\n' || c == '\0') return false;
    }
    return cell != "\"\"";
  }

  void flush() {
    out_.write(pending_.data(), static_cast<std::streamsize>(pending_.size()));
    pending_.clear();
  }

  std::ofstream out_;
  bool zeros_;
  std::string pending_;
  size_t recordEnd_ = 0;
  int64_t row_ = 0;
  int32_t column_ = 0;
  Patches patches_;
};

// The lines where --lenient kept a quote as a character, a few of them by number.
void warnKeptQuotes(const std::string& name, const std::vector<size_t>& lines) {
  if (lines.empty()) return;
  constexpr size_t kNamed = 10;
  std::string list;
  for (size_t k = 0; k < std::min(lines.size(), kNamed); ++k) {
    list += (k ? ", " : "") + std::to_string(lines[k]);
  }
  if (lines.size() > kNamed) list += " and " + std::to_string(lines.size() - kNamed) + " more";
  warn(name + ": stray quotes kept as characters (RFC 4180 allows them only around a whole " +
       "field), on " + (lines.size() == 1 ? "line " : "lines ") + list);
}

std::unique_ptr<Instance> loadRfc4180(const Module& module, const Input& input, bool lenient) {
  const TempFile plain;
  PlainCsvWriter::Patches patches;
  {
    const ByteBuffer bytes = readBytes(input.path);
    PlainCsvWriter writer(plain.path(), std::memchr(bytes.data(), 0, bytes.size()) != nullptr);
    const Rfc4180Outcome read = readRfc4180(bytes.view(), writer, lenient);
    patches = writer.finish();
    if (read.problem) {
      // Only an unclosed quote stops a lenient reading.
      const std::string where = problemText(input.name, *read.problem);
      if (!lenient) {
        throw FileError(where + (read.problem->what == "a quoted field is not closed"
                                     ? " (--lenient keeps the records before it)"
                                     : " (--lenient keeps the quote as a character)"));
      }
      warn(where + "; the records before it kept");
    }
    warnKeptQuotes(input.name, read.keptQuoteLines);
  }
  auto instance = loadedInstance(module, ArrayFormat::Csv, plain.path(), input.name);
  const int64_t columns = askNumber(*instance, kBoundary, {Argument(1)});
  const char* text = patches.texts.c_str();
  for (const auto& [row, column] : patches.cells) {
    const std::string_view cell(text);
    setStringAt(*instance, std::string(cell), static_cast<int32_t>(row * columns + column));
    text += cell.size() + 1;
  }
  return instance;
}

std::unique_ptr<Instance> loadJson(const Module& module, const Input& input) {
  const TempFile built;
  {
    NativeFileBuilder builder;
    {
      const ByteBuffer bytes = readBytes(input.path);
      std::optional<TextProblem> problem;
      try {
        problem = buildFromJson(builder, bytes.view());
      } catch (const JsonMistake& mistake) {
        throw FileError(input.name + ": " + mistake.what());
      }
      if (problem) throw FileError(problemText(input.name, *problem));
    }
    if (!builder.save(built.path())) throw FileError("cannot write " + built.path());
  }
  return loadedInstance(module, ArrayFormat::Native, built.path(), built.path());
}

struct LoadOptions {
  bool header = false;
  bool lenient = false;
};

std::unique_ptr<Instance> loadInput(const Module& module, const Input& input,
                                    const LoadOptions& options) {
  std::unique_ptr<Instance> instance;
  if (input.format == ArrayFormat::CsvRfc4180) {
    instance = loadRfc4180(module, input, options.lenient);
  } else if (input.format == ArrayFormat::Json) {
    instance = loadJson(module, input);
  } else {
    instance = loadedInstance(module, input.format, input.path, input.name);
  }
  if (options.header &&
      (input.format == ArrayFormat::Csv || input.format == ArrayFormat::CsvRfc4180)) {
    takeHeaderRow(*instance);
  }
  return instance;
}

// ---------------------------------------------------------------------------------
// Damage: a native or host array file that ends inside an element (a cell) or goes on
// after its last one, as the loader's own reader finds it.

void warnAboutDamage(const std::string& name, const std::string& path, ArrayFormat format) {
  const ByteBuffer read = readBytes(path);
  const std::string_view bytes = read.view();
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
    values += value.type == kValueType;
    files += value.type == kFileType;
    valueKeys += key.type == kValueType;
    if (target == ArrayFormat::Csv && value.type == kStringType) {
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
  int32_t elements;  // as the instance counted them
  Output* out;       // for the formats the command writes; null otherwise
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
    if (plan.target == ArrayFormat::CsvRfc4180 && plan.header) {
      appendRfc4180Record(labelRow(h, csvColumns(h, plan.elements)), pending);
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
      if (static_cast<int32_t>(record.size()) == csvColumns(h, plan.elements)) {
        appendRfc4180Record(record, pending);
        record.clear();
      }
    }
    if (plan.out) plan.out->drain(pending);
    return true;
  });
  if (!begun) begin();
  if (plan.target == ArrayFormat::Json) appendJsonEnd(pending, tally.elements > 0);
  if (plan.target == ArrayFormat::CsvRfc4180 && !record.empty()) {
    // The last row padded, as the extension's CSV save pads it.
    record.resize(static_cast<size_t>(csvColumns(h, plan.elements)));
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

int inspectCommand(const Module& module, const std::string& path, const InspectOptions& options) {
  ProgressNote progress("inspecting " + path);
  std::optional<TempFile> converted;
  if (options.to) {
    // What the array becomes in that format: converted, then inspected as such.
    converted.emplace();
    convertCommand(module, {path, converted->path(), options.to, options.from, options.header,
                            options.lenient, true, false});
  }
  Input input =
      openInput(converted ? converted->path() : path, converted ? options.to : options.from);
  progress.setSize(input.bytes);
  if (converted) input.name = path + " as " + formatInfo(input.format).name;
  auto instance = loadInput(module, input, {options.header, options.lenient});
  progress.stop();
  std::cout << "file        " << input.name << '\n';
  std::cout << "format      " << formatInfo(input.format).description << " (" << input.bytes
            << " bytes)\n";
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
  if (toStdout && formatInfo(target).binary && !options.force && platform::isTerminal(stdout)) {
    throw UsageError(std::string("convert will not write a ") + formatInfo(target).description +
                     " to a terminal; redirect it or add --force");
  }
  return target;
}

int convertCommand(const Module& module, const ConvertOptions& options) {
  const ArrayFormat target = checkedTarget(options);
  const std::string& out = options.out;
  const bool toStdout = out == "-";
  ProgressNote progress("converting " + options.in);
  const Input input = openInput(options.in, options.from);
  progress.setSize(input.bytes);
  auto instance = loadInput(module, input, {options.header, options.lenient});
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
    const ByteBuffer bytes = readBytes(snapshot->file.path());
    const Tally tally = writeFromSnapshot(
        bytes.view(), {target, options.header, elements, ownFormat ? nullptr : &*output}, header);
    progress.stop();
    warnLosses(header, tally, target, options.header);
  }
  if (output && ownFormat) {
    if (options.header) output->write(plainCsvRow(labelRow(header, csvColumns(header, elements))));
    output->copyFrom(written);
  }
  if (output) output->finish();
  progress.stop();
  if (!options.report) return 0;
  (toStdout ? std::cerr : std::cout)
      << input.name << " (" << formatInfo(input.format).name << ") -> "
      << (toStdout ? "<stdout>" : out) << " (" << formatInfo(target).name
      << "): " << plural(elements, "element") << '\n';
  return 0;
}

}  // namespace quorrel::tool
