#include "io/host_array_file.h"

#include "io_test_support.h"

namespace quorrel {
namespace {

using HostArrayFile = IoTest;

std::string head(int32_t version, int32_t x, int32_t y, int32_t z, int32_t kind) {
  return std::string("CNC ARRAY\0", 10) + le32(version) + le32(x) + le32(y) + le32(z) + le32(kind);
}

// Three-dimensional, X 2, Y 2: the string a, the value 5, an empty string.
const std::string kExample =
    head(2, 2, 2, 1, 2) + le32(1) + "a" + le32(1) + "5" + le32(0) + le32(0);

TEST_F(HostArrayFile, WritesTheExampleByteForByte) {
  ASSERT_EQ(kExample.size(), 48u);
  ElementArray a = shaped(3, 2, 2);
  a.appendString("a");
  a.appendValue(5);
  a.appendString("");
  a.setKeyString("key", 0);
  EXPECT_EQ(saved(saveHostArrayFile, a), kExample);
  EXPECT_EQ(a.settings.fileMode, FileModeTruncate);
  // Exactly X x Y elements still get a further, empty layer.
  a.appendFile({"bin", 3});
  EXPECT_EQ(saved(saveHostArrayFile, a),
            head(2, 2, 2, 2, 2) + le32(1) + "a" + le32(1) + "5" + std::string(24, '\0'));

  // Zero sizes count as one.
  ElementArray b;  // one dimension: X and Y are 0
  b.appendValue(-12);
  b.appendString("xy");
  EXPECT_EQ(saved(saveHostArrayFile, b),
            head(2, 1, 1, 3, 2) + le32(3) + "-12" + le32(2) + "xy" + le32(0));
  ElementArray empty = shaped(2, 3);
  saveHostArrayFile(empty, path("empty.arr").c_str(), FileModeAppend);
  EXPECT_EQ(empty.settings.fileMode, FileModeAppend);
  EXPECT_EQ(readBytes(path("empty.arr")), head(2, 3, 1, 1, 2) + le32(0) + le32(0) + le32(0));
}

TEST_F(HostArrayFile, LoadsTextAndNumberCells) {
  ElementArray n = loaded(loadHostArrayFile, head(2, 2, 1, 1, 1) + le32(7) + le32(0));
  EXPECT_EQ(contents(n), "#7|~");
  EXPECT_EQ(n.boundary(2), 1);
  // Kind 5 reads numbers and kind 6 texts, like 1 and 2.
  n = loaded(loadHostArrayFile, head(2, 1, 1, 1, 5) + le32(-9));
  EXPECT_EQ(contents(n), "#-9");
  n = loaded(loadHostArrayFile, head(2, 1, 1, 1, 6) + le32(2) + "hi");
  EXPECT_EQ(contents(n), "hi");

  // Text cells of a version other than 2 carry no bytes.
  ElementArray a = loaded(loadHostArrayFile, head(1, 2, 1, 2, 2) + le32(1) + "a");
  EXPECT_EQ(contents(a), "~|~|~|~");
  // An unknown kind loads nothing, yet the replacing load still clears and takes X, Y.
  a = loaded(loadHostArrayFile, head(2, 2, 1, 1, 3) + le32(1) + "a", std::move(a));
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(a.dimensions(), 3);
  EXPECT_EQ(a.boundary(1), 2);
}

TEST_F(HostArrayFile, MoreCellsThanAnArrayHoldsWriteNothing) {
  ElementArray a = shaped(3, INT32_MAX);
  a.appendString("a");
  writeBytes(path("out"), "old");
  EXPECT_EQ(saved(saveHostArrayFile, a), "old");  // not even truncated
  a.setBoundary(1, 65536);
  a.setBoundary(2, 65536);  // 2^32 cells: wraps to 0 in 32 bits
  saveHostArrayFile(a, path("square.arr").c_str(), FileModeTruncate);
  EXPECT_FALSE(exists(path("square.arr")));
  a.appendString("b");
  a.appendString("c");
  a.setBoundary(1, INT32_MAX);
  a.setBoundary(2, INT32_MAX);  // X × Y wraps to 1, so Z = size + 1 = 4: X × Y × Z > 2^63
  saveHostArrayFile(a, path("huge.arr").c_str(), FileModeTruncate);
  EXPECT_FALSE(exists(path("huge.arr")));

  // Wide but within the cap: every empty cell is written, 4 bytes each.
  a.setBoundary(1, 65536);
  a.setBoundary(2, 5);
  EXPECT_EQ(saved(saveHostArrayFile, a).size(), 30u + 4u * 65536 * 5 + 3u);  // "a" "b" "c"
}

// A 30-byte file may declare up to 16,777,216 byteless cells, and one more reads none.
TEST_F(HostArrayFile, ByteLessCellsUpToTheLimit) {
  ElementArray a = shaped(2, 3);
  a.appendString("first");
  a = loaded(loadHostArrayFile, head(1, 4096, 4096, 1, 2), std::move(a), LoadAppend);
  ASSERT_EQ(a.size(), 1 + 16777216);
  EXPECT_STREQ(a.getString(0), "first");
  EXPECT_EQ(a.at(16777216).type(), ElementType::None);
  EXPECT_EQ(a.rowStates.size(), static_cast<std::size_t>((1 + 16777216) / 3));
  a = loaded(loadHostArrayFile, head(1, 4097, 4096, 1, 2), std::move(a));
  EXPECT_EQ(a.size(), 0);
  EXPECT_EQ(a.boundary(1), 4097);
}

TEST_F(HostArrayFile, AppendKeepsDimensions) {
  ElementArray a = shaped(2, 7);
  a.appendValue(1);
  a = loaded(loadHostArrayFile, kExample, std::move(a), LoadAppend);
  EXPECT_EQ(contents(a), "#1|a|5|~|~");
  EXPECT_EQ(a.dimensions(), 2);
  EXPECT_EQ(a.boundary(1), 7);
}

// Number cells come back as Values and go out again as their decimal text.
TEST_F(HostArrayFile, NumberCellsAreSavedAsText) {
  ElementArray a = loaded(loadHostArrayFile, head(2, 2, 1, 1, 1) + le32(-7) + le32(40));
  EXPECT_EQ(saved(saveHostArrayFile, a),
            head(2, 2, 1, 2, 2) + le32(2) + "-7" + le32(2) + "40" + le32(0) + le32(0));
}

// Offsets of the example: version 10-13, X 14-17, Y 18-21, Z 22-25, kind 26-29; cells
// at 30 (text at 34), 35 (text at 39), 40 and 44. A cell cut inside its text keeps
// what the file holds; a cell starting at or past the end does not exist. The whole
// file is the example: what the array held goes, its labels stay, cells have no key.
TEST_F(HostArrayFile, TruncatedExampleLoadsWhatItHolds) {
  for (size_t n = 0; n <= kExample.size(); ++n) {
    SCOPED_TRACE(n);
    ElementArray old;
    old.appendString("old");
    old.labels = LabelList{"keep"};
    ElementArray a = loaded(loadHostArrayFile, kExample.substr(0, n), std::move(old));
    EXPECT_EQ(a.labels, LabelList{"keep"});
    EXPECT_EQ(a.dimensions(), n < 10 ? 0 : 3);
    EXPECT_EQ(a.boundaryEntry(1), n >= 15 ? 2 : 0);
    EXPECT_EQ(a.boundaryEntry(2), n >= 19 ? 2 : 0);
    const int32_t cells = n < 27 ? 0 : (n > 30) + (n > 35) + (n > 40) + (n > 44);
    ASSERT_EQ(a.size(), cells);
    if (cells >= 1) {
      EXPECT_EQ(a.at(0).type(), ElementType::String);
      EXPECT_FALSE(a.at(0).hasKey());
      EXPECT_STREQ(a.getString(0), n < 35 ? "" : "a");
    }
    if (cells >= 2) {
      EXPECT_STREQ(a.getString(1), n < 40 ? "" : "5");
    }
    if (cells >= 3) {
      EXPECT_EQ(a.at(2).type(), ElementType::None);
    }
  }
}

TEST_F(HostArrayFile, MeasureSaysWhereTheCellsEnd) {
  // The example's cells start at bytes 30, 35, 40 and 44; the file ends at 48.
  const FileExtent whole = measureHostFile(kExample + "xyz");
  EXPECT_TRUE(whole.usable);
  EXPECT_EQ(whole.declared, 4);
  EXPECT_EQ(whole.read, 4);
  EXPECT_FALSE(whole.endsInsideRecord);
  EXPECT_EQ(whole.end, 48u);
  const FileExtent inside = measureHostFile(kExample.substr(0, 38));  // in cell 1's length
  EXPECT_EQ(inside.read, 2);
  EXPECT_TRUE(inside.endsInsideRecord);
  EXPECT_EQ(inside.lastRecordStart, 35u);
  const FileExtent between = measureHostFile(kExample.substr(0, 40));  // after cell 1
  EXPECT_EQ(between.read, 2);
  EXPECT_FALSE(between.endsInsideRecord);
  EXPECT_EQ(between.end, 40u);
  const FileExtent numbers = measureHostFile(head(2, 2, 1, 1, 1) + le32(7) + "ab");
  EXPECT_EQ(numbers.read, 2);
  EXPECT_TRUE(numbers.endsInsideRecord);
  EXPECT_EQ(numbers.lastRecordStart, 34u);
  EXPECT_FALSE(measureHostFile("CNC ARR").usable);
}

TEST_F(HostArrayFile, HostileSizesReadNoCellsOrOnlyWhatIsThere) {
  const std::string cells = le32(1) + "a" + le32(1) + "b";
  for (const std::string& bytes :
       {head(2, -1, 1, 1, 2) + cells, head(2, 1, -5, 1, 1) + cells,
        head(2, 1, 1, INT32_MIN, 2) + cells, head(2, 65536, 65536, 1, 2) + cells,
        head(2, 2, 1 << 20, 1 << 20, 1) + cells, head(1, 4097, 4096, 1, 2),
        head(2, 0, 5, 5, 2) + cells}) {
    ElementArray a = loaded(loadHostArrayFile, bytes);
    EXPECT_EQ(a.size(), 0);
    EXPECT_EQ(a.dimensions(), 3);
  }
  // A huge but valid count reads only the cells the file holds.
  ElementArray n =
      loaded(loadHostArrayFile, head(2, INT32_MAX, 1, 1, 1) + le32(4) + le32(5) + "\x06");
  EXPECT_EQ(contents(n), "#4|#5|#6");
  ElementArray t = loaded(loadHostArrayFile, head(2, 3, 1, 1, 2) + le32(INT32_MAX) + "abc");
  EXPECT_EQ(contents(t), "abc");
  ElementArray g = loaded(loadHostArrayFile, head(2, 2, 1, 1, 2) + le32(-1) + le32(-1));
  EXPECT_EQ(contents(g), "~|~");
}

}  // namespace
}  // namespace quorrel
