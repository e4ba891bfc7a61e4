#include "io/host_array_file.h"

#include <string>

#include <algorithm>
#include <cstring>
#include <memory>
#include <string_view>

#include "array/int32.h"
#include "array/text.h"
#include "io/apply.h"
#include "io/file_handle.h"
#include "io/parsing.h"

namespace quorrel {

namespace {

using io_detail::Cursor;

constexpr int32_t kVersion = 2;
constexpr int32_t kTextCells = 2;
// Text cells without bytes cost nothing to read, so a tiny file could declare
// billions of them; past this many the file reads no cells.
constexpr int64_t kMaxByteless = 16777216;

int32_t atLeastOne(int32_t size) {
  return size == 0 ? 1 : size;
}

// Writes one cell: its length field, then its text. A number's decimal text is
// written straight into the output.
void writeCell(BufferedWriter& out, const ElementArray& array, int32_t k, NumberText& scratch) {
  constexpr std::size_t kNumberRoom = 4 + sizeof scratch.text;
  const Element* e = array.inRange(k) ? &array.at(k) : nullptr;
  if (e != nullptr && e->type() == ElementType::Value) {
    if (char* p = out.room(kNumberRoom)) {
      const int length = writeDecimal(e->number(), p + 4);
      BufferedWriter::putLE32(p, static_cast<uint32_t>(length));
      out.commit(4 + static_cast<std::size_t>(length));
      return;
    }
  }
  const char* text = e != nullptr ? e->asString(scratch) : "";
  const std::size_t length = std::strlen(text);
  if (char* p = out.room(4 + length)) {
    p = BufferedWriter::putLE32(p, static_cast<uint32_t>(length));
    std::memcpy(p, text, length);
    out.commit(4 + length);
    return;
  }
  out.i32(static_cast<int32_t>(length));
  out.bytes(text, length);
}

// Writes the header, the sizes and every cell (an empty text past the elements).
void writeHostFile(BufferedWriter& out, const ElementArray& array, int32_t x, int32_t y,
                   int32_t z) {
  out.text(kHostFileHeader);
  out.i32(kVersion);
  out.i32(x);
  out.i32(y);
  out.i32(z);
  out.i32(kTextCells);
  NumberText scratch;
  for (int32_t k3 = 0; k3 < z; ++k3) {
    for (int32_t k2 = 0; k2 < y; ++k2) {
      const int32_t row = mulWrap(addWrap(mulWrap(y, k3), k2), x);
      for (int32_t k1 = 0; k1 < x; ++k1) writeCell(out, array, addWrap(row, k1), scratch);
    }
  }
}

// The number of cells X x Y x Z, or -1 when a size is negative or the product does
// not fit 32 bits.
int64_t cellCount(int32_t x, int32_t y, int32_t z) {
  if (x < 0 || y < 0 || z < 0) return -1;
  int64_t count = int64_t{x} * y;
  if (count > INT32_MAX) return -1;
  count *= z;
  return count > INT32_MAX ? -1 : count;
}

// Walks a host array file held in memory; false when it is not one. Cells that would
// start at or past the end of the file are not produced. Text cells are cut in place:
// the byte after a cell's text (the next cell's length, once read, or the byte past
// the file, which must be writable) becomes its terminator.
template <class Sink>
FileExtent parseHost(char* data, std::size_t size, Sink& sink) {
  Cursor in({data, size});
  FileExtent extent;
  if (!in.matches(kHostFileHeader)) return extent;
  extent.usable = true;
  const int32_t version = in.i32();
  const int32_t x = in.i32();
  const int32_t y = in.i32();
  const int32_t z = in.i32();
  const int32_t kind = in.i32();
  sink.header(x, y, z);
  const int64_t count = cellCount(x, y, z);
  extent.end = in.position();
  if (count <= 0) return extent;
  extent.declared = count;
  // Every stored cell takes at least 4 bytes.
  sink.expectCells(std::min<int64_t>(count, static_cast<int64_t>(in.remaining() / 4 + 1)));
  if (kind == 1 || kind == 5) {
    for (int64_t i = 0; i < count && !in.atEnd(); ++i) {
      extent.lastRecordStart = in.position();
      sink.number(in.i32());
      ++extent.read;
    }
  } else if ((kind == 2 || kind == 6) && version == kVersion) {
    bool more = !in.atEnd();
    extent.lastRecordStart = in.position();
    int32_t n = more ? in.i32() : 0;
    for (int64_t i = 0; i < count && more; ++i) {
      const int32_t length = n;
      const std::string_view held = length > 0 ? in.take(length) : std::string_view{};
      extent.read = i + 1;
      extent.endsInsideRecord = in.ranShort();
      extent.end = in.position();
      // The next cell's length is read ahead: its first byte becomes this text's end.
      more = !in.atEnd() && i + 1 < count;
      if (more) extent.lastRecordStart = in.position();
      n = more ? in.i32() : 0;
      if (length <= 0) {
        sink.text(nullptr, length);
        continue;
      }
      // Nothing held means the file ended: the text is the empty one past it.
      char* const text = held.empty() ? data + size : data + (held.data() - data);
      text[held.size()] = '\0';
      sink.text(text, static_cast<int32_t>(held.size()));
    }
    return extent;
  } else if ((kind == 2 || kind == 6) && count <= kMaxByteless) {
    sink.emptyTexts(count);
    extent.read = count;
  }
  extent.endsInsideRecord = in.ranShort();
  extent.end = in.position();
  return extent;
}

// Texts are borrowed from the file's bytes (which the array then keeps).
struct LoadSink : io_detail::BinaryLoad {
  using BinaryLoad::BinaryLoad;

  void header(int32_t x, int32_t y, int32_t) {
    headerSeen = true;
    if (!replace) return;
    array.setDimensions(3);
    array.setBoundary(1, x);
    array.setBoundary(2, y);
  }
  void expectCells(int64_t count) { run.expect(count); }
  void number(int32_t n) { run.add(Element::of(ElementValue::ofValue(n))); }
  // A terminated text, or none (a None element).
  void text(const char* data, int32_t) {
    if (data == nullptr) {
      run.add(Element());
      return;
    }
    borrowed = true;
    run.add(Element::borrowed(data));
  }
  void emptyTexts(int64_t count) {
    run.flush();
    array.appendNone(count);
  }
};

}  // namespace

namespace {

// Passes the cells by: only where they lie counts.
struct MeasureSink {
  void header(int32_t, int32_t, int32_t) {}
  void expectCells(int64_t) {}
  void number(int32_t) {}
  void text(const char*, int32_t) {}
  void emptyTexts(int64_t) {}
};

}  // namespace

FileExtent measureHostFile(std::string_view file) {
  // The reader ends texts in place, one byte past the file at most: it walks a copy.
  std::string copy(file);
  copy.push_back('\0');
  MeasureSink sink;
  return parseHost(copy.data(), file.size(), sink);
}

FileStatus saveHostArrayFile(const ElementArray& array, const char* path, FileMode mode) {
  // Sizes of 0 are written and counted as 1.
  const int32_t x = atLeastOne(array.boundary(1));
  const int32_t y = atLeastOne(array.boundary(2));
  const int32_t z = atLeastOne(addWrap(divTrunc(array.size(), mulWrap(x, y)), 1));
  // More cells than any array can hold (a wide boundary, say) would mean gigabytes of
  // empty cells: such a file is not written at all.
  // (X × Y is checked first: with all three near 2^31 the product passes 64 bits.)
  const int64_t layer = int64_t{x} * y;
  const bool fits = layer <= ElementArray::kMaxSize && layer * z <= ElementArray::kMaxSize;
  return saveWith(path, mode, fits,
                  [&](BufferedWriter& out) { writeHostFile(out, array, x, y, z); });
}

FileStatus loadHostArrayFile(ElementArray& array, const char* path, LoadMode mode) {
  const bool replace = mode == LoadReplace;
  return loadWith(array, path, mode, ReadAs::Bytes,
                  [&](ElementArray& target, const std::shared_ptr<ByteBuffer>& bytes) {
                    LoadSink sink{target, replace};
                    parseHost(bytes->data(), bytes->size(), sink);
                    sink.finish(bytes);
                  });
}

}  // namespace quorrel
