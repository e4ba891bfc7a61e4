// Routines of the recordset: rows, columns and labels, selections, row sorts,
// column aggregates, the between column and cell reads.
#include "host/routine_support.h"
#include "host/routines.h"
#include "recordset/aggregates.h"
#include "recordset/row_sort.h"
#include "recordset/selection.h"
#include "recordset/table.h"

namespace quorrel::host {
namespace {

// Label sorts act only on a two-dimensional array.
void sortRowsByLabel(ElementArray& a, const char* label, int32_t kind, bool descending) {
  if (a.dimensions() != 2) return;
  sortRows(a, columnOfLabel(a, label), kind, descending);
}

// Cell reads test only the element index, not the row or the column.
int32_t cellIndexOf(const ElementArray& a, int32_t row, int32_t column) {
  return cellIndex(a, row, column);
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

// --- Between selections: the column lives in the run record ------------------------
QUORREL_ACTION_ROUTINE(pickColumnForBetween) {
  return runAction(runRecord,
                   [&](ElementArray&) { setBetweenColumn(runRecord, numberParam(param1)); });
}
QUORREL_ACTION_ROUTINE(pickLabelForBetween) {
  return runAction(runRecord, [&](ElementArray& a) {
    setBetweenColumn(runRecord, columnOfLabel(a, textParam(param1)));
  });
}
QUORREL_ACTION_ROUTINE(selectRowsBetweenValues) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectBetweenValues(a, betweenColumnOf(runRecord), numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectRowsBetweenStrings) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectBetweenStrings(a, betweenColumnOf(runRecord), textParam(param1), textParam(param2));
  });
}

// --- Rows and labels -----------------------------------------------------------------
QUORREL_ACTION_ROUTINE(insertRowFromList) {
  return runAction(runRecord, [&](ElementArray& a) {
    quorrel::insertRowFromList(a, textParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(appendRowFromList) {
  return runAction(runRecord,
                   [&](ElementArray& a) { quorrel::appendRowFromList(a, textParam(param1)); });
}
QUORREL_ACTION_ROUTINE(replaceRowWithList) {
  return runAction(runRecord, [&](ElementArray& a) {
    quorrel::replaceRowWithList(a, textParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(deleteRow) {
  return runAction(runRecord, [&](ElementArray& a) { quorrel::deleteRow(a, numberParam(param1)); });
}
QUORREL_ACTION_ROUTINE(setLabel) {
  return runAction(runRecord, [&](ElementArray& a) {
    quorrel::setLabel(a, textParam(param1), numberParam(param2));
  });
}

// --- Row sorts -----------------------------------------------------------------------
QUORREL_ACTION_ROUTINE(sortRowsByColumnValueAscending) {
  return runAction(runRecord,
                   [&](ElementArray& a) { sortRows(a, numberParam(param1), SortByValue, false); });
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnValueDescending) {
  return runAction(runRecord,
                   [&](ElementArray& a) { sortRows(a, numberParam(param1), SortByValue, true); });
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnStringAscending) {
  return runAction(runRecord,
                   [&](ElementArray& a) { sortRows(a, numberParam(param1), SortByText, false); });
}
QUORREL_ACTION_ROUTINE(sortRowsByColumnStringDescending) {
  return runAction(runRecord,
                   [&](ElementArray& a) { sortRows(a, numberParam(param1), SortByText, true); });
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelValueAscending) {
  return runAction(runRecord, [&](ElementArray& a) {
    sortRowsByLabel(a, textParam(param1), SortByValue, false);
  });
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelValueDescending) {
  return runAction(runRecord, [&](ElementArray& a) {
    sortRowsByLabel(a, textParam(param1), SortByValue, true);
  });
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelStringAscending) {
  return runAction(runRecord, [&](ElementArray& a) {
    sortRowsByLabel(a, textParam(param1), SortByText, false);
  });
}
QUORREL_ACTION_ROUTINE(sortRowsByLabelStringDescending) {
  return runAction(
      runRecord, [&](ElementArray& a) { sortRowsByLabel(a, textParam(param1), SortByText, true); });
}

// --- Selection modes and whole-selection edits ---------------------------------------
QUORREL_ACTION_ROUTINE(andMode) {
  return runAction(runRecord, [](ElementArray& a) { a.settings.selectionMode = SelectAnd; });
}
QUORREL_ACTION_ROUTINE(orMode) {
  return runAction(runRecord, [](ElementArray& a) { a.settings.selectionMode = SelectOr; });
}
QUORREL_ACTION_ROUTINE(selectAllRows) {
  return runAction(runRecord, [](ElementArray& a) { quorrel::selectAllRows(a); });
}
QUORREL_ACTION_ROUTINE(invertSelection) {
  return runAction(runRecord, [](ElementArray& a) { quorrel::invertSelection(a); });
}
QUORREL_ACTION_ROUTINE(startNewWhere) {
  return runAction(runRecord, [](ElementArray& a) { quorrel::startNewWhere(a); });
}

// --- Where by column -----------------------------------------------------------------
QUORREL_ACTION_ROUTINE(selectColumnMatching) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereMatching(a, numberParam(param1), textParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnContaining) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereContaining(a, numberParam(param1), textParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereEqual(a, numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnNotEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereNotEqual(a, numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnGreater) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereGreater(a, numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnGreaterOrEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereGreaterOrEqual(a, numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnLess) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereLess(a, numberParam(param1), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectColumnLessOrEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereLessOrEqual(a, numberParam(param1), numberParam(param2));
  });
}

// --- Where by label: the label's column, passed on as found (-1 when missing) -------
QUORREL_ACTION_ROUTINE(selectLabelMatching) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereMatching(a, columnOfLabel(a, textParam(param1)), textParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelContaining) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereContaining(a, columnOfLabel(a, textParam(param1)), textParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereEqual(a, columnOfLabel(a, textParam(param1)), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelNotEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereNotEqual(a, columnOfLabel(a, textParam(param1)), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelGreater) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereGreater(a, columnOfLabel(a, textParam(param1)), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelGreaterOrEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereGreaterOrEqual(a, columnOfLabel(a, textParam(param1)), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelLess) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereLess(a, columnOfLabel(a, textParam(param1)), numberParam(param2));
  });
}
QUORREL_ACTION_ROUTINE(selectLabelLessOrEqual) {
  return runAction(runRecord, [&](ElementArray& a) {
    selectWhereLessOrEqual(a, columnOfLabel(a, textParam(param1)), numberParam(param2));
  });
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {

QUORREL_EXPRESSION_ROUTINE(numberOfRows) {
  return runExpression<>(runRecord, parameterToken,
                         [](ElementArray& a) { return quorrel::numberOfRows(a); });
}
QUORREL_EXPRESSION_ROUTINE(numberOfCols) {
  return runExpression<>(runRecord, parameterToken,
                         [](ElementArray& a) { return quorrel::numberOfCols(a); });
}
QUORREL_EXPRESSION_ROUTINE(rowList) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t row) { return quorrel::rowList(a, row); });
}
QUORREL_EXPRESSION_ROUTINE(columnList) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t column) {
    return quorrel::columnList(a, column);
  });
}
QUORREL_EXPRESSION_ROUTINE(labelList) {
  return runExpression<>(runRecord, parameterToken,
                         [](ElementArray& a) { return quorrel::labelList(a); });
}
QUORREL_EXPRESSION_ROUTINE(getLabel) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t column) {
    return Borrowed{quorrel::getLabel(a, column)};
  });
}
QUORREL_EXPRESSION_ROUTINE(getCol) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* label) {
    return columnOfLabel(a, label);
  });
}
QUORREL_EXPRESSION_ROUTINE(delimiter) {
  return runExpression<>(runRecord, parameterToken,
                         [](ElementArray& a) { return Borrowed{listDelimiter(a)}; });
}

// --- Cell reads ----------------------------------------------------------------------
QUORREL_EXPRESSION_ROUTINE(getFromColumnRow) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray& a, int32_t column, int32_t row) {
                                   return a.getValue(cellIndexOf(a, row, column));
                                 });
}
QUORREL_EXPRESSION_ROUTINE(getStringFromColumnRow) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray& a, int32_t column, int32_t row) {
                                   return Borrowed{a.getString(cellIndexOf(a, row, column))};
                                 });
}
// An unknown label reads nothing, rather than the cell before the row.
QUORREL_EXPRESSION_ROUTINE(getFromLabelRow) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray& a, const char* label, int32_t row) {
                                    const int32_t column = columnOfLabel(a, label);
                                    if (column < 0) return 0;
                                    return a.getValue(cellIndexOf(a, row, column));
                                  });
}
QUORREL_EXPRESSION_ROUTINE(getStringFromLabelRow) {
  return runExpression<Text, Int>(
      runRecord, parameterToken, [](ElementArray& a, const char* label, int32_t row) {
        const int32_t column = columnOfLabel(a, label);
        return Borrowed{column < 0 ? nullptr : a.getString(cellIndexOf(a, row, column))};
      });
}

// --- Column aggregates ---------------------------------------------------------------
QUORREL_EXPRESSION_ROUTINE(colMax) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t column) { return columnMax(a, column); });
}
QUORREL_EXPRESSION_ROUTINE(colMin) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t column) { return columnMin(a, column); });
}
QUORREL_EXPRESSION_ROUTINE(colSum) {
  return runExpression<Int>(runRecord, parameterToken,
                            [](ElementArray& a, int32_t column) { return columnSum(a, column); });
}
QUORREL_EXPRESSION_ROUTINE(colAvg) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t column) {
    return columnAverage(a, column);
  });
}
QUORREL_EXPRESSION_ROUTINE(labMax) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* label) {
    return columnMax(a, columnOfLabel(a, label));
  });
}
QUORREL_EXPRESSION_ROUTINE(labMin) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* label) {
    return columnMin(a, columnOfLabel(a, label));
  });
}
QUORREL_EXPRESSION_ROUTINE(labSum) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* label) {
    return columnSum(a, columnOfLabel(a, label));
  });
}
QUORREL_EXPRESSION_ROUTINE(labAvg) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* label) {
    return columnAverage(a, columnOfLabel(a, label));
  });
}

}  // namespace quorrel::host::expr
