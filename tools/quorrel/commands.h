// The subcommands of the quorrel command. Each returns the process exit status:
// 0 success, 1 a file or the module could not be used, 2 misuse or a script error.
#pragma once

#include <string>
#include <vector>

#include "module.h"

namespace quorrel::tool {

// Misuse of the command line: reported with a pointer to --help, exit status 2.
struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// A file that cannot be read or written: reported, exit status 1.
struct FileError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

int runCommand(const ModuleLoader& module, const std::string& path);
int shellCommand(const ModuleLoader& module);
int inspectCommand(const Module& module, const std::string& path);
int convertCommand(const Module& module, const std::string& in, const std::string& out,
                   const std::string& to);
int menuCommand(const Module& module, const std::string& which);
int stringsCommand(const Module& module, const std::string& which);

}  // namespace quorrel::tool
