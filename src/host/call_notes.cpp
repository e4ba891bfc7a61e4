#include "host/call_notes.h"

#include <algorithm>
#include <cstring>
#include <string>
#include <utility>
#include <vector>

#include "array/text.h"
#include "host/abi.h"
#include "recordset/table.h"

namespace quorrel::host {
namespace {

constexpr const char* kActionNames[] = {
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2) #name,
#include "host/table.inc"
};
// Expression names as people call them in prose: labSum, not labSum(.
constexpr const char* kExpressionRoutineNames[] = {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) name,
#include "host/table.inc"
};

struct RunningCall {
  std::string name;
  const void* runRecord = nullptr;
  std::size_t rowsBefore = 0;
};
RunningCall gCall;

// Run records of the live instances, by their number (position + 1); a destroyed
// instance's number is not given again.
std::vector<const void*> gObjects;

std::string nameOfCall(bool action, int32_t code) {
  if (action) return code >= 0 && code < abi::kActionCount ? kActionNames[code] : "action";
  std::string name = code >= 0 && code < abi::kExpressionCount ? kExpressionRoutineNames[code] : "";
  if (name.ends_with('(')) name.pop_back();
  return name;
}

std::string labelNames(const ElementArray& a) {
  if (!a.labels || a.labels->empty()) return "none";
  std::string names;
  for (const auto& label : *a.labels) {
    if (!names.empty()) names += ", ";
    names += label ? *label : "-";
  }
  return names;
}

// The rows the call added, as new row states, that are not selected.
void noteRowsAdded(const ElementArray& a) {
  const std::vector<uint8_t>& states = a.rowStates;
  const auto first =
      states.begin() + static_cast<std::ptrdiff_t>(std::min(gCall.rowsBefore, states.size()));
  const auto added = std::count_if(first, states.end(), [](uint8_t s) { return s != RowSelected; });
  if (added > 0) {
    note(NoteKind::RowsNotSelected, {noteNumber(added), noteNumber(numberOfRows(a)),
                                     noteNumber(static_cast<int64_t>(states.size()))});
  }
}

}  // namespace

// A scope lives outside the routines' guards (an expression's, a destructor): a note
// that cannot be made for want of memory is dropped rather than let out.
void CallScope::begin(bool action, int32_t code, const void* runRecord,
                      const ElementArray* array) noexcept {
  try {
    gCall = {nameOfCall(action, code), runRecord, array ? array->rowStates.size() : 0};
    active_ = true;
    array_ = array;
  } catch (...) {
  }
}

void CallScope::end() noexcept {
  try {
    if (array_ != nullptr && notesWanted() && !array_->settings.autoSelectNewRows) {
      noteRowsAdded(*array_);
    }
  } catch (...) {
  }
  gCall = {};
}

void rowsReplaced() {
  gCall.rowsBefore = 0;
}

const char* currentCallName() {
  return gCall.name.c_str();
}

int currentObject() {
  const auto found = std::find(gObjects.begin(), gObjects.end(), gCall.runRecord);
  return found == gObjects.end() ? 0 : static_cast<int>(found - gObjects.begin()) + 1;
}

void objectCreated(const void* runRecord) {
  if constexpr (kNotesBuilt) gObjects.push_back(runRecord);
}

void objectDestroyed(const void* runRecord) {
  if constexpr (kNotesBuilt)
    std::replace(gObjects.begin(), gObjects.end(), runRecord, static_cast<const void*>(nullptr));
}

// --- Checks ----------------------------------------------------------------------------

void reportIndex(const ElementArray& a, int32_t index) {
  note(NoteKind::IndexOutside, {noteNumber(index), noteNumber(a.size())});
}

void reportNotTable(const ElementArray& a) {
  note(NoteKind::NotTable, {noteNumber(a.dimensions())});
}

void reportColumn(const ElementArray& a, int32_t column) {
  if (a.dimensions() != 2) return reportNotTable(a);
  if (column < 0 || column >= numberOfCols(a)) {
    note(NoteKind::ColumnOutside, {noteNumber(column), noteNumber(numberOfCols(a))});
  }
}

void reportVisibleRow(const ElementArray& a, int32_t row, bool endAllowed) {
  if (a.dimensions() != 2) return reportNotTable(a);
  const int32_t visible = numberOfRows(a);
  if (row < 0 || row > visible || (row == visible && !endAllowed)) {
    note(NoteKind::RowOutside, {noteNumber(row), noteNumber(visible)});
  }
}

void reportNoVisibleRow(const ElementArray& a) {
  if (numberOfRows(a) == 0) {
    note(NoteKind::NoVisibleRow, {noteNumber(static_cast<int64_t>(a.rowStates.size()))});
  }
}

void reportNumber(const Element& element, int32_t value) {
  if (element.type() != ElementType::String) return;
  NumberText scratch;
  const char* text = element.asString(scratch);
  if (*text != '\0' && !isWholeDecimal(text)) {
    note(NoteKind::NotWhollyNumber, {noteText(text), noteNumber(value)});
  }
}

void reportFile(const char* path, FileStatus status) {
  if (!notesWanted() || status.ok()) return;
  std::string what = failedStepWords(status.failed);
  if (status.error != 0) what += std::string(" (") + std::strerror(status.error) + ')';
  note(NoteKind::FileFailed, {noteText(path ? path : ""), what});
}

int32_t labelColumn(const ElementArray& a, const char* label) {
  const int32_t column = columnOfLabel(a, label);
  if (column < 0 && notesWanted()) {
    if (a.dimensions() != 2) {
      reportNotTable(a);
    } else {
      note(NoteKind::LabelUnknown, {noteText(label ? label : ""), labelNames(a)});
    }
  }
  return column;
}

// --- Where notes go ----------------------------------------------------------------------

#ifdef QUORREL_NOTES
namespace {
abi::NoteListenerFn gListener = nullptr;
void* gListenerContext = nullptr;

void deliver(void*, NoteKind kind, const std::string& message) {
  if (gListener) gListener(gListenerContext, noteId(kind), currentCallName(), message.c_str());
  if (noteLogWanted()) writeNoteToLog(kind, message);
}

void updateSink() {
  gNoteSink = gListener || noteLogWanted() ? NoteSink{&deliver, nullptr} : NoteSink{};
}

// The log, where there is one, hears every note from the moment the module is loaded.
[[maybe_unused]] const bool kLogListens = (updateSink(), true);
}  // namespace

void listenToNotes(abi::NoteListenerFn listener, void* context) {
  gListener = listener;
  gListenerContext = context;
  updateSink();
}
#endif

}  // namespace quorrel::host
