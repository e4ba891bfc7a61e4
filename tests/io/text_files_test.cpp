// The two text formats, CSV and INI: saves byte for byte, the readers' rules by hand,
// and both loaders against plain models of their rules.
#include <random>
#include <string>
#include <vector>

#include "io/csv_file.h"
#include "io/ini_file.h"
#include "io_test_support.h"

namespace quorrel {
namespace {

using CsvFile = IoTest;
using IniFile = IoTest;
using TextLoaders = IoTest;

// A table saved and loaded back is the file_csv case's; an empty cell read as a String
// of size 1 is the model's (TextLoaders below).
TEST_F(CsvFile, SavesTableRowsWithEmptyCellsAsTwoQuotes) {
  // One dimension, or a zero width, is one line; an empty table is an empty file.
  ElementArray c;
  EXPECT_EQ(saved(saveCsvFile, c), "\r\n");
  c = with(std::move(c), {"a", "#0", "#-5"});
  c.appendFile({"bin", 3});
  EXPECT_EQ(saved(saveCsvFile, c), "a,\"\",-5,\"\"\r\n");
  c.setDimensions(2);  // X boundary still 0
  EXPECT_EQ(saved(saveCsvFile, c, FileModeAppend), "a,\"\",-5,\"\"\r\na,\"\",-5,\"\"\r\n");
  c.setDimensions(3);
  c.setBoundary(1, 3);
  EXPECT_EQ(saved(saveCsvFile, c), "a,\"\",-5\r\n\"\",\"\",\"\"\r\n");
  ElementArray empty = shaped(2, 3);
  EXPECT_EQ(saved(saveCsvFile, empty), "");
  EXPECT_TRUE(exists(path("out")));

  // Cells are taken as they stand: delimiters and line breaks inside them are not quoted.
  ElementArray s = with({}, {"x,y", "l1\nl2"});
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

TEST_F(IniFile, SavesOneSectionWithALinePerElement) {
  ElementArray a = with({}, {"a", "#5"});
  a.setKeyString("k1", 0);
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

// The CSV and INI loaders against plain models of their rules, on random texts long
// enough that lines and cells cross the loaders' 8- and 16-byte scan blocks.

std::string randomText(std::mt19937& random, std::string_view alphabet) {
  std::string text(random() % 120, ' ');
  for (char& c : text) c = alphabet[random() % alphabet.size()];
  return text;
}

// Lines are the runs of characters between CR and LF; each line's cells are split at
// commas, a cell of two double quotes is empty, and short lines are padded to the
// widest. Returns the width, and the cells joined as contents() joins them.
std::pair<int32_t, std::string> csvModel(const std::string& text) {
  std::vector<std::vector<std::string>> lines;
  std::string line;
  const auto endLine = [&] {
    if (line.empty()) return;
    std::vector<std::string>& cells = lines.emplace_back(1);
    for (char c : line) {
      if (c == ',') {
        cells.emplace_back();
      } else {
        cells.back().push_back(c);
      }
    }
    for (std::string& cell : cells) cell = cell == "\"\"" ? "" : cell;
    line.clear();
  };
  for (char c : text) c == '\r' || c == '\n' ? endLine() : line.push_back(c);
  endLine();
  size_t width = 0;
  for (const auto& cells : lines) width = std::max(width, cells.size());
  std::string joined;
  bool first = true;
  for (const auto& cells : lines) {
    for (size_t j = 0; j < width; ++j) {
      joined += first ? "" : "|";
      first = false;
      if (j < cells.size()) joined += cells[j];
    }
  }
  return {static_cast<int32_t>(width), joined};
}

// Entries of every section in order: a line of two or more characters that starts
// (after blanks) with "[" and has a "]" later opens a section; "//" lines and entry
// lines before the first section are skipped; the first "=" splits key and value, and
// a line without one has no value ("~"). Joined as entriesOf() joins them.
std::string iniModel(const std::string& text) {
  std::string joined, line;
  bool inSection = false, first = true;
  const auto endLine = [&] {
    const std::string l = line;
    line.clear();
    if (l.size() <= 1) return;
    const size_t p = l.find_first_not_of(" \t");
    const std::string rest = p == std::string::npos ? "" : l.substr(p);
    if (!rest.empty() && rest[0] == '[') {
      if (rest.find(']', 1) != std::string::npos) inSection = true;
      return;
    }
    if (rest.starts_with("//") || !inSection) return;
    const size_t equals = rest.find('=');
    joined += (first ? "" : "|") + (equals == std::string::npos ? rest + "=~" : rest);
    first = false;
  };
  for (char c : text) c == '\r' || c == '\n' ? endLine() : line.push_back(c);
  endLine();
  return joined;
}

TEST_F(TextLoaders, AgreeWithTheirModelsOnRandomTexts) {
  std::mt19937 random(21);
  for (int round = 0; round < 400; ++round) {
    const std::string csv = randomText(random, "ab,,,\r\n\"  xyz");
    SCOPED_TRACE(csv);
    ElementArray table = loaded(loadCsvFile, csv);
    const auto [width, cells] = csvModel(csv);
    EXPECT_EQ(table.dimensions(), 2);
    EXPECT_EQ(table.boundary(1), width);
    EXPECT_EQ(contents(table), cells);

    const std::string ini = "[s]\n" + randomText(random, "ab==[]//  \r\n\nkv");
    SCOPED_TRACE(ini);
    ElementArray entries = loaded(loadIniFile, ini);
    EXPECT_EQ(entriesOf(entries), iniModel(ini));
  }
}

}  // namespace
}  // namespace quorrel
