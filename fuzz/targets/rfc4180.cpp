// Any bytes as RFC 4180 CSV for `quorrel convert --from csv-rfc4180`: what the reader
// makes of them must survive a write and a second read unchanged, and the writer's
// text must be a fixed point.
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "text_formats.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  using namespace quorrel::tool;
  const CsvRows rows =
      readRfc4180(std::string_view(reinterpret_cast<const char*>(data), size)).rows;
  const std::string text = writeRfc4180(rows);
  if (readRfc4180(text).rows != rows) std::abort();
  if (writeRfc4180(readRfc4180(text).rows) != text) std::abort();
  return 0;
}
