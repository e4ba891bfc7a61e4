#include "platform/files.h"

#include <cerrno>
#include <iterator>
#include <utility>

#include "platform/file_system.h"

namespace quorrel {

const char* failedStepWords(int step) {
  static constexpr const char* kWords[] = {
      "done",
      "could not open it",
      "could not read it",
      "could not write it",
      "could not flush it to the disk",
      "could not put the new file in place",
      "ran out of memory",
      "wrote nothing (no such element, or more cells than the format holds)"};
  return step >= 0 && step < static_cast<int>(std::size(kWords)) ? kWords[step] : "failed";
}

namespace fsys = file_system;

FileHandle& FileHandle::operator=(FileHandle&& other) noexcept {
  if (this != &other) {
    close();
    fd_ = std::exchange(other.fd_, -1);
  }
  return *this;
}

FileHandle FileHandle::openForReading(const char* path) {
  if (path == nullptr) {
    errno = EINVAL;
    return {};
  }
  FileHandle file(fsys::open(path, fsys::OpenFor::Reading));
  if (!file.isOpen()) return file;
  fsys::Kind kind{};
  int64_t size = 0;
  if (!fsys::examine(file.fd_, kind, size) ||
      (kind != fsys::Kind::Regular && kind != fsys::Kind::Pipe) || !fsys::readable(file.fd_)) {
    file.close();
    // The reason a caller can tell the user; a device has no fitting error number.
    errno = kind == fsys::Kind::Directory ? EISDIR : 0;
  }
  return file;
}

FileHandle FileHandle::openForWriting(const char* path, bool append) {
  if (path == nullptr) {
    errno = EINVAL;
    return {};
  }
  return FileHandle(
      fsys::open(path, append ? fsys::OpenFor::Appending : fsys::OpenFor::Truncating));
}

std::ptrdiff_t FileHandle::read(char* into, std::size_t count) {
  if (!isOpen()) return -1;
  std::ptrdiff_t got;
  do {
    got = fsys::read(fd_, into, count);
  } while (got < 0 && errno == EINTR);
  return got;
}

bool FileHandle::writeAll(const char* bytes, std::size_t count) {
  if (!isOpen()) return false;
  while (count > 0) {
    const std::ptrdiff_t put = fsys::write(fd_, bytes, count);
    if (put < 0 && errno == EINTR) continue;
    if (put <= 0) return false;
    bytes += put;
    count -= static_cast<std::size_t>(put);
  }
  return true;
}

std::size_t FileHandle::sizeHint() const {
  fsys::Kind kind{};
  int64_t size = 0;
  if (!isOpen() || !fsys::examine(fd_, kind, size) || kind != fsys::Kind::Regular || size <= 0) {
    return 0;
  }
  return static_cast<std::size_t>(size);
}

bool FileHandle::sync() {
  return isOpen() && fsys::sync(fd_) == 0;
}

bool FileHandle::close() {
  if (fd_ < 0) return true;
  return fsys::close(std::exchange(fd_, -1)) == 0;
}

void SaveFile::openInPlace(const char* path, bool append) {
  file_ = FileHandle::openForWriting(path, append);
}

SaveFile::SaveFile(const char* path, bool append) {
  if (path == nullptr) {
    errno = EINVAL;
  } else if (append) {
    openInPlace(path, append);
  } else {
    openReplacing(path);
  }
}

std::string folderOf(const std::string& path) {
  const std::size_t cut = path.find_last_of(fsys::kFolderSeparators);
  return cut == std::string::npos ? std::string() : path.substr(0, cut + 1);
}

SaveFile::~SaveFile() {
  discard();
}

FileStatus SaveFile::finish(bool written, int writeError) {
  if (!isOpen()) return {FileStatus::Open};
  FileStatus status;
  if (!written) {
    status = {FileStatus::Write, writeError};
  } else if (!file_.sync()) {
    status = {FileStatus::Flush, errno};
  }
  // A close that fails has lost a write.
  if (!file_.close() && status.ok()) status = {FileStatus::Write, errno};
  if (temp_.empty()) return status;
  if (status.ok()) status = replaceTarget();
  if (!status.ok()) discard();
  return status;
}

}  // namespace quorrel
