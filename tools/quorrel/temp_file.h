// A scratch file in the system's temporary folder, removed when the object goes.
// The extension reads and writes files only by path, so standard input and output
// pass through one of these.
#pragma once

#include <cstdio>
#include <istream>
#include <string>
#include <string_view>

namespace quorrel::tool {

class TempFile {
 public:
  // Creates an empty file that no other process chose; throws FileError on failure.
  TempFile();
  ~TempFile();
  TempFile(const TempFile&) = delete;
  TempFile& operator=(const TempFile&) = delete;

  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

// File helpers shared by the file commands; they throw FileError with the reason.
// At most `count` bytes from the start of a regular file; throws FileError when it
// cannot be read (a folder or a device too).
std::string readFileStart(const std::string& path, size_t count);

// Whether the path is neither a regular file nor a folder as the system shows it: a
// pipe or a device (or a missing file), which reads once, from its start.
bool isStreamFile(const std::string& path);

// At most `count` bytes from the start of a stream (standard input, a pipe, a
// device), and the stream's copy into the file `to`: `start` (what was read of it) and
// the rest. Standard input and output are bytes, unchanged on every platform; a
// failed write to standard output throws FileError.
std::string readStreamStart(std::istream& in, size_t count);
void copyStreamTo(std::istream& in, std::string_view start, const std::string& to);
// Copies the file `from`, less its first `skip` bytes, to `to`; throws FileError.
void copyFileFrom(const std::string& from, size_t skip, const std::string& to);
void writeStandardOutput(std::string_view bytes);

}  // namespace quorrel::tool
