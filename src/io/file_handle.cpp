#include "io/file_handle.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <new>
#include <utility>

#include "array/array_edit.h"
#include "platform/allocation.h"
#include "platform/files.h"

namespace quorrel {

// --- ByteBuffer ----------------------------------------------------------------------

namespace {

// A big first buffer asks for huge pages, so reading a large file takes a few hundred
// page faults instead of one per 4 KiB.
char* allocateFresh(std::size_t capacity) {
  constexpr std::size_t kHugeFrom = std::size_t{8} << 20;
  if (capacity < kHugeFrom) return static_cast<char*>(allocateBytes(capacity));
  if (allocationRefused()) return nullptr;
  void* p = allocateHugePages(capacity);
  return static_cast<char*>(p != nullptr ? p : std::malloc(capacity));
}

}  // namespace

bool ByteBuffer::reserve(std::size_t capacity) {
  if (capacity <= capacity_) return true;
  if (data_ == nullptr) {
    char* fresh = allocateFresh(capacity);
    if (fresh == nullptr) return false;
    data_.reset(fresh);
    capacity_ = capacity;
    return true;
  }
  char* grown = static_cast<char*>(reallocateBytes(data_.get(), capacity));
  if (grown == nullptr) return false;
  (void)data_.release();
  data_.reset(grown);
  capacity_ = capacity;
  return true;
}

FileStatus readToEnd(FileHandle& file, ByteBuffer& buffer, std::size_t limit, std::size_t spare) {
  constexpr std::size_t kMinChunk = 4096;
  constexpr FileStatus kNoMemory{FileStatus::OutOfMemory};
  // A regular file's size is known: room for all of it plus one read that finds the end.
  const std::size_t hint = std::min(file.sizeHint(), limit);
  if (!buffer.reserve(buffer.size() + hint + spare + kMinChunk)) return kNoMemory;
  while (buffer.size() < limit) {
    std::size_t room = buffer.capacity() - buffer.size() - spare;
    if (room < kMinChunk) {
      const std::size_t wanted =
          std::min(std::max(buffer.capacity() * 2, buffer.capacity() + kMinChunk), limit + spare);
      if (!buffer.reserve(wanted)) return kNoMemory;
      room = buffer.capacity() - buffer.size() - spare;
    }
    room = std::min(room, limit - buffer.size());
    const std::ptrdiff_t got = file.read(buffer.data() + buffer.size(), room);
    if (got < 0) return {FileStatus::Read, errno};
    if (got == 0) return {};
    buffer.setSize(buffer.size() + static_cast<std::size_t>(got));
  }
  return {};
}

FileRead readFile(const char* path, ReadAs as) {
  FileRead read;
  FileHandle file = FileHandle::openForReading(path);
  if (!file.isOpen()) {
    read.status = {FileStatus::Open, errno};
    return read;
  }
  read.status = readToEnd(file, read.bytes, kMaxFileBytes, 1);
  if (read.status.failed == FileStatus::OutOfMemory) {
    read.bytes = ByteBuffer();
  } else if (as == ReadAs::Text) {
    read.bytes.data()[read.bytes.size()] = '\0';
    read.bytes.setSize(std::strlen(read.bytes.data()));
  }
  return read;
}

// --- BufferedWriter ------------------------------------------------------------------

BufferedWriter::BufferedWriter(FileHandle& file)
    : file_(file), buffer_(std::make_unique<char[]>(kCapacity)) {}

void BufferedWriter::bytesSlow(const char* data, std::size_t count) {
  flush();
  if (count >= kCapacity) {
    if (!failed_ && !file_.writeAll(data, count)) {
      failed_ = true;
      error_ = errno;
    }
    return;
  }
  std::memcpy(buffer_.get(), data, count);
  used_ = count;
}

void BufferedWriter::flush() {
  if (used_ > 0 && !failed_ && !file_.writeAll(buffer_.get(), used_)) {
    failed_ = true;
    error_ = errno;
  }
  used_ = 0;
}

// --- The save path and the load path -------------------------------------------------
// Every save of the formats ends in saveThrough and every read in readFile: the two
// places where a file's failure is known with its path, step and system error number.

FileStatus io_detail::saveThrough(const char* path, FileMode mode, bool fits, void* body,
                                  WriteBody write) {
  if (!fits) return {FileStatus::Refused};
  try {
    SaveFile file(path, mode == FileModeAppend);
    if (!file.isOpen()) return {FileStatus::Open, errno};
    BufferedWriter out(file.handle());
    write(body, out);
    return out.finish(file);
  } catch (const std::bad_alloc&) {
    return {FileStatus::OutOfMemory};
  }
}

FileStatus io_detail::loadThrough(ElementArray& array, const char* path, LoadMode mode, ReadAs as,
                                  void* body, LoadBody load) {
  FileRead read = readFile(path, as);
  if (read.status.failed == FileStatus::OutOfMemory) return read.status;
  try {
    const auto bytes = std::make_shared<ByteBuffer>(std::move(read.bytes));
    ArrayEdit edit(array, mode == LoadReplace ? ArrayEdit::Replacing : ArrayEdit::Growing);
    load(body, edit.target(), bytes);
    edit.commit();
  } catch (const std::bad_alloc&) {
    return {FileStatus::OutOfMemory};
  }
  return read.status;
}

}  // namespace quorrel
