#include "temp_file.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <random>

#include "commands.h"

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

std::string readWholeFile(const std::string& path) {
  std::error_code error;
  const auto status = fs::status(path, error);
  if (fs::is_directory(status)) throw FileError("cannot read " + path + ": it is a directory");
  if (fs::exists(status) && !fs::is_regular_file(status)) {
    throw FileError("cannot read " + path + ": it is not a regular file");
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) throw FileError("cannot read " + path + ": " + std::strerror(errno));
  std::string bytes(std::istreambuf_iterator<char>(in), {});
  if (in.bad()) throw FileError("cannot read " + path);
  return bytes;
}

void writeWholeFile(const std::string& path, std::string_view bytes) {
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  if (!out) throw FileError("cannot write " + path + ": " + std::strerror(errno));
  out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  if (!out.flush()) throw FileError("cannot write " + path);
}

// main() made the standard streams binary on every system.
std::string readStandardInput() {
  std::string bytes(std::istreambuf_iterator<char>(std::cin), {});
  return bytes;
}

void writeStandardOutput(std::string_view bytes) {
  std::cout.flush();
  std::fwrite(bytes.data(), 1, bytes.size(), stdout);
  std::fflush(stdout);
}

}  // namespace quorrel::tool
