// Any bytes as a native array file: replacing and appending loads, then a save of what was
// loaded must load back to the same element count.
#include <cstdint>
#include <string>

#include "fuzz_files.h"
#include "io/native_file.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const std::string path = quorrel::fuzzTempPath("native");
  static const std::string copy = quorrel::fuzzTempPath("native-copy");
  quorrel::writeFuzzFile(path, data, size);

  quorrel::ElementArray replaced;
  quorrel::loadNativeFile(replaced, path.c_str(), 0);
  quorrel::checkInvariants(replaced);

  quorrel::ElementArray appended;
  quorrel::fillSample(appended);
  quorrel::loadNativeFile(appended, path.c_str(), 1);
  quorrel::checkInvariants(appended);

  quorrel::saveNativeFile(replaced, copy.c_str(), 0);
  quorrel::ElementArray again;
  quorrel::loadNativeFile(again, copy.c_str(), 0);
  quorrel::checkInvariants(again);
  if (again.size() != replaced.size()) __builtin_trap();
  return 0;
}
