// Files on Windows, through the C runtime's descriptors and the Win32 calls that
// replace a file in one step.
#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#include <fcntl.h>
#include <io.h>
#include <sys/stat.h>
#include <windows.h>

#include <algorithm>
#include <cerrno>
#include <utility>

#include "platform/file_system.h"
#include "platform/files.h"

namespace quorrel {

namespace file_system {

namespace {

constexpr std::size_t kMaxTransfer = std::size_t{1} << 30;

int openRetrying(const char* path, int flags) {
  int fd;
  do {
    fd = _open(path, flags | _O_BINARY, _S_IREAD | _S_IWRITE);
  } while (fd < 0 && errno == EINTR);
  return fd;
}

}  // namespace

int open(const char* path, OpenFor mode) {
  switch (mode) {
    case OpenFor::Reading:
      return openRetrying(path, _O_RDONLY);
    case OpenFor::Truncating:
      return openRetrying(path, _O_WRONLY | _O_CREAT | _O_TRUNC);
    case OpenFor::Appending:
      return openRetrying(path, _O_WRONLY | _O_CREAT | _O_APPEND);
    case OpenFor::Rewriting:
      return openRetrying(path, _O_WRONLY);
  }
  return -1;
}

bool readable(int) {
  return true;  // reads never started out non-blocking
}

int close(int fd) {
  return _close(fd);
}

int sync(int fd) {
  return _commit(fd);
}

// The count parameter is an unsigned int.
std::ptrdiff_t read(int fd, char* into, std::size_t count) {
  return _read(fd, into, static_cast<unsigned>(std::min(count, kMaxTransfer)));
}

std::ptrdiff_t write(int fd, const char* bytes, std::size_t count) {
  return _write(fd, bytes, static_cast<unsigned>(std::min(count, kMaxTransfer)));
}

bool examine(int fd, Kind& kind, int64_t& size) {
  struct _stat st {};
  if (_fstat(fd, &st) != 0) return false;
  const auto type = st.st_mode & _S_IFMT;
  kind = type == _S_IFREG   ? Kind::Regular
         : type == _S_IFIFO ? Kind::Pipe
         : type == _S_IFDIR ? Kind::Directory
                            : Kind::Other;
  size = st.st_size;
  return true;
}

}  // namespace file_system

namespace {

// The folder part of a path, with its separator; "" for a bare name.
std::string folderOf(const std::string& path) {
  const std::size_t cut = path.find_last_of("/\\:");
  return cut == std::string::npos ? std::string() : path.substr(0, cut + 1);
}

}  // namespace

SaveFile::SaveFile(const char* path, bool append) {
  if (path == nullptr) return;
  const DWORD attributes = GetFileAttributesA(path);
  const bool exists = attributes != INVALID_FILE_ATTRIBUTES;
  if (append ||
      (exists && (attributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT)))) {
    openInPlace(path, append);
    return;
  }
  FileHandle existing;
  if (exists) {
    // The old file must be writable, as an in-place save would need it to be.
    existing = FileHandle(file_system::open(path, file_system::OpenFor::Rewriting));
    if (!existing.isOpen()) return;
    const auto handle = reinterpret_cast<HANDLE>(_get_osfhandle(existing.fd_));
    BY_HANDLE_FILE_INFORMATION info{};
    if (GetFileType(handle) != FILE_TYPE_DISK || !GetFileInformationByHandle(handle, &info) ||
        info.nNumberOfLinks > 1) {
      existing.close();
      openInPlace(path, append);
      return;
    }
    existing.close();
  }
  std::string folder = folderOf(path);
  char temp[MAX_PATH + 1];
  if (GetTempFileNameA(folder.empty() ? "." : folder.c_str(), "qrl", 0, temp) == 0) {
    openInPlace(path, append);
    return;
  }
  temp_ = temp;
  file_ = FileHandle(file_system::open(temp, file_system::OpenFor::Truncating));
  if (!file_.isOpen()) {
    discard();
    openInPlace(path, append);
    return;
  }
  if (exists) {
    SetFileAttributesA(temp, attributes & (FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM |
                                           FILE_ATTRIBUTE_ARCHIVE));
  }
  target_ = path;
}

void SaveFile::discard() {
  file_.close();
  if (temp_.empty()) return;
  DeleteFileA(temp_.c_str());
  temp_.clear();
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

void* allocateHugePages(std::size_t) {
  return nullptr;  // large pages need a privilege that games do not run with
}

}  // namespace quorrel
