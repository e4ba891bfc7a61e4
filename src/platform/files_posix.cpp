// Files on POSIX systems.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <memory>
#include <random>
#include <string>
#include <utility>

#include "platform/file_system.h"
#include "platform/files.h"

#ifdef __linux__
#include <sys/mman.h>
#endif

namespace quorrel {

namespace file_system {

namespace {

constexpr std::size_t kMaxTransfer = std::size_t{1} << 30;

// A created file gets what the umask leaves of read and write for everyone, as any
// program's plain create does.
constexpr mode_t kCreateMode = 0666;

int openRetrying(const char* path, int flags) {
  int fd;
  do {
    fd = ::open(path, flags | O_CLOEXEC, kCreateMode);
  } while (fd < 0 && errno == EINTR);
  return fd;
}

}  // namespace

int open(const char* path, OpenFor mode) {
  switch (mode) {
    case OpenFor::Reading:
      // Non-blocking so that a pipe without a writer does not hang the open.
      return openRetrying(path, O_RDONLY | O_NONBLOCK);
    case OpenFor::Truncating:
      return openRetrying(path, O_WRONLY | O_CREAT | O_TRUNC);
    case OpenFor::Appending:
      return openRetrying(path, O_WRONLY | O_CREAT | O_APPEND);
    case OpenFor::Rewriting:
      return openRetrying(path, O_WRONLY);
  }
  return -1;
}

bool readable(int fd) {
  const int flags = ::fcntl(fd, F_GETFL);
  return flags != -1 && ::fcntl(fd, F_SETFL, flags & ~O_NONBLOCK) != -1;
}

int close(int fd) {
  return ::close(fd);
}

int sync(int fd) {
  int rc;
  do {
    rc = ::fsync(fd);
  } while (rc != 0 && errno == EINTR);
  return rc;
}

std::ptrdiff_t read(int fd, char* into, std::size_t count) {
  return ::read(fd, into, std::min(count, kMaxTransfer));
}

std::ptrdiff_t write(int fd, const char* bytes, std::size_t count) {
  return ::write(fd, bytes, std::min(count, kMaxTransfer));
}

bool examine(int fd, Kind& kind, int64_t& size) {
  struct stat st {};
  if (::fstat(fd, &st) != 0) return false;
  kind = S_ISREG(st.st_mode)    ? Kind::Regular
         : S_ISFIFO(st.st_mode) ? Kind::Pipe
         : S_ISDIR(st.st_mode)  ? Kind::Directory
                                : Kind::Other;
  size = st.st_size;
  return true;
}

const char* const kFolderSeparators = "/";

}  // namespace file_system

namespace {

// A new file beside the target that no one else has, created like any other file
// (mkstemp would give it mode 0600 whatever the umask). Its name goes to `temp`.
int createTemporary(const std::string& folder, std::string& temp) {
  static constexpr char kNameChars[] = "abcdefghijklmnopqrstuvwxyz0123456789";
  std::random_device entropy;
  std::minstd_rand pick(entropy());
  for (int attempt = 0; attempt < 100; ++attempt) {
    temp = folder + ".quorrel-";
    for (int i = 0; i < 8; ++i) temp += kNameChars[pick() % (sizeof kNameChars - 1)];
    const int fd = file_system::openRetrying(temp.c_str(), O_WRONLY | O_CREAT | O_EXCL);
    if (fd >= 0 || errno != EEXIST) return fd;
  }
  return -1;
}

}  // namespace

void SaveFile::openReplacing(const char* path) {
  // A link is followed to the file it names, which is the one replaced. A dangling
  // link is written through, creating the file it names.
  std::string target = path;
  struct stat st {};
  if (::lstat(path, &st) == 0 && S_ISLNK(st.st_mode)) {
    std::unique_ptr<char, void (*)(void*)> real(::realpath(path, nullptr), std::free);
    if (real == nullptr) {
      openInPlace(path, false);
      return;
    }
    target = real.get();
  }
  const bool exists = ::stat(target.c_str(), &st) == 0;
  if (exists && (!S_ISREG(st.st_mode) || st.st_nlink > 1)) {
    openInPlace(path, false);
    return;
  }
  FileHandle existing;
  if (exists) {
    // The old file must be writable, as an in-place save would need it to be.
    existing = FileHandle(file_system::open(target.c_str(), file_system::OpenFor::Rewriting));
    if (!existing.isOpen()) return;
  }
  std::string temp;
  const int fd = createTemporary(folderOf(target), temp);
  if (fd < 0) {
    // A read-only folder: the old file is rewritten where it is.
    if (existing.isOpen() && ::ftruncate(existing.fd_, 0) == 0) {
      file_ = std::move(existing);
    } else if (!exists) {
      openInPlace(path, false);
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

void SaveFile::discard() {
  file_.close();
  if (temp_.empty()) return;
  ::unlink(temp_.c_str());
  temp_.clear();
}

FileStatus SaveFile::replaceTarget() {
  if (::rename(temp_.c_str(), target_.c_str()) != 0) return {FileStatus::Replace, errno};
  temp_.clear();
  // The new name is on the disk once the folder is.
  const std::string folder = folderOf(target_);
  const int dir = ::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (dir >= 0) {
    file_system::sync(dir);
    ::close(dir);
  }
  return {};
}

void* allocateHugePages(std::size_t capacity) {
#ifdef __linux__
  constexpr std::size_t kHugePage = std::size_t{2} << 20;
  void* p = nullptr;
  const std::size_t rounded = (capacity + kHugePage - 1) / kHugePage * kHugePage;
  if (posix_memalign(&p, kHugePage, rounded) != 0) return nullptr;
  madvise(p, rounded, MADV_HUGEPAGE);
  return p;
#else
  (void)capacity;
  return nullptr;
#endif
}

}  // namespace quorrel
