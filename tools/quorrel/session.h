// Runs script commands against one instance at a time, as the host would.
#pragma once

#include <istream>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "catalog.h"
#include "module.h"
#include "script.h"

namespace quorrel::tool {

// What `run` and `shell` add to the script language's plain output.
struct RunOptions {
  bool echo = false;       // print each E line beside its result
  bool warnFiles = false;  // warn about file paths an action cannot use; changes nothing else
  bool strict = false;     // a failed file action makes the exit status 1
  bool notes = true;       // print the module's notes on calls that do nothing
  bool notesFail = false;  // a note makes the exit status kNotesGiven
};

// What a text expression with no text to give prints.
inline constexpr std::string_view kNoText = "(no text)";

// The exit status of a run that gave notes, with RunOptions::notesFail.
inline constexpr int kNotesGiven = 3;

// Where a command came from, for --echo and warnings.
struct Where {
  std::string_view file;
  int line = 0;
  std::string_view text;  // the line as written
};

class Session {
 public:
  explicit Session(const ModuleLoader& module, RunOptions options = {},
                   std::ostream* warnings = nullptr)
      : module_(module), options_(options), warnings_(warnings) {}
  ~Session();
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  // Runs one parsed command; throws ScriptError for a call that does not fit the tables.
  void execute(const Command& command, std::ostream& out, const Where& where = {});

  // Runs one script line: a command, or show [VIEW OPTIONS], which prints the current
  // array as inspect does, the selected rows marked.
  void run(std::string_view line, std::ostream& out, const Where& where);

  // The current instance, created with the default setup when there is none.
  Instance& instance();
  void replaceInstance(const SetupFields& setup);

  // Whether a file action has failed since the session began.
  bool fileActionFailed() const { return fileActionFailed_; }
  // Whether the module gave a note since the session began.
  bool notesGiven() const { return !notes_.empty(); }
  // The notes given more than once, each once more with its count.
  void printRepeatedNotes();
  // The exit status of a run without errors: 1 with --strict after a failed file
  // action, kNotesGiven with --notes-fail after a note, else 0.
  int status() const;

 private:
  struct Note {
    std::string where;  // "FILE:LINE" of its first time
    std::string text;   // "call: message [id]"
    int count = 0;
  };
  static void QUORREL_CALL onNote(void* context, const char* id, const char* call,
                                  const char* message);
  void listenToNotes();
  void printNotes(const Where& where);
  void checkFileAction(int32_t code, const std::vector<Argument>& args, const Where& where);

  const ModuleLoader& module_;
  RunOptions options_;
  std::ostream* warnings_;
  std::unique_ptr<Instance> instance_;
  bool fileActionFailed_ = false;
  bool listening_ = false;
  std::vector<std::pair<std::string, std::string>> pending_;  // id, "call: message"
  std::vector<Note> notes_;                                   // in order of first time
  std::unordered_map<std::string, size_t> noteIndex_;         // text -> place in notes_
};

// Runs a whole script; reports the first error as "NAME:LINE: error: WHAT" and returns 2.
// Returns 1 when `out` fails (the caller says why) or, with options.strict, when a
// file action failed.
int runScript(const ModuleLoader& module, std::istream& in, const std::string& name,
              std::ostream& out, std::ostream& err, const RunOptions& options = {});

// The first word of a script line and the rest, without the blanks around them.
std::pair<std::string_view, std::string_view> firstWord(std::string_view line);

// The reason an action that uses `path` as `use` says cannot open it, or nothing.
std::optional<std::string> fileProblem(const std::string& path, FileUse use);

}  // namespace quorrel::tool
