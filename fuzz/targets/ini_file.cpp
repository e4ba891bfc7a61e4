// Any bytes as a ini file: replacing and appending loads, then a save of what was loaded
// and a reload of that save.
#include <cstdint>
#include <string>

#include "fuzz_files.h"
#include "io/ini_file.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const std::string path = quorrel::fuzzTempPath("ini");
  static const std::string copy = quorrel::fuzzTempPath("ini-copy");
  quorrel::writeFuzzFile(path, data, size);

  quorrel::ElementArray replaced;
  quorrel::loadIniFile(replaced, path.c_str(), 0);
  quorrel::checkInvariants(replaced);

  quorrel::ElementArray appended;
  quorrel::fillSample(appended);
  quorrel::loadIniFile(appended, path.c_str(), 1);
  quorrel::checkInvariants(appended);

  quorrel::saveIniFile(replaced, copy.c_str(), 0);
  quorrel::ElementArray again;
  quorrel::loadIniFile(again, copy.c_str(), 0);
  quorrel::checkInvariants(again);
  return 0;
}
