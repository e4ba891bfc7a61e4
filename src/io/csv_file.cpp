#include "io/csv_file.h"

#include <cstring>
#include <new>
#include <span>
#include <string_view>
#include <utility>

#include "io/apply.h"
#include "io/parsing.h"

namespace quorrel {

namespace {

constexpr std::string_view kEmptyCell = "\"\"";
constexpr std::string_view kLineEnd = "\r\n";

void writeCell(BufferedWriter& out, int32_t column, const char* text) {
  const std::string_view cell =
      text != nullptr && text[0] != '\0' ? std::string_view(text) : kEmptyCell;
  const std::size_t total = cell.size() + (column > 0 ? 1 : 0);
  if (char* p = out.room(total)) {
    if (column > 0) *p++ = ',';
    std::memcpy(p, cell.data(), cell.size());
    out.commit(total);
    return;
  }
  if (column > 0) out.text(",");
  out.text(cell);
}

int32_t cellsOfLine(const char* line, std::size_t length) {
  int32_t cells = 1;
  for (std::size_t i = 0; i < length; ++i) cells += line[i] == ',' ? 1 : 0;
  return cells;
}

// Cuts the line's cells in place (its end must be writable) and hands each to visit
// with its length; a cell of exactly two double quotes is an empty text.
template <class Visit>
void forEachCell(char* line, std::size_t length, Visit&& visit) {
  char* const stop = line + length;
  *stop = '\0';
  char* cell = line;
  for (;;) {
    auto* comma = static_cast<char*>(std::memchr(cell, ',', static_cast<std::size_t>(stop - cell)));
    char* const cellEnd = comma != nullptr ? comma : stop;
    *cellEnd = '\0';
    auto cellLength = static_cast<std::size_t>(cellEnd - cell);
    if (std::string_view(cell, cellLength) == kEmptyCell) {
      cell[0] = '\0';
      cellLength = 0;
    }
    visit(cell, cellLength);
    if (comma == nullptr) return;
    cell = comma + 1;
  }
}

// appendString of a cut cell (a text file holds no zero bytes before its end).
Element cellElement(const char* cell, std::size_t length, RecordSlab* slab) {
  return Element::of({ElementType::String, 0, cell, static_cast<int32_t>(length + 1)}, slab);
}

}  // namespace

std::optional<ByteBuffer> readTextFile(const char* path) {
  std::optional<ByteBuffer> text = readFileBytes(path, 1);
  if (!text) return std::nullopt;
  if (!text->reserve(text->size() + 1)) throw std::bad_alloc();
  text->data()[text->size()] = '\0';
  text->setSize(std::strlen(text->data()));
  return text;
}

void saveCsvFile(ElementArray& array, const char* path, uint16_t mode) {
  array.fileMode = static_cast<int16_t>(mode);
  try {
    const int64_t size = array.size();
    int64_t columns = size;
    int64_t rows = 1;
    if (array.dimensions() > 1 && array.boundary(1) >= 1) {
      columns = array.boundary(1);
      rows = (size + columns - 1) / columns;
    }
    // The last row is padded to X cells; past the array's cap (X = 2147483647, say)
    // that is gigabytes of empty cells, so such a file is not written at all.
    if (rows * columns > ElementArray::kMaxSize) return;
    SaveFile file(path, mode);
    if (!file.isOpen()) return;
    BufferedWriter out(file.handle());
    const std::span<const Element> cells = std::as_const(array).slots();
    NumberText scratch;
    for (int64_t r = 0; r < rows; ++r) {
      for (int64_t j = 0; j < columns; ++j) {
        const auto index = static_cast<std::size_t>(r * columns + j);
        writeCell(out, static_cast<int32_t>(j),
                  index < cells.size() ? cells[index].asString(scratch) : nullptr);
      }
      out.text(kLineEnd);
    }
    file.finish(out.complete());
  } catch (const std::bad_alloc&) {
  }
}

void writeCsvFile(const char* path, const CsvTable& table, uint16_t fileMode) {
  try {
    SaveFile file(path, fileMode);
    if (!file.isOpen()) return;
    BufferedWriter out(file.handle());
    for (const CsvRow& row : table.rows) {
      for (int32_t j = 0; j < row.cellCount(); ++j) {
        writeCell(out, j, row.cells[static_cast<std::size_t>(j)]);
      }
      out.text(kLineEnd);
    }
    file.finish(out.complete());
  } catch (const std::bad_alloc&) {
  }
}

std::optional<CsvTable> readCsvFile(const char* path) {
  try {
    std::optional<ByteBuffer> text = readTextFile(path);
    if (!text) return std::nullopt;
    CsvTable table;
    table.text = std::move(*text);
    io_detail::forEachLine(table.text.data(), table.text.size(), [&](char* line, size_t length) {
      CsvRow& row = table.rows.emplace_back();
      forEachCell(line, length, [&](const char* cell, std::size_t) { row.cells.push_back(cell); });
    });
    return table;
  } catch (const std::bad_alloc&) {
    return std::nullopt;
  }
}

void loadCsvFile(ElementArray& array, const char* path, int32_t append) {
  try {
    std::optional<ByteBuffer> text = readTextFile(path);
    char* data = text ? text->data() : nullptr;
    const std::size_t size = text ? text->size() : 0;
    int32_t columns = 0;
    io_detail::forEachLine(data, size, [&](char* line, size_t length) {
      columns = std::max(columns, cellsOfLine(line, length));
    });
    io_detail::loadAllOrNothing(array, append == 0, [&](ElementArray& target) {
      target.setDimensions(2);
      target.setBoundary(1, columns);
      // Past the array's size limit appends change nothing, so the walk stops there.
      io_detail::AppendRun run(target);
      io_detail::forEachLine(data, size, [&](char* line, size_t length) {
        if (run.size() >= ElementArray::kMaxSize) return;
        int32_t cells = 0;
        forEachCell(line, length, [&](const char* cell, std::size_t cellLength) {
          run.add(cellElement(cell, cellLength, run.slab()));
          ++cells;
        });
        for (; cells < columns && run.size() < ElementArray::kMaxSize; ++cells) {
          run.add(cellElement("", 0, run.slab()));
        }
      });
      run.flush();
    });
  } catch (const std::bad_alloc&) {
  }
}

}  // namespace quorrel
