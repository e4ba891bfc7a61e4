// Routines of the file actions: whole-array saves and loads, element files, and
// file contents taken into elements.
#include <optional>

#include "host/routines.h"
#include "io/csv_file.h"
#include "io/element_file.h"
#include "io/host_array_file.h"
#include "io/ini_file.h"
#include "io/native_file.h"

namespace quorrel::host {
namespace {

// Hands the whole file to use as a block; a file that cannot be opened leaves the
// array untouched. The temporary bytes are released on return.
template <typename Use>
void withFileContents(const char* path, Use&& use) {
  std::optional<ByteBuffer> contents = readWholeFile(path);
  if (!contents) return;
  use(ByteBlock{contents->data(), static_cast<int32_t>(contents->size())});
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

// Whole-array saves write a new file (mode 0); loads replace (0) or append (1).
void saveToFile(Instance in, const char* path) {
  saveNativeFile(in.array, path, FileModeTruncate);
}
void loadFromFile(Instance in, const char* path) {
  loadNativeFile(in.array, path, LoadReplace);
}
void appendElementsFromFile(Instance in, const char* path) {
  loadNativeFile(in.array, path, LoadAppend);
}
void saveToHostArray(Instance in, const char* path) {
  saveHostArrayFile(in.array, path, FileModeTruncate);
}
void loadFromHostArray(Instance in, const char* path) {
  loadHostArrayFile(in.array, path, LoadReplace);
}
void appendElementsFromHostArray(Instance in, const char* path) {
  loadHostArrayFile(in.array, path, LoadAppend);
}

void saveToCsv(Instance in, const char* path) {
  saveCsvFile(in.array, path, FileModeTruncate);
}
void loadFromCsv(Instance in, const char* path) {
  loadCsvFile(in.array, path, LoadReplace);
}
void appendElementsFromCsv(Instance in, const char* path) {
  loadCsvFile(in.array, path, LoadAppend);
}
void saveToIni(Instance in, const char* path) {
  saveIniFile(in.array, path, FileModeTruncate);
}
void loadFromIni(Instance in, const char* path) {
  loadIniFile(in.array, path, LoadReplace);
}
void appendElementsFromIni(Instance in, const char* path) {
  loadIniFile(in.array, path, LoadAppend);
}

// Element files: index first, path second; a new file (0) or appended to (1).
void saveElementToFile(Instance in, int32_t index, const char* path) {
  quorrel::saveElementToFile(in.array, index, path, FileModeTruncate);
}
void appendElementToFile(Instance in, int32_t index, const char* path) {
  quorrel::saveElementToFile(in.array, index, path, FileModeAppend);
}

// File contents become File elements.
void setFileAt(Instance in, const char* path, int32_t index) {
  withFileContents(path, [&](ByteBlock block) { in.array.setFile(block, index); });
}
void insertFileAt(Instance in, const char* path, int32_t index) {
  withFileContents(path, [&](ByteBlock block) { in.array.insertFile(block, index); });
}
void appendFile(Instance in, const char* path) {
  withFileContents(path, [&](ByteBlock block) { in.array.appendFile(block); });
}

}  // namespace quorrel::host::act
