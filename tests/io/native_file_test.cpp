#include "io/native_file.h"

#include "io_test_support.h"

namespace quorrel {
namespace {

using NativeFile = IoTest;

const std::string kMagic = "ZUBARRAY";

// A two-dimensional array, X boundary 3, no labels: "ab" without key, then 7 with the
// string key "k".
const std::string kExample =
    kMagic +
    bytesOf({0x01, 0x00, 0x02, 0, 0, 0, 0x03, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0x02, 0, 0, 0,
             // record 0
             0x02, 0x00, 0x03, 0, 0, 0, 0x61, 0x62, 0x00, 0x00, 0x00, 0, 0, 0, 0,
             // record 1
             0x01, 0x00, 0x04, 0, 0, 0, 0x07, 0, 0, 0, 0x02, 0x00, 0x02, 0, 0, 0, 0x6B, 0x00});

ElementArray exampleArray() {
  ElementArray a;
  a.setDimensions(2);
  a.setBoundary(1, 3);
  a.appendString("ab");
  a.appendValue(7);
  a.setKeyString("k", 1);
  return a;
}

TEST_F(NativeFile, WritesTheExampleAndTheEmptyArrayByteForByte) {
  ASSERT_EQ(kExample.size(), 63u);
  ElementArray a = exampleArray();
  saveNativeFile(a, path("ex.arr").c_str(), 0);
  EXPECT_EQ(readBytes(path("ex.arr")), kExample);
  EXPECT_EQ(a.fileMode, 0);

  ElementArray empty;
  saveNativeFile(empty, path("empty.arr").c_str(), 0);
  const std::string expected = kMagic + le16(1) + le32(1) + le32(0) + le32(0) + le32(0);
  EXPECT_EQ(expected.size(), 26u);
  EXPECT_EQ(readBytes(path("empty.arr")), expected);

  // Mode 1 appends a second copy; mode 0 truncates again.
  saveNativeFile(empty, path("empty.arr").c_str(), 1);
  EXPECT_EQ(empty.fileMode, 1);
  EXPECT_EQ(readBytes(path("empty.arr")), expected + expected);
  saveNativeFile(empty, path("empty.arr").c_str(), 0);
  EXPECT_EQ(readBytes(path("empty.arr")), expected);
}

TEST_F(NativeFile, WritesZeroAsNoneEmptyTextsFilesAndThreeBoundaries) {
  ElementArray a;
  a.setDimensions(3);
  a.setBoundary(1, 4);
  a.setBoundary(2, 5);
  a.appendValue(0);
  a.appendString("");
  a.appendFile({"x\0y", 3});
  a.setKeyValue(-2, 2);
  saveNativeFile(a, path("f.arr").c_str(), 0);
  const std::string expected = kMagic + le16(1) + le32(3) + le32(4) + le32(5) + le32(0) + le32(0) +
                               le32(3) + le16(0) + le32(0) + le16(0) + le32(0) +       // None
                               le16(2) + le32(1) + bytesOf({0}) + le16(0) + le32(0) +  // ""
                               le16(3) + le32(3) + bytesOf({'x', 0, 'y'}) + le16(1) + le32(4) +
                               le32(-2);  // file
  EXPECT_EQ(readBytes(path("f.arr")), expected);
}

TEST_F(NativeFile, LoadsTheExample) {
  writeBytes(path("ex.arr"), kExample);
  ElementArray a;
  a.appendString("old");
  loadNativeFile(a, path("ex.arr").c_str(), 0);
  ASSERT_EQ(a.size(), 2);
  EXPECT_EQ(a.dimensions(), 2);
  EXPECT_EQ(a.boundary(1), 3);
  EXPECT_EQ(a.at(0).type(), ElementType::String);
  EXPECT_STREQ(a.getString(0), "ab");
  // An element saved without key comes back with an empty key of type None.
  ASSERT_TRUE(a.at(0).hasKey());
  EXPECT_EQ(a.at(0).key()->type(), ElementType::None);
  EXPECT_EQ(a.at(1).type(), ElementType::Value);
  EXPECT_EQ(a.getValue(1), 7);
  EXPECT_STREQ(a.getKeyString(1), "k");
  EXPECT_EQ(a.at(1).key()->type(), ElementType::String);
}

TEST_F(NativeFile, RoundTripsEveryTypeOfElementAndKey) {
  const char fileBytes[] = {'\0', 'a', '\0', '\0', 'b'};
  ElementArray a;
  a.appendString("text");
  a.setKeyString("s", 0);
  a.appendValue(-123456);
  a.setKeyValue(99, 1);
  a.appendFile({fileBytes, 5});
  a.setKeyFile({fileBytes, 3}, 2);
  a.appendString("");
  a.setKeyString("", 3);
  a.appendValue(0);
  a.appendFile({"z", 1});
  saveNativeFile(a, path("rt.arr").c_str(), 0);

  ElementArray b;
  loadNativeFile(b, path("rt.arr").c_str(), 0);
  ASSERT_EQ(b.size(), 6);
  EXPECT_EQ(b.dimensions(), 1);
  for (int32_t i = 0; i < 6; ++i) {
    SCOPED_TRACE(i);
    EXPECT_EQ(b.at(i).type(), a.at(i).type());
    EXPECT_EQ(b.at(i).size(), a.at(i).size());
    EXPECT_EQ(b.at(i).number(), a.at(i).number());
    EXPECT_EQ(contentOf(b.at(i)), contentOf(a.at(i)));
    ASSERT_TRUE(b.at(i).hasKey());
    if (a.at(i).hasKey()) {
      EXPECT_EQ(b.at(i).key()->type(), a.at(i).key()->type());
      EXPECT_EQ(b.at(i).key()->size(), a.at(i).key()->size());
      EXPECT_EQ(b.at(i).key()->number(), a.at(i).key()->number());
      EXPECT_EQ(contentOf(*b.at(i).key()), contentOf(*a.at(i).key()));
    } else {
      EXPECT_EQ(b.at(i).key()->type(), ElementType::None);
    }
  }
  EXPECT_EQ(b.at(2).size(), 5);
  EXPECT_EQ(b.at(3).type(), ElementType::String);
  EXPECT_EQ(b.at(3).size(), 1);
  EXPECT_EQ(b.at(4).type(), ElementType::None);
}

TEST_F(NativeFile, LabelsTravelAndLengthZeroLeavesAColumnAlone) {
  ElementArray a = exampleArray();
  a.labels = LabelList{"name", std::nullopt, "age"};
  saveNativeFile(a, path("l.arr").c_str(), 0);
  const std::string bytes = readBytes(path("l.arr"));
  const std::string labelPart = le32(3) + le32(4) + "name" + le32(0) + le32(3) + "age";
  EXPECT_EQ(bytes.substr(22, labelPart.size()), labelPart);

  ElementArray b;
  b.setDimensions(2);
  b.setBoundary(1, 3);
  b.labels = LabelList{"x", "y", "z"};
  loadNativeFile(b, path("l.arr").c_str(), 0);
  EXPECT_EQ(b.labels, (LabelList{"name", "y", "age"}));

  // Labels only apply to a two-dimensional array, within its columns.
  ElementArray c;
  c.setBoundary(1, 3);
  loadNativeFile(c, path("l.arr").c_str(), 1);
  EXPECT_FALSE(c.labels.has_value());
  ElementArray d;
  d.setDimensions(2);
  d.setBoundary(1, 2);
  loadNativeFile(d, path("l.arr").c_str(), 1);
  EXPECT_EQ(d.labels, (LabelList{"name", std::nullopt}));
}

TEST_F(NativeFile, AppendAddsAtTheEndAndKeepsDimensions) {
  writeBytes(path("ex.arr"), kExample);
  ElementArray a;
  a.setDimensions(3);
  a.setBoundary(1, 5);
  a.setBoundary(2, 6);
  for (int i = 1; i <= 5; ++i) a.appendValue(i);
  loadNativeFile(a, path("ex.arr").c_str(), 1);
  ASSERT_EQ(a.size(), 7);
  EXPECT_EQ(a.dimensions(), 3);
  EXPECT_EQ(a.boundary(1), 5);
  EXPECT_EQ(a.boundary(2), 6);
  EXPECT_EQ(a.getValue(4), 5);
  EXPECT_FALSE(a.at(4).hasKey());
  EXPECT_STREQ(a.getString(5), "ab");
  EXPECT_EQ(a.getValue(6), 7);
  EXPECT_STREQ(a.getKeyString(6), "k");
}

TEST_F(NativeFile, UnusableFilesClearOnReplaceAndChangeNothingOnAppend) {
  writeBytes(path("magic.arr"), "ZUBARRAX" + kExample.substr(8));
  writeBytes(path("v2.arr"), kMagic + le16(2) + kExample.substr(10));
  writeBytes(path("d11.arr"), kMagic + le16(1) + le32(11) + std::string(44, '\0'));
  writeBytes(path("zero.arr"), "");
  const std::string unusable[] = {path("missing.arr"), dir_.string(),   path("magic.arr"),
                                  path("v2.arr"),      path("d11.arr"), path("zero.arr")};
  for (const std::string& file : unusable) {
    SCOPED_TRACE(file);
    ElementArray a;
    a.setDimensions(2);
    a.setBoundary(1, 4);
    a.appendString("keep");
    a.labels = LabelList{"l"};
    loadNativeFile(a, file.c_str(), 1);
    EXPECT_EQ(a.size(), 1);
    EXPECT_EQ(a.dimensions(), 2);
    loadNativeFile(a, file.c_str(), 0);
    EXPECT_EQ(a.size(), 0);
    EXPECT_EQ(a.dimensions(), 0);
    EXPECT_EQ(a.boundaryEntry(1), 4);
    EXPECT_EQ(a.labels, LabelList{"l"});
    EXPECT_FALSE(readNativeFile(file.c_str()).has_value());
  }
}

TEST_F(NativeFile, VersionsZeroAndNegativeReadLikeOne) {
  for (uint16_t version : {uint16_t{0}, uint16_t{0xFFFF}}) {
    writeBytes(path("v.arr"), kMagic + le16(version) + kExample.substr(10));
    ElementArray a;
    loadNativeFile(a, path("v.arr").c_str(), 0);
    EXPECT_EQ(a.size(), 2);
    auto image = readNativeFile(path("v.arr").c_str());
    ASSERT_TRUE(image.has_value());
    EXPECT_EQ(image->version, version);
  }
}

TEST_F(NativeFile, ReadAndWriteImageReproduceTheFile) {
  ElementArray a = exampleArray();
  a.labels = LabelList{"p", "", "qq"};
  a.appendFile({"\0\1\2", 3});
  a.setKeyFile({"\0", 1}, 2);
  saveNativeFile(a, path("a.arr").c_str(), 0);
  auto image = readNativeFile(path("a.arr").c_str());
  ASSERT_TRUE(image.has_value());
  EXPECT_EQ(image->dimensions, 2);
  EXPECT_EQ(image->boundaries[0], 3);
  EXPECT_EQ(image->labelCount(), 3);
  ASSERT_EQ(image->elementCount(), 3);
  EXPECT_EQ(image->elements[1].number, 7);
  EXPECT_EQ(image->elements[2].type, 3);
  EXPECT_EQ(image->elements[2].keySize, 1);
  writeNativeFile(path("b.arr").c_str(), *image, 0);
  EXPECT_EQ(readBytes(path("b.arr")), readBytes(path("a.arr")));
}

// Cuts the example after every byte and checks what each prefix loads. Field offsets:
// D 10-13, boundary 1 14-17, N 26-29; record 0 at 30 (size 32-35, text 36-38, key
// 39-44); record 1 at 45 (size 47-50, number 51-54, key type 55-56, key size 57-60,
// key text 61-62). Missing bytes read as zero; records starting past the end do not exist.
TEST_F(NativeFile, TruncatedExampleLoadsWhatItHolds) {
  for (size_t n = 0; n <= kExample.size(); ++n) {
    SCOPED_TRACE(n);
    writeBytes(path("t.arr"), kExample.substr(0, n));
    ElementArray a;
    loadNativeFile(a, path("t.arr").c_str(), 0);
    const int32_t dims = n < 8 ? 0 : (n >= 11 ? 2 : 0);
    EXPECT_EQ(a.dimensions(), dims);
    EXPECT_EQ(a.boundaryEntry(1), n >= 15 ? 3 : 0);
    const int32_t records = n > 45 ? 2 : (n > 30 ? 1 : 0);
    ASSERT_EQ(a.size(), records);
    if (records >= 1) {
      const Element& e = a.at(0);
      if (n < 33) {
        EXPECT_EQ(e.type(), ElementType::None);
      } else {
        EXPECT_EQ(e.type(), ElementType::String);
        EXPECT_STREQ(e.bytes(), n < 37 ? "" : (n == 37 ? "a" : "ab"));
      }
      ASSERT_TRUE(e.hasKey());
      EXPECT_EQ(e.key()->type(), ElementType::None);
    }
    if (records == 2) {
      const Element& e = a.at(1);
      EXPECT_EQ(e.number(), n >= 52 ? 7 : 0);
      EXPECT_EQ(e.type(), n >= 52 ? ElementType::Value : ElementType::None);
      ASSERT_TRUE(e.hasKey());
      if (n < 58) {
        EXPECT_EQ(e.key()->type(), ElementType::None);
      } else {
        EXPECT_EQ(e.key()->type(), ElementType::String);
        EXPECT_STREQ(e.key()->bytes(), n < 62 ? "" : "k");
      }
    }
  }
}

TEST_F(NativeFile, HostileCountsAndSizesAreBoundedByTheFile) {
  const std::string head = kMagic + le16(1) + le32(1) + le32(0);
  // Huge and negative label and element counts.
  for (int32_t count : {INT32_MAX, -1}) {
    writeBytes(path("c.arr"),
               head + le32(count) + le32(2) + "ab" + le32(count) + le16(2) + le32(2) + "x");
    ElementArray a;
    loadNativeFile(a, path("c.arr").c_str(), 0);
    auto image = readNativeFile(path("c.arr").c_str());
    ASSERT_TRUE(image.has_value());
    if (count > 0) {
      // The second label swallows the rest of the file.
      EXPECT_EQ(image->labelCount(), 2);
    } else {
      EXPECT_EQ(image->labelCount(), 0);
    }
    EXPECT_LE(a.size(), 2);
  }
  // A file block claiming more bytes than any file holds keeps what is there; a text
  // keeps its bytes; a block the end cuts short (but not beyond the file's size) is
  // completed with zeros.
  writeBytes(path("s.arr"), head + le32(0) + le32(1) + le16(3) + le32(INT32_MAX) + "abc");
  ElementArray a;
  loadNativeFile(a, path("s.arr").c_str(), 0);
  ASSERT_EQ(a.size(), 1);
  EXPECT_EQ(a.at(0).type(), ElementType::File);
  EXPECT_EQ(contentOf(a.at(0)), "abc");
  writeBytes(path("z.arr"), head + le32(0) + le32(1) + le16(3) + le32(10) + "abc");
  ElementArray z;
  loadNativeFile(z, path("z.arr").c_str(), 0);
  ASSERT_EQ(z.size(), 1);
  EXPECT_EQ(contentOf(z.at(0)), std::string("abc") + std::string(7, '\0'));
  writeBytes(path("k.arr"),
             head + le32(0) + le32(1) + le16(0) + le32(0) + le16(2) + le32(-7) + le16(2));
  ElementArray k;
  loadNativeFile(k, path("k.arr").c_str(), 0);
  ASSERT_EQ(k.size(), 1);
  EXPECT_EQ(k.at(0).key()->type(), ElementType::None);
  // Dimension counts: 11 is rejected, -5 reads no boundaries and is taken as it is.
  writeBytes(path("d.arr"), kMagic + le16(1) + le32(11) + std::string(48, '\x01'));
  EXPECT_FALSE(readNativeFile(path("d.arr").c_str()).has_value());
  writeBytes(path("d.arr"), kMagic + le16(1) + le32(-5) + le32(0) + le32(1) + le16(2) + le32(2) +
                                "q" + bytesOf({0}) + le16(0) + le32(0));
  ElementArray d;
  loadNativeFile(d, path("d.arr").c_str(), 0);
  EXPECT_EQ(d.dimensions(), -5);
  ASSERT_EQ(d.size(), 1);
  EXPECT_STREQ(d.getString(0), "q");
  // A huge X boundary with a label: the label list is not blown up to that length.
  writeBytes(path("x.arr"), kMagic + le16(1) + le32(2) + le32(INT32_MAX) + le32(0) + le32(1) +
                                le32(1) + "L" + le32(0));
  ElementArray x;
  loadNativeFile(x, path("x.arr").c_str(), 0);
  EXPECT_EQ(x.boundary(1), INT32_MAX);
  EXPECT_FALSE(x.labels.has_value());
}

TEST_F(NativeFile, SaveToAnUnusablePathWritesNothing) {
  ElementArray a = exampleArray();
  saveNativeFile(a, dir_.string().c_str(), 0);
  saveNativeFile(a, path("no/such/dir.arr").c_str(), 0);
  EXPECT_FALSE(exists(path("no")));
  if (geteuid() == 0) GTEST_SKIP() << "running as root: a read-only folder is still writable";
  std::filesystem::permissions(
      dir_, std::filesystem::perms::owner_read | std::filesystem::perms::owner_exec);
  saveNativeFile(a, path("ro.arr").c_str(), 0);
  EXPECT_FALSE(exists(path("ro.arr")));
}

}  // namespace
}  // namespace quorrel
