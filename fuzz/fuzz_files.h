// Shared by the file-format fuzz targets: a private temporary file per process and the
// invariants every array must keep whatever it loaded.
#pragma once

#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "array/element_array.h"

namespace quorrel {

inline std::string fuzzTempPath(const char* name) {
  std::error_code error;
  std::filesystem::path base = std::filesystem::temp_directory_path(error);
  if (error) base = ".";
  return (base / ("quorrel-fuzz-" + std::to_string(getpid()) + "-" + name)).string();
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
