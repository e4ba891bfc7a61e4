// The pictures the resource script names: the editor shows them beside the object.
#include <gtest/gtest.h>

#include <cstdint>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace quorrel::editor_test {
namespace {

using Bytes = std::vector<unsigned char>;

Bytes readFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return Bytes(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// Little-endian fields of the picture files, read in order.
struct Reader {
  const Bytes& bytes;
  size_t pos = 0;
  uint32_t word() {
    uint32_t value = bytes[pos] | uint32_t{bytes[pos + 1]} << 8;
    pos += 2;
    return value;
  }
  uint32_t dword() {
    uint32_t low = word();
    return low | word() << 16;
  }
};

// The bitmaps are 32 x 32 pixels, 16 colours (4 bits per pixel), uncompressed.
TEST(ResourceScript, BitmapsAreSmallSixteenColourPictures) {
  for (const char* name : {"quorrel400.bmp", "quorrel401.bmp"}) {
    Bytes picture = readFile(std::string(QUORREL_RESOURCE_DIR) + "/" + name);
    ASSERT_EQ(picture.size(), 14u + 40u + 16u * 4u + 32u * 16u) << name;
    Reader reader{picture};
    EXPECT_EQ(reader.word(), 0x4D42u);  // "BM"
    EXPECT_EQ(reader.dword(), picture.size());
    reader.pos += 4;
    // Pixel data offset, information header size, width, height.
    EXPECT_EQ(
        (std::vector<uint32_t>{reader.dword(), reader.dword(), reader.dword(), reader.dword()}),
        (std::vector<uint32_t>{118, 40, 32, 32}));
    EXPECT_EQ(reader.word(), 1u);
    EXPECT_EQ(reader.word(), 4u);
    EXPECT_EQ(reader.dword(), 0u);  // no compression
  }
}

}  // namespace
}  // namespace quorrel::editor_test
