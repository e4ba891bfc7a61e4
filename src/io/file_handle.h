// Files as the formats see them: a growable byte buffer, buffered writing, and the one
// save path and the one load path that every format goes through. The handle and the
// save that puts a new file in place in one step are the system's (platform/files.h).
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string_view>
#include <type_traits>
#include <utility>

#include "array/settings.h"
#include "platform/files.h"

namespace quorrel {

// Whether a load replaces the array's contents or appends to them.
enum LoadMode : int32_t { LoadReplace = 0, LoadAppend = 1 };

// A malloc-owned byte buffer that grows without zero-filling, so reading a big file
// touches each byte once.
class ByteBuffer {
 public:
  char* data() { return data_.get(); }
  const char* data() const { return data_.get(); }
  std::size_t size() const { return size_; }
  std::size_t capacity() const { return capacity_; }
  std::string_view view() const { return {data_.get(), size_}; }
  // False (and no change) when the memory cannot be had.
  bool reserve(std::size_t capacity);
  // Count must not exceed the capacity.
  void setSize(std::size_t count) { size_ = count; }

 private:
  struct Free {
    void operator()(char* p) const { std::free(p); }
  };
  std::unique_ptr<char, Free> data_;
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
};

// Reads from the handle's position to the end of the file (or a read error, or
// `limit` bytes) into the buffer, keeping `spare` writable bytes past the data.
// Growth is geometric. What was read before an error stays; the status tells of a
// read error, or that the buffer could not grow (the file was not read to its end).
FileStatus readToEnd(FileHandle& file, ByteBuffer& buffer, std::size_t limit, std::size_t spare);

// The largest file a reader takes in: what a block length can count.
inline constexpr std::size_t kMaxFileBytes = INT32_MAX;

// How a reader takes a file's bytes.
enum class ReadAs {
  Bytes,  // all of them, with one writable byte past them
  Text,   // up to the first zero byte, which then ends them
};

// A whole file as read, with how the reading went: Done; Open, with no bytes; Read, with
// the bytes before the error; OutOfMemory, with no bytes, so that no load takes half a
// file.
struct FileRead {
  ByteBuffer bytes;
  FileStatus status;
  // The file was opened and read, to its end or up to a read error.
  bool hasContents() const { return status.ok() || status.failed == FileStatus::Read; }
};

// Opens the file read only, reads all of it (up to kMaxFileBytes) and closes it.
FileRead readFile(const char* path, ReadAs as = ReadAs::Bytes);

// How far a reader got through the records (elements, cells) of a binary file, for
// telling a damaged file from a whole one.
struct FileExtent {
  bool usable = false;  // the header is one the reader takes
  int64_t declared = 0;
  int64_t read = 0;               // records handed on
  bool endsInsideRecord = false;  // the file ends inside the last record handed on
  std::size_t lastRecordStart = 0;
  std::size_t end = 0;  // where the reader stopped; the file's size unless bytes follow
};

// Collects output in large blocks so a file is written in few system calls; flushes
// when destroyed. Numbers are written little-endian. After a refused write the rest
// of the output is dropped and failed() is true.
class BufferedWriter {
 public:
  explicit BufferedWriter(FileHandle& file);
  ~BufferedWriter() { flush(); }
  BufferedWriter(const BufferedWriter&) = delete;
  BufferedWriter& operator=(const BufferedWriter&) = delete;

  void bytes(const char* data, std::size_t count) {
    if (count == 0) return;
    if (count <= kCapacity - used_) {
      std::memcpy(buffer_.get() + used_, data, count);
      used_ += count;
    } else {
      bytesSlow(data, count);
    }
  }
  void text(std::string_view s) { bytes(s.data(), s.size()); }
  void u16(uint16_t v) {
    char le[2];
    putLE16(le, v);
    bytes(le, 2);
  }
  void i32(int32_t v) {
    char le[4];
    putLE32(le, static_cast<uint32_t>(v));
    bytes(le, 4);
  }
  // Room for `count` bytes to be written in place and then kept with commit(count):
  // small records go into the buffer without a bounds check per field. Null when
  // `count` is more than the buffer holds; use bytes() then.
  char* room(std::size_t count) {
    if (count > kCapacity - used_) {
      flush();
      if (count > kCapacity) return nullptr;
    }
    return buffer_.get() + used_;
  }
  void commit(std::size_t count) { used_ += count; }
  void flush();
  // True once the system refused a write.
  bool failed() const { return failed_; }
  // Flushes and hands the save over to be flushed to the disk and put in place.
  FileStatus finish(SaveFile& file) {
    flush();
    return file.finish(!failed_, error_);
  }

  static char* putLE16(char* p, uint16_t v) {
    p[0] = static_cast<char>(v & 0xFF);
    p[1] = static_cast<char>(v >> 8);
    return p + 2;
  }
  static char* putLE32(char* p, uint32_t v) {
    p[0] = static_cast<char>(v & 0xFF);
    p[1] = static_cast<char>((v >> 8) & 0xFF);
    p[2] = static_cast<char>((v >> 16) & 0xFF);
    p[3] = static_cast<char>(v >> 24);
    return p + 4;
  }

 private:
  void bytesSlow(const char* data, std::size_t count);

  static constexpr std::size_t kCapacity = 1 << 16;
  FileHandle& file_;
  std::unique_ptr<char[]> buffer_;
  std::size_t used_ = 0;
  bool failed_ = false;
  int error_ = 0;  // the system's reason for the refused write
};

class ElementArray;

namespace io_detail {
using WriteBody = void (*)(void* body, BufferedWriter& out);
using LoadBody = void (*)(void* body, ElementArray& target,
                          const std::shared_ptr<ByteBuffer>& bytes);
FileStatus saveThrough(const char* path, FileMode mode, bool fits, void* body, WriteBody write);
FileStatus loadThrough(ElementArray& array, const char* path, LoadMode mode, ReadAs as, void* body,
                       LoadBody load);
}  // namespace io_detail

// Every save: `write` puts the file's bytes into the writer, and the save ends as
// SaveFile makes it (a new file put in place once whole, or an append). With `fits`
// false nothing is opened and the save is Refused (an element that is not there, a
// table too large for its format). Memory running out ends it as OutOfMemory.
template <class Write>
FileStatus saveWith(const char* path, FileMode mode, bool fits, Write&& write) {
  return io_detail::saveThrough(path, mode, fits, &write, [](void* body, BufferedWriter& out) {
    (*static_cast<std::remove_reference_t<Write>*>(body))(out);
  });
}
template <class Write>
FileStatus saveWith(const char* path, FileMode mode, Write&& write) {
  return saveWith(path, mode, true, std::forward<Write>(write));
}

// Every whole-array load: the file is read whole and `load(target, bytes)` applies it
// under an ArrayEdit, all or nothing: a replacing load fills an empty copy that is moved
// in once complete, an appending one that runs out of memory is undone (OutOfMemory,
// the array as it was). A file that cannot be opened reads as no bytes, so a replacing
// load still clears the array; the status says why.
template <class Load>
FileStatus loadWith(ElementArray& array, const char* path, LoadMode mode, ReadAs as, Load&& load) {
  return io_detail::loadThrough(
      array, path, mode, as, &load,
      [](void* body, ElementArray& target, const std::shared_ptr<ByteBuffer>& bytes) {
        (*static_cast<std::remove_reference_t<Load>*>(body))(target, bytes);
      });
}

}  // namespace quorrel
