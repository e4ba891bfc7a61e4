#include "io/csv_file.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <memory>
#include <span>
#include <string_view>

#include "array/notes.h"
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

// The text of the cells that pad short lines.
constexpr char kNoText[] = "";

// Splits a CSV text into lines and cells in one pass over its bytes: lines end at CR or
// LF and a run of them is one break, so no line is empty; cells end at a comma. Calls
// cell(begin, end) for every cell (it may overwrite *end, the separator) and lineEnd()
// after each line's last cell.
template <class Cell, class LineEnd>
void walkCsv(char* text, std::size_t size, Cell&& cell, LineEnd&& lineEnd) {
  std::size_t start = 0;  // of the open cell, or where the next line may start
  bool inLine = false;
  io_detail::forEachBlockOf(text, size, ',', '\r', '\n', [&](const io_detail::ScanBlock& b) {
    for (uint64_t hits = b.first | b.others; hits != 0; hits &= hits - 1) {
      const int bit = std::countr_zero(hits);
      const std::size_t at = b.at(bit);
      const bool lineBreak = ((b.others >> bit) & 1) != 0;
      if (!inLine) {
        if (lineBreak && at == start) {
          start = at + 1;  // one more break of a run
          continue;
        }
        inLine = true;
      }
      cell(text + start, text + at);
      start = at + 1;
      if (lineBreak) {
        lineEnd();
        inLine = false;
      }
    }
  });
  if (inLine || start < size) {
    cell(text + start, text + size);
    lineEnd();
  }
}

struct CsvShape {
  int64_t rows = 0;
  int32_t columns = 0;  // the widest line's cell count
};

// The same lines as walkCsv, counted from the blocks' bit masks alone: a comma adds a
// cell to its line, and only line breaks are looked at one by one.
CsvShape shapeOf(const char* text, std::size_t size) {
  CsvShape shape;
  int64_t commas = 0;
  bool lineOpen = false;  // a character of the current line has been seen
  std::size_t start = 0;  // where the current line may start
  const auto closeLine = [&] {
    if (lineOpen) {
      ++shape.rows;
      shape.columns = static_cast<int32_t>(std::max<int64_t>(shape.columns, commas + 1));
    }
    commas = 0;
    lineOpen = false;
  };
  io_detail::forEachBlockOf(text, size, ',', '\r', '\n', [&](const io_detail::ScanBlock& b) {
    uint64_t commaBits = b.first;
    for (uint64_t breaks = b.others; breaks != 0; breaks &= breaks - 1) {
      const int bit = std::countr_zero(breaks);
      const uint64_t below = (uint64_t{1} << bit) - 1;
      commas += io_detail::countBits(commaBits & below);
      commaBits &= ~below;
      const std::size_t at = b.at(bit);
      if (at > start) lineOpen = true;
      closeLine();
      start = at + 1;
    }
    commas += io_detail::countBits(commaBits);
    if (b.end > start) lineOpen = true;
  });
  closeLine();
  return shape;
}

// Appends the table's cells as texts borrowed from the file's bytes, each cut in place
// and short lines padded with empty texts, up to `total` elements.
void appendCells(ElementArray& target, std::shared_ptr<ByteBuffer> text, CsvShape shape,
                 int64_t total) {
  const int32_t base = target.size();
  target.keepBlock(text);
  target.appendNone(total);
  Element* const out = target.slots().data() + base;
  int64_t filled = 0;
  int32_t cellsInLine = 0;
  const auto add = [&](const char* cell) {
    if (filled < total) out[filled++] = Element::borrowed(cell);
  };
  walkCsv(
      text->data(), text->size(),
      [&](char* cell, char* end) {
        *end = '\0';
        if (std::string_view(cell, static_cast<std::size_t>(end - cell)) == kEmptyCell) {
          cell[0] = '\0';
        }
        add(cell);
        ++cellsInLine;
      },
      [&] {
        for (; cellsInLine < shape.columns; ++cellsInLine) add(kNoText);
        cellsInLine = 0;
      });
}

// A spreadsheet's UTF-8 file may begin with a byte-order mark; the loader keeps it, so
// the first cell (a label, often) no longer equals the text the author sees.
void noteByteOrderMark(std::string_view text) {
  if (!notesWanted() || !text.starts_with("\xEF\xBB\xBF")) return;
  note(NoteKind::ByteOrderMark, {noteText(text.substr(0, text.find_first_of(",\r\n")))});
}

}  // namespace

FileStatus saveCsvFile(const ElementArray& array, const char* path, FileMode mode) {
  const int64_t size = array.size();
  int64_t columns = size;
  int64_t rows = 1;
  if (array.dimensions() > 1 && array.boundary(1) >= 1) {
    columns = array.boundary(1);
    rows = (size + columns - 1) / columns;
  }
  // The last row is padded to X cells; past the array's cap (X = 2147483647, say)
  // that is gigabytes of empty cells, so such a file is not written at all.
  const bool fits = rows * columns <= ElementArray::kMaxSize;
  return saveWith(path, mode, fits, [&](BufferedWriter& out) {
    const std::span<const Element> cells = array.slots();
    NumberText scratch;
    for (int64_t r = 0; r < rows; ++r) {
      for (int64_t j = 0; j < columns; ++j) {
        const auto index = static_cast<std::size_t>(r * columns + j);
        writeCell(out, static_cast<int32_t>(j),
                  index < cells.size() ? cells[index].asString(scratch) : nullptr);
      }
      out.text(kLineEnd);
    }
  });
}

FileStatus loadCsvFile(ElementArray& array, const char* path, LoadMode mode) {
  return loadWith(array, path, mode, ReadAs::Text,
                  [](ElementArray& target, const std::shared_ptr<ByteBuffer>& text) {
                    noteByteOrderMark(text->view());
                    const CsvShape shape = shapeOf(text->data(), text->size());
                    target.setDimensions(2);
                    target.setBoundary(1, shape.columns);
                    // Appends past the array's size limit change nothing.
                    const int64_t total = std::min(shape.rows * shape.columns,
                                                   int64_t{ElementArray::kMaxSize} - target.size());
                    if (total > 0) appendCells(target, text, shape, total);
                  });
}

}  // namespace quorrel
