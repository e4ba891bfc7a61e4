// Any bytes as JSON for `quorrel convert --from json`: the reader must come back with a
// value or a problem, never more; and any bytes written as a JSON string must read back
// as themselves when they are UTF-8.
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "text_formats.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  using namespace quorrel::tool;
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  const JsonRead read = readJson(bytes);
  if (read.problem && read.problem->line == 0) std::abort();
  const JsonRead string = readJson(jsonString(bytes));
  if (string.problem || string.value.kind != JsonValue::Kind::String) std::abort();
  if (isUtf8(bytes) && string.value.text != bytes) std::abort();
  return 0;
}
