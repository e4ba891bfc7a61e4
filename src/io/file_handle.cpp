#include "io/file_handle.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>

#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif
#ifdef __linux__
#include <sys/mman.h>
#endif

namespace quorrel {

namespace {

#ifdef _WIN32
using StatBuffer = struct _stat;
int openPath(const char* path, int flags) {
  return _open(path, flags | _O_BINARY, _S_IREAD | _S_IWRITE);
}
int statOf(int fd, StatBuffer* st) {
  return _fstat(fd, st);
}
bool isDirectory(const StatBuffer& st) {
  return (st.st_mode & _S_IFMT) == _S_IFDIR;
}
bool isRegular(const StatBuffer& st) {
  return (st.st_mode & _S_IFMT) == _S_IFREG;
}
int closeFd(int fd) {
  return _close(fd);
}
// One call moves at most this many bytes; the count parameter is an unsigned int.
constexpr std::size_t kMaxTransfer = std::size_t{1} << 30;
std::ptrdiff_t readFd(int fd, char* into, std::size_t count) {
  return _read(fd, into, static_cast<unsigned>(std::min(count, kMaxTransfer)));
}
std::ptrdiff_t writeFd(int fd, const char* bytes, std::size_t count) {
  return _write(fd, bytes, static_cast<unsigned>(std::min(count, kMaxTransfer)));
}
constexpr int kReadOnly = _O_RDONLY;
constexpr int kWriteTruncate = _O_WRONLY | _O_CREAT | _O_TRUNC;
constexpr int kWriteAppend = _O_WRONLY | _O_CREAT | _O_APPEND;
#else
using StatBuffer = struct stat;
int openPath(const char* path, int flags) {
  return ::open(path, flags | O_CLOEXEC, 0600);
}
int statOf(int fd, StatBuffer* st) {
  return ::fstat(fd, st);
}
bool isDirectory(const StatBuffer& st) {
  return S_ISDIR(st.st_mode);
}
bool isRegular(const StatBuffer& st) {
  return S_ISREG(st.st_mode);
}
int closeFd(int fd) {
  return ::close(fd);
}
constexpr std::size_t kMaxTransfer = std::size_t{1} << 30;
std::ptrdiff_t readFd(int fd, char* into, std::size_t count) {
  return ::read(fd, into, std::min(count, kMaxTransfer));
}
std::ptrdiff_t writeFd(int fd, const char* bytes, std::size_t count) {
  return ::write(fd, bytes, std::min(count, kMaxTransfer));
}
constexpr int kReadOnly = O_RDONLY;
constexpr int kWriteTruncate = O_WRONLY | O_CREAT | O_TRUNC;
constexpr int kWriteAppend = O_WRONLY | O_CREAT | O_APPEND;
#endif

int openRetrying(const char* path, int flags) {
  int fd;
  do {
    fd = openPath(path, flags);
  } while (fd < 0 && errno == EINTR);
  return fd;
}

}  // namespace

// --- FileHandle ------------------------------------------------------------------------

FileHandle& FileHandle::operator=(FileHandle&& other) noexcept {
  if (this != &other) {
    close();
    fd_ = std::exchange(other.fd_, -1);
  }
  return *this;
}

FileHandle FileHandle::openForReading(const char* path) {
  if (path == nullptr) return {};
  FileHandle file(openRetrying(path, kReadOnly));
  StatBuffer st{};
  if (file.isOpen() && statOf(file.fd_, &st) == 0 && isDirectory(st)) file.close();
  return file;
}

FileHandle FileHandle::openForWriting(const char* path, uint16_t mode) {
  if (path == nullptr) return {};
  return FileHandle(openRetrying(path, mode == FileModeAppend ? kWriteAppend : kWriteTruncate));
}

std::ptrdiff_t FileHandle::read(char* into, std::size_t count) {
  if (!isOpen()) return -1;
  std::ptrdiff_t got;
  do {
    got = readFd(fd_, into, count);
  } while (got < 0 && errno == EINTR);
  return got;
}

bool FileHandle::writeAll(const char* bytes, std::size_t count) {
  if (!isOpen()) return false;
  while (count > 0) {
    std::ptrdiff_t put = writeFd(fd_, bytes, count);
    if (put < 0 && errno == EINTR) continue;
    if (put <= 0) return false;
    bytes += put;
    count -= static_cast<std::size_t>(put);
  }
  return true;
}

std::size_t FileHandle::sizeHint() const {
  StatBuffer st{};
  if (!isOpen() || statOf(fd_, &st) != 0 || !isRegular(st) || st.st_size <= 0) return 0;
  return static_cast<std::size_t>(st.st_size);
}

void FileHandle::close() {
  if (fd_ >= 0) closeFd(std::exchange(fd_, -1));
}

// --- ByteBuffer ----------------------------------------------------------------------

namespace {

// A big first buffer is placed on huge-page boundaries and asks for huge pages, so
// reading a large file takes a few hundred page faults instead of one per 4 KiB.
char* allocateFresh(std::size_t capacity) {
#ifdef __linux__
  constexpr std::size_t kHugePage = std::size_t{2} << 20;
  if (capacity >= 4 * kHugePage) {
    void* p = nullptr;
    const std::size_t rounded = (capacity + kHugePage - 1) / kHugePage * kHugePage;
    if (posix_memalign(&p, kHugePage, rounded) != 0) return nullptr;
    madvise(p, rounded, MADV_HUGEPAGE);
    return static_cast<char*>(p);
  }
#endif
  return static_cast<char*>(std::malloc(capacity));
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
  char* grown = static_cast<char*>(std::realloc(data_.get(), capacity));
  if (grown == nullptr) return false;
  (void)data_.release();
  data_.reset(grown);
  capacity_ = capacity;
  return true;
}

void readToEnd(FileHandle& file, ByteBuffer& buffer, std::size_t limit, std::size_t spare) {
  constexpr std::size_t kMinChunk = 4096;
  // A regular file's size is known: room for all of it plus one read that finds the end.
  const std::size_t hint = std::min(file.sizeHint(), limit);
  if (!buffer.reserve(buffer.size() + hint + spare + kMinChunk)) return;
  while (buffer.size() < limit) {
    std::size_t room = buffer.capacity() - buffer.size() - spare;
    if (room < kMinChunk) {
      const std::size_t wanted =
          std::min(std::max(buffer.capacity() * 2, buffer.capacity() + kMinChunk), limit + spare);
      if (!buffer.reserve(wanted)) return;
      room = buffer.capacity() - buffer.size() - spare;
    }
    room = std::min(room, limit - buffer.size());
    const std::ptrdiff_t got = file.read(buffer.data() + buffer.size(), room);
    if (got <= 0) return;
    buffer.setSize(buffer.size() + static_cast<std::size_t>(got));
  }
}

std::optional<ByteBuffer> readFileBytes(const char* path, std::size_t spare) {
  FileHandle file = FileHandle::openForReading(path);
  if (!file.isOpen()) return std::nullopt;
  ByteBuffer buffer;
  readToEnd(file, buffer, kMaxFileBytes, spare);
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
