#include "io/element_file.h"

#include <sys/stat.h>

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
  const std::string f = path("e.bin");
  saveElementToFile(a, 0, f.c_str(), 0);
  EXPECT_EQ(readBytes(f), std::string("abc\0", 4));
  saveElementToFile(a, 0, f.c_str(), 1);
  EXPECT_EQ(readBytes(f), std::string("abc\0abc\0", 8));
  saveElementToFile(a, 1, f.c_str(), 0);
  EXPECT_EQ(readBytes(f), bytesOf({0x02, 0x01, 0, 0}));
  saveElementToFile(a, 2, f.c_str(), 0);
  EXPECT_EQ(readBytes(f), bytesOf({0xFE, 0xFF, 0xFF, 0xFF}));
  saveElementToFile(a, 3, f.c_str(), 0);
  EXPECT_EQ(readBytes(f), std::string("\0x\0", 3));
  // A None element: mode 1 leaves the file alone, mode 0 empties it, and a missing
  // file is created empty either way.
  saveElementToFile(a, 4, f.c_str(), 1);
  EXPECT_EQ(readBytes(f).size(), 3u);
  saveElementToFile(a, 4, f.c_str(), 0);
  EXPECT_TRUE(exists(f));
  EXPECT_EQ(readBytes(f).size(), 0u);
  saveElementToFile(a, 4, path("new.bin").c_str(), 1);
  EXPECT_TRUE(exists(path("new.bin")));
  // Out of range: no file is touched.
  saveElementToFile(a, 5, path("none.bin").c_str(), 0);
  saveElementToFile(a, -1, path("none.bin").c_str(), 0);
  EXPECT_FALSE(exists(path("none.bin")));
}

TEST_F(ElementFile, ReadsWholeFilesAndPassesThemThroughAnElement) {
  std::string bytes;
  for (int i = 0; i < 300; ++i) bytes.push_back(static_cast<char>(i * 7));
  writeBytes(path("in.bin"), bytes);
  auto block = readWholeFile(path("in.bin").c_str());
  ASSERT_TRUE(block.has_value());
  EXPECT_EQ(blockText(*block), bytes);

  ElementArray a;
  a.appendFile({block->data(), static_cast<int32_t>(block->size())});
  saveElementToFile(a, 0, path("out.bin").c_str(), 0);
  EXPECT_EQ(readBytes(path("out.bin")), bytes);

  writeBytes(path("empty.bin"), "");
  auto empty = readWholeFile(path("empty.bin").c_str());
  ASSERT_TRUE(empty.has_value());
  EXPECT_EQ(empty->size(), 0u);

  EXPECT_FALSE(readWholeFile(path("missing.bin").c_str()).has_value());
  EXPECT_FALSE(readWholeFile(dir_.string().c_str()).has_value());
  EXPECT_FALSE(readWholeFile(nullptr).has_value());
}

TEST_F(ElementFile, BigFilesAndFilesOfUnknownSizeAreReadCompletely) {
  std::string big(3 * 1024 * 1024 + 17, '\0');
  for (size_t i = 0; i < big.size(); ++i) big[i] = static_cast<char>((i * 2654435761u) >> 13);
  writeBytes(path("big.bin"), big);
  auto block = readWholeFile(path("big.bin").c_str());
  ASSERT_TRUE(block.has_value());
  EXPECT_TRUE(blockText(*block) == big);
#ifdef __linux__
  // Files under /proc report size 0, so the buffer has to grow as it reads.
  auto maps = readWholeFile("/proc/self/maps");
  ASSERT_TRUE(maps.has_value());
  ASSERT_GT(maps->size(), 0u);
  EXPECT_EQ(maps->data()[maps->size() - 1], '\n');
#endif
}

TEST_F(ElementFile, UnwritablePlacesGetNothing) {
  ElementArray a;
  a.appendString("x");
  saveElementToFile(a, 0, dir_.string().c_str(), 0);
  saveElementToFile(a, 0, path("no/such.bin").c_str(), 0);
  EXPECT_FALSE(exists(path("no")));
  if (geteuid() == 0) GTEST_SKIP() << "running as root: a read-only folder is still writable";
  std::filesystem::permissions(
      dir_, std::filesystem::perms::owner_read | std::filesystem::perms::owner_exec);
  saveElementToFile(a, 0, path("ro.bin").c_str(), 0);
  EXPECT_FALSE(exists(path("ro.bin")));
}

#ifndef _WIN32
TEST_F(ElementFile, NewFilesAreOwnerReadWriteOnly) {
  ElementArray a;
  a.appendString("x");
  const mode_t old = umask(0);
  saveElementToFile(a, 0, path("p.bin").c_str(), 0);
  umask(old);
  const auto perms = std::filesystem::status(path("p.bin")).permissions();
  EXPECT_EQ(perms, std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}
#endif

}  // namespace
}  // namespace quorrel
