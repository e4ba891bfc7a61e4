// Shared by the file-format fuzz targets: a private temporary folder per process and the
// invariants every array must keep whatever it loaded. Portable: the Windows builds
// replay the corpora under Wine (tests/windows/run_wine_fuzz.sh).
#pragma once

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>

#include "array/element_array.h"

namespace quorrel {

// This process's own folder in the system's temporary folder (TMPDIR, or TMP and TEMP
// on Windows), made on first use under a random name: making it fails when the name is
// taken, so no two processes share one, whatever their process numbers (Wine numbers
// the processes of each prefix on its own). Removed with its files when the process
// ends normally.
class FuzzTempFolder {
 public:
  static const std::filesystem::path& path() {
    static const FuzzTempFolder folder;
    return folder.path_;
  }
  FuzzTempFolder(const FuzzTempFolder&) = delete;
  FuzzTempFolder& operator=(const FuzzTempFolder&) = delete;

 private:
  FuzzTempFolder() {
    namespace fs = std::filesystem;
    std::error_code error;
    fs::path base = fs::temp_directory_path(error);
    if (error) base = ".";
    std::random_device random;
    for (int attempt = 0; attempt < 100; ++attempt) {
      fs::path candidate = base / ("quorrel-fuzz-" + std::to_string(random()));
      if (fs::create_directory(candidate, error)) {
        path_ = std::move(candidate);
        return;
      }
    }
    std::fprintf(stderr, "cannot make a folder in %s\n", base.string().c_str());
    std::abort();
  }
  ~FuzzTempFolder() {
    std::error_code error;
    std::filesystem::remove_all(path_, error);
  }
  std::filesystem::path path_;
};

// A file or folder name in this process's temporary folder.
inline std::string fuzzTempPath(const char* name) {
  return (FuzzTempFolder::path() / name).string();
}

inline void writeFuzzFile(const std::string& path, const uint8_t* data, size_t size) {
  std::FILE* file = std::fopen(path.c_str(), "wb");
  if (file == nullptr) std::abort();
  if (size > 0) std::fwrite(data, 1, size, file);
  std::fclose(file);
}

// The walk over every element is the harness's own check: with comparison tracing it
// would cost more than the load it checks (files can declare millions of cells).
#if defined(__clang__)
#define QUORREL_UNTRACED __attribute__((no_sanitize("coverage")))
#else
#define QUORREL_UNTRACED
#endif

QUORREL_UNTRACED inline void checkInvariants(const ElementArray& array) {
  if (array.size() < 0 || array.size() >= array.capacity()) __builtin_trap();
  if (array.rowStates.size() != static_cast<size_t>(array.tableRowCount())) __builtin_trap();
  for (const Element& e : array.slots()) {
    if (e.type() == ElementType::None && e.size() != 0) __builtin_trap();
    if (e.type() == ElementType::String && e.bytes() == nullptr) __builtin_trap();
  }
}

// An array with a little of everything, for the appending loads.
inline void fillSample(ElementArray& array) {
  array.setDimensions(2);
  array.setBoundary(1, 2);
  array.appendString("name");
  array.appendValue(-7);
  array.appendString("");
  array.setKeyString("k", 0);
  array.labels = LabelList{"a", std::nullopt};
}

}  // namespace quorrel
