#include "io/ini_file.h"

#include "io_test_support.h"

namespace quorrel {
namespace {

using IniFile = IoTest;

TEST_F(IniFile, SavesOneSectionWithALinePerElement) {
  ElementArray a;
  a.appendString("a");
  a.setKeyString("k1", 0);
  a.appendValue(5);
  EXPECT_EQ(saved(saveIniFile, a), "[ZUBArray]\r\nk1=a\r\n=5\r\n\r\n");
  ElementArray b = shaped(2, 3);
  b.labels = LabelList{"l"};
  b.appendValue(1);
  loadIniFile(b, path("out").c_str(), LoadReplace);
  EXPECT_EQ(entriesOf(b), "k1=a|=5");
  EXPECT_EQ(b.dimensions(), 2);
  EXPECT_EQ(b.boundary(1), 3);
  EXPECT_EQ(b.labels, LabelList{"l"});

  ElementArray empty;
  saveIniFile(empty, path("e.ini").c_str(), FileModeAppend);
  EXPECT_EQ(empty.settings.fileMode, FileModeAppend);
  EXPECT_EQ(readBytes(path("e.ini")), "[ZUBArray]\r\n\r\n");

  // Keys of every type, and equals signs in keys.
  ElementArray k;
  k.appendString("x");
  k.setKeyString("a=b", 0);
  k.appendFile({"bin", 3});
  k.setKeyValue(-4, 1);
  k.appendString("");
  k.setKeyFile({"f", 1}, 2);
  k.appendValue(0);
  k.setKeyString(" sp ", 3);
  EXPECT_EQ(saved(saveIniFile, k), "[ZUBArray]\r\na=b=x\r\n-4=\r\n=\r\n sp =\r\n\r\n");
  // The line "=" is a single character and so is skipped by the reader.
  loadIniFile(k, path("out").c_str(), LoadReplace);
  EXPECT_EQ(entriesOf(k), "a=b=x|-4=|sp =");
}

// Line breaks, blank lines and prefixes of files are the model's (TextLoaders).
TEST_F(IniFile, ReaderRules) {
  const std::string text =
      "before=ignored\r\n"
      "[first]\r\n"
      "x=\r\n"
      "flag\r\n"
      "// comment=1\r\n"
      "  \t// indented comment\r\n"
      "y\r\n"
      "\t  key = value \r\n"
      "[bad\r\n"
      "[a] word\r\n"
      "z=1\r\n";
  ElementArray a = loaded(loadIniFile, text);
  EXPECT_EQ(entriesOf(a), "x=|flag=~|key = value |z=1");
}

TEST_F(IniFile, AppendAddsEveryEntry) {
  ElementArray a;
  a.appendValue(3);
  a = loaded(loadIniFile, "[s]\r\nk=v\r\n[t]\r\nm=n\r\n", std::move(a), LoadAppend);
  ASSERT_EQ(a.size(), 3);
  EXPECT_EQ(a.getValue(0), 3);
  EXPECT_STREQ(a.getString(1), "v");
  EXPECT_STREQ(a.getKeyString(2), "m");
}

}  // namespace
}  // namespace quorrel
