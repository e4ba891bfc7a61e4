// Notes: why a call did nothing, or not what it seems. The host interface has no way to
// report a mistake, so a call on a bad index, an unknown label or an unreadable file
// quietly does nothing or answers 0; a note says so to whoever listens (the quorrel
// command, the checked DLL's log). The kinds are listed once, in notes.inc.
//
// Notes exist only in a build with QUORREL_NOTES: elsewhere notesWanted() is a constant
// false, so every report below it compiles away and the module behaves as it always did.
// Even with notes built in, nothing is formatted unless a sink is set.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <string>
#include <string_view>

#include "array/int32.h"

namespace quorrel {

enum class NoteKind : uint8_t {
#define NOTE(kind, id, message) kind,
#include "array/notes.inc"
#undef NOTE
};

inline constexpr int kNoteKindCount = 0
#define NOTE(kind, id, message) +1
#include "array/notes.inc"
#undef NOTE
    ;

// The stable id ("label-unknown") and the message with its {} places.
const char* noteId(NoteKind kind);
const char* noteMessage(NoteKind kind);
// The message with each {} replaced by the next value.
std::string formatNote(NoteKind kind, std::initializer_list<std::string_view> values);

// Where notes go: one function and its context, called on the host's thread.
struct NoteSink {
  void (*report)(void* context, NoteKind kind, const std::string& message) = nullptr;
  void* context = nullptr;
};

// Reports a note with its values. Callers test notesWanted() first, so that building
// the values costs nothing when no one listens.
#ifdef QUORREL_NOTES
inline constexpr bool kNotesBuilt = true;
inline NoteSink gNoteSink;
inline bool notesWanted() {
  return gNoteSink.report != nullptr;
}
inline void note(NoteKind kind, std::initializer_list<std::string_view> values) {
  if (notesWanted()) gNoteSink.report(gNoteSink.context, kind, formatNote(kind, values));
}
#else
inline constexpr bool kNotesBuilt = false;
constexpr bool notesWanted() {
  return false;
}
inline void note(NoteKind, std::initializer_list<std::string_view>) {}
#endif

// Values as notes show them: a number in decimal, a text in double quotes with the
// bytes that do not print as \xHH.
std::string noteNumber(int64_t number);
std::string noteText(std::string_view text);

// A total taken in 64 bits that the 32-bit answer wrapped.
inline void noteTotal(int64_t total) {
  if (notesWanted() && total != wrap(total)) {
    note(NoteKind::TotalWrapped, {noteNumber(total), noteNumber(wrap(total))});
  }
}

}  // namespace quorrel
