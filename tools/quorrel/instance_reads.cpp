#include "instance_reads.h"

#include <cstring>
#include <new>

#include "array_files.h"
#include "catalog.h"
#include "commands.h"

namespace quorrel::tool {

int32_t askNumber(Instance& instance, int32_t code, std::vector<Argument> args) {
  const ExpressionResult result = instance.callExpression(code, args);
  return result.isText ? 0 : result.number;
}

std::optional<std::string> askText(Instance& instance, int32_t code, std::vector<Argument> args) {
  ExpressionResult result = instance.callExpression(code, args);
  if (!result.isText) return std::nullopt;
  return std::move(result.text);
}

Snapshot::Snapshot(Instance& instance) {
  instance.callAction(codeOfName(true, formatInfo(ArrayFormat::Native).saveAction).value(),
                      {Argument(file.path())});
}

ByteBuffer readBytes(const std::string& path) {
  FileRead read = readFile(path.c_str());
  if (read.status.failed == FileStatus::OutOfMemory) throw std::bad_alloc();
  if (!read.hasContents()) {
    throw FileError("cannot read " + path + ": " + std::strerror(read.status.error));
  }
  return std::move(read.bytes);
}

std::string plural(int64_t count, const char* noun) {
  return std::to_string(count) + ' ' + noun + (count == 1 ? "" : "s");
}

std::string joined(const char* head, const std::string& tail) {
  std::string text = head;
  text += tail;
  return text;
}

}  // namespace quorrel::tool
