#include "array/notes.h"

namespace quorrel {
namespace {

struct NoteRow {
  const char* id;
  const char* message;
};
constexpr NoteRow kNoteRows[] = {
#define NOTE(kind, id, message) {id, message},
#include "array/notes.inc"
#undef NOTE
};

const NoteRow& rowOf(NoteKind kind) {
  return kNoteRows[static_cast<std::size_t>(kind)];
}

}  // namespace

const char* noteId(NoteKind kind) {
  return rowOf(kind).id;
}

const char* noteMessage(NoteKind kind) {
  return rowOf(kind).message;
}

std::string formatNote(NoteKind kind, std::initializer_list<std::string_view> values) {
  const std::string_view message = noteMessage(kind);
  std::string out;
  const std::string_view* value = values.begin();
  for (std::size_t i = 0; i < message.size(); ++i) {
    if (message.substr(i, 2) == "{}" && value != values.end()) {
      out += *value++;
      ++i;
    } else {
      out += message[i];
    }
  }
  return out;
}

std::string noteNumber(int64_t number) {
  return std::to_string(number);
}

std::string noteText(std::string_view text) {
  static constexpr char kHex[] = "0123456789abcdef";
  std::string out = "\"";
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (c == '"' || c == '\\') {
      out += '\\';
      out += c;
    } else if (byte >= 0x20 && byte <= 0x7E) {
      out += c;
    } else {
      out += "\\x";
      out += kHex[byte >> 4];
      out += kHex[byte & 15];
    }
  }
  return out + '"';
}

}  // namespace quorrel
