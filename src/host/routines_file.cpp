// Routines of the file actions: whole-array saves and loads, element files, and
// file contents taken into elements.
#include <optional>

#include "host/routine_support.h"
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
FileStatus withFileContents(const char* path, Use&& use) {
  FileStatus status;
  std::optional<ByteBuffer> contents = readWholeFile(path, status);
  if (contents) use(ByteBlock{contents->data(), static_cast<int32_t>(contents->size())});
  return status;
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

// Whole-array saves write a new file (mode 0); loads replace (0) or append (1).
QUORREL_ACTION_ROUTINE(saveToFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return saveNativeFile(a, textParam(param1), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(loadFromFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return loadNativeFile(a, textParam(param1), LoadReplace);
  });
}
QUORREL_ACTION_ROUTINE(appendElementsFromFile) {
  return runFileAction(
      runRecord, [&](ElementArray& a) { return loadNativeFile(a, textParam(param1), LoadAppend); });
}
QUORREL_ACTION_ROUTINE(saveAsHostArray) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return saveHostArrayFile(a, textParam(param1), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(loadFromHostArray) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return loadHostArrayFile(a, textParam(param1), LoadReplace);
  });
}
QUORREL_ACTION_ROUTINE(appendElementsFromHostArray) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return loadHostArrayFile(a, textParam(param1), LoadAppend);
  });
}

QUORREL_ACTION_ROUTINE(saveToCsvFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return saveCsvFile(a, textParam(param1), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(loadFromCsvFile) {
  return runFileAction(
      runRecord, [&](ElementArray& a) { return loadCsvFile(a, textParam(param1), LoadReplace); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromCsvFile) {
  return runFileAction(
      runRecord, [&](ElementArray& a) { return loadCsvFile(a, textParam(param1), LoadAppend); });
}
QUORREL_ACTION_ROUTINE(saveToIniFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return saveIniFile(a, textParam(param1), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(loadFromIniFile) {
  return runFileAction(
      runRecord, [&](ElementArray& a) { return loadIniFile(a, textParam(param1), LoadReplace); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromIniFile) {
  return runFileAction(
      runRecord, [&](ElementArray& a) { return loadIniFile(a, textParam(param1), LoadAppend); });
}

// Element files: index first, path second; a new file (0) or appended to (1).
QUORREL_ACTION_ROUTINE(saveElementToFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return quorrel::saveElementToFile(a, numberParam(param1), textParam(param2), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(appendElementToFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return quorrel::saveElementToFile(a, numberParam(param1), textParam(param2), FileModeAppend);
  });
}

// File contents become File elements.
QUORREL_ACTION_ROUTINE(setFileAt) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return withFileContents(textParam(param1),
                            [&](ByteBlock block) { a.setFile(block, numberParam(param2)); });
  });
}
QUORREL_ACTION_ROUTINE(insertFileAt) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return withFileContents(textParam(param1),
                            [&](ByteBlock block) { a.insertFile(block, numberParam(param2)); });
  });
}
QUORREL_ACTION_ROUTINE(appendFile) {
  return runFileAction(runRecord, [&](ElementArray& a) {
    return withFileContents(textParam(param1), [&](ByteBlock block) { a.appendFile(block); });
  });
}

}  // namespace quorrel::host::act
