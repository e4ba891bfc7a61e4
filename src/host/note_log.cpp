// The notes' log: where the checked DLL writes while a game runs, and the Linux module
// too when QUORREL_NOTES_LOG names a file. Each line names the object and the call. A
// bad call in a loop that runs every frame must not fill a disk: a note is written the
// first time, then only as a count when its count reaches 10, 100, 1000 and so on, and
// once more with its total when the module is unloaded; and the log stops for good
// after kMaxLines lines.
#ifdef QUORREL_NOTES

#include <cstdlib>
#include <map>
#include <string>
#include <tuple>

#include "host/call_notes.h"
#include "platform/files.h"

#ifdef _WIN32
#include <windows.h>
#endif

namespace quorrel::host {
namespace {

constexpr int kMaxLines = 10000;

// The log's place: QUORREL_NOTES_LOG, else (in the checked DLL) %TEMP%\quorrel-notes.log.
// An empty QUORREL_NOTES_LOG writes no file.
std::string logPath() {
  if (const char* chosen = std::getenv("QUORREL_NOTES_LOG")) return chosen;
#ifdef _WIN32
  const char* temp = std::getenv("TEMP");
  return std::string(temp && *temp ? temp : ".") + "\\quorrel-notes.log";
#else
  return "";
#endif
}

class NoteLog {
 public:
  NoteLog() : path_(logPath()) {}
  ~NoteLog() {
    for (const auto& [key, seen] : seen_) {
      if (seen.count != seen.written)
        write(seen.text + " (" + std::to_string(seen.count) + " times in all)");
    }
  }
  NoteLog(const NoteLog&) = delete;
  NoteLog& operator=(const NoteLog&) = delete;

  bool wanted() const {
#ifdef _WIN32
    return true;
#else
    return !path_.empty();
#endif
  }

  void add(int object, const std::string& call, NoteKind kind, const std::string& message) {
    Seen& seen = seen_[{object, call, kind}];
    if (++seen.count == 1) {
      seen.text = "object " + std::to_string(object) + ": " + call + ": " + message + " [" +
                  noteId(kind) + ']';
    } else if (!isPowerOfTen(seen.count)) {
      return;
    }
    seen.written = seen.count;
    write(seen.count == 1 ? seen.text
                          : seen.text + " (" + std::to_string(seen.count) + " times so far)");
  }

 private:
  struct Seen {
    std::string text;
    long long count = 0;
    long long written = 0;
  };
  static bool isPowerOfTen(long long n) {
    while (n % 10 == 0) n /= 10;
    return n == 1;
  }

  void write(const std::string& text) {
    if (lines_ >= kMaxLines) return;
    const std::string line =
        ++lines_ == kMaxLines ? "the note log is full; no more notes are written" : text;
#ifdef _WIN32
    OutputDebugStringA(("quorrel: " + line + "\n").c_str());
    const char* lineEnd = "\r\n";
#else
    const char* lineEnd = "\n";
#endif
    if (path_.empty()) return;
    if (!file_.isOpen()) file_ = FileHandle::openForWriting(path_.c_str(), true);
    const std::string bytes = line + lineEnd;
    file_.writeAll(bytes.data(), bytes.size());
  }

  std::string path_;
  FileHandle file_;
  int lines_ = 0;
  std::map<std::tuple<int, std::string, NoteKind>, Seen> seen_;
};

NoteLog& theLog() {
  static NoteLog log;
  return log;
}

}  // namespace

bool noteLogWanted() {
  return theLog().wanted();
}

void writeNoteToLog(NoteKind kind, const std::string& message) {
  theLog().add(currentObject(), currentCallName(), kind, message);
}

}  // namespace quorrel::host

#endif
