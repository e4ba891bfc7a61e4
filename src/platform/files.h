// Files as the system gives them: a handle that reads and writes bytes, and a save
// that puts a new file in place in one step. One implementation per system
// (files_posix.cpp, files_windows.cpp); the file formats work only through this.
#pragma once

#include <cstddef>
#include <string>

namespace quorrel {

// What a file operation did: Done, or the step at which it stopped, with the system's
// error number where it gave one. Refused: the operation chose to write nothing (an
// element that is not there, a table too large for its format).
struct FileStatus {
  enum Step : uint8_t { Done, Open, Read, Write, Flush, Replace, OutOfMemory, Refused };
  Step failed = Done;
  int error = 0;
  bool ok() const { return failed == Done; }
};

// What failed, in words for a person ("could not open it"); "done" for Done and
// "failed" for a number that is no step.
const char* failedStepWords(int step);

class FileHandle {
 public:
  FileHandle() = default;
  ~FileHandle() { close(); }
  FileHandle(FileHandle&& other) noexcept : fd_(other.fd_) { other.fd_ = -1; }
  FileHandle& operator=(FileHandle&& other) noexcept;
  FileHandle(const FileHandle&) = delete;
  FileHandle& operator=(const FileHandle&) = delete;

  // Read only, binary. Only regular files and pipes open: a directory is not a file,
  // and a device could block or never end. A pipe without a writer reads as empty.
  static FileHandle openForReading(const char* path);
  // Write only, binary, created with owner read and write permission when missing;
  // truncated, or with every write at the end when `append`.
  static FileHandle openForWriting(const char* path, bool append);

  bool isOpen() const { return fd_ >= 0; }
  // Bytes delivered (0 at the end of the file) or -1 on an error; retries interrupts.
  std::ptrdiff_t read(char* into, std::size_t count);
  // Writes all bytes unless the system refuses; false when it did.
  bool writeAll(const char* bytes, std::size_t count);
  // The size of a regular file, for sizing buffers; 0 when unknown.
  std::size_t sizeHint() const;
  // Asks the system to put the written bytes on the disk; false when it could not.
  bool sync();
  // False when closing reported a lost write.
  bool close();

 private:
  friend class SaveFile;
  explicit FileHandle(int fd) : fd_(fd) {}
  int fd_ = -1;
};

// Where a save writes. A whole-file save (not an append) writes a temporary file
// beside the target and, once every byte is written and flushed to the disk, puts it in
// the target's place in one step: a save that fails or is interrupted leaves the old
// file whole. The replacement keeps the old file's permission bits and owner; a new
// file gets owner read and write. A symbolic link is followed (the file it names is
// replaced). Where no temporary file can be made (a read-only folder, a file with
// several hard links, not a regular file) the target is written in place as an append
// always is. A target that cannot be opened for writing gets nothing.
class SaveFile {
 public:
  SaveFile(const char* path, bool append);
  ~SaveFile();
  SaveFile(const SaveFile&) = delete;
  SaveFile& operator=(const SaveFile&) = delete;

  bool isOpen() const { return file_.isOpen(); }
  FileHandle& handle() { return file_; }
  // Flushes to the disk and puts the temporary file in place. With `written` false (a
  // write failed, with `writeError`), or when the flush or the replacement fails, the
  // temporary file is removed and the target keeps its old bytes.
  FileStatus finish(bool written, int writeError = 0);

 private:
  void openInPlace(const char* path, bool append);
  // A whole-file save: through a temporary file where the system allows one.
  void openReplacing(const char* path);
  // Puts the flushed and closed temporary file in the target's place.
  FileStatus replaceTarget();
  void discard();

  FileHandle file_;
  std::string temp_;  // empty when writing in place
  std::string target_;
};

// A block of at least `capacity` bytes on huge-page boundaries that asks the system
// for huge pages, so that reading a big file takes few page faults; released with
// std::free. Null where the system offers no such thing or memory ran out: the caller
// then allocates as usual.
void* allocateHugePages(std::size_t capacity);

}  // namespace quorrel
