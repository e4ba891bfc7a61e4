// Routines whose operations are not wired yet: they keep the calling conventions
// (parameters fetched, nothing changed, 0 answered).
#include "host/routine_support.h"
#include "host/routines.h"

namespace quorrel::host::act {

QUORREL_ACTION_ROUTINE(saveAsHostArray) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(saveToCsvFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(loadFromHostArray) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(loadFromCsvFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendElementsFromHostArray) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendElementsFromCsvFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(saveElementToFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendElementToFile) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectRowsBetweenValues) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(insertRowFromList) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelGreaterOrEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendRowFromList) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelLess) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(replaceRowWithList) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelLessOrEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(pickLabelForBetween) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(deleteRow) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnValueAscending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnValueDescending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnStringAscending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnStringDescending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelValueAscending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelValueDescending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelStringAscending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelStringDescending) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(setLabel) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectRowsBetweenStrings) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(setFileAt) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(insertFileAt) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(appendFile) {
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
QUORREL_ACTION_ROUTINE(selectAllRows) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(invertSelection) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnMatching) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnContaining) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnNotEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnGreater) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnGreaterOrEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnLess) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectColumnLessOrEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelMatching) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelContaining) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelNotEqual) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(selectLabelGreater) {
  return runAction(runRecord, [](ElementArray&) {});
}
QUORREL_ACTION_ROUTINE(startNewWhere) {
  return runAction(runRecord, [](ElementArray&) {});
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {

QUORREL_EXPRESSION_ROUTINE(numberOfRows) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray&) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(rowList) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(numberOfCols) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray&) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(getLabel) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(labelList) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray&) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(getCol) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray&, const char*) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(columnList) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(getFromColumnRow) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray&, int32_t, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(getStringFromColumnRow) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray&, int32_t, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(getFromLabelRow) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray&, const char*, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(getStringFromLabelRow) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray&, const char*, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(colMax) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(colMin) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(colSum) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(colAvg) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray&, int32_t) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(labMax) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray&, const char*) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(labMin) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray&, const char*) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(labSum) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray&, const char*) { return 0; });
}
QUORREL_EXPRESSION_ROUTINE(labAvg) {
  return runExpression<Text>(runRecord, parameterToken,
                             [](ElementArray&, const char*) { return 0; });
}

}  // namespace quorrel::host::expr
