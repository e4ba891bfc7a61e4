#include "io/csv_file.h"

#include "io_test_support.h"

namespace quorrel {
namespace {

using CsvFile = IoTest;

std::vector<std::string> textsOf(ElementArray& a) {
  std::vector<std::string> texts;
  for (int32_t i = 0; i < a.size(); ++i) {
    EXPECT_EQ(a.at(i).type(), ElementType::String) << "element " << i;
    texts.emplace_back(a.getString(i));
  }
  return texts;
}

using Texts = std::vector<std::string>;

TEST_F(CsvFile, SavesTableRowsWithEmptyCellsAsTwoQuotes) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, 2);
  a.appendString("name");
  a.appendString("age");
  a.appendValue(7);
  saveCsvFile(a, path("t.csv").c_str(), 0);
  EXPECT_EQ(readBytes(path("t.csv")), "name,age\r\n7,\"\"\r\n");

  ElementArray b;
  loadCsvFile(b, path("t.csv").c_str(), 0);
  EXPECT_EQ(b.dimensions(), 2);
  EXPECT_EQ(b.boundary(1), 2);
  EXPECT_EQ(textsOf(b), (Texts{"name", "age", "7", ""}));
  EXPECT_EQ(b.at(3).size(), 1);
}

TEST_F(CsvFile, SavesOneDimensionAndZeroWidthArraysOnOneLine) {
  ElementArray a;
  saveCsvFile(a, path("e1.csv").c_str(), 0);
  EXPECT_EQ(readBytes(path("e1.csv")), "\r\n");
  a.appendString("a");
  a.appendValue(0);
  a.appendValue(-5);
  a.appendFile({"bin", 3});
  saveCsvFile(a, path("one.csv").c_str(), 0);
  EXPECT_EQ(readBytes(path("one.csv")), "a,\"\",-5,\"\"\r\n");
  a.setDimensions(2);  // X boundary still 0
  saveCsvFile(a, path("x0.csv").c_str(), 1);
  EXPECT_EQ(a.fileMode, 1);
  EXPECT_EQ(readBytes(path("x0.csv")), "a,\"\",-5,\"\"\r\n");
  a.setDimensions(3);
  a.setBoundary(1, 3);
  saveCsvFile(a, path("x3.csv").c_str(), 0);
  EXPECT_EQ(readBytes(path("x3.csv")), "a,\"\",-5\r\n\"\",\"\",\"\"\r\n");

  ElementArray empty2;
  empty2.setDimensions(2);
  empty2.setBoundary(1, 3);
  writeBytes(path("e2.csv"), "old");
  saveCsvFile(empty2, path("e2.csv").c_str(), 0);
  EXPECT_TRUE(exists(path("e2.csv")));
  EXPECT_EQ(readBytes(path("e2.csv")), "");
}

TEST_F(CsvFile, RowsWiderThanTheCapWriteNothing) {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, INT32_MAX);
  a.appendString("a");
  writeBytes(path("wide.csv"), "old");
  saveCsvFile(a, path("wide.csv").c_str(), 0);
  EXPECT_EQ(readBytes(path("wide.csv")), "old");  // not even truncated
  a.setBoundary(1, ElementArray::kMaxSize + 1);
  saveCsvFile(a, path("new.csv").c_str(), 0);
  EXPECT_FALSE(std::filesystem::exists(path("new.csv")));
}

TEST_F(CsvFile, CellsAreTakenAsTheyStand) {
  ElementArray a;
  a.appendString("x,y");
  a.appendString("l1\nl2");
  saveCsvFile(a, path("s.csv").c_str(), 0);
  EXPECT_EQ(readBytes(path("s.csv")), "x,y,l1\nl2\r\n");
  ElementArray b;
  loadCsvFile(b, path("s.csv").c_str(), 0);
  EXPECT_EQ(b.boundary(1), 3);
  EXPECT_EQ(textsOf(b), (Texts{"x", "y", "l1", "l2", "", ""}));

  writeBytes(path("q.csv"), "\"x,y\", a ,12,,\"\"\"\",\r\n");
  ElementArray c;
  loadCsvFile(c, path("q.csv").c_str(), 0);
  EXPECT_EQ(textsOf(c), (Texts{"\"x", "y\"", " a ", "12", "", "\"\"\"\"", ""}));
  EXPECT_EQ(c.getValue(3), 12);
}

TEST_F(CsvFile, RowsOfUnequalLengthArePadded) {
  writeBytes(path("u.csv"), "a\r\nb,c,d\r\ne,f\r\n");
  ElementArray a;
  loadCsvFile(a, path("u.csv").c_str(), 0);
  EXPECT_EQ(a.dimensions(), 2);
  EXPECT_EQ(a.boundary(1), 3);
  EXPECT_EQ(textsOf(a), (Texts{"a", "", "", "b", "c", "d", "e", "f", ""}));
}

TEST_F(CsvFile, AnyLineBreakSeparatesAndBlankLinesVanish) {
  for (const std::string& text :
       Texts{"a,b\r\nc,d\r\n", "a,b\nc,d", "a,b\rc,d\r", "\r\n\na,b\n\n\r\rc,d\n\n",
             std::string("a,b\nc,d\n\0e,f\n", 13)}) {
    SCOPED_TRACE(text);
    writeBytes(path("l.csv"), text);
    ElementArray a;
    loadCsvFile(a, path("l.csv").c_str(), 0);
    EXPECT_EQ(textsOf(a), (Texts{"a", "b", "c", "d"}));
  }
  // Several lone CRs before the first LF, then LFs past the last CR.
  writeBytes(path("m.csv"), "x\ry\rz\nw,v\nu");
  ElementArray m;
  loadCsvFile(m, path("m.csv").c_str(), 0);
  EXPECT_EQ(textsOf(m), (Texts{"x", "", "y", "", "z", "", "w", "v", "u", ""}));
}

TEST_F(CsvFile, AppendAndFailedOpens) {
  writeBytes(path("a.csv"), "p,q\r\n");
  ElementArray a;
  a.appendValue(1);
  a.appendValue(2);
  a.appendValue(3);
  a.setKeyString("k", 0);
  loadCsvFile(a, path("a.csv").c_str(), 1);
  ASSERT_EQ(a.size(), 5);
  EXPECT_EQ(a.dimensions(), 2);
  EXPECT_EQ(a.boundary(1), 2);
  EXPECT_STREQ(a.getKeyString(0), "k");
  EXPECT_STREQ(a.getString(3), "p");
  EXPECT_STREQ(a.getString(4), "q");

  for (const std::string& file : {path("missing.csv"), dir_.string()}) {
    ElementArray b;
    b.setDimensions(3);
    b.setBoundary(1, 4);
    b.appendValue(9);
    loadCsvFile(b, file.c_str(), 1);
    EXPECT_EQ(b.size(), 1);
    EXPECT_EQ(b.dimensions(), 2);
    loadCsvFile(b, file.c_str(), 0);
    EXPECT_EQ(b.size(), 0);
    EXPECT_EQ(b.dimensions(), 2);
    EXPECT_EQ(b.boundary(1), 4);
    EXPECT_FALSE(readCsvFile(file.c_str()).has_value());
  }
  writeBytes(path("empty.csv"), "");
  ElementArray c;
  c.appendValue(1);
  loadCsvFile(c, path("empty.csv").c_str(), 0);
  EXPECT_EQ(c.size(), 0);
  auto table = readCsvFile(path("empty.csv").c_str());
  ASSERT_TRUE(table.has_value());
  EXPECT_EQ(table->rowCount(), 0);
}

TEST_F(CsvFile, TableReadAndWrite) {
  writeBytes(path("r.csv"), "a,\"\",b\n\nc\rd,\n");
  auto table = readCsvFile(path("r.csv").c_str());
  ASSERT_TRUE(table.has_value());
  ASSERT_EQ(table->rowCount(), 3);
  ASSERT_EQ(table->rows[0].cellCount(), 3);
  EXPECT_STREQ(table->rows[0].cells[1], "");
  EXPECT_STREQ(table->rows[0].cells[2], "b");
  EXPECT_EQ(table->rows[1].cellCount(), 1);
  EXPECT_EQ(table->rows[2].cellCount(), 2);
  writeCsvFile(path("w.csv").c_str(), *table, 0);
  EXPECT_EQ(readBytes(path("w.csv")), "a,\"\",b\r\nc\r\nd,\"\"\r\n");

  CsvTable built;
  built.rows.push_back({{"x", nullptr, ""}});
  built.rows.push_back({});
  writeCsvFile(path("w.csv").c_str(), built, 1);
  EXPECT_EQ(readBytes(path("w.csv")), "a,\"\",b\r\nc\r\nd,\"\"\r\nx,\"\",\"\"\r\n\r\n");
  writeCsvFile(path("w.csv").c_str(), CsvTable{}, 0);
  EXPECT_EQ(readBytes(path("w.csv")), "");
}

TEST_F(CsvFile, TruncatedFileLoadsItsPrefix) {
  const std::string full = "a,b\r\nc\r\n";
  const Texts expected[] = {{},
                            {"a"},
                            {"a", ""},
                            {"a", "b"},
                            {"a", "b"},
                            {"a", "b"},
                            {"a", "b", "c", ""},
                            {"a", "b", "c", ""},
                            {"a", "b", "c", ""}};
  ASSERT_EQ(full.size() + 1, std::size(expected));
  for (size_t n = 0; n <= full.size(); ++n) {
    SCOPED_TRACE(n);
    writeBytes(path("t.csv"), full.substr(0, n));
    ElementArray a;
    loadCsvFile(a, path("t.csv").c_str(), 0);
    EXPECT_EQ(textsOf(a), expected[n]);
    EXPECT_EQ(a.dimensions(), 2);
  }
}

TEST_F(CsvFile, ReadTextFileStopsAtAZeroByte) {
  writeBytes(path("z.txt"), std::string("ab\0cd", 5));
  auto text = readTextFile(path("z.txt").c_str());
  ASSERT_TRUE(text.has_value());
  EXPECT_EQ(text->size(), 2u);
  EXPECT_STREQ(text->data(), "ab");
  EXPECT_FALSE(readTextFile(path("none.txt").c_str()).has_value());
}

}  // namespace
}  // namespace quorrel
