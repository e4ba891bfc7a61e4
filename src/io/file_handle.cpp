#include "io/file_handle.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <new>

#include "array/allocation.h"
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

bool readToEnd(FileHandle& file, ByteBuffer& buffer, std::size_t limit, std::size_t spare) {
  constexpr std::size_t kMinChunk = 4096;
  // A regular file's size is known: room for all of it plus one read that finds the end.
  const std::size_t hint = std::min(file.sizeHint(), limit);
  if (!buffer.reserve(buffer.size() + hint + spare + kMinChunk)) return false;
  while (buffer.size() < limit) {
    std::size_t room = buffer.capacity() - buffer.size() - spare;
    if (room < kMinChunk) {
      const std::size_t wanted =
          std::min(std::max(buffer.capacity() * 2, buffer.capacity() + kMinChunk), limit + spare);
      if (!buffer.reserve(wanted)) return false;
      room = buffer.capacity() - buffer.size() - spare;
    }
    room = std::min(room, limit - buffer.size());
    const std::ptrdiff_t got = file.read(buffer.data() + buffer.size(), room);
    if (got <= 0) return true;
    buffer.setSize(buffer.size() + static_cast<std::size_t>(got));
  }
  return true;
}

std::optional<ByteBuffer> readFileBytes(const char* path, std::size_t spare) {
  FileHandle file = FileHandle::openForReading(path);
  if (!file.isOpen()) return std::nullopt;
  ByteBuffer buffer;
  if (!readToEnd(file, buffer, kMaxFileBytes, spare)) throw std::bad_alloc();
  return buffer;
}

// --- BufferedWriter ------------------------------------------------------------------

BufferedWriter::BufferedWriter(FileHandle& file)
    : file_(file), buffer_(std::make_unique<char[]>(kCapacity)) {}

void BufferedWriter::bytesSlow(const char* data, std::size_t count) {
  flush();
  if (count >= kCapacity) {
    failed_ = failed_ || !file_.writeAll(data, count);
    return;
  }
  std::memcpy(buffer_.get(), data, count);
  used_ = count;
}

void BufferedWriter::flush() {
  if (used_ > 0 && !failed_) failed_ = !file_.writeAll(buffer_.get(), used_);
  used_ = 0;
}

}  // namespace quorrel
