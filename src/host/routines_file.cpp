// Routines of the file actions: whole-array saves and loads, element files, and
// file contents taken into elements.
#include "host/routines.h"
#include "io/csv_file.h"
#include "io/element_file.h"
#include "io/host_array_file.h"
#include "io/ini_file.h"
#include "io/native_file.h"

namespace quorrel::host {
namespace {

// Hands the whole file to use as a block; a file that cannot be opened, or that memory
// cannot hold, leaves the array untouched. The temporary bytes are released on return.
template <typename Use>
FileStatus withFileContents(const char* path, Use&& use) {
  const FileRead read = readFile(path);
  if (read.hasContents())
    use(ByteBlock{read.bytes.data(), static_cast<int32_t>(read.bytes.size())});
  return read.status;
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

// Whole-array saves write a new file (mode 0); loads replace (0) or append (1).
FileStatus saveToFile(Instance in, const char* path) {
  return saveNativeFile(in.array, path, FileModeTruncate);
}
FileStatus loadFromFile(Instance in, const char* path) {
  rowsReplaced();
  return loadNativeFile(in.array, path, LoadReplace);
}
FileStatus appendElementsFromFile(Instance in, const char* path) {
  return loadNativeFile(in.array, path, LoadAppend);
}
FileStatus saveToHostArray(Instance in, const char* path) {
  return saveHostArrayFile(in.array, path, FileModeTruncate);
}
FileStatus loadFromHostArray(Instance in, const char* path) {
  rowsReplaced();
  return loadHostArrayFile(in.array, path, LoadReplace);
}
FileStatus appendElementsFromHostArray(Instance in, const char* path) {
  return loadHostArrayFile(in.array, path, LoadAppend);
}

FileStatus saveToCsv(Instance in, const char* path) {
  return saveCsvFile(in.array, path, FileModeTruncate);
}
FileStatus loadFromCsv(Instance in, const char* path) {
  rowsReplaced();
  return loadCsvFile(in.array, path, LoadReplace);
}
FileStatus appendElementsFromCsv(Instance in, const char* path) {
  return loadCsvFile(in.array, path, LoadAppend);
}
FileStatus saveToIni(Instance in, const char* path) {
  return saveIniFile(in.array, path, FileModeTruncate);
}
FileStatus loadFromIni(Instance in, const char* path) {
  rowsReplaced();
  return loadIniFile(in.array, path, LoadReplace);
}
FileStatus appendElementsFromIni(Instance in, const char* path) {
  return loadIniFile(in.array, path, LoadAppend);
}

// Element files: index first, path second; a new file (0) or appended to (1).
FileStatus saveElementToFile(Instance in, int32_t index, const char* path) {
  return quorrel::saveElementToFile(in.array, index, path, FileModeTruncate);
}
FileStatus appendElementToFile(Instance in, int32_t index, const char* path) {
  return quorrel::saveElementToFile(in.array, index, path, FileModeAppend);
}

// File contents become File elements.
FileStatus setFileAt(Instance in, const char* path, int32_t index) {
  noteNegativeIndex(in.array, index);
  return withFileContents(path, [&](ByteBlock block) { in.array.setFile(block, index); });
}
FileStatus insertFileAt(Instance in, const char* path, int32_t index) {
  noteNegativeIndex(in.array, index);
  return withFileContents(path, [&](ByteBlock block) { in.array.insertFile(block, index); });
}
FileStatus appendFile(Instance in, const char* path) {
  return withFileContents(path, [&](ByteBlock block) { in.array.appendFile(block); });
}

}  // namespace quorrel::host::act
