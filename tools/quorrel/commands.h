// The subcommands of the quorrel command. Each returns the process exit status:
// 0 success, 1 a file or the module could not be used, 2 misuse or a script error.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <ostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "array_files.h"
#include "module.h"
#include "session.h"

namespace quorrel::tool {

// Misuse of the command line: reported with a pointer to --help, exit status 2.
struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// A file that cannot be read or written: reported, exit status 1.
struct FileError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// How much of an array inspect and the shell's `show` print.
struct ViewOptions {
  std::optional<int32_t> rows;  // table rows or list elements; default 20 and 40
  size_t width = 24;            // cells cut to this many characters; 0 for no limit
  bool all = false;             // every row, element and column
  bool keys = false;            // every element with its type and key, as a list
  bool selection = false;       // mark the selected table rows (the shell's show)
};

// Takes one view option (--rows N, --width N, --all, --keys; a value after = or as
// `next()`): false when `arg` is none of them. Throws UsageError on a bad value.
bool takeViewOption(std::string_view arg, const std::function<std::optional<std::string>()>& next,
                    ViewOptions& view);

struct InspectOptions {
  ViewOptions view;
  std::optional<ArrayFormat> from;  // none: recognised
  std::optional<ArrayFormat> to;    // show the array as it comes back from this format
  bool header = false;              // a CSV's first row is its labels
  bool lenient = false;             // broken RFC 4180 CSV: a warning, not an error
};

struct ConvertOptions {
  std::string in, out;
  std::optional<ArrayFormat> to;    // none: by OUT's extension
  std::optional<ArrayFormat> from;  // none: recognised
  bool header = false;              // CSV labels as a first row, both ways
  bool lenient = false;
  bool force = false;  // overwrite IN; binary output to a terminal
  bool report = true;  // say what was converted
};

int runCommand(const ModuleLoader& module, const std::string& path, const RunOptions& options);
// The script given as separate lines (run -e), named -e in errors.
int runLinesCommand(const ModuleLoader& module, const std::vector<std::string>& lines,
                    const RunOptions& options);
int shellCommand(const ModuleLoader& module, const RunOptions& options);
int inspectCommand(const Module& module, const std::string& path, const InspectOptions& options);
int convertCommand(const Module& module, const ConvertOptions& options);
void printArray(Instance& instance, const ViewOptions& view, std::ostream& out);
int listCommand(const Module& module, const std::string& what);
// The list and descriptions behind `quorrel list`, for the shell's help too.
void printCatalog(const Module& module, std::string_view which, std::ostream& out);
bool printDescription(const Module& module, std::string_view what, std::ostream& out);
int menuCommand(const Module& module, const std::string& which);
int stringsCommand(const Module& module, const std::string& which);

}  // namespace quorrel::tool
