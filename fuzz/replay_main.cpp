// Runs a fuzz target over every file of the folders (or files) named on the command line,
// without libFuzzer: the test suite uses it to replay the seed and regression corpora.
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace {

int replayFile(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  std::vector<char> bytes((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size());
  return 1;
}

}  // namespace

int main(int argc, char** argv) {
  namespace fs = std::filesystem;
  int count = 0;
  for (int i = 1; i < argc; ++i) {
    fs::path root(argv[i]);
    std::error_code error;
    if (fs::is_regular_file(root, error)) {
      count += replayFile(root);
      continue;
    }
    if (!fs::is_directory(root, error)) continue;
    for (const auto& entry : fs::recursive_directory_iterator(root, error)) {
      if (entry.is_regular_file()) count += replayFile(entry.path());
    }
  }
  // An empty input must be survivable too.
  LLVMFuzzerTestOneInput(nullptr, 0);
  std::printf("replayed %d inputs\n", count);
  return 0;
}
