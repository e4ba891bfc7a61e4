#include "io/native_file.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>

#include "io/apply.h"
#include "io/file_handle.h"
#include "io/parsing.h"

namespace quorrel {

namespace {

// One column label. `text` holds `length` bytes (not terminated); null when the
// record has no text (a length of 0 or less).
struct LabelRecord {
  int32_t length = 0;
  const char* text = nullptr;
};

// One element (or one host array cell). `number` is the data of a Value (type 1);
// for every other type `data` holds `size` bytes (not terminated), or is null when
// the size is 0 or less. The key half follows the same rule; keyType 0 and keySize 0
// mean no key.
struct ElementRecord {
  const char* data = nullptr;
  const char* keyData = nullptr;
  int32_t size = 0;
  int32_t number = 0;
  int32_t keySize = 0;
  int32_t keyNumber = 0;
  uint16_t type = 0;
  uint16_t keyType = 0;
};

using io_detail::Cursor;

constexpr uint16_t kTypeValue = static_cast<uint16_t>(ElementType::Value);
constexpr uint16_t kTypeString = static_cast<uint16_t>(ElementType::String);
constexpr int32_t kMaxDimensions = ElementArray::kBoundaryCount;

// --- Writing -------------------------------------------------------------------------

// Bytes gathered in memory, for a head written before its file is opened.
struct StringOut {
  std::string& bytes;
  void text(std::string_view s) { bytes.append(s); }
  void u16(uint16_t v) { BufferedWriter::putLE16(grow(2), v); }
  void i32(int32_t v) { BufferedWriter::putLE32(grow(4), static_cast<uint32_t>(v)); }
  char* grow(std::size_t count) {
    bytes.resize(bytes.size() + count);
    return bytes.data() + bytes.size() - count;
  }
};

// Everything before the records: magic, version, dimensions and boundaries, the label
// records (length 0 for a column without a label text) and the element count.
template <class Out>
void writeHead(Out& out, int32_t dimensions, const int32_t* boundaries, const LabelList* labels,
               int32_t count) {
  out.text(kNativeFileMagic);
  out.u16(1);
  out.i32(dimensions);
  for (int32_t d = 0; d < std::min(dimensions, kMaxDimensions); ++d) out.i32(boundaries[d]);
  out.i32(static_cast<int32_t>(labels ? labels->size() : 0));
  if (labels) {
    for (const auto& label : *labels) {
      out.i32(label ? static_cast<int32_t>(label->size()) : 0);
      if (label) out.text(*label);
    }
  }
  out.i32(count);
}

// One half of an element record as written: a type code (any, for images that carry
// unknown ones), a size and the data.
struct Half {
  uint16_t type = 0;
  int32_t size = 0;
  int32_t number = 0;
  const char* data = nullptr;
};

// A Value's data is its 4-byte number whatever the size says; other data is `size`
// bytes, none when there are none to write.
std::size_t dataLength(const Half& h) {
  if (h.type == kTypeValue) return 4;
  return h.size > 0 && h.data != nullptr ? static_cast<std::size_t>(h.size) : 0;
}

char* putHalf(char* p, const Half& h, std::size_t length) {
  p = BufferedWriter::putLE16(p, h.type);
  p = BufferedWriter::putLE32(p, static_cast<uint32_t>(h.size));
  if (h.type == kTypeValue) return BufferedWriter::putLE32(p, static_cast<uint32_t>(h.number));
  if (length > 0) std::memcpy(p, h.data, length);
  return p + length;
}

void writeRecord(BufferedWriter& out, const Half& value, const Half& key) {
  const std::size_t valueLength = dataLength(value);
  const std::size_t keyLength = dataLength(key);
  const std::size_t total = 12 + valueLength + keyLength;
  if (char* p = out.room(total)) {
    putHalf(putHalf(p, value, valueLength), key, keyLength);
    out.commit(total);
    return;
  }
  for (const Half* h : {&value, &key}) {
    out.u16(h->type);
    out.i32(h->size);
    if (h->type == kTypeValue) {
      out.i32(h->number);
    } else {
      out.bytes(h->data, dataLength(*h));
    }
  }
}

Half halfOf(const Element* e) {
  if (e == nullptr) return {};
  const ElementValue v = e->view();
  return {static_cast<uint16_t>(v.type), v.size, v.number, v.bytes};
}

// A half that may hold fewer bytes than its size (a text without its terminating zero)
// is completed with zeros.
std::size_t dataLength(const NativeHalf& h) {
  if (h.type == kTypeValue) return 4;
  return h.size > 0 ? static_cast<std::size_t>(h.size) : 0;
}

char* putHalf(char* p, const NativeHalf& h) {
  p = BufferedWriter::putLE16(p, h.type);
  p = BufferedWriter::putLE32(p, static_cast<uint32_t>(h.size));
  if (h.type == kTypeValue) return BufferedWriter::putLE32(p, static_cast<uint32_t>(h.number));
  const std::size_t length = dataLength(h);
  const std::size_t held = std::min(length, h.bytes.size());
  if (held > 0) std::memcpy(p, h.bytes.data(), held);
  std::memset(p + held, 0, length - held);
  return p + length;
}

// --- Reading -------------------------------------------------------------------------

// Reads one half of an element record. A block that the end of the file cuts short
// is completed with zero bytes, except when its size is beyond the file's own size
// (only a damaged file claims that): then it keeps the bytes the file holds, so no
// file makes the reader allocate more than twice its length. A text keeps only the
// bytes held either way: the zeros would end it there.
// Inlined, so that the cursor stays in registers across the element loop.
template <class Sink>
[[gnu::always_inline]] inline void readHalf(Cursor& in, Sink& sink, uint16_t& type, int32_t& size,
                                            int32_t& number, const char*& data) {
  type = in.u16();
  size = in.i32();
  if (size <= 0) return;
  if (type == kTypeValue) {
    number = in.i32();
    return;
  }
  const std::string_view held = in.take(size);
  data = held.data();
  if (held.size() == static_cast<std::size_t>(size)) return;
  if (type != kTypeString && static_cast<std::size_t>(size) <= in.fileSize()) {
    data = sink.zeroFilled(held, size);
  } else {
    size = static_cast<int32_t>(held.size());
  }
}

// Walks a native file held in memory and hands its parts to the sink in file order.
// False when the file is not usable (wrong magic, version above 1, more than 10
// dimensions). Labels and records that would start at or past the end of the file
// are not produced, which also bounds what a crafted count can ask for.
template <class Sink>
FileExtent parseNative(std::string_view file, Sink& sink) {
  Cursor in(file);
  FileExtent extent;
  if (!in.matches(kNativeFileMagic)) return extent;
  const uint16_t version = in.u16();
  sink.version(version);
  if (static_cast<int16_t>(version) > 1) return extent;
  const int32_t dimensions = in.i32();
  if (dimensions > kMaxDimensions) return extent;
  extent.usable = true;
  int32_t boundaries[kMaxDimensions] = {};
  for (int32_t d = 0; d < dimensions; ++d) boundaries[d] = in.i32();
  sink.header(dimensions, boundaries);

  const int32_t labelCount = in.i32();
  for (int32_t j = 0; j < labelCount && !in.atEnd(); ++j) {
    LabelRecord label;
    label.length = in.i32();
    if (label.length > 0) {
      const std::string_view text = in.take(label.length);
      label.text = text.data();
      label.length = static_cast<int32_t>(text.size());
    }
    sink.label(label);
  }

  const int32_t elementCount = in.i32();
  extent.declared = elementCount;
  // Every complete record takes at least 12 bytes.
  sink.expectElements(std::min<std::size_t>(std::max(elementCount, 0), in.remaining() / 12 + 1));
  bool more = true;
  for (int32_t i = 0; i < elementCount && !in.atEnd() && more; ++i) {
    ElementRecord r;
    extent.lastRecordStart = in.position();
    readHalf(in, sink, r.type, r.size, r.number, r.data);
    readHalf(in, sink, r.keyType, r.keySize, r.keyNumber, r.keyData);
    ++extent.read;
    extent.endsInsideRecord = in.ranShort();
    more = sink.element(r);
  }
  extent.end = in.position();
  return extent;
}

// The operand of one half of a record: the value or key that a load stores.
ElementValue operandOf(uint16_t type, int32_t size, int32_t number, const char* data,
                       std::string& spill) {
  if (type == kTypeString) return io_detail::textOperand(data, size, spill);
  if (type == kTypeValue) return ElementValue::ofValue(number);
  return ElementValue::ofBytes(data, size);
}

// Applies the file to the array as it is read, so a load needs no second copy of the
// file's records; labels wait until every element is in place. Every loaded element
// has a key, even if only a None one. A text with its terminator in the file and no
// key of its own is borrowed from the file's bytes (which the array then keeps).
struct LoadSink : io_detail::BinaryLoad {
  using BinaryLoad::BinaryLoad;

  int32_t labelIndex = 0;
  std::vector<std::pair<int32_t, std::string>> pendingLabels;
  std::vector<std::unique_ptr<char[]>> filled;
  std::string valueSpill;
  std::string keySpill;

  void version(uint16_t) {}
  void expectElements(std::size_t count) { run.expect(static_cast<int64_t>(count)); }
  void header(int32_t dimensions, const int32_t* boundaries) {
    headerSeen = true;
    if (!replace) return;
    array.setDimensions(dimensions);
    for (int32_t d = 1; d < kMaxDimensions; ++d) array.setBoundary(d, boundaries[d - 1]);
  }
  void label(const LabelRecord& label) {
    const int32_t column = labelIndex++;
    if (label.text == nullptr) return;
    pendingLabels.emplace_back(
        column, std::string(io_detail::textOf({label.text, static_cast<size_t>(label.length)})));
  }
  bool element(const ElementRecord& r) {
    add(r);
    return true;
  }
  void add(const ElementRecord& r) {
    // A half with neither bytes nor number is None whatever its type (most keys).
    const bool plainNone = r.keyData == nullptr && r.keyNumber == 0;
    const ElementValue key =
        plainNone ? ElementValue{}
                  : operandOf(r.keyType, r.keySize, r.keyNumber, r.keyData, keySpill);
    if (!plainNone && !Element::isNoneKey(key)) {
      run.add(
          Element::keyed(operandOf(r.type, r.size, r.number, r.data, valueSpill), key, run.slab()));
    } else if (r.type == kTypeString && r.size > 0 &&
               std::string_view(r.data, static_cast<uint32_t>(r.size)).find('\0') !=
                   std::string_view::npos) {
      borrowed = true;
      run.add(Element::borrowedWithNoneKey(r.data));
    } else {
      run.add(
          Element::noneKeyed(operandOf(r.type, r.size, r.number, r.data, valueSpill), run.slab()));
    }
  }
  const char* zeroFilled(std::string_view held, int32_t size) {
    filled.clear();  // the previous block is in an element by now
    auto block = std::make_unique<char[]>(static_cast<std::size_t>(size));
    std::copy(held.begin(), held.end(), block.get());
    filled.push_back(std::move(block));
    return filled.back().get();
  }
};

// Hands the parts to a visitor; a block cut short by the end is handed over as held.
struct VisitorSink {
  NativeFileVisitor& visitor;
  void version(uint16_t) {}
  void expectElements(std::size_t) {}
  void header(int32_t dimensions, const int32_t* boundaries) {
    visitor.header(dimensions, boundaries);
  }
  void label(const LabelRecord& label) { visitor.label(label.text, label.length); }
  bool element(const ElementRecord& r) {
    return visitor.element(half(r.type, r.size, r.number, r.data),
                           half(r.keyType, r.keySize, r.keyNumber, r.keyData));
  }
  static NativeHalf half(uint16_t type, int32_t size, int32_t number, const char* data) {
    if (type == kTypeValue || data == nullptr) return {type, size, number, {}};
    return {type, size, number, {data, static_cast<std::size_t>(std::max(size, 0))}};
  }
  // Only the file's last block can be cut short, so one buffer serves.
  const char* zeroFilled(std::string_view held, int32_t size) {
    filled.assign(held);
    filled.resize(static_cast<std::size_t>(size), '\0');
    return filled.data();
  }
  std::string filled;
};

}  // namespace

FileExtent scanNativeFile(std::string_view file, NativeFileVisitor& visitor) {
  VisitorSink sink{visitor, {}};
  return parseNative(file, sink);
}

FileStatus saveNativeFile(const ElementArray& array, const char* path, FileMode mode) {
  return saveWith(path, mode, [&](BufferedWriter& out) {
    int32_t boundaries[kMaxDimensions];
    for (int32_t d = 0; d < kMaxDimensions; ++d) boundaries[d] = array.boundary(d + 1);
    writeHead(out, array.dimensions(), boundaries, array.labels ? &*array.labels : nullptr,
              array.size());
    for (const Element& e : array.slots()) writeRecord(out, halfOf(&e), halfOf(e.key()));
  });
}

std::string nativeFileHead(int32_t dimensions, const int32_t* boundaries, const LabelList& labels,
                           int32_t count) {
  std::string bytes;
  StringOut out{bytes};
  writeHead(out, dimensions, boundaries, &labels, count);
  return bytes;
}

void appendNativeRecord(std::string& out, const NativeHalf& value, const NativeHalf& key) {
  const std::size_t at = out.size();
  out.resize(at + 12 + dataLength(value) + dataLength(key));
  putHalf(putHalf(out.data() + at, value), key);
}

FileStatus loadNativeFile(ElementArray& array, const char* path, LoadMode mode) {
  const bool replace = mode == LoadReplace;
  return loadWith(array, path, mode, ReadAs::Bytes,
                  [&](ElementArray& target, const std::shared_ptr<ByteBuffer>& bytes) {
                    LoadSink sink{target, replace};
                    parseNative(bytes->view(), sink);
                    sink.finish(bytes);
                    for (const auto& [column, text] : sink.pendingLabels) {
                      io_detail::applyLabel(target, text, column);
                    }
                  });
}

}  // namespace quorrel
