// Routines of the recordset: rows, columns and labels, selections, row sorts,
// column aggregates, the between column and cell reads.
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
void pickColumnForBetween(Instance in, int32_t column) {
  setBetweenColumn(in.runRecord, column);
}
void pickLabelForBetween(Instance in, const char* label) {
  setBetweenColumn(in.runRecord, columnOfLabel(in.array, label));
}
void selectBetweenValues(Instance in, int32_t low, int32_t high) {
  quorrel::selectBetweenValues(in.array, betweenColumnOf(in.runRecord), low, high);
}
void selectBetweenStrings(Instance in, const char* low, const char* high) {
  quorrel::selectBetweenStrings(in.array, betweenColumnOf(in.runRecord), low, high);
}

// --- Rows and labels -----------------------------------------------------------------
void insertRowFromList(Instance in, const char* list, int32_t row) {
  quorrel::insertRowFromList(in.array, list, row);
}
void appendRowFromList(Instance in, const char* list) {
  quorrel::appendRowFromList(in.array, list);
}
void replaceRowWithList(Instance in, const char* list, int32_t row) {
  quorrel::replaceRowWithList(in.array, list, row);
}
void deleteRow(Instance in, int32_t row) {
  quorrel::deleteRow(in.array, row);
}
void setLabel(Instance in, const char* label, int32_t column) {
  quorrel::setLabel(in.array, label, column);
}

// --- Row sorts -----------------------------------------------------------------------
void sortRowsByColumnValueAscending(Instance in, int32_t column) {
  sortRows(in.array, column, SortByValue, false);
}
void sortRowsByColumnValueDescending(Instance in, int32_t column) {
  sortRows(in.array, column, SortByValue, true);
}
void sortRowsByColumnStringAscending(Instance in, int32_t column) {
  sortRows(in.array, column, SortByText, false);
}
void sortRowsByColumnStringDescending(Instance in, int32_t column) {
  sortRows(in.array, column, SortByText, true);
}
void sortRowsByLabelValueAscending(Instance in, const char* label) {
  sortRowsByLabel(in.array, label, SortByValue, false);
}
void sortRowsByLabelValueDescending(Instance in, const char* label) {
  sortRowsByLabel(in.array, label, SortByValue, true);
}
void sortRowsByLabelStringAscending(Instance in, const char* label) {
  sortRowsByLabel(in.array, label, SortByText, false);
}
void sortRowsByLabelStringDescending(Instance in, const char* label) {
  sortRowsByLabel(in.array, label, SortByText, true);
}

// --- Selection modes and whole-selection edits ---------------------------------------
void selectionModeAnd(Instance in) {
  in.array.settings.selectionMode = SelectAnd;
}
void selectionModeOr(Instance in) {
  in.array.settings.selectionMode = SelectOr;
}
void selectAllRows(Instance in) {
  quorrel::selectAllRows(in.array);
}
void invertSelection(Instance in) {
  quorrel::invertSelection(in.array);
}
void startNewWhere(Instance in) {
  quorrel::startNewWhere(in.array);
}

// --- Where by column -----------------------------------------------------------------
void selectWhereMatchingByColumn(Instance in, int32_t column, const char* pattern) {
  selectWhereMatching(in.array, column, pattern);
}
void selectWhereContainingByColumn(Instance in, int32_t column, const char* text) {
  selectWhereContaining(in.array, column, text);
}
void selectWhereEqualByColumn(Instance in, int32_t column, int32_t number) {
  selectWhereEqual(in.array, column, number);
}
void selectWhereNotEqualByColumn(Instance in, int32_t column, int32_t number) {
  selectWhereNotEqual(in.array, column, number);
}
void selectWhereGreaterByColumn(Instance in, int32_t column, int32_t number) {
  selectWhereGreater(in.array, column, number);
}
void selectWhereGreaterOrEqualByColumn(Instance in, int32_t column, int32_t number) {
  selectWhereGreaterOrEqual(in.array, column, number);
}
void selectWhereLessByColumn(Instance in, int32_t column, int32_t number) {
  selectWhereLess(in.array, column, number);
}
void selectWhereLessOrEqualByColumn(Instance in, int32_t column, int32_t number) {
  selectWhereLessOrEqual(in.array, column, number);
}

// --- Where by label: the label's column, passed on as found (-1 when missing) -------
void selectWhereMatchingByLabel(Instance in, const char* label, const char* pattern) {
  selectWhereMatching(in.array, columnOfLabel(in.array, label), pattern);
}
void selectWhereContainingByLabel(Instance in, const char* label, const char* text) {
  selectWhereContaining(in.array, columnOfLabel(in.array, label), text);
}
void selectWhereEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereEqual(in.array, columnOfLabel(in.array, label), number);
}
void selectWhereNotEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereNotEqual(in.array, columnOfLabel(in.array, label), number);
}
void selectWhereGreaterByLabel(Instance in, const char* label, int32_t number) {
  selectWhereGreater(in.array, columnOfLabel(in.array, label), number);
}
void selectWhereGreaterOrEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereGreaterOrEqual(in.array, columnOfLabel(in.array, label), number);
}
void selectWhereLessByLabel(Instance in, const char* label, int32_t number) {
  selectWhereLess(in.array, columnOfLabel(in.array, label), number);
}
void selectWhereLessOrEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereLessOrEqual(in.array, columnOfLabel(in.array, label), number);
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {

Result numberOfRows(ElementArray& a) {
  return quorrel::numberOfRows(a);
}
Result numberOfCols(ElementArray& a) {
  return quorrel::numberOfCols(a);
}
Result rowListText(ElementArray& a, int32_t row) {
  return quorrel::rowList(a, row);
}
Result columnListText(ElementArray& a, int32_t column) {
  return quorrel::columnList(a, column);
}
Result labelListText(ElementArray& a) {
  return quorrel::labelList(a);
}
Result getLabelText(ElementArray& a, int32_t column) {
  return Borrowed{quorrel::getLabel(a, column)};
}
Result getCol(ElementArray& a, const char* label) {
  return columnOfLabel(a, label);
}
Result delimiterText(ElementArray& a) {
  return Borrowed{listDelimiter(a)};
}

// --- Cell reads ----------------------------------------------------------------------
Result getFromColumnRow(ElementArray& a, int32_t column, int32_t row) {
  return a.getValue(cellIndexOf(a, row, column));
}
Result getFromColumnRowText(ElementArray& a, int32_t column, int32_t row) {
  return Borrowed{a.getString(cellIndexOf(a, row, column))};
}
// An unknown label reads nothing, rather than the cell before the row.
Result getFromLabelRow(ElementArray& a, const char* label, int32_t row) {
  const int32_t column = columnOfLabel(a, label);
  if (column < 0) return 0;
  return a.getValue(cellIndexOf(a, row, column));
}
Result getFromLabelRowText(ElementArray& a, const char* label, int32_t row) {
  const int32_t column = columnOfLabel(a, label);
  return Borrowed{column < 0 ? nullptr : a.getString(cellIndexOf(a, row, column))};
}

// --- Column aggregates ---------------------------------------------------------------
Result colMax(ElementArray& a, int32_t column) {
  return columnMax(a, column);
}
Result colMin(ElementArray& a, int32_t column) {
  return columnMin(a, column);
}
Result colSum(ElementArray& a, int32_t column) {
  return columnSum(a, column);
}
Result colAvg(ElementArray& a, int32_t column) {
  return columnAverage(a, column);
}
Result labMax(ElementArray& a, const char* label) {
  return columnMax(a, columnOfLabel(a, label));
}
Result labMin(ElementArray& a, const char* label) {
  return columnMin(a, columnOfLabel(a, label));
}
Result labSum(ElementArray& a, const char* label) {
  return columnSum(a, columnOfLabel(a, label));
}
Result labAvg(ElementArray& a, const char* label) {
  return columnAverage(a, columnOfLabel(a, label));
}

}  // namespace quorrel::host::expr
