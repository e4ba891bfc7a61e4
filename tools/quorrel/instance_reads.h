// What the file commands and the shell's show read from an instance: expressions by
// code, and a native snapshot the instance saves of itself (element and key types,
// which no expression tells, and every element in one pass). Also the wording their
// messages share.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "io/file_handle.h"
#include "module.h"
#include "temp_file.h"

namespace quorrel::tool {

// Expression codes the views and conversions read.
inline constexpr int32_t kSize = 0;
inline constexpr int32_t kGetString = 2;
inline constexpr int32_t kDim = 26;
inline constexpr int32_t kBoundary = 27;
inline constexpr int32_t kNumberOfRows = 40;
inline constexpr int32_t kRowList = 41;
inline constexpr int32_t kGetLabel = 43;
inline constexpr int32_t kDelimiter = 51;

// A number answer (0 for a text), or a text answer (none for a number).
int32_t askNumber(Instance& instance, int32_t code, std::vector<Argument> args = {});
std::optional<std::string> askText(Instance& instance, int32_t code, std::vector<Argument> args);

// The instance saved by its own save action into a scratch file. The save reports
// nothing here (the shell's show has no module at hand): a snapshot that could not be
// written reads as an unusable file.
struct Snapshot {
  TempFile file;
  explicit Snapshot(Instance& instance);
};

// A file's bytes, read as the extension's loaders read one; throws FileError.
ByteBuffer readBytes(const std::string& path);

// "3 rows", "1 row".
std::string plural(int64_t count, const char* noun);
// head + tail by appending: GCC 12 at -O3 reports a false -Wrestrict overlap in
// "literal" + std::string&& (its insert-at-front path), which -Werror turns fatal.
std::string joined(const char* head, const std::string& tail);

}  // namespace quorrel::tool
