// Routines of the file actions, through the host's calls.
#include <cstdio>
#include <fstream>
#include <iterator>

#include "test_host.h"

namespace testhost {
namespace {

std::string tempPath(const char* name) {
  return ::testing::TempDir() + "quorrel_host_" + name;
}
void writeFile(const std::string& path, const std::string& bytes) {
  std::ofstream(path, std::ios::binary) << bytes;
}
std::string readFile(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

TEST(FileRoutinesTest, FileContentsBecomeElements) {
  const std::string three = tempPath("three.bin"), empty = tempPath("empty.bin");
  const std::string out = tempPath("out.bin"), missing = tempPath("does_not_exist.bin");
  writeFile(three, std::string("a\0c", 3));
  writeFile(empty, "");
  std::remove(missing.c_str());

  Instance t(oneD());
  for (int32_t v = 1; v <= 5; ++v) t.action(9, v);
  t.action(54, three);  // Append file: element 5, a File of 3 bytes
  EXPECT_EQ(t.number(0), 6);
  t.action(18, 5, out);  // Save element to file
  EXPECT_EQ(readFile(out), std::string("a\0c", 3));
  t.action(19, 5, out);  // Append element to file
  EXPECT_EQ(readFile(out), std::string("a\0ca\0c", 6));

  t.action(52, empty, 1);  // Set file at, empty file: the element becomes None
  EXPECT_EQ(t.number(3, {1}), 0);
  EXPECT_EQ(t.text(2, {1}), "");
  t.action(18, 1, out);
  EXPECT_EQ(readFile(out), "");

  t.action(53, three, 0);  // Insert file at 0: the rest shift up
  EXPECT_EQ(t.number(0), 7);
  EXPECT_EQ(t.number(3, {3}), 3);
  EXPECT_EQ(t.number(3, {1}), 1);

  // A file that cannot be opened leaves the array as it was.
  t.action(52, missing, 1);
  t.action(53, missing, 0);
  t.action(54, missing);
  EXPECT_EQ(t.number(0), 7);
  EXPECT_EQ(t.number(3, {1}), 1);

  // A String saves with its terminator, a Value as four little-endian bytes.
  t.action(13, "hi", 0);
  t.action(14, 258, 1);
  t.action(18, 0, out);
  EXPECT_EQ(readFile(out), std::string("hi\0", 3));
  t.action(18, 1, out);
  EXPECT_EQ(readFile(out), std::string("\x02\x01\x00\x00", 4));
  for (const std::string& path : {three, empty, out}) std::remove(path.c_str());
}

}  // namespace
}  // namespace testhost
