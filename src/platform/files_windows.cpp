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
  // The runtime says "permission denied" for a folder; say what POSIX systems say.
  if (fd < 0 && errno == EACCES) {
    const DWORD attributes = GetFileAttributesA(path);
    if (attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY)) {
      errno = EISDIR;
    }
  }
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

const char* const kFolderSeparators = "/\\:";

}  // namespace file_system

void SaveFile::openReplacing(const char* path) {
  const DWORD attributes = GetFileAttributesA(path);
  const bool exists = attributes != INVALID_FILE_ATTRIBUTES;
  if (exists && (attributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT))) {
    openInPlace(path, false);
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
      openInPlace(path, false);
      return;
    }
    existing.close();
  }
  std::string folder = folderOf(path);
  char temp[MAX_PATH + 1];
  if (GetTempFileNameA(folder.empty() ? "." : folder.c_str(), "qrl", 0, temp) == 0) {
    openInPlace(path, false);
    return;
  }
  temp_ = temp;
  file_ = FileHandle(file_system::open(temp, file_system::OpenFor::Truncating));
  if (!file_.isOpen()) {
    discard();
    openInPlace(path, false);
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

namespace {

// The error number a POSIX system gives for the same failure, so that both say the
// same; 0 where there is none to match.
int errnoOf(DWORD error) {
  switch (error) {
    case ERROR_FILE_NOT_FOUND:
    case ERROR_PATH_NOT_FOUND:
    case ERROR_INVALID_NAME:
      return ENOENT;
    case ERROR_ACCESS_DENIED:
    case ERROR_SHARING_VIOLATION:
      return EACCES;
    case ERROR_DISK_FULL:
    case ERROR_HANDLE_DISK_FULL:
      return ENOSPC;
    default:
      return 0;
  }
}

}  // namespace

FileStatus SaveFile::replaceTarget() {
  if (!MoveFileExA(temp_.c_str(), target_.c_str(),
                   MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH)) {
    return {FileStatus::Replace, errnoOf(GetLastError())};
  }
  temp_.clear();
  return {};
}

void* allocateHugePages(std::size_t) {
  return nullptr;  // large pages need a privilege that games do not run with
}

}  // namespace quorrel
