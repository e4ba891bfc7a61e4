#include "io/csv_file.h"

#include "io_test_support.h"

namespace quorrel {
namespace {

using CsvFile = IoTest;

// A table saved and loaded back is the file_csv case's; an empty cell read as a String
// of size 1 is the model's (text_loaders_model_test).
TEST_F(CsvFile, SavesTableRowsWithEmptyCellsAsTwoQuotes) {
  // One dimension, or a zero width, is one line; an empty table is an empty file.
  ElementArray c;
  EXPECT_EQ(saved(saveCsvFile, c), "\r\n");
  c.appendString("a");
  c.appendValue(0);
  c.appendValue(-5);
  c.appendFile({"bin", 3});
  EXPECT_EQ(saved(saveCsvFile, c), "a,\"\",-5,\"\"\r\n");
  c.setDimensions(2);  // X boundary still 0
  EXPECT_EQ(saved(saveCsvFile, c, FileModeAppend), "a,\"\",-5,\"\"\r\na,\"\",-5,\"\"\r\n");
  EXPECT_EQ(c.settings.fileMode, FileModeAppend);
  c.setDimensions(3);
  c.setBoundary(1, 3);
  EXPECT_EQ(saved(saveCsvFile, c), "a,\"\",-5\r\n\"\",\"\",\"\"\r\n");
  ElementArray empty = shaped(2, 3);
  EXPECT_EQ(saved(saveCsvFile, empty), "");
  EXPECT_TRUE(exists(path("out")));

  // Cells are taken as they stand: delimiters and line breaks inside them are not quoted.
  ElementArray s;
  s.appendString("x,y");
  s.appendString("l1\nl2");
  EXPECT_EQ(saved(saveCsvFile, s), "x,y,l1\nl2\r\n");
}

TEST_F(CsvFile, RowsWiderThanTheCapWriteNothing) {
  ElementArray a = shaped(2, INT32_MAX);
  a.appendString("a");
  writeBytes(path("out"), "old");
  EXPECT_EQ(saved(saveCsvFile, a), "old");  // not even truncated
  a.setBoundary(1, ElementArray::kMaxSize + 1);
  saveCsvFile(a, path("new.csv").c_str(), FileModeTruncate);
  EXPECT_FALSE(exists(path("new.csv")));
}

// Line breaks, blank lines and prefixes of files are the model's (TextLoaders).
TEST_F(CsvFile, LoadsRowsPaddedToTheWidestAtAnyLineBreak) {
  const struct {
    std::string bytes;
    int32_t width;
    std::string cells;
  } cases[] = {
      {"x,y,l1\nl2\r\n", 3, "x|y|l1|l2||"},
      {"\"x,y\", a ,12,,\"\"\"\",\r\n", 7, "\"x|y\"| a |12||\"\"\"\"|"},
      {"a\r\nb,c,d\r\ne,f\r\n", 3, "a|||b|c|d|e|f|"},
      // A zero byte ends the file.
      {std::string("a,b\nc,d\n\0e,f\n", 13), 2, "a|b|c|d"},
      // Several lone CRs before the first LF, then LFs past the last CR.
      {"x\ry\rz\nw,v\nu", 2, "x||y||z||w|v|u|"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.bytes);
    ElementArray a = loaded(loadCsvFile, c.bytes);
    EXPECT_EQ(a.dimensions(), 2);
    EXPECT_EQ(a.boundary(1), c.width);
    EXPECT_EQ(contents(a), c.cells);
  }
}

TEST_F(CsvFile, AppendAndEmptyFiles) {
  ElementArray a;
  for (int32_t v : {1, 2, 3}) a.appendValue(v);
  a.setKeyString("k", 0);
  a = loaded(loadCsvFile, "p,q\r\n", std::move(a), LoadAppend);
  EXPECT_EQ(a.dimensions(), 2);
  EXPECT_EQ(a.boundary(1), 2);
  EXPECT_STREQ(a.getKeyString(0), "k");
  EXPECT_EQ(contents(a), "#1|#2|#3|p|q");

  ElementArray c;
  c.appendValue(1);
  EXPECT_EQ(loaded(loadCsvFile, "", std::move(c)).size(), 0);
}

// Loading pads short lines to the widest; saving writes the padding as empty cells.
TEST_F(CsvFile, LoadThenSaveWritesEveryRowAtFullWidth) {
  ElementArray a = loaded(loadCsvFile, "a,\"\",b\n\nc\rd,\n");
  EXPECT_EQ(saved(saveCsvFile, a), "a,\"\",b\r\nc,\"\",\"\"\r\nd,\"\",\"\"\r\n");
}

}  // namespace
}  // namespace quorrel
