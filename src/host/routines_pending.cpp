// Routines whose operations are not wired yet: they keep the calling conventions
// (parameters fetched, nothing changed, 0 answered).
#include "host/routine_support.h"
#include "host/routines.h"

namespace quorrel::host::act {

QUORREL_ACTION_ROUTINE(saveToCsvFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(loadFromCsvFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendElementsFromCsvFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(saveToIniFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(loadFromIniFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendElementsFromIniFile) {
  return runAction(runRecord, [](ElementArray&) {});
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {}  // namespace quorrel::host::expr
