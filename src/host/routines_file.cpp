// Routines of the file actions: whole-array saves and loads, element files, and
// file contents taken into elements.
#include "host/routine_support.h"
#include "host/routines.h"
#include "io/native_file.h"

namespace quorrel::host::act {

// Whole-array saves write a new file; loads replace (0) or append (1).
QUORREL_ACTION_ROUTINE(saveToFile) {
  return runAction(runRecord, [&](ElementArray& a) { saveNativeFile(a, textParam(param1), 0); });
}
QUORREL_ACTION_ROUTINE(loadFromFile) {
  return runAction(runRecord, [&](ElementArray& a) { loadNativeFile(a, textParam(param1), 0); });
}
QUORREL_ACTION_ROUTINE(appendElementsFromFile) {
  return runAction(runRecord, [&](ElementArray& a) { loadNativeFile(a, textParam(param1), 1); });
}

}  // namespace quorrel::host::act
