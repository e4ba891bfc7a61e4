// A small reader for 32-bit PE images: enough to read back the export table, the
// imported DLLs and the resource tree of the Windows DLL on a machine without Windows.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace quorrel::pe {

struct Export {
  std::string name;  // empty for an entry exported by ordinal only
  uint32_t ordinal = 0;
  bool operator==(const Export&) const = default;
};

struct Resource {
  uint32_t type = 0;  // numeric type (RT_MENU 4, RT_STRING 6, ...); 0 for a named type
  std::string typeName;
  uint32_t id = 0;  // numeric id; 0 for a named resource
  std::string name;
  uint32_t language = 0;
  uint32_t codePage = 0;
  std::vector<uint8_t> bytes;
};

struct Image {
  uint16_t machine = 0;
  uint16_t optionalMagic = 0;  // 0x10b for PE32
  uint16_t characteristics = 0;
  uint32_t ordinalBase = 0;
  uint32_t exportSlotsInUse = 0;  // address-table entries that point somewhere
  std::string exportDllName;
  std::vector<Export> exports;
  std::vector<std::string> importedDlls;
  std::vector<std::string> delayImportedDlls;
  std::vector<Resource> resources;
};

// Parses the image; an error text describes the first structural fault found.
std::optional<Image> readImage(const std::vector<uint8_t>& file, std::string& error);
std::vector<uint8_t> readFileBytes(const std::string& path);

// Resource data decoders. Texts are converted from UTF-16 by keeping the low byte,
// which is exact for the 8-bit texts of these resources.
struct MenuItem {
  std::string text;
  uint16_t id = 0;
  uint16_t flags = 0;  // without the popup and end-of-level bits
  bool popup = false;
  std::vector<MenuItem> children;
  bool operator==(const MenuItem&) const = default;
};
std::optional<std::vector<MenuItem>> decodeMenu(const std::vector<uint8_t>& data);

// The 16 strings of string-table block `block` (ids (block-1)*16 ... +15);
// an empty optional for an entry that is not there.
std::vector<std::optional<std::string>> decodeStringBlock(const std::vector<uint8_t>& data);

struct DialogItem {
  uint32_t style = 0;
  int16_t x = 0, y = 0, cx = 0, cy = 0;
  int32_t id = 0;          // -1 for an item without an id
  uint16_t classAtom = 0;  // 0x80 button, 0x81 edit, 0x82 static; 0 for a named class
  std::string className;
  std::string text;
};
struct Dialog {
  bool extended = false;
  uint32_t style = 0;
  int16_t x = 0, y = 0, cx = 0, cy = 0;
  std::string title;
  uint16_t pointSize = 0;
  std::string font;
  std::vector<DialogItem> items;
};
std::optional<Dialog> decodeDialog(const std::vector<uint8_t>& data);

struct BitmapHeader {
  uint32_t headerSize = 0;
  int32_t width = 0, height = 0;
  uint16_t planes = 0, bitCount = 0;
  uint32_t compression = 0;
};
std::optional<BitmapHeader> decodeBitmap(const std::vector<uint8_t>& data);

}  // namespace quorrel::pe
