// What the file commands and the shell's show read from an instance: expressions by
// code, and a native snapshot the instance saves of itself (element and key types,
// which no expression tells, and every element in one pass). Also the wording their
// messages share.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "catalog.h"
#include "io/file_handle.h"
#include "module.h"
#include "temp_file.h"

namespace quorrel::tool {

// The expressions the views and conversions read, by the table's names.
inline const int32_t kSize = expressionCode("size(");
inline const int32_t kGetString = expressionCode("get$(");
inline const int32_t kDim = expressionCode("dim(");
inline const int32_t kBoundary = expressionCode("boundary(");
inline const int32_t kNumberOfRows = expressionCode("numberOfRows(");
inline const int32_t kRowList = expressionCode("rowList$(");
inline const int32_t kGetLabel = expressionCode("getLabel$(");
inline const int32_t kDelimiter = expressionCode("delimiter$(");

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
