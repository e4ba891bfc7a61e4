// Routines of the recordset: rows, columns and labels, selections, row sorts,
// column aggregates, the between column and cell reads.
#include "host/routine_support.h"
#include "host/routines.h"

namespace quorrel::host::act {

QUORREL_ACTION_ROUTINE(pickColumnForBetween) {
  return runAction(runRecord,
                   [&](ElementArray&) { setBetweenColumn(runRecord, numberParam(param1)); });
}
QUORREL_ACTION_ROUTINE(andMode) {
  return runAction(runRecord, [](ElementArray& a) { a.selectionMode = 0; });
}
QUORREL_ACTION_ROUTINE(orMode) {
  return runAction(runRecord, [](ElementArray& a) { a.selectionMode = 1; });
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {

QUORREL_EXPRESSION_ROUTINE(delimiter) {
  return runExpression<>(runRecord, parameterToken,
                         [](ElementArray& a) { return Borrowed{a.listDelimiter()}; });
}

}  // namespace quorrel::host::expr
