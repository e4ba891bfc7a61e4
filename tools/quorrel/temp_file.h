// A scratch file in the system's temporary folder, removed when the object goes.
// The extension reads and writes files only by path, so standard input and output
// pass through one of these.
#pragma once

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

// Whole-file helpers shared by the file commands. Both throw FileError with the reason.
std::string readWholeFile(const std::string& path);
void writeWholeFile(const std::string& path, std::string_view bytes);

// Standard input or output as bytes, unchanged on every platform.
std::string readStandardInput();
void writeStandardOutput(std::string_view bytes);

}  // namespace quorrel::tool
