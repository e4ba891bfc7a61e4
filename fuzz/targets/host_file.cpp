// Any bytes as a host file: replacing and appending loads, then a save of what was loaded
// and a reload of that save.
#include <cstdint>
#include <string>

#include "fuzz_files.h"
#include "io/host_array_file.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const std::string path = quorrel::fuzzTempPath("host");
  static const std::string copy = quorrel::fuzzTempPath("host-copy");
  quorrel::writeFuzzFile(path, data, size);

  quorrel::ElementArray replaced;
  quorrel::loadHostArrayFile(replaced, path.c_str(), 0);
  quorrel::checkInvariants(replaced);

  {
    // A few bytes may declare millions of empty cells: one such array at a time.
    quorrel::ElementArray appended;
    quorrel::fillSample(appended);
    quorrel::loadHostArrayFile(appended, path.c_str(), 1);
    quorrel::checkInvariants(appended);
  }

  // The file holds X × Y × Z cells whatever the element count, so a load that set huge
  // boundaries would save a huge file: round-trip only arrays of a sane cell count.
  const int64_t x = replaced.boundary(1) > 0 ? replaced.boundary(1) : 1;
  const int64_t y = replaced.boundary(2) > 0 ? replaced.boundary(2) : 1;
  const int64_t cells = (replaced.size() / (x * y) + 1) * x * y;
  if (cells > (int64_t{1} << 16)) return 0;
  quorrel::saveHostArrayFile(replaced, copy.c_str(), 0);
  quorrel::ElementArray again;
  quorrel::loadHostArrayFile(again, copy.c_str(), 0);
  quorrel::checkInvariants(again);
  return 0;
}
