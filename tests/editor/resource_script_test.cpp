// The generated resource tables of the portable build hold exactly what the resource
// compiler makes of resources/quorrel.rc: every menu item, string and dialog
// control, read back from the compiler's binary .res output.
#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <cstdint>
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
struct Reader {
  const Bytes& bytes;
  std::size_t pos, end;

  bool done() const { return pos >= end; }
  void align(std::size_t to) { pos = (pos + to - 1) / to * to; }
  uint16_t word() {
    if (pos + 2 > end) {
      ADD_FAILURE() << "read past the end at " << pos;
      pos = end;
      return 0;
    }
    pos += 2;
    return static_cast<uint16_t>(bytes[pos - 2] | bytes[pos - 1] << 8);
  }
  int16_t signedWord() { return static_cast<int16_t>(word()); }
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
    if (pos + 2 <= end && bytes[pos] == 0xFF && bytes[pos + 1] == 0xFF) {
      word();
      ordinal = word();
      return {};
    }
    return text();
  }
};

struct Resource {
  uint16_t type, id, language;
  std::size_t begin, end;
};

std::vector<Resource> resourcesOf(const Bytes& file) {
  std::vector<Resource> out;
  Reader reader{file, 0, file.size()};
  while (!reader.done()) {
    std::size_t start = reader.pos;
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
    reader.pos = resource.end;
    reader.align(4);
  }
  return out;
}

void expectSameMenu(const Bytes& file, const Resource& r,
                    const quorrel::platform::MenuResource& generated) {
  Reader reader{file, r.begin, r.end};
  EXPECT_EQ(reader.dword(), 0u);  // menu header: version and size 0
  std::size_t i = 0;
  for (; !reader.done() && i < generated.items.size(); ++i) {
    const auto& item = generated.items[i];
    const uint16_t flags = reader.word();
    EXPECT_EQ(flags, item.flags) << r.id << ":" << i;
    EXPECT_EQ(flags & 0x10 ? 0 : reader.word(), item.id) << r.id << ":" << i;
    EXPECT_EQ(reader.text(), item.text) << r.id << ":" << i;
  }
  EXPECT_TRUE(reader.done() && i == generated.items.size()) << "menu " << r.id;
}

// String blocks of sixteen counted texts; block b holds ids (b - 1) * 16 to b * 16 - 1.
void addStrings(const Bytes& file, const Resource& r, std::map<uint16_t, std::string>& strings) {
  Reader reader{file, r.begin, r.end};
  for (uint16_t i = 0; i < 16; ++i) {
    std::string text(reader.word(), ' ');
    for (char& c : text) c = static_cast<char>(reader.word());
    if (!text.empty()) strings[static_cast<uint16_t>((r.id - 1) * 16 + i)] = text;
  }
}

// Class names compare without case, as Windows matches them.
std::string className(uint16_t atom, std::string name) {
  if (atom >= 0x80 && atom <= 0x82)
    return std::vector<std::string>{"button", "edit", "static"}[atom - 0x80];
  for (char& c : name) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return name;
}

void expectSameDialog(const Bytes& file, const Resource& r,
                      const quorrel::platform::DialogResource& generated) {
  Reader reader{file, r.begin, r.end};
  EXPECT_EQ(reader.dword(), generated.style);
  EXPECT_EQ(reader.dword(), 0u);  // extended style
  ASSERT_EQ(reader.word(), generated.controls.size());
  EXPECT_EQ((std::vector<int16_t>{reader.signedWord(), reader.signedWord(), reader.signedWord(),
                                  reader.signedWord()}),
            (std::vector<int16_t>{generated.x, generated.y, generated.cx, generated.cy}));
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
    EXPECT_EQ((std::vector<int16_t>{reader.signedWord(), reader.signedWord(), reader.signedWord(),
                                    reader.signedWord()}),
              (std::vector<int16_t>{control.x, control.y, control.cx, control.cy}))
        << control.text;
    EXPECT_EQ(reader.word(), control.id) << control.text;
    uint16_t atom;
    std::string name = reader.nameOrOrdinal(atom);
    EXPECT_EQ(className(atom, name), className(0, control.className)) << control.text;
    EXPECT_EQ(reader.nameOrOrdinal(ordinal), control.text);
    EXPECT_EQ(reader.word(), 0u);  // no creation data
  }
}

TEST(ResourceScript, GeneratedTablesEqualTheCompiledScript) {
  if (std::string(QUORREL_REFERENCE_RES).empty())
    GTEST_SKIP() << "no resource compiler (mingw-w64 windres) on this machine";
  Bytes file = readFile(QUORREL_REFERENCE_RES);
  ASSERT_FALSE(file.empty());
  const auto& data = moduleResources();
  EXPECT_EQ(data.language, kEnglishUs);

  std::map<uint16_t, std::string> strings;
  std::map<uint16_t, int> kinds;
  for (const Resource& r : resourcesOf(file)) {
    EXPECT_EQ(r.language, kEnglishUs) << r.type << " " << r.id;
    ++kinds[r.type];
    const Bytes content(file.begin() + static_cast<std::ptrdiff_t>(r.begin),
                        file.begin() + static_cast<std::ptrdiff_t>(r.end));
    if (r.type == kTypeMenu) {
      auto generated = std::find_if(data.menus.begin(), data.menus.end(),
                                    [&](const auto& menu) { return menu.id == r.id; });
      ASSERT_NE(generated, data.menus.end()) << "menu " << r.id;
      expectSameMenu(file, r, *generated);
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
      EXPECT_EQ(Bytes(picture.begin() + 14, picture.end()), content);
    } else if (r.type == kTypeData) {
      EXPECT_EQ(r.id, 200);
      EXPECT_EQ(content, Bytes(4, 0));
    }
  }
  kinds.erase(kTypeString);
  EXPECT_EQ(kinds, (std::map<uint16_t, int>{
                       {kTypeBitmap, 2}, {kTypeMenu, 3}, {kTypeDialog, 1}, {kTypeData, 1}}));
  EXPECT_EQ(data.menus.size(), 3u);

  ASSERT_EQ(strings.size(), data.strings.size());
  for (const auto& entry : data.strings) EXPECT_EQ(strings[entry.id], entry.text) << entry.id;
  // 1, 2, 128 to 131, 79 display strings and 60 names.
  EXPECT_EQ(strings.size(), 2u + 4u + 79u + 60u);
}

// The bitmaps are 32 x 32 pixels, 16 colours (4 bits per pixel), uncompressed.
TEST(ResourceScript, BitmapsAreSmallSixteenColourPictures) {
  for (const char* name : {"quorrel400.bmp", "quorrel401.bmp"}) {
    Bytes picture = readFile(std::string(QUORREL_RESOURCE_DIR) + "/" + name);
    ASSERT_EQ(picture.size(), 14u + 40u + 16u * 4u + 32u * 16u) << name;
    Reader reader{picture, 0, picture.size()};
    EXPECT_EQ(reader.word(), 0x4D42);  // "BM"
    EXPECT_EQ(reader.dword(), picture.size());
    reader.pos += 4;
    // Pixel data offset, information header size, width, height.
    EXPECT_EQ(
        (std::vector<uint32_t>{reader.dword(), reader.dword(), reader.dword(), reader.dword()}),
        (std::vector<uint32_t>{118, 40, 32, 32}));
    EXPECT_EQ(reader.word(), 1);
    EXPECT_EQ(reader.word(), 4);
    EXPECT_EQ(reader.dword(), 0u);  // no compression
  }
}

}  // namespace
}  // namespace quorrel::editor_test
