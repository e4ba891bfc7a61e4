// The two array file formats, native and host: files written byte for byte, and loads
// of whole, cut and hostile files.
#include "io/host_array_file.h"
#include "io/native_file.h"
#include "io_test_support.h"

namespace quorrel {
namespace {

using NativeFile = IoTest;

const std::string kMagic = "ZUBARRAY";

// A two-dimensional array, X boundary 3, no labels: "ab" without key, then 7 with the
// string key "k".
const std::string kNativeExample =
    kMagic +
    bytesOf({0x01, 0x00, 0x02, 0, 0, 0, 0x03, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0x02, 0, 0, 0,
             // record 0
             0x02, 0x00, 0x03, 0, 0, 0, 0x61, 0x62, 0x00, 0x00, 0x00, 0, 0, 0, 0,
             // record 1
             0x01, 0x00, 0x04, 0, 0, 0, 0x07, 0, 0, 0, 0x02, 0x00, 0x02, 0, 0, 0, 0x6B, 0x00});
// The head of a one-dimensional file without labels, up to the label count.
const std::string kHead = kMagic + le16(1) + le32(1) + le32(0);

ElementArray exampleArray() {
  ElementArray a = with(shaped(2, 3), {"ab", "#7"});
  a.setKeyString("k", 1);
  return a;
}

TEST_F(NativeFile, WritesTheExampleAndTheEmptyArrayByteForByte) {
  ElementArray a = exampleArray();
  EXPECT_EQ(saved(saveNativeFile, a), kNativeExample);

  ElementArray empty;
  const std::string expected = kHead + le32(0) + le32(0);
  EXPECT_EQ(saved(saveNativeFile, empty), expected);
  // Mode 1 appends a second copy; mode 0 truncates again.
  EXPECT_EQ(saved(saveNativeFile, empty, FileModeAppend), expected + expected);
  EXPECT_EQ(saved(saveNativeFile, empty, FileModeTruncate), expected);

  ElementArray b = with(shaped(3, 4, 5), {"#0", ""});
  b.appendFile({"x\0y", 3});
  b.setKeyValue(-2, 2);
  EXPECT_EQ(saved(saveNativeFile, b),
            kMagic + le16(1) + le32(3) + le32(4) + le32(5) + le32(0) + le32(0) + le32(3) + le16(0) +
                le32(0) + le16(0) + le32(0) +                           // 0 is None
                le16(2) + le32(1) + bytesOf({0}) + le16(0) + le32(0) +  // ""
                le16(3) + le32(3) + bytesOf({'x', 0, 'y'}) + le16(1) + le32(4) + le32(-2));
}

TEST_F(NativeFile, LabelsTravelAndLengthZeroLeavesAColumnAlone) {
  ElementArray a = exampleArray();
  a.labels = LabelList{"name", std::nullopt, "age"};
  const std::string labelPart = le32(3) + le32(4) + "name" + le32(0) + le32(3) + "age";
  EXPECT_EQ(saved(saveNativeFile, a).substr(22, labelPart.size()), labelPart);

  ElementArray b = shaped(2, 3);
  b.labels = LabelList{"x", "y", "z"};
  loadNativeFile(b, path("out").c_str(), LoadReplace);
  EXPECT_EQ(b.labels, (LabelList{"name", "y", "age"}));
  // Labels only apply to a two-dimensional array, within its columns.
  ElementArray c = shaped(1);
  loadNativeFile(c, path("out").c_str(), LoadAppend);
  EXPECT_FALSE(c.labels.has_value());
  ElementArray d = shaped(2, 2);
  loadNativeFile(d, path("out").c_str(), LoadAppend);
  EXPECT_EQ(d.labels, (LabelList{"name", std::nullopt}));
}

// Files that cannot be used are the file_unusable script case's; versions 0 and 0xFFFF
// (negative) read like 1.
TEST_F(NativeFile, VersionsBelowTwoAreRead) {
  for (uint16_t version : {uint16_t{0}, uint16_t{0xFFFF}}) {
    EXPECT_EQ(loaded(loadNativeFile, kMagic + le16(version) + kNativeExample.substr(10)).size(), 2);
  }
}

// A hand-made file with labels (one of length 0), keys of every type and a File with
// zero bytes: loading it and saving the array again gives back the same bytes.
TEST_F(NativeFile, LoadThenSaveReproducesTheFile) {
  const std::string bytes = kMagic + le16(1) + le32(2) + le32(3) + le32(0) + le32(3) + le32(1) +
                            "p" + le32(0) + le32(2) + "qq" + le32(4) +
                            // "ab", no key
                            le16(2) + le32(3) + "ab" + bytesOf({0}) + le16(0) + le32(0) +
                            // 7, key "k"
                            le16(1) + le32(4) + le32(7) + le16(2) + le32(2) + "k" + bytesOf({0}) +
                            // a File of 3 bytes, key a File of 1 zero byte
                            le16(3) + le32(3) + bytesOf({0, 1, 2}) + le16(3) + le32(1) +
                            bytesOf({0}) +
                            // None, key -2
                            le16(0) + le32(0) + le16(1) + le32(4) + le32(-2);
  ElementArray a = loaded(loadNativeFile, bytes);
  EXPECT_EQ(contents(a), "ab|#7|<" + bytesOf({0, 1, 2}) + ">|~");
  EXPECT_EQ(a.getKeyValue(3), -2);
  EXPECT_EQ(a.labels, (LabelList{"p", std::nullopt, "qq"}));
  EXPECT_EQ(saved(saveNativeFile, a), bytes);
}

// Cuts the example after every byte and checks what each prefix loads. Field offsets:
// D 10-13, boundary 1 14-17, N 26-29; record 0 at 30 (size 32-35, text 36-38, key
// 39-44); record 1 at 45 (size 47-50, number 51-54, key type 55-56, key size 57-60,
// key text 61-62). Missing bytes read as zero; records starting past the end do not exist.
// The whole file (n = 63) is the example; what the array held before is gone.
TEST_F(NativeFile, TruncatedExampleLoadsWhatItHolds) {
  for (size_t n = 0; n <= kNativeExample.size(); ++n) {
    SCOPED_TRACE(n);
    ElementArray a = loaded(loadNativeFile, kNativeExample.substr(0, n), with({}, {"old"}));
    EXPECT_EQ(a.dimensions(), n >= 11 ? 2 : 0);
    EXPECT_EQ(a.boundaryEntry(1), n >= 15 ? 3 : 0);
    const int32_t records = n > 45 ? 2 : (n > 30 ? 1 : 0);
    ASSERT_EQ(a.size(), records);
    const std::string first = n < 33 ? "~" : n < 37 ? "" : n == 37 ? "a" : "ab";
    EXPECT_EQ(contents(a),
              records < 2 ? (records == 0 ? "" : first) : first + (n < 52 ? "|~" : "|#7"));
    for (int32_t i = 0; i < records; ++i) {
      ASSERT_TRUE(a.at(i).hasKey());
      // Record 0 was saved without key; record 1's "k" is there as far as the file goes.
      const Element& key = *a.at(i).key();
      EXPECT_EQ(key.type(), i == 1 && n >= 58 ? ElementType::String : ElementType::None);
      EXPECT_STREQ(key.type() == ElementType::String ? key.bytes() : "",
                   i == 1 && n >= 62 ? "k" : "");
    }
  }
}

TEST_F(NativeFile, HostileCountsAndSizesAreBoundedByTheFile) {
  // Huge and negative label and element counts; a huge label count lets the second
  // label swallow the rest of the file.
  for (int32_t count : {INT32_MAX, -1}) {
    const std::string bytes =
        kHead + le32(count) + le32(2) + "ab" + le32(count) + le16(2) + le32(2) + "x";
    EXPECT_LE(loaded(loadNativeFile, bytes).size(), 2);
    const ElementArray labelled = loaded(loadNativeFile, bytes, shaped(2, 2), LoadAppend);
    EXPECT_EQ(labelled.labels,
              count > 0 ? std::optional<LabelList>(LabelList{"ab", "\x02"}) : std::nullopt);
  }
  // A file block claiming more bytes than any file holds keeps what is there; a block
  // the end cuts short (but not beyond the file's size) is completed with zeros.
  ElementArray a =
      loaded(loadNativeFile, kHead + le32(0) + le32(1) + le16(3) + le32(INT32_MAX) + "abc");
  EXPECT_EQ(contents(a), "<abc>");
  a = loaded(loadNativeFile, kHead + le32(0) + le32(1) + le16(3) + le32(10) + "abc");
  EXPECT_EQ(contents(a), "<abc" + std::string(7, '\0') + ">");
  // A negative key size.
  a = loaded(loadNativeFile,
             kHead + le32(0) + le32(1) + le16(0) + le32(0) + le16(2) + le32(-7) + le16(2));
  ASSERT_EQ(a.size(), 1);
  EXPECT_EQ(a.at(0).key()->type(), ElementType::None);
  // A dimension count of -5 reads no boundaries and is taken as it is.
  a = loaded(loadNativeFile, kMagic + le16(1) + le32(-5) + le32(0) + le32(1) + le16(2) + le32(2) +
                                 "q" + bytesOf({0}) + le16(0) + le32(0));
  EXPECT_EQ(a.dimensions(), -5);
  EXPECT_EQ(contents(a), "q");
  // A huge X boundary with a label: the label list is not blown up to that length.
  a = loaded(loadNativeFile, kMagic + le16(1) + le32(2) + le32(INT32_MAX) + le32(0) + le32(1) +
                                 le32(1) + "L" + le32(0));
  EXPECT_EQ(a.boundary(1), INT32_MAX);
  EXPECT_FALSE(a.labels.has_value());
}

using HostArrayFile = IoTest;

std::string head(int32_t version, int32_t x, int32_t y, int32_t z, int32_t kind) {
  return std::string("CNC ARRAY\0", 10) + le32(version) + le32(x) + le32(y) + le32(z) + le32(kind);
}

// Three-dimensional, X 2, Y 2: the string a, the value 5, an empty string.
const std::string kHostExample =
    head(2, 2, 2, 1, 2) + le32(1) + "a" + le32(1) + "5" + le32(0) + le32(0);

TEST_F(HostArrayFile, WritesTheExampleByteForByte) {
  ElementArray a = with(shaped(3, 2, 2), {"a", "#5", ""});
  a.setKeyString("key", 0);
  EXPECT_EQ(saved(saveHostArrayFile, a), kHostExample);
  // Exactly X x Y elements still get a further, empty layer.
  a.appendFile({"bin", 3});
  EXPECT_EQ(saved(saveHostArrayFile, a),
            head(2, 2, 2, 2, 2) + le32(1) + "a" + le32(1) + "5" + std::string(24, '\0'));

  // Zero sizes count as one.
  ElementArray b = with({}, {"#-12", "xy"});  // one dimension: X and Y are 0
  EXPECT_EQ(saved(saveHostArrayFile, b),
            head(2, 1, 1, 3, 2) + le32(3) + "-12" + le32(2) + "xy" + le32(0));
  ElementArray empty = shaped(2, 3);
  saveHostArrayFile(empty, path("empty.arr").c_str(), FileModeAppend);
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
  a = with(std::move(a), {"b", "c"});
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

// An appending load of either format adds after the array's own elements, which keep
// their keys, and leaves the array's dimensions and boundaries.
TEST_F(HostArrayFile, AppendingLoadsOfBothFormatsKeepTheArraysShape) {
  const struct {
    FileStatus (*load)(ElementArray&, const char*, LoadMode);
    const std::string& bytes;
    const char *added, *key3;
  } cases[] = {{loadNativeFile, kNativeExample, "|ab|#7", "k"},
               {loadHostArrayFile, kHostExample, "|a|5|~|~", nullptr}};
  for (const auto& c : cases) {
    ElementArray a = with(shaped(3, 5, 6), {"#1", "#2"});
    a.setKeyString("k1", 0);
    a = loaded(c.load, c.bytes, std::move(a), LoadAppend);
    EXPECT_EQ(contents(a), "#1|#2" + std::string(c.added));
    EXPECT_EQ(a.dimensions(), 3);
    EXPECT_EQ(a.boundary(1), 5);
    EXPECT_EQ(a.boundary(2), 6);
    EXPECT_STREQ(a.getKeyString(0), "k1");
    EXPECT_FALSE(a.at(1).hasKey());
    EXPECT_STREQ(a.getKeyString(3), c.key3);
  }
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
  for (size_t n = 0; n <= kHostExample.size(); ++n) {
    SCOPED_TRACE(n);
    ElementArray old = with({}, {"old"});
    old.labels = LabelList{"keep"};
    ElementArray a = loaded(loadHostArrayFile, kHostExample.substr(0, n), std::move(old));
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
  const FileExtent whole = measureHostFile(kHostExample + "xyz");
  EXPECT_TRUE(whole.usable);
  EXPECT_EQ(whole.declared, 4);
  EXPECT_EQ(whole.read, 4);
  EXPECT_FALSE(whole.endsInsideRecord);
  EXPECT_EQ(whole.end, 48u);
  const FileExtent inside = measureHostFile(kHostExample.substr(0, 38));  // in cell 1's length
  EXPECT_EQ(inside.read, 2);
  EXPECT_TRUE(inside.endsInsideRecord);
  EXPECT_EQ(inside.lastRecordStart, 35u);
  const FileExtent between = measureHostFile(kHostExample.substr(0, 40));  // after cell 1
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
