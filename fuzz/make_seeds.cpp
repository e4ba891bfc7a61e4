// Writes the seed corpora of the file-format fuzz targets with our own save operations:
//   fuzz_make_seeds fuzz/corpus
// Run it again after a format change and commit the result.
#include <filesystem>
#include <fstream>
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

// The array_file target reads its first byte as the format: 0 native, 1 host array,
// 2 CSV, 3 INI. Saves go to a scratch file that is copied in behind that byte.
void addArraySeed(const std::filesystem::path& dir, const char* name, char format,
                  quorrel::FileStatus (*save)(const ElementArray&, const char*, quorrel::FileMode),
                  ElementArray& array) {
  const std::filesystem::path scratch = dir / ".scratch";
  save(array, scratch.c_str(), quorrel::FileModeTruncate);
  std::ifstream in(scratch, std::ios::binary);
  std::ofstream out(dir / name, std::ios::binary);
  out << format << in.rdbuf();
  in.close();
  std::filesystem::remove(scratch);
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
  const fs::path arrays = dir("array_file");
  addArraySeed(arrays, "empty.arr", 0, quorrel::saveNativeFile, empty);
  addArraySeed(arrays, "table.arr", 0, quorrel::saveNativeFile, t);
  addArraySeed(arrays, "cube.arr", 0, quorrel::saveNativeFile, c);
  addArraySeed(arrays, "table.mmf", 1, quorrel::saveHostArrayFile, t);
  addArraySeed(arrays, "cube.mmf", 1, quorrel::saveHostArrayFile, c);
  addArraySeed(arrays, "table.csv", 2, quorrel::saveCsvFile, t);
  addArraySeed(arrays, "cube.csv", 2, quorrel::saveCsvFile, c);
  addArraySeed(arrays, "table.ini", 3, quorrel::saveIniFile, t);
  addArraySeed(arrays, "empty.ini", 3, quorrel::saveIniFile, empty);
  quorrel::saveElementToFile(t, 0, (dir("element_file") / "string.bin").c_str(),
                             quorrel::FileModeTruncate);
  quorrel::saveElementToFile(t, 8, (dir("element_file") / "file.bin").c_str(),
                             quorrel::FileModeTruncate);
  quorrel::saveElementToFile(t, 6, (dir("element_file") / "value.bin").c_str(),
                             quorrel::FileModeTruncate);
  return 0;
}
