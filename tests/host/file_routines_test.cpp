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
  const std::string three = tempPath("three.bin");
  const std::string empty = tempPath("empty.bin");
  const std::string out = tempPath("out.bin");
  const std::string missing = tempPath("does_not_exist.bin");
  writeFile(three, std::string("a\0c", 3));
  writeFile(empty, "");
  std::remove(missing.c_str());

  Instance t(SetupRecord().set(kSetupDimensionCount, 1));
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
  EXPECT_EQ(t.number(3, {0 + 3}), 3);
  EXPECT_EQ(t.number(3, {1}), 1);

  // A file that cannot be opened leaves the array as it was.
  t.action(52, missing, 1);
  t.action(53, missing, 0);
  t.action(54, missing);
  EXPECT_EQ(t.number(0), 7);
  EXPECT_EQ(t.number(3, {1}), 1);

  t.action(13, "hi", 0);
  t.action(14, 258, 1);
  t.action(18, 0, out);
  EXPECT_EQ(readFile(out), std::string("hi\0", 3));
  t.action(18, 1, out);
  EXPECT_EQ(readFile(out), std::string("\x02\x01\x00\x00", 4));
  for (const std::string& path : {three, empty, out}) std::remove(path.c_str());
}

TEST(FileRoutinesTest, HostArrayFileSavesLoadsAndAppends) {
  const std::string path = tempPath("host_array.arr");
  Instance t(SetupRecord().set(kSetupDimensionCount, 1));
  t.action(8, "one");
  t.action(9, 2);
  t.action(1, path);  // Save as MMF1.5 array
  EXPECT_EQ(readFile(path).substr(0, 10), std::string("CNC ARRAY\0", 10));

  Instance loaded(SetupRecord().set(kSetupDimensionCount, 1));
  loaded.action(8, "old");
  // The file lays the two elements out along Z with one more layer (Z = 2 / 1 + 1),
  // every cell as text.
  loaded.action(4, path);  // Load from MMF array: replaces
  EXPECT_EQ(loaded.number(0), 3);
  EXPECT_EQ(loaded.text(2, {0}), "one");
  EXPECT_EQ(loaded.text(2, {1}), "2");
  EXPECT_EQ(loaded.text(2, {2}), "");
  loaded.action(11, path);  // Append elements from MMF array
  EXPECT_EQ(loaded.number(0), 6);
  EXPECT_EQ(loaded.text(2, {3}), "one");
  std::remove(path.c_str());
}

TEST(FileRoutinesTest, CsvFileSavesLoadsAndAppends) {
  const std::string path = tempPath("table.csv");
  Instance t(SetupRecord().set(kSetupXBoundary, 2));
  t.action(8, "name");
  t.action(8, "age");
  t.action(9, 7);
  t.action(2, path);  // Save to CSV file
  EXPECT_EQ(readFile(path), "name,age\r\n7,\"\"\r\n");

  Instance loaded(SetupRecord().set(kSetupDimensionCount, 1));
  loaded.action(8, "old");
  loaded.action(5, path);  // Load from CSV file: replaces, takes the table's shape
  EXPECT_EQ(loaded.number(0), 4);
  EXPECT_EQ(loaded.number(26), 2);
  EXPECT_EQ(loaded.number(28), 2);
  EXPECT_EQ(loaded.text(2, {2}), "7");
  EXPECT_EQ(loaded.text(2, {3}), "");
  loaded.action(12, path);  // Append elements from CSV file
  EXPECT_EQ(loaded.number(0), 8);
  EXPECT_EQ(loaded.text(2, {4}), "name");
  std::remove(path.c_str());
}

TEST(FileRoutinesTest, IniFileSavesLoadsAndAppends) {
  const std::string path = tempPath("elements.ini");
  Instance t(SetupRecord().set(kSetupDimensionCount, 1));
  t.action(8, "a");
  t.action(20, "k1", 0);
  t.action(9, 5);
  t.action(58, path);  // Save to INI file
  EXPECT_EQ(readFile(path), "[ZUBArray]\r\nk1=a\r\n=5\r\n\r\n");

  Instance loaded(SetupRecord().set(kSetupDimensionCount, 1));
  loaded.action(8, "old");
  loaded.action(59, path);  // Load from INI file: replaces
  EXPECT_EQ(loaded.number(0), 2);
  EXPECT_EQ(loaded.text(2, {0}), "a");
  EXPECT_EQ(loaded.text(4, {0}), "k1");
  EXPECT_EQ(loaded.text(2, {1}), "5");
  EXPECT_EQ(loaded.text(4, {1}), "");  // an empty String key
  loaded.action(60, path);             // Append elements from INI file
  EXPECT_EQ(loaded.number(0), 4);
  EXPECT_EQ(loaded.number(6, {"k1"}), 0);
  std::remove(path.c_str());
}

}  // namespace
}  // namespace testhost
