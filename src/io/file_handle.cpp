#include "io/file_handle.h"

#include "array/allocation.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <new>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>

#ifdef _WIN32
#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#include <io.h>
#include <windows.h>
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
bool isReadable(const StatBuffer& st) {
  return isRegular(st) || (st.st_mode & _S_IFMT) == _S_IFIFO;
}
int closeFd(int fd) {
  return _close(fd);
}
int syncFd(int fd) {
  return _commit(fd);
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
bool isReadable(const StatBuffer& st) {
  return S_ISREG(st.st_mode) || S_ISFIFO(st.st_mode);
}
int closeFd(int fd) {
  return ::close(fd);
}
int syncFd(int fd) {
  int rc;
  do {
    rc = ::fsync(fd);
  } while (rc != 0 && errno == EINTR);
  return rc;
}
constexpr std::size_t kMaxTransfer = std::size_t{1} << 30;
std::ptrdiff_t readFd(int fd, char* into, std::size_t count) {
  return ::read(fd, into, std::min(count, kMaxTransfer));
}
std::ptrdiff_t writeFd(int fd, const char* bytes, std::size_t count) {
  return ::write(fd, bytes, std::min(count, kMaxTransfer));
}
// Non-blocking so that a pipe without a writer does not hang the open; reads block
// again once the file is known to be one that may be read.
constexpr int kReadOnly = O_RDONLY | O_NONBLOCK;
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
  if (!file.isOpen()) return file;
  if (statOf(file.fd_, &st) != 0 || isDirectory(st) || !isReadable(st)) {
    file.close();
    return file;
  }
#ifndef _WIN32
  const int flags = ::fcntl(file.fd_, F_GETFL);
  if (flags == -1 || ::fcntl(file.fd_, F_SETFL, flags & ~O_NONBLOCK) == -1) file.close();
#endif
  return file;
}

FileHandle FileHandle::openForWriting(const char* path, FileMode mode) {
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

bool FileHandle::sync() {
  return isOpen() && syncFd(fd_) == 0;
}

bool FileHandle::close() {
  if (fd_ < 0) return true;
  return closeFd(std::exchange(fd_, -1)) == 0;
}

// --- SaveFile ------------------------------------------------------------------------

namespace {

// The folder part of a path, with its separator; "" for a bare name.
std::string folderOf(const std::string& path) {
#ifdef _WIN32
  const std::size_t cut = path.find_last_of("/\\:");
#else
  const std::size_t cut = path.rfind('/');
#endif
  return cut == std::string::npos ? std::string() : path.substr(0, cut + 1);
}

}  // namespace

void SaveFile::openInPlace(const char* path, FileMode mode) {
  file_ = FileHandle::openForWriting(path, mode);
}

void SaveFile::discard() {
  file_.close();
  if (temp_.empty()) return;
#ifdef _WIN32
  DeleteFileA(temp_.c_str());
#else
  ::unlink(temp_.c_str());
#endif
  temp_.clear();
}

SaveFile::~SaveFile() {
  discard();
}

#ifdef _WIN32

SaveFile::SaveFile(const char* path, FileMode mode) {
  if (path == nullptr) return;
  const DWORD attributes = GetFileAttributesA(path);
  const bool exists = attributes != INVALID_FILE_ATTRIBUTES;
  if (mode == FileModeAppend ||
      (exists && (attributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT)))) {
    openInPlace(path, mode);
    return;
  }
  FileHandle existing;
  if (exists) {
    // The old file must be writable, as an in-place save would need it to be.
    existing = FileHandle(openRetrying(path, _O_WRONLY));
    if (!existing.isOpen()) return;
    const auto handle = reinterpret_cast<HANDLE>(_get_osfhandle(existing.fd_));
    BY_HANDLE_FILE_INFORMATION info{};
    if (GetFileType(handle) != FILE_TYPE_DISK || !GetFileInformationByHandle(handle, &info) ||
        info.nNumberOfLinks > 1) {
      existing.close();
      openInPlace(path, mode);
      return;
    }
    existing.close();
  }
  std::string folder = folderOf(path);
  char temp[MAX_PATH + 1];
  if (GetTempFileNameA(folder.empty() ? "." : folder.c_str(), "qrl", 0, temp) == 0) {
    openInPlace(path, mode);
    return;
  }
  temp_ = temp;
  file_ = FileHandle(openRetrying(temp, _O_WRONLY | _O_TRUNC));
  if (!file_.isOpen()) {
    discard();
    openInPlace(path, mode);
    return;
  }
  if (exists) {
    SetFileAttributesA(temp, attributes & (FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM |
                                           FILE_ATTRIBUTE_ARCHIVE));
  }
  target_ = path;
}

bool SaveFile::finish(bool written) {
  if (!isOpen()) return false;
  bool ok = written && file_.sync();
  ok = file_.close() && ok;
  if (temp_.empty()) return ok;
  if (ok && MoveFileExA(temp_.c_str(), target_.c_str(),
                        MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH)) {
    temp_.clear();
    return true;
  }
  discard();
  return false;
}

#else

SaveFile::SaveFile(const char* path, FileMode mode) {
  if (path == nullptr) return;
  if (mode == FileModeAppend) {
    openInPlace(path, mode);
    return;
  }
  // A link is followed to the file it names, which is the one replaced. A dangling
  // link is written through, creating the file it names.
  std::string target = path;
  struct stat st {};
  if (::lstat(path, &st) == 0 && S_ISLNK(st.st_mode)) {
    std::unique_ptr<char, void (*)(void*)> real(::realpath(path, nullptr), std::free);
    if (real == nullptr) {
      openInPlace(path, mode);
      return;
    }
    target = real.get();
  }
  const bool exists = ::stat(target.c_str(), &st) == 0;
  if (exists && (!S_ISREG(st.st_mode) || st.st_nlink > 1)) {
    openInPlace(path, mode);
    return;
  }
  FileHandle existing;
  if (exists) {
    // The old file must be writable, as an in-place save would need it to be.
    existing = FileHandle(openRetrying(target.c_str(), O_WRONLY));
    if (!existing.isOpen()) return;
  }
  std::string temp = folderOf(target) + ".quorrel-XXXXXX";
  const int fd = ::mkostemp(temp.data(), O_CLOEXEC);
  if (fd < 0) {
    // A read-only folder: the old file is rewritten where it is.
    if (existing.isOpen() && ::ftruncate(existing.fd_, 0) == 0) {
      file_ = std::move(existing);
    } else if (!exists) {
      openInPlace(path, mode);
    }
    return;
  }
  file_ = FileHandle(fd);
  temp_ = std::move(temp);
  // The replacement takes the old file's owner and permission bits (owner first: a
  // change of owner clears the set-id bits). A file that would change owner is
  // rewritten in place instead.
  if (exists) {
    const bool sameOwner = st.st_uid == ::geteuid() && st.st_gid == ::getegid();
    if ((!sameOwner && ::fchown(fd, st.st_uid, st.st_gid) != 0) ||
        ::fchmod(fd, st.st_mode & 07777) != 0) {
      discard();
      if (::ftruncate(existing.fd_, 0) == 0) file_ = std::move(existing);
      return;
    }
  }
  target_ = std::move(target);
}

bool SaveFile::finish(bool written) {
  if (!isOpen()) return false;
  bool ok = written && file_.sync();
  ok = file_.close() && ok;
  if (temp_.empty()) return ok;
  if (!ok || ::rename(temp_.c_str(), target_.c_str()) != 0) {
    discard();
    return false;
  }
  temp_.clear();
  // The new name is on the disk once the folder is.
  const std::string folder = folderOf(target_);
  FileHandle dir(openRetrying(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY));
  dir.sync();
  return true;
}

#endif

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
    if (allocationRefused() || posix_memalign(&p, kHugePage, rounded) != 0) return nullptr;
    madvise(p, rounded, MADV_HUGEPAGE);
    return static_cast<char*>(p);
  }
#endif
  return static_cast<char*>(allocateBytes(capacity));
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
