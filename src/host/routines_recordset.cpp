// Routines of the recordset: rows, columns and labels, selections, row sorts,
// column aggregates, the between column and cell reads.
#include "array/text.h"
#include "host/routines.h"
#include "recordset/aggregates.h"
#include "recordset/row_sort.h"
#include "recordset/selection.h"
#include "recordset/table.h"

namespace quorrel::host {
namespace {

// Label sorts act only on a two-dimensional array.
void sortRowsByLabel(ElementArray& a, const char* label, int32_t kind, bool descending) {
  if (a.dimensions() != 2) return noteTable(a);
  sortRows(a, labelColumn(a, label), kind, descending);
}

// Column sorts act only on a column inside a two-dimensional table.
void sortRowsByColumn(ElementArray& a, int32_t column, int32_t kind, bool descending) {
  noteColumn(a, column);
  sortRows(a, column, kind, descending);
}

// A list longer than the table is wide loses its last fields.
void noteFields(const ElementArray& a, const char* list) {
  if (!notesWanted() || list == nullptr || a.dimensions() != 2) return;
  TokenSplitter fields(list, a.listDelimiter());
  int64_t count = 0;
  while (fields.next()) ++count;
  if (count > numberOfCols(a)) {
    note(NoteKind::FieldsDropped, {noteNumber(count), noteNumber(numberOfCols(a))});
  }
}

// Cell reads test only the element index, not the row or the column.
int32_t cellIndexOf(const ElementArray& a, int32_t row, int32_t column) {
  return cellIndex(a, row, column);
}

// Cell reads: the cell's index must lie inside the array.
int32_t checkedCell(const ElementArray& a, int32_t row, int32_t column) {
  const int32_t index = cellIndexOf(a, row, column);
  noteIndex(a, index);
  return index;
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

// --- Between selections: the column lives in the run record ------------------------
void pickColumnForBetween(Instance in, int32_t column) {
  noteColumn(in.array, column);
  setBetweenColumn(in.runRecord, column);
}
void pickLabelForBetween(Instance in, const char* label) {
  setBetweenColumn(in.runRecord, labelColumn(in.array, label));
}
void selectBetweenValues(Instance in, int32_t low, int32_t high) {
  noteColumn(in.array, betweenColumnOf(in.runRecord));
  quorrel::selectBetweenValues(in.array, betweenColumnOf(in.runRecord), low, high);
}
void selectBetweenStrings(Instance in, const char* low, const char* high) {
  noteColumn(in.array, betweenColumnOf(in.runRecord));
  quorrel::selectBetweenStrings(in.array, betweenColumnOf(in.runRecord), low, high);
}

// --- Rows and labels -----------------------------------------------------------------
void insertRowFromList(Instance in, const char* list, int32_t row) {
  noteVisibleRow(in.array, row, true);
  noteFields(in.array, list);
  quorrel::insertRowFromList(in.array, list, row);
}
void appendRowFromList(Instance in, const char* list) {
  noteTable(in.array);
  noteFields(in.array, list);
  quorrel::appendRowFromList(in.array, list);
}
void replaceRowWithList(Instance in, const char* list, int32_t row) {
  noteVisibleRow(in.array, row);
  noteFields(in.array, list);
  quorrel::replaceRowWithList(in.array, list, row);
}
void deleteRow(Instance in, int32_t row) {
  noteVisibleRow(in.array, row);
  quorrel::deleteRow(in.array, row);
}
void setLabel(Instance in, const char* label, int32_t column) {
  noteColumn(in.array, column);
  quorrel::setLabel(in.array, label, column);
}

// --- Row sorts -----------------------------------------------------------------------
void sortRowsByColumnValueAscending(Instance in, int32_t column) {
  sortRowsByColumn(in.array, column, SortByValue, false);
}
void sortRowsByColumnValueDescending(Instance in, int32_t column) {
  sortRowsByColumn(in.array, column, SortByValue, true);
}
void sortRowsByColumnStringAscending(Instance in, int32_t column) {
  sortRowsByColumn(in.array, column, SortByText, false);
}
void sortRowsByColumnStringDescending(Instance in, int32_t column) {
  sortRowsByColumn(in.array, column, SortByText, true);
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
  noteColumn(in.array, column);
  selectWhereMatching(in.array, column, pattern);
}
void selectWhereContainingByColumn(Instance in, int32_t column, const char* text) {
  noteColumn(in.array, column);
  selectWhereContaining(in.array, column, text);
}
void selectWhereEqualByColumn(Instance in, int32_t column, int32_t number) {
  noteColumn(in.array, column);
  selectWhereEqual(in.array, column, number);
}
void selectWhereNotEqualByColumn(Instance in, int32_t column, int32_t number) {
  noteColumn(in.array, column);
  selectWhereNotEqual(in.array, column, number);
}
void selectWhereGreaterByColumn(Instance in, int32_t column, int32_t number) {
  noteColumn(in.array, column);
  selectWhereGreater(in.array, column, number);
}
void selectWhereGreaterOrEqualByColumn(Instance in, int32_t column, int32_t number) {
  noteColumn(in.array, column);
  selectWhereGreaterOrEqual(in.array, column, number);
}
void selectWhereLessByColumn(Instance in, int32_t column, int32_t number) {
  noteColumn(in.array, column);
  selectWhereLess(in.array, column, number);
}
void selectWhereLessOrEqualByColumn(Instance in, int32_t column, int32_t number) {
  noteColumn(in.array, column);
  selectWhereLessOrEqual(in.array, column, number);
}

// --- Where by label: the label's column, passed on as found (-1 when missing) -------
void selectWhereMatchingByLabel(Instance in, const char* label, const char* pattern) {
  selectWhereMatching(in.array, labelColumn(in.array, label), pattern);
}
void selectWhereContainingByLabel(Instance in, const char* label, const char* text) {
  selectWhereContaining(in.array, labelColumn(in.array, label), text);
}
void selectWhereEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereEqual(in.array, labelColumn(in.array, label), number);
}
void selectWhereNotEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereNotEqual(in.array, labelColumn(in.array, label), number);
}
void selectWhereGreaterByLabel(Instance in, const char* label, int32_t number) {
  selectWhereGreater(in.array, labelColumn(in.array, label), number);
}
void selectWhereGreaterOrEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereGreaterOrEqual(in.array, labelColumn(in.array, label), number);
}
void selectWhereLessByLabel(Instance in, const char* label, int32_t number) {
  selectWhereLess(in.array, labelColumn(in.array, label), number);
}
void selectWhereLessOrEqualByLabel(Instance in, const char* label, int32_t number) {
  selectWhereLessOrEqual(in.array, labelColumn(in.array, label), number);
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
  noteVisibleRow(a, row);
  return quorrel::rowList(a, row);
}
Result columnListText(ElementArray& a, int32_t column) {
  noteColumn(a, column);
  return quorrel::columnList(a, column);
}
Result labelListText(ElementArray& a) {
  noteTable(a);
  return quorrel::labelList(a);
}
Result getLabelText(ElementArray& a, int32_t column) {
  noteColumn(a, column);
  return Borrowed{quorrel::getLabel(a, column)};
}
Result getCol(ElementArray& a, const char* label) {
  noteTable(a);
  return columnOfLabel(a, label);
}
Result delimiterText(ElementArray& a) {
  return Borrowed{listDelimiter(a)};
}

// --- Cell reads ----------------------------------------------------------------------
Result getFromColumnRow(ElementArray& a, int32_t column, int32_t row) {
  noteColumn(a, column);
  const int32_t index = checkedCell(a, row, column);
  noteNumberRead(a, index);
  return a.getValue(index);
}
Result getFromColumnRowText(ElementArray& a, int32_t column, int32_t row) {
  noteColumn(a, column);
  return Borrowed{a.getString(checkedCell(a, row, column))};
}
// An unknown label reads nothing, rather than the cell before the row.
Result getFromLabelRow(ElementArray& a, const char* label, int32_t row) {
  const int32_t column = labelColumn(a, label);
  if (column < 0) return 0;
  const int32_t index = checkedCell(a, row, column);
  noteNumberRead(a, index);
  return a.getValue(index);
}
Result getFromLabelRowText(ElementArray& a, const char* label, int32_t row) {
  const int32_t column = labelColumn(a, label);
  return Borrowed{column < 0 ? nullptr : a.getString(checkedCell(a, row, column))};
}

// --- Column aggregates ---------------------------------------------------------------
Result colMax(ElementArray& a, int32_t column) {
  noteColumn(a, column);
  noteSomeVisibleRow(a);
  return columnMax(a, column);
}
Result colMin(ElementArray& a, int32_t column) {
  noteColumn(a, column);
  noteSomeVisibleRow(a);
  return columnMin(a, column);
}
Result colSum(ElementArray& a, int32_t column) {
  noteColumn(a, column);
  noteSomeVisibleRow(a);
  return columnSum(a, column);
}
Result colAvg(ElementArray& a, int32_t column) {
  noteColumn(a, column);
  noteSomeVisibleRow(a);
  return columnAverage(a, column);
}
Result labMax(ElementArray& a, const char* label) {
  const int32_t column = labelColumn(a, label);
  noteSomeVisibleRow(a);
  return columnMax(a, column);
}
Result labMin(ElementArray& a, const char* label) {
  const int32_t column = labelColumn(a, label);
  noteSomeVisibleRow(a);
  return columnMin(a, column);
}
Result labSum(ElementArray& a, const char* label) {
  const int32_t column = labelColumn(a, label);
  noteSomeVisibleRow(a);
  return columnSum(a, column);
}
Result labAvg(ElementArray& a, const char* label) {
  const int32_t column = labelColumn(a, label);
  noteSomeVisibleRow(a);
  return columnAverage(a, column);
}

}  // namespace quorrel::host::expr
