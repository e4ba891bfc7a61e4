// Any bytes as a raw element file: read whole into a file element (set, insert, append),
// saved back byte for byte, and appended to a file.
#include <cstdint>
#include <cstring>
#include <string>

#include "fuzz_files.h"
#include "io/element_file.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const std::string path = quorrel::fuzzTempPath("element");
  static const std::string copy = quorrel::fuzzTempPath("element-copy");
  quorrel::writeFuzzFile(path, data, size);

  const quorrel::FileRead block = quorrel::readFile(path.c_str());
  if (!block.hasContents() || block.bytes.size() != size) __builtin_trap();
  if (size > 0 && std::memcmp(block.bytes.data(), data, size) != 0) __builtin_trap();

  quorrel::ElementArray array;
  quorrel::fillSample(array);
  const quorrel::ByteBlock bytes{block.bytes.data(), static_cast<int32_t>(block.bytes.size())};
  array.setFile(bytes, 1);
  array.insertFile(bytes, 0);
  array.appendFile(bytes);
  quorrel::checkInvariants(array);

  // A file element writes back exactly the bytes it was read from.
  quorrel::saveElementToFile(array, array.size() - 1, copy.c_str(), quorrel::FileModeTruncate);
  const quorrel::FileRead back = quorrel::readFile(copy.c_str());
  if (!back.hasContents() || back.bytes.size() != size) __builtin_trap();
  if (size > 0 && std::memcmp(back.bytes.data(), data, size) != 0) __builtin_trap();
  quorrel::saveElementToFile(array, 0, copy.c_str(), quorrel::FileModeAppend);
  return 0;
}
