// Writes the seed corpora of the file-format fuzz targets with our own save operations:
//   fuzz_make_seeds fuzz/corpus
// Run it again after a format change and commit the result.
#include <filesystem>
#include <string>

#include "array/element_array.h"
#include "io/csv_file.h"
#include "io/element_file.h"
#include "io/host_array_file.h"
#include "io/ini_file.h"
#include "io/native_file.h"

namespace {

using quorrel::ElementArray;

ElementArray table() {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, 3);
  for (const char* cell : {"name", "score", "", "Ann", "120", "x,y"}) a.appendString(cell);
  a.appendValue(-2147483647 - 1);
  a.appendValue(7);
  a.labels = quorrel::LabelList{"name", std::nullopt, "note"};
  a.setKeyString("first", 0);
  a.setKeyValue(42, 1);
  const char bytes[] = {'a', '\0', 'b', '\r', '\n'};
  a.appendFile({bytes, 5});
  a.setKeyFile({bytes, 3}, 8);
  return a;
}

ElementArray cube() {
  ElementArray a;
  a.setDimensions(3);
  a.setBoundary(1, 2);
  a.setBoundary(2, 2);
  a.appendString("a");
  a.appendValue(5);
  a.appendString("");
  return a;
}

}  // namespace

int main(int argc, char** argv) {
  namespace fs = std::filesystem;
  fs::path root = argc > 1 ? argv[1] : "fuzz/corpus";
  auto dir = [&](const char* name) {
    fs::create_directories(root / name);
    return root / name;
  };
  ElementArray empty;
  ElementArray t = table();
  ElementArray c = cube();
  quorrel::saveNativeFile(empty, (dir("native_file") / "empty.arr").c_str(), 0);
  quorrel::saveNativeFile(t, (dir("native_file") / "table.arr").c_str(), 0);
  quorrel::saveNativeFile(c, (dir("native_file") / "cube.arr").c_str(), 0);
  quorrel::saveHostArrayFile(t, (dir("host_file") / "table.mmf").c_str(), 0);
  quorrel::saveHostArrayFile(c, (dir("host_file") / "cube.mmf").c_str(), 0);
  quorrel::saveCsvFile(t, (dir("csv_file") / "table.csv").c_str(), 0);
  quorrel::saveCsvFile(c, (dir("csv_file") / "cube.csv").c_str(), 0);
  quorrel::saveIniFile(t, (dir("ini_file") / "table.ini").c_str(), 0);
  quorrel::saveIniFile(empty, (dir("ini_file") / "empty.ini").c_str(), 0);
  quorrel::saveElementToFile(t, 0, (dir("element_file") / "string.bin").c_str(), 0);
  quorrel::saveElementToFile(t, 8, (dir("element_file") / "file.bin").c_str(), 0);
  quorrel::saveElementToFile(t, 6, (dir("element_file") / "value.bin").c_str(), 0);
  return 0;
}
