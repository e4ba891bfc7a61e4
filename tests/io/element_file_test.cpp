#include "io/element_file.h"

#include "io_test_support.h"

namespace quorrel {
namespace {

using ElementFile = IoTest;

std::string blockText(const ByteBuffer& b) {
  return std::string(b.data(), b.size());
}

TEST_F(ElementFile, WritesExactlyTheElementsBytes) {
  ElementArray a;
  a.appendString("abc");
  a.appendValue(258);
  a.appendValue(-2);
  a.appendFile({"\0x\0", 3});
  a.appendValue(0);
  const auto savedElement = [&](int32_t index, FileMode mode = FileModeTruncate) {
    return saved([&](ElementArray& array, const char* file,
                     FileMode m) { saveElementToFile(array, index, file, m); },
                 a, mode);
  };
  EXPECT_EQ(savedElement(1), bytesOf({0x02, 0x01, 0, 0}));
  EXPECT_EQ(savedElement(2), bytesOf({0xFE, 0xFF, 0xFF, 0xFF}));
  EXPECT_EQ(savedElement(3), std::string("\0x\0", 3));
  // A None element: appending leaves the file alone, truncating empties it, and a missing
  // file is created empty either way.
  EXPECT_EQ(savedElement(4, FileModeAppend).size(), 3u);
  EXPECT_EQ(savedElement(4, FileModeTruncate).size(), 0u);
  EXPECT_TRUE(exists(path("out")));
  saveElementToFile(a, 4, path("new.bin").c_str(), FileModeAppend);
  EXPECT_TRUE(exists(path("new.bin")));
  // Below the range: no file is touched.
  saveElementToFile(a, -1, path("none.bin").c_str(), FileModeTruncate);
  EXPECT_FALSE(exists(path("none.bin")));
}

TEST_F(ElementFile, ReadsWholeFilesOfAnySize) {
  std::string big(3 * 1024 * 1024 + 17, '\0');
  for (size_t i = 0; i < big.size(); ++i) big[i] = static_cast<char>((i * 2654435761u) >> 13);
  for (const std::string& bytes : {big, std::string()}) {
    writeBytes(path("in.bin"), bytes);
    FileStatus status{FileStatus::Read, 1};
    auto block = readWholeFile(path("in.bin").c_str(), status);
    ASSERT_TRUE(block.has_value());
    EXPECT_TRUE(status.ok());
    EXPECT_TRUE(blockText(*block) == bytes);
    // Passed through a File element, the bytes come out unchanged.
    ElementArray a;
    a.appendFile({block->data(), static_cast<int32_t>(block->size())});
    EXPECT_TRUE(saveElementToFile(a, 0, path("out.bin").c_str(), FileModeTruncate).ok());
    EXPECT_TRUE(readBytes(path("out.bin")) == bytes);
  }
  // A file that cannot be read gives nothing, and says which step failed and why (a
  // missing file and a folder: the file_unusable case).
  FileStatus failed;
  EXPECT_FALSE(readWholeFile(nullptr, failed).has_value());
  EXPECT_EQ(failed.failed, FileStatus::Open);
  EXPECT_EQ(failed.error, EINVAL);
#ifdef __linux__
  // Files under /proc report size 0, so the buffer has to grow as it reads.
  FileStatus status;
  auto maps = readWholeFile("/proc/self/maps", status);
  ASSERT_TRUE(maps.has_value());
  ASSERT_GT(maps->size(), 0u);
  EXPECT_EQ(maps->data()[maps->size() - 1], '\n');
#endif
}

}  // namespace
}  // namespace quorrel
