// File scenarios: saving and loading each whole-array format, and reading a whole file,
// against writing or reading the same number of bytes with one fwrite or fread. Loads
// report the memory per loaded element next to the file's own bytes per element.
//
// Saves and loads run on a memory file system where there is one (/dev/shm): there the
// flush that makes every save crash-safe costs nothing, so the save rows measure the
// writing alone. The flush's cost on the disk has a row of its own.
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "array/element_array.h"
#include "harness.h"
#include "io/csv_file.h"
#include "io/element_file.h"
#include "io/host_array_file.h"
#include "io/ini_file.h"
#include "io/native_file.h"

namespace quorrel::bench {

namespace {

std::filesystem::path scratchDir(const std::filesystem::path& under) {
  auto path = under / ("quorrel-bench-" + std::to_string(static_cast<long>(getpid())));
  std::filesystem::create_directories(path);
  return path;
}

const std::filesystem::path& diskDir() {
  static const std::filesystem::path dir = scratchDir(std::filesystem::temp_directory_path());
  return dir;
}

const std::filesystem::path& memoryDir() {
  static const std::filesystem::path dir = [] {
    std::error_code error;
    return std::filesystem::is_directory("/dev/shm", error) ? scratchDir("/dev/shm") : diskDir();
  }();
  return dir;
}

std::string scratchPath(const std::string& name) {
  return (memoryDir() / name).string();
}

std::string diskPath(const std::string& name) {
  return (diskDir() / name).string();
}

int64_t fileSize(const std::string& path) {
  std::error_code error;
  const auto size = std::filesystem::file_size(path, error);
  return error ? 0 : static_cast<int64_t>(size);
}

void writeBytes(const std::string& path, const std::vector<char>& bytes) {
  std::FILE* file = std::fopen(path.c_str(), "wb");
  if (file == nullptr) return;
  std::fwrite(bytes.data(), 1, bytes.size(), file);
  std::fclose(file);
}

void readBytes(const std::string& path, std::vector<char>& bytes) {
  std::FILE* file = std::fopen(path.c_str(), "rb");
  if (file == nullptr) return;
  benchmark::DoNotOptimize(std::fread(bytes.data(), 1, bytes.size(), file));
  std::fclose(file);
}

using Fill = void (*)(ElementArray&, int64_t);
using Save = FileStatus (*)(const ElementArray&, const char*, FileMode);
using Load = FileStatus (*)(ElementArray&, const char*, LoadMode);

// Save and load of one format; the baselines move the bytes of the file the save made.
void addFormat(const std::string& format, int64_t n, Fill fill, Save save, Load load) {
  const std::string path = scratchPath(format + ".out");
  const std::string copy = scratchPath(format + ".copy");
  const auto ensureFile = [=] {
    if (fileSize(path) > 0) return;
    ElementArray array;
    fill(array, n);
    save(array, path.c_str(), FileModeTruncate);
  };
  add({"save " + format, n, 1, 2.0,
       [=](benchmark::State& state) {
         ElementArray array;
         fill(array, n);
         for (auto _ : state) save(array, path.c_str(), FileModeTruncate);
       },
       [=](benchmark::State& state) {
         ensureFile();
         std::vector<char> bytes(static_cast<std::size_t>(fileSize(path)), 'x');
         for (auto _ : state) writeBytes(copy, bytes);
       }});
  add({"load " + format, n, 1, 5.0,
       [=](benchmark::State& state) {
         ensureFile();
         ElementArray array;
         const int64_t before = heapInUse();
         load(array, path.c_str(), LoadReplace);
         reportMemory(state, static_cast<double>(heapInUse() - before) / array.size());
         for (auto _ : state) load(array, path.c_str(), LoadReplace);
         benchmark::DoNotOptimize(array.size());
       },
       [=](benchmark::State& state) {
         ensureFile();
         std::vector<char> bytes(static_cast<std::size_t>(fileSize(path)));
         ElementArray array;
         load(array, path.c_str(), LoadReplace);
         reportMemory(state, static_cast<double>(bytes.size()) / array.size());
         for (auto _ : state) readBytes(path, bytes);
       }});
}

void fillMixed(ElementArray& array, int64_t n) {
  const std::vector<std::string> texts = randomTexts(n / 2 + 1, 8, 16, 31);
  const std::vector<int32_t> values = randomValues(n / 2 + 1, 32);
  for (int64_t i = 0; i < n; ++i) {
    const auto half = static_cast<std::size_t>(i / 2);
    if (i % 2 == 0) {
      array.appendString(texts[half].c_str());
    } else {
      array.appendValue(values[half]);
    }
  }
}

// A table of 10 columns of 10-letter texts: 111 bytes per CSV line.
void fillCsvTable(ElementArray& array, int64_t bytes) {
  array.setDimensions(2);
  array.setBoundary(1, 10);
  const int64_t cells = bytes / 111 * 10;
  for (const std::string& t : randomTexts(cells, 10, 10, 33)) array.appendString(t.c_str());
}

void fillTexts(ElementArray& array, int64_t n) {
  for (const std::string& t : randomTexts(n, 8, 16, 34)) array.appendString(t.c_str());
}

}  // namespace

void registerIoScenarios() {
  addFormat("native file", scaled(1'000'000), fillMixed, saveNativeFile, loadNativeFile);
  addFormat("host array file", scaled(1'000'000), fillMixed, saveHostArrayFile, loadHostArrayFile);
  addFormat("CSV file (bytes)", scaled(100'000'000), fillCsvTable, saveCsvFile, loadCsvFile);
  addFormat("INI file", scaled(1'000'000), fillTexts, saveIniFile, loadIniFile);

  // What a save's durability costs on the disk: the native file's bytes written as
  // every whole-file save writes them (a temporary file, flushed to the disk, renamed
  // over the target) against one plain fwrite of the same bytes.
  {
    const std::string target = diskPath("durable.out");
    const std::string plain = diskPath("durable.copy");
    const auto fileBytes = [] {
      ElementArray array;
      fillMixed(array, scaled(1'000'000));
      const std::string path = scratchPath("durable.src");
      saveNativeFile(array, path.c_str(), FileModeTruncate);
      return std::vector<char>(static_cast<std::size_t>(fileSize(path)), 'd');
    };
    add({"flushed replace (native file)", scaled(1'000'000), 1, 2.0,
         [=](benchmark::State& state) {
           const std::vector<char> bytes = fileBytes();
           for (auto _ : state) {
             SaveFile file(target.c_str(), false);
             file.finish(file.handle().writeAll(bytes.data(), bytes.size()));
           }
         },
         [=](benchmark::State& state) {
           const std::vector<char> bytes = fileBytes();
           for (auto _ : state) writeBytes(plain, bytes);
         }});
  }

  const int64_t bytes = scaled(100'000'000);
  const std::string path = scratchPath("whole.bin");
  add({"readFile (bytes)", bytes, 1, 2.0,
       [=](benchmark::State& state) {
         writeBytes(path, std::vector<char>(static_cast<std::size_t>(bytes), 'w'));
         for (auto _ : state) {
           auto block = readFile(path.c_str());
           benchmark::DoNotOptimize(block);
         }
       },
       [=](benchmark::State& state) {
         std::vector<char> buffer(static_cast<std::size_t>(bytes));
         for (auto _ : state) readBytes(path, buffer);
       }});
}

void removeScratchFiles() {
  std::error_code error;
  std::filesystem::remove_all(memoryDir(), error);
  std::filesystem::remove_all(diskDir(), error);
}

}  // namespace quorrel::bench
