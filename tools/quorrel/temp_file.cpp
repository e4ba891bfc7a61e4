#include "temp_file.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <random>

#include "commands.h"
#include "io/file_handle.h"

namespace quorrel::tool {
namespace fs = std::filesystem;

TempFile::TempFile() {
  std::error_code error;
  fs::path dir = fs::temp_directory_path(error);
  if (error) dir = ".";
  std::random_device random;
  for (int attempt = 0; attempt < 100; ++attempt) {
    const fs::path candidate = dir / ("quorrel-" + std::to_string(random()) + ".tmp");
    // "x": fails when the file exists, so two processes never share one.
    if (std::FILE* file = std::fopen(candidate.string().c_str(), "wbx")) {
      std::fclose(file);
      path_ = candidate.string();
      return;
    }
  }
  throw FileError("cannot create a temporary file in " + dir.string() + ": " +
                  std::strerror(errno));
}

TempFile::~TempFile() {
  std::error_code error;
  fs::remove(path_, error);
}

namespace {

std::ifstream openRegular(const std::string& path) {
  std::error_code error;
  const auto status = fs::status(path, error);
  if (fs::is_directory(status)) throw FileError("cannot read " + path + ": it is a directory");
  if (fs::exists(status) && !fs::is_regular_file(status)) {
    throw FileError("cannot read " + path + ": it is not a regular file");
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) throw FileError("cannot read " + path + ": " + std::strerror(errno));
  return in;
}

}  // namespace

bool isStreamFile(const std::string& path) {
  // Whatever the system cannot show as a regular file or a folder is read as a stream:
  // Windows (and Wine) give no status at all for a pipe or a device such as /dev/null.
  // A missing file fails there with the same words as anywhere.
  std::error_code error;
  const auto status = fs::status(path, error);
  return !fs::is_directory(status) && !fs::is_regular_file(status);
}

std::string readFileStart(const std::string& path, size_t count) {
  std::ifstream in = openRegular(path);
  std::string bytes(count, '\0');
  in.read(bytes.data(), static_cast<std::streamsize>(count));
  if (in.bad()) throw FileError("cannot read " + path);
  bytes.resize(static_cast<size_t>(in.gcount()));
  return bytes;
}

std::string readStreamStart(std::istream& in, size_t count) {
  std::string bytes(count, '\0');
  in.read(bytes.data(), static_cast<std::streamsize>(count));
  if (in.bad()) throw FileError("cannot read the input");
  bytes.resize(static_cast<size_t>(in.gcount()));
  return bytes;
}

void copyStreamTo(std::istream& in, std::string_view start, const std::string& to) {
  std::ofstream out(to, std::ios::binary | std::ios::trunc);
  out.write(start.data(), static_cast<std::streamsize>(start.size()));
  std::string chunk(size_t{1} << 20, '\0');
  size_t copied = start.size();
  // No reader takes more than kMaxFileBytes: a device without end stops there.
  while (copied <= kMaxFileBytes &&
         (in.read(chunk.data(), static_cast<std::streamsize>(chunk.size())) || in.gcount() > 0)) {
    out.write(chunk.data(), in.gcount());
    copied += static_cast<size_t>(in.gcount());
  }
  if (in.bad() || !out.flush()) throw FileError("cannot copy the input to " + to);
}

void copyFileFrom(const std::string& from, size_t skip, const std::string& to) {
  std::ifstream in(from, std::ios::binary);
  if (skip > 0) in.seekg(static_cast<std::streamoff>(skip));  // a pipe cannot seek
  std::ofstream out(to, std::ios::binary | std::ios::trunc);
  std::string chunk(size_t{1} << 20, '\0');
  while (in.read(chunk.data(), static_cast<std::streamsize>(chunk.size())) || in.gcount() > 0) {
    out.write(chunk.data(), in.gcount());
  }
  if (!in.is_open() || in.bad() || !out.flush()) {
    throw FileError("cannot copy " + from + " to " + to);
  }
}

void writeStandardOutput(std::string_view bytes) {
  std::cout.flush();
  if (std::fwrite(bytes.data(), 1, bytes.size(), stdout) != bytes.size() || std::fflush(stdout)) {
    // A reader that stopped reading wanted no more; the stream's error stays for the
    // final check, which says nothing about a closed pipe either.
    if (standardOutputReaderGone(errno)) return;
    throw FileError(std::string("cannot write standard output: ") + std::strerror(errno));
  }
}

}  // namespace quorrel::tool
