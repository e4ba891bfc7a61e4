// Routines of the element edits, settings and dimensions: each forwards to one
// operation of the array or writes one setting.
#include "host/routine_support.h"
#include "host/routines.h"

namespace quorrel::host::act {

QUORREL_ACTION_ROUTINE(insertStringAt) {
  return runAction(
      runRecord, [&](ElementArray& a) { a.insertString(textParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(insertValueAt) {
  return runAction(
      runRecord, [&](ElementArray& a) { a.insertValue(numberParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(appendString) {
  return runAction(runRecord, [&](ElementArray& a) { a.appendString(textParam(param1)); });
}
QUORREL_ACTION_ROUTINE(appendValue) {
  return runAction(runRecord, [&](ElementArray& a) { a.appendValue(numberParam(param1)); });
}
QUORREL_ACTION_ROUTINE(setStringAt) {
  return runAction(runRecord,
                   [&](ElementArray& a) { a.setString(textParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(setValueAt) {
  return runAction(runRecord,
                   [&](ElementArray& a) { a.setValue(numberParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(deleteAt) {
  return runAction(runRecord, [&](ElementArray& a) { a.deleteAt(numberParam(param1)); });
}
QUORREL_ACTION_ROUTINE(deleteAll) {
  return runAction(runRecord, [](ElementArray& a) { a.clear(); });
}
QUORREL_ACTION_ROUTINE(setKeyStringAt) {
  return runAction(
      runRecord, [&](ElementArray& a) { a.setKeyString(textParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(setKeyValueAt) {
  return runAction(
      runRecord, [&](ElementArray& a) { a.setKeyValue(numberParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(setArrayDimension) {
  return runAction(runRecord, [&](ElementArray& a) { a.setDimensions(numberParam(param1)); });
}
QUORREL_ACTION_ROUTINE(use2DArray) {
  return runAction(runRecord, [](ElementArray& a) { a.setDimensions(2); });
}
QUORREL_ACTION_ROUTINE(use3DArray) {
  return runAction(runRecord, [](ElementArray& a) { a.setDimensions(3); });
}
QUORREL_ACTION_ROUTINE(setDimensionBoundary) {
  return runAction(
      runRecord, [&](ElementArray& a) { a.setBoundary(numberParam(param1), numberParam(param2)); });
}
QUORREL_ACTION_ROUTINE(resizeDimensionBoundary) {
  return runAction(runRecord, [&](ElementArray& a) {
    a.resizeBoundary(numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(caseInsensitive) {
  return runAction(runRecord, [](ElementArray& a) { a.settings.caseMode = CaseInsensitive; });
}
QUORREL_ACTION_ROUTINE(caseSensitive) {
  return runAction(runRecord, [](ElementArray& a) { a.settings.caseMode = CaseSensitive; });
}
QUORREL_ACTION_ROUTINE(literalSearch) {
  return runAction(runRecord, [](ElementArray& a) { a.settings.searchMode = SearchLiteral; });
}
QUORREL_ACTION_ROUTINE(wildcardSearch) {
  return runAction(runRecord, [](ElementArray& a) { a.settings.searchMode = SearchWildcard; });
}
QUORREL_ACTION_ROUTINE(setListDelimiter) {
  return runAction(runRecord, [&](ElementArray& a) { a.setListDelimiter(textParam(param1)); });
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {

QUORREL_EXPRESSION_ROUTINE(size) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return a.size(); });
}
QUORREL_EXPRESSION_ROUTINE(capacity) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return a.capacity(); });
}
QUORREL_EXPRESSION_ROUTINE(getString) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t index) {
    return Borrowed{a.getString(index)};
  });
}
QUORREL_EXPRESSION_ROUTINE(getValue) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t index) { return a.getValue(index); });
}
QUORREL_EXPRESSION_ROUTINE(keyString) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t index) {
    return Borrowed{a.getKeyString(index)};
  });
}
QUORREL_EXPRESSION_ROUTINE(keyValue) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t index) { return a.getKeyValue(index); });
}
QUORREL_EXPRESSION_ROUTINE(dim) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return a.dimensions(); });
}
QUORREL_EXPRESSION_ROUTINE(boundary) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t d) { return a.boundary(d); });
}
QUORREL_EXPRESSION_ROUTINE(boundaryX) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return a.boundary(1); });
}
QUORREL_EXPRESSION_ROUTINE(boundaryY) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return a.boundary(2); });
}
QUORREL_EXPRESSION_ROUTINE(boundaryZ) {
  return runExpression<>(runRecord, parameterToken, [](ElementArray& a) { return a.boundary(3); });
}
QUORREL_EXPRESSION_ROUTINE(dimIndexOfIndex) {
  return runExpression<Int, Int>(
      runRecord, parameterToken,
      [](ElementArray& a, int32_t d, int32_t index) { return a.dimIndexOfIndex(d, index); });
}
QUORREL_EXPRESSION_ROUTINE(xOfIndex) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t index) {
    return a.dimIndexOfIndex(1, index);
  });
}
QUORREL_EXPRESSION_ROUTINE(yOfIndex) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t index) {
    return a.dimIndexOfIndex(2, index);
  });
}
QUORREL_EXPRESSION_ROUTINE(zOfIndex) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t index) {
    return a.dimIndexOfIndex(3, index);
  });
}
QUORREL_EXPRESSION_ROUTINE(indexOfDimIndex) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* list) {
    return a.indexOfDimIndex(list);
  });
}
QUORREL_EXPRESSION_ROUTINE(indexOfXY) {
  return runExpression<Int, Int>(
      runRecord, parameterToken,
      [](ElementArray& a, int32_t x, int32_t y) { return a.indexOfXY(x, y); });
}

}  // namespace quorrel::host::expr
