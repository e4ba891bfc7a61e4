// Low-level file access for the file formats: an owned descriptor opened by path,
// a crash-safe whole-file save, a growable byte buffer, buffered writing and
// whole-file reading. Files are opened and closed within one operation.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

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

// Opens the file read only, reads all of it (up to kMaxFileBytes) and closes it;
// `spare` writable bytes stay past the data. Nothing when the file cannot be opened;
// `status` tells why, or of a read error after which the bytes read so far are
// returned. Throws std::bad_alloc when memory runs out, so that no load takes half a
// file.
std::optional<ByteBuffer> readFileBytes(const char* path, std::size_t spare, FileStatus& status);

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

}  // namespace quorrel
