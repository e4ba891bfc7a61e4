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
void withFileContents(const char* path, Use&& use) {
  std::optional<ByteBuffer> contents = readWholeFile(path);
  if (!contents) return;
  use(ByteBlock{contents->data(), static_cast<int32_t>(contents->size())});
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

// Whole-array saves write a new file (mode 0); loads replace (0) or append (1).
QUORREL_ACTION_ROUTINE(saveToFile) {
  return runAction(
      runRecord, [&](ElementArray& a) { saveNativeFile(a, textParam(param1), FileModeTruncate); });
}
QUORREL_ACTION_ROUTINE(loadFromFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadNativeFile(a, textParam(param1), LoadReplace); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadNativeFile(a, textParam(param1), LoadAppend); });
}
QUORREL_ACTION_ROUTINE(saveAsHostArray) {
  return runAction(runRecord, [&](ElementArray& a) {
    saveHostArrayFile(a, textParam(param1), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(loadFromHostArray) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadHostArrayFile(a, textParam(param1), LoadReplace); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromHostArray) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadHostArrayFile(a, textParam(param1), LoadAppend); });
}

QUORREL_ACTION_ROUTINE(saveToCsvFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { saveCsvFile(a, textParam(param1), FileModeTruncate); });
}
QUORREL_ACTION_ROUTINE(loadFromCsvFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadCsvFile(a, textParam(param1), LoadReplace); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromCsvFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadCsvFile(a, textParam(param1), LoadAppend); });
}
QUORREL_ACTION_ROUTINE(saveToIniFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { saveIniFile(a, textParam(param1), FileModeTruncate); });
}
QUORREL_ACTION_ROUTINE(loadFromIniFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadIniFile(a, textParam(param1), LoadReplace); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromIniFile) {
  return runAction(runRecord,
                   [&](ElementArray& a) { loadIniFile(a, textParam(param1), LoadAppend); });
}

// Element files: index first, path second; a new file (0) or appended to (1).
QUORREL_ACTION_ROUTINE(saveElementToFile) {
  return runAction(runRecord, [&](ElementArray& a) {
    quorrel::saveElementToFile(a, numberParam(param1), textParam(param2), FileModeTruncate);
  });
}
QUORREL_ACTION_ROUTINE(appendElementToFile) {
  return runAction(runRecord, [&](ElementArray& a) {
    quorrel::saveElementToFile(a, numberParam(param1), textParam(param2), FileModeAppend);
  });
}

// File contents become File elements.
QUORREL_ACTION_ROUTINE(setFileAt) {
  return runAction(runRecord, [&](ElementArray& a) {
    withFileContents(textParam(param1),
                     [&](ByteBlock block) { a.setFile(block, numberParam(param2)); });
  });
}
QUORREL_ACTION_ROUTINE(insertFileAt) {
  return runAction(runRecord, [&](ElementArray& a) {
    withFileContents(textParam(param1),
                     [&](ByteBlock block) { a.insertFile(block, numberParam(param2)); });
  });
}
QUORREL_ACTION_ROUTINE(appendFile) {
  return runAction(runRecord, [&](ElementArray& a) {
    withFileContents(textParam(param1), [&](ByteBlock block) { a.appendFile(block); });
  });
}

}  // namespace quorrel::host::act
