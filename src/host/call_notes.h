// The host side of notes: which action or expression a note comes from, the checks a
// routine makes on its arguments before it runs, and where notes go. With notes not
// built in (the release DLL) every check here compiles to nothing.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "array/element_array.h"
#include "array/notes.h"
#include "host/abi.h"
#include "platform/files.h"

namespace quorrel::host {

// A note's receiver outside the module (QuorrelListenNotes).
void listenToNotes(abi::NoteListenerFn listener, void* context);
// The log (note_log.cpp): whether there is one, and a note for it.
bool noteLogWanted();
void writeNoteToLog(NoteKind kind, const std::string& message);

// The call whose notes are being reported, for as long as it runs. An action also
// notes the rows it added that are not selected.
class CallScope {
 public:
  CallScope(bool action, int32_t code, const void* runRecord, const ElementArray* array) {
    if (notesWanted()) begin(action, code, runRecord, array);
  }
  ~CallScope() {
    if (active_) end();
  }
  CallScope(const CallScope&) = delete;
  CallScope& operator=(const CallScope&) = delete;

 private:
  void begin(bool action, int32_t code, const void* runRecord, const ElementArray* array) noexcept;
  void end() noexcept;
  bool active_ = false;
  const ElementArray* array_ = nullptr;
};

// An action that replaced the whole array: every row it leaves is a new one.
void rowsReplaced();

// The name of the running call (appendString, labSum) and the number of its object;
// empty and 0 between calls.
const char* currentCallName();
int currentObject();

// Instances are named in notes by their order of creation ("object 2").
void objectCreated(const void* runRecord);
void objectDestroyed(const void* runRecord);

// --- Checks on a routine's arguments: each reports only when someone listens ---------
void reportIndex(const ElementArray& a, int32_t index);
void reportColumn(const ElementArray& a, int32_t column);
void reportVisibleRow(const ElementArray& a, int32_t row, bool endAllowed);
void reportNotTable(const ElementArray& a);
void reportNoVisibleRow(const ElementArray& a);
void reportNumber(const Element& element, int32_t value);
void reportFile(const char* path, FileStatus status);

// An element index that must lie inside the array.
inline void noteIndex(const ElementArray& a, int32_t index) {
  if (notesWanted() && !a.inRange(index)) reportIndex(a, index);
}
// An index that may grow the array but not be negative.
inline void noteNegativeIndex(const ElementArray& a, int32_t index) {
  if (notesWanted() && index < 0) reportIndex(a, index);
}
// The array is a table.
inline void noteTable(const ElementArray& a) {
  if (notesWanted() && a.dimensions() != 2) reportNotTable(a);
}
// A column inside the table (or that the array is no table at all).
inline void noteColumn(const ElementArray& a, int32_t column) {
  if (notesWanted()) reportColumn(a, column);
}
// A visible row; with endAllowed, the row just past the visible ones too.
inline void noteVisibleRow(const ElementArray& a, int32_t row, bool endAllowed = false) {
  if (notesWanted()) reportVisibleRow(a, row, endAllowed);
}
// At least one visible row, for answers folded over them.
inline void noteSomeVisibleRow(const ElementArray& a) {
  if (notesWanted()) reportNoVisibleRow(a);
}
// An element read as a number.
inline void noteNumberRead(const ElementArray& a, int32_t index) {
  if (notesWanted() && a.inRange(index)) reportNumber(a.at(index), a.at(index).asValue());
}

// The column of a label, noting an unknown label (or that the array is no table).
int32_t labelColumn(const ElementArray& a, const char* label);

}  // namespace quorrel::host
