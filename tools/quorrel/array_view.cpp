// The views of an instance that inspect and the shell's show print: a table of rows
// and columns (the selected rows marked, for show), or a list of every element with
// its type and key, read from a snapshot.
#include <algorithm>
#include <functional>
#include <ostream>

#include "array_files.h"
#include "commands.h"
#include "instance_reads.h"

namespace quorrel::tool {
namespace {

constexpr int32_t kMaxTableColumns = 12;

Argument number(int32_t value) {
  return Argument(value);
}

int32_t limit(int32_t count, int32_t most) {
  return most < 0 ? count : std::min(count, most);
}

// Plain text stays as it is: text that quoteText prints byte for byte (valid UTF-8 under
// a UTF-8 locale included; its quotes and backslashes aside), without blanks at its ends
// or a leading quote. Anything a reader could mistake is quoted.
std::string displayText(const std::string& value, size_t width) {
  const std::string quoted = quoteText(value);
  const auto escapedAnyway =
      std::count_if(value.begin(), value.end(), [](char c) { return c == '"' || c == '\\'; });
  const bool plain = !value.empty() && value.front() != ' ' && value.back() != ' ' &&
                     value.front() != '"' &&
                     quoted.size() == value.size() + 2 + static_cast<size_t>(escapedAnyway);
  return cutToWidth(plain ? value : quoted, width);
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
  if (half.type == kValueType) return std::to_string(half.number);
  if (half.type != kStringType) {
    return joined("(", plural(static_cast<int64_t>(half.bytes.size()), "byte")) + ")";
  }
  return cutToWidth(quoteText(textOf(half)), width);
}

// Every element with its type and key, from a snapshot.
void printList(Instance& instance, int32_t size, const ViewOptions& view, std::ostream& out) {
  const int32_t shown = limit(size, view.all ? -1 : view.rows.value_or(40));
  std::vector<std::vector<std::string>> lines(1, {"index", "type", "value", "key type", "key"});
  const Snapshot snapshot(instance);
  const ByteBuffer bytes = readBytes(snapshot.file.path());
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
    if (view.width != 0 && view.width < kMinimumCutWidth) {
      throw UsageError("--width needs 0 (never cut) or at least " +
                       std::to_string(kMinimumCutWidth) +
                       ": a cut cell keeps a character and ends in ...");
    }
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

}  // namespace quorrel::tool
