// Routines of the element edits, settings and dimensions: each forwards to one
// operation of the array or writes one setting.
#include "host/routines.h"

namespace quorrel::host {
namespace {

// A boundary below 1, or a dimension that is not bounded, changes nothing.
void noteBoundary(const ElementArray& a, int32_t dimension, int32_t boundary) {
  if (notesWanted() && (boundary < 1 || dimension < 0 || dimension >= a.dimensions())) {
    note(NoteKind::SettingRefused,
         {"boundary " + noteNumber(boundary) + " of dimension " + noteNumber(dimension),
          "a boundary is at least 1, of dimension 0 to " + noteNumber(a.dimensions() - 1)});
  }
}

}  // namespace
}  // namespace quorrel::host

namespace quorrel::host::act {

void insertStringAt(Instance in, const char* text, int32_t index) {
  noteNegativeIndex(in.array, index);
  in.array.insertString(text, index);
}
void insertValueAt(Instance in, int32_t number, int32_t index) {
  noteNegativeIndex(in.array, index);
  in.array.insertValue(number, index);
}
void appendString(Instance in, const char* text) {
  in.array.appendString(text);
}
void appendValue(Instance in, int32_t number) {
  in.array.appendValue(number);
}
void setStringAt(Instance in, const char* text, int32_t index) {
  noteNegativeIndex(in.array, index);
  in.array.setString(text, index);
}
void setValueAt(Instance in, int32_t number, int32_t index) {
  noteNegativeIndex(in.array, index);
  in.array.setValue(number, index);
}
void deleteAt(Instance in, int32_t index) {
  noteIndex(in.array, index);
  in.array.deleteAt(index);
}
void deleteAll(Instance in) {
  in.array.clear();
}
void setKeyStringAt(Instance in, const char* key, int32_t index) {
  noteIndex(in.array, index);
  in.array.setKeyString(key, index);
}
void setKeyValueAt(Instance in, int32_t key, int32_t index) {
  noteIndex(in.array, index);
  in.array.setKeyValue(key, index);
}
void setArrayDimension(Instance in, int32_t dimension) {
  if (notesWanted() && dimension >= ElementArray::kBoundaryCount) {
    note(NoteKind::SettingRefused,
         {"a count of " + noteNumber(dimension) + " dimensions", "at most 9"});
  }
  in.array.setDimensions(dimension);
}
void use2D(Instance in) {
  in.array.setDimensions(2);
}
void use3D(Instance in) {
  in.array.setDimensions(3);
}
void setDimensionBoundary(Instance in, int32_t dimension, int32_t boundary) {
  noteBoundary(in.array, dimension, boundary);
  in.array.setBoundary(dimension, boundary);
}
void resizeDimensionBoundary(Instance in, int32_t dimension, int32_t boundary) {
  noteBoundary(in.array, dimension, boundary);
  in.array.resizeBoundary(dimension, boundary);
}
void caseInsensitive(Instance in) {
  in.array.settings.caseMode = CaseInsensitive;
}
void caseSensitive(Instance in) {
  in.array.settings.caseMode = CaseSensitive;
}
void literalSearch(Instance in) {
  in.array.settings.searchMode = SearchLiteral;
}
void wildcardSearch(Instance in) {
  in.array.settings.searchMode = SearchWildcard;
}
void setListDelimiter(Instance in, const char* delimiter) {
  in.array.setListDelimiter(delimiter);
}

}  // namespace quorrel::host::act

namespace quorrel::host::expr {

Result size(ElementArray& a) {
  return a.size();
}
Result capacity(ElementArray& a) {
  return a.capacity();
}
Result getText(ElementArray& a, int32_t index) {
  noteIndex(a, index);
  return Borrowed{a.getString(index)};
}
Result get(ElementArray& a, int32_t index) {
  noteIndex(a, index);
  noteNumberRead(a, index);
  return a.getValue(index);
}
Result keyText(ElementArray& a, int32_t index) {
  noteIndex(a, index);
  return Borrowed{a.getKeyString(index)};
}
Result key(ElementArray& a, int32_t index) {
  noteIndex(a, index);
  return a.getKeyValue(index);
}
Result dim(ElementArray& a) {
  return a.dimensions();
}
Result boundary(ElementArray& a, int32_t d) {
  return a.boundary(d);
}
Result boundaryX(ElementArray& a) {
  return a.boundary(1);
}
Result boundaryY(ElementArray& a) {
  return a.boundary(2);
}
Result boundaryZ(ElementArray& a) {
  return a.boundary(3);
}
Result dimIndexOfIndexText(ElementArray& a, int32_t d, int32_t index) {
  return a.dimIndexOfIndex(d, index);
}
Result XOfIndex(ElementArray& a, int32_t index) {
  return a.dimIndexOfIndex(1, index);
}
Result YOfIndex(ElementArray& a, int32_t index) {
  return a.dimIndexOfIndex(2, index);
}
Result ZOfIndex(ElementArray& a, int32_t index) {
  return a.dimIndexOfIndex(3, index);
}
Result indexOfDimIndex(ElementArray& a, const char* list) {
  return a.indexOfDimIndex(list);
}
Result indexOfXY(ElementArray& a, int32_t x, int32_t y) {
  return a.indexOfXY(x, y);
}

}  // namespace quorrel::host::expr
