// The generated resource tables of the portable build hold exactly what the resource
// compiler makes of resources/quorrel.rc: every menu item, string and dialog
// control, read back from the compiler's binary .res output.
#include <gtest/gtest.h>

#include <cctype>
#include <cstdint>
#include <cstring>
#include <fstream>
#include <iterator>
#include <map>
#include <string>
#include <vector>

#include "platform/resource_data.h"

namespace quorrel::editor_test {
namespace {

using Bytes = std::vector<unsigned char>;
using quorrel::platform::moduleResources;

constexpr uint16_t kTypeBitmap = 2, kTypeMenu = 4, kTypeDialog = 5, kTypeString = 6, kTypeData = 10;
constexpr uint16_t kEnglishUs = 1033;

Bytes readFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return Bytes(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// Little-endian reads with a moving position; a read past the end fails the test.
class Reader {
 public:
  Reader(const Bytes& bytes, std::size_t begin, std::size_t end)
      : bytes_(bytes), pos_(begin), end_(end) {}

  bool done() const { return pos_ >= end_; }
  std::size_t position() const { return pos_; }
  void align(std::size_t to) { pos_ = (pos_ + to - 1) / to * to; }
  void skip(std::size_t n) { pos_ += n; }

  uint16_t word() {
    if (pos_ + 2 > end_) {
      ADD_FAILURE() << "read past the end at " << pos_;
      pos_ = end_;
      return 0;
    }
    uint16_t value = static_cast<uint16_t>(bytes_[pos_] | bytes_[pos_ + 1] << 8);
    pos_ += 2;
    return value;
  }
  uint32_t dword() {
    uint32_t low = word();
    return low | static_cast<uint32_t>(word()) << 16;
  }
  // A zero-terminated UTF-16 text of ASCII characters.
  std::string text() {
    std::string out;
    while (uint16_t c = word()) out += static_cast<char>(c);
    return out;
  }
  // A name or an ordinal: 0xFFFF and a number, or a text.
  std::string nameOrOrdinal(uint16_t& ordinal) {
    ordinal = 0;
    if (pos_ + 2 <= end_ && bytes_[pos_] == 0xFF && bytes_[pos_ + 1] == 0xFF) {
      word();
      ordinal = word();
      return {};
    }
    return text();
  }

 private:
  const Bytes& bytes_;
  std::size_t pos_;
  std::size_t end_;
};

struct Resource {
  uint16_t type;
  uint16_t id;
  uint16_t language;
  std::size_t begin, end;
};

std::vector<Resource> resourcesOf(const Bytes& file) {
  std::vector<Resource> out;
  Reader reader(file, 0, file.size());
  while (!reader.done()) {
    std::size_t start = reader.position();
    uint32_t dataSize = reader.dword();
    uint32_t headerSize = reader.dword();
    Resource resource{};
    reader.nameOrOrdinal(resource.type);
    reader.nameOrOrdinal(resource.id);
    reader.align(4);
    reader.dword();  // data version
    reader.word();   // memory flags
    resource.language = reader.word();
    resource.begin = start + headerSize;
    resource.end = resource.begin + dataSize;
    if (resource.type != 0) out.push_back(resource);
    reader.skip(resource.end - reader.position());
    reader.align(4);
  }
  return out;
}

struct CompiledItem {
  uint16_t flags, id;
  std::string text;
};

std::vector<CompiledItem> compiledMenu(const Bytes& file, const Resource& r) {
  Reader reader(file, r.begin, r.end);
  EXPECT_EQ(reader.dword(), 0u);  // menu header: version and size 0
  std::vector<CompiledItem> items;
  while (!reader.done()) {
    CompiledItem item{};
    item.flags = reader.word();
    if (!(item.flags & 0x10)) item.id = reader.word();
    item.text = reader.text();
    items.push_back(item);
  }
  return items;
}

// String blocks of sixteen counted texts; block b holds ids (b - 1) * 16 to b * 16 - 1.
void addStrings(const Bytes& file, const Resource& r, std::map<uint16_t, std::string>& strings) {
  Reader reader(file, r.begin, r.end);
  for (uint16_t i = 0; i < 16; ++i) {
    uint16_t length = reader.word();
    std::string text;
    for (uint16_t c = 0; c < length; ++c) text += static_cast<char>(reader.word());
    if (length) strings[static_cast<uint16_t>((r.id - 1) * 16 + i)] = text;
  }
}

std::string lowerCase(std::string text) {
  for (char& c : text) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return text;
}

// Class names compare without case, as Windows matches them.
std::string className(uint16_t atom, const std::string& name) {
  switch (atom) {
    case 0x80:
      return "button";
    case 0x81:
      return "edit";
    case 0x82:
      return "static";
    default:
      return lowerCase(name);
  }
}

void expectSameDialog(const Bytes& file, const Resource& r,
                      const quorrel::platform::DialogResource& generated) {
  Reader reader(file, r.begin, r.end);
  EXPECT_EQ(reader.dword(), generated.style);
  EXPECT_EQ(reader.dword(), 0u);  // extended style
  uint16_t count = reader.word();
  ASSERT_EQ(count, generated.controls.size());
  EXPECT_EQ(static_cast<int16_t>(reader.word()), generated.x);
  EXPECT_EQ(static_cast<int16_t>(reader.word()), generated.y);
  EXPECT_EQ(static_cast<int16_t>(reader.word()), generated.cx);
  EXPECT_EQ(static_cast<int16_t>(reader.word()), generated.cy);
  uint16_t ordinal;
  EXPECT_EQ(reader.nameOrOrdinal(ordinal), "");  // no menu
  EXPECT_EQ(reader.nameOrOrdinal(ordinal), "");  // the standard dialog class
  EXPECT_EQ(reader.text(), generated.caption);
  ASSERT_TRUE(generated.style & 0x40);  // DS_SETFONT
  EXPECT_EQ(reader.word(), generated.fontSize);
  EXPECT_EQ(reader.text(), generated.fontName);
  for (const auto& control : generated.controls) {
    reader.align(4);
    EXPECT_EQ(reader.dword(), control.style) << control.text;
    EXPECT_EQ(reader.dword(), 0u);
    EXPECT_EQ(static_cast<int16_t>(reader.word()), control.x) << control.text;
    EXPECT_EQ(static_cast<int16_t>(reader.word()), control.y) << control.text;
    EXPECT_EQ(static_cast<int16_t>(reader.word()), control.cx) << control.text;
    EXPECT_EQ(static_cast<int16_t>(reader.word()), control.cy) << control.text;
    EXPECT_EQ(reader.word(), control.id) << control.text;
    uint16_t atom;
    std::string name = reader.nameOrOrdinal(atom);
    EXPECT_EQ(className(atom, name), lowerCase(control.className)) << control.text;
    EXPECT_EQ(reader.nameOrOrdinal(ordinal), control.text);
    EXPECT_EQ(reader.word(), 0u);  // no creation data
  }
}

TEST(ResourceScript, GeneratedTablesEqualTheCompiledScript) {
#ifndef QUORREL_REFERENCE_RES
  GTEST_SKIP() << "no resource compiler on this machine";
#else
  Bytes file = readFile(QUORREL_REFERENCE_RES);
  ASSERT_FALSE(file.empty());
  const auto& data = moduleResources();
  EXPECT_EQ(data.language, kEnglishUs);

  std::map<uint16_t, std::string> strings;
  std::map<uint16_t, int> kinds;
  for (const Resource& r : resourcesOf(file)) {
    EXPECT_EQ(r.language, kEnglishUs) << r.type << " " << r.id;
    ++kinds[r.type];
    if (r.type == kTypeMenu) {
      const quorrel::platform::MenuResource* generated = nullptr;
      for (const auto& menu : data.menus) {
        if (menu.id == r.id) generated = &menu;
      }
      ASSERT_NE(generated, nullptr) << "menu " << r.id;
      std::vector<CompiledItem> compiled = compiledMenu(file, r);
      ASSERT_EQ(compiled.size(), generated->items.size()) << "menu " << r.id;
      for (std::size_t i = 0; i < compiled.size(); ++i) {
        EXPECT_EQ(compiled[i].flags, generated->items[i].flags) << r.id << ":" << i;
        EXPECT_EQ(compiled[i].id, generated->items[i].id) << r.id << ":" << i;
        EXPECT_EQ(compiled[i].text, generated->items[i].text) << r.id << ":" << i;
      }
    } else if (r.type == kTypeString) {
      addStrings(file, r, strings);
    } else if (r.type == kTypeDialog) {
      ASSERT_EQ(data.dialogs.size(), 1u);
      EXPECT_EQ(r.id, data.dialogs[0].id);
      expectSameDialog(file, r, data.dialogs[0]);
    } else if (r.type == kTypeBitmap) {
      // The picture file without its 14-byte file header.
      Bytes picture =
          readFile(std::string(QUORREL_RESOURCE_DIR) + "/quorrel" + std::to_string(r.id) + ".bmp");
      ASSERT_GT(picture.size(), 14u);
      EXPECT_TRUE(std::equal(picture.begin() + 14, picture.end(),
                             file.begin() + static_cast<std::ptrdiff_t>(r.begin),
                             file.begin() + static_cast<std::ptrdiff_t>(r.end)));
    } else if (r.type == kTypeData) {
      EXPECT_EQ(r.id, 200);
      EXPECT_EQ(Bytes(file.begin() + static_cast<std::ptrdiff_t>(r.begin),
                      file.begin() + static_cast<std::ptrdiff_t>(r.end)),
                Bytes(4, 0));
    }
  }
  EXPECT_EQ(kinds[kTypeMenu], static_cast<int>(data.menus.size()));
  EXPECT_EQ(kinds[kTypeMenu], 3);
  EXPECT_EQ(kinds[kTypeDialog], 1);
  EXPECT_EQ(kinds[kTypeBitmap], 2);
  EXPECT_EQ(kinds[kTypeData], 1);

  ASSERT_EQ(strings.size(), data.strings.size());
  for (const auto& entry : data.strings) {
    EXPECT_EQ(strings[entry.id], entry.text) << entry.id;
  }
  // 1, 2, 128 to 131, 79 display strings and 60 names.
  EXPECT_EQ(strings.size(), 2u + 4u + 79u + 60u);
#endif
}

// The bitmaps are 32 x 32 pixels, 16 colours (4 bits per pixel), uncompressed.
TEST(ResourceScript, BitmapsAreSmallSixteenColourPictures) {
  for (const char* name : {"quorrel400.bmp", "quorrel401.bmp"}) {
    Bytes picture = readFile(std::string(QUORREL_RESOURCE_DIR) + "/" + name);
    ASSERT_EQ(picture.size(), 14u + 40u + 16u * 4u + 32u * 16u) << name;
    Reader reader(picture, 0, picture.size());
    EXPECT_EQ(reader.word(), 0x4D42);  // "BM"
    EXPECT_EQ(reader.dword(), picture.size());
    reader.skip(4);
    EXPECT_EQ(reader.dword(), 118u);  // pixel data offset
    EXPECT_EQ(reader.dword(), 40u);   // information header size
    EXPECT_EQ(reader.dword(), 32u);
    EXPECT_EQ(reader.dword(), 32u);
    EXPECT_EQ(reader.word(), 1);
    EXPECT_EQ(reader.word(), 4);
    EXPECT_EQ(reader.dword(), 0u);  // no compression
  }
}

}  // namespace
}  // namespace quorrel::editor_test
