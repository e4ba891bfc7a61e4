// Any bytes as a csv file: replacing and appending loads, then a save of what was loaded
// and a reload of that save.
#include <cstdint>
#include <string>

#include "fuzz_files.h"
#include "io/csv_file.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const std::string path = quorrel::fuzzTempPath("csv");
  static const std::string copy = quorrel::fuzzTempPath("csv-copy");
  quorrel::writeFuzzFile(path, data, size);

  quorrel::ElementArray replaced;
  quorrel::loadCsvFile(replaced, path.c_str(), 0);
  quorrel::checkInvariants(replaced);

  quorrel::ElementArray appended;
  quorrel::fillSample(appended);
  quorrel::loadCsvFile(appended, path.c_str(), 1);
  quorrel::checkInvariants(appended);

  quorrel::saveCsvFile(replaced, copy.c_str(), 0);
  quorrel::ElementArray again;
  quorrel::loadCsvFile(again, copy.c_str(), 0);
  quorrel::checkInvariants(again);
  return 0;
}
