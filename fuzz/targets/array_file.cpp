// Any bytes as a whole-array file of one of the four formats, chosen by the first byte:
// replacing and appending loads, then a save of what was loaded and a reload of that save.
#include <cstdint>
#include <iterator>
#include <string>

#include "fuzz_files.h"
#include "io/csv_file.h"
#include "io/host_array_file.h"
#include "io/ini_file.h"
#include "io/native_file.h"

namespace {

using quorrel::ElementArray;

struct Format {
  void (*load)(ElementArray&, const char* path, quorrel::LoadMode mode);
  void (*save)(ElementArray&, const char* path);
};

template <auto load, auto save>
constexpr Format formatOf() {
  return {[](ElementArray& a, const char* path, quorrel::LoadMode mode) { load(a, path, mode); },
          [](ElementArray& a, const char* path) { save(a, path, quorrel::FileModeTruncate); }};
}

// The seeds in the corpus start with their index here: native, host array, CSV, INI.
constexpr Format kFormats[] = {
    formatOf<quorrel::loadNativeFile, quorrel::saveNativeFile>(),
    formatOf<quorrel::loadHostArrayFile, quorrel::saveHostArrayFile>(),
    formatOf<quorrel::loadCsvFile, quorrel::saveCsvFile>(),
    formatOf<quorrel::loadIniFile, quorrel::saveIniFile>(),
};

// A host array file holds X × Y × Z cells whatever the element count, so a load that set
// huge boundaries would save a huge file: round-trip only arrays of a sane cell count.
bool savesHugeFile(const Format& format, const ElementArray& array) {
  if (&format != &kFormats[1]) return false;
  const int64_t x = array.boundary(1) > 0 ? array.boundary(1) : 1;
  const int64_t y = array.boundary(2) > 0 ? array.boundary(2) : 1;
  return (array.size() / (x * y) + 1) * x * y > (int64_t{1} << 16);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  const Format& format = kFormats[data[0] % std::size(kFormats)];
  static const std::string path = quorrel::fuzzTempPath("array");
  static const std::string copy = quorrel::fuzzTempPath("array-copy");
  quorrel::writeFuzzFile(path, data + 1, size - 1);

  ElementArray replaced;
  format.load(replaced, path.c_str(), quorrel::LoadReplace);
  quorrel::checkInvariants(replaced);
  {
    // A few bytes may declare millions of empty cells: one such array at a time.
    ElementArray appended;
    quorrel::fillSample(appended);
    format.load(appended, path.c_str(), quorrel::LoadAppend);
    quorrel::checkInvariants(appended);
  }

  if (savesHugeFile(format, replaced)) return 0;
  format.save(replaced, copy.c_str());
  ElementArray again;
  format.load(again, copy.c_str(), quorrel::LoadReplace);
  quorrel::checkInvariants(again);
  // The native format keeps every element.
  if (&format == &kFormats[0] && again.size() != replaced.size()) __builtin_trap();
  return 0;
}
