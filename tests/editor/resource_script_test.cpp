// The pictures the resource script names: the editor shows them beside the object.
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <string>

namespace quorrel::editor_test {
namespace {

// 32 x 32 pixels, 16 colours (4 bits per pixel), uncompressed: a 14-byte file header
// ("BM", 630 bytes, pixels at 118), then a 40-byte information header (width, height,
// one plane, bit count, compression 0), a 16-entry palette and 16 bytes per row.
TEST(ResourceScript, BitmapsAreSmallSixteenColourPictures) {
  const std::string head(
      "BM\x76\x02\0\0\0\0\0\0\x76\0\0\0"
      "\x28\0\0\0\x20\0\0\0\x20\0\0\0\x01\0\x04\0\0\0\0\0",
      34);
  for (const char* name : {"quorrel400.bmp", "quorrel401.bmp"}) {
    std::ifstream in(std::string(QUORREL_RESOURCE_DIR) + "/" + name, std::ios::binary);
    const std::string picture{std::istreambuf_iterator<char>(in), {}};
    EXPECT_EQ(picture.size(), 14u + 40u + 16u * 4u + 32u * 16u) << name;
    EXPECT_EQ(picture.substr(0, head.size()), head) << name;
  }
}

}  // namespace
}  // namespace quorrel::editor_test
