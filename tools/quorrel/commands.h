// The subcommands of the quorrel command. Each returns the process exit status:
// 0 success, 1 a file or the module could not be used, 2 misuse or a script error.
#pragma once

#include <cstdint>
#include <optional>
#include <ostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

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
};

struct ConvertOptions {
  std::string in, out;
  std::string to;    // native|host|csv|ini|csv-rfc4180|json, empty: by OUT's extension
  std::string from;  // csv-rfc4180, empty: recognised
  bool force = false;
};

int runCommand(const ModuleLoader& module, const std::string& path, const RunOptions& options);
int shellCommand(const ModuleLoader& module, const RunOptions& options);
int inspectCommand(const Module& module, const std::string& path, const ViewOptions& view);
int convertCommand(const Module& module, const ConvertOptions& options);
void printArray(Instance& instance, const ViewOptions& view, std::ostream& out);
int listCommand(const Module& module, const std::string& what);
// The list and descriptions behind `quorrel list`, for the shell's help too.
void printCatalog(const Module& module, std::string_view which, std::ostream& out);
bool printDescription(const Module& module, std::string_view what, std::ostream& out);
int menuCommand(const Module& module, const std::string& which);
int stringsCommand(const Module& module, const std::string& which);

}  // namespace quorrel::tool
