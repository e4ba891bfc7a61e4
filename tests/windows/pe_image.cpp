#include "windows/pe_image.h"

#include <fstream>
#include <iterator>

namespace quorrel::pe {
namespace {

// Little-endian reads that report running off the end instead of reading past it.
class Bytes {
 public:
  explicit Bytes(const std::vector<uint8_t>& data) : data_(data) {}
  bool has(std::size_t offset, std::size_t count) const {
    return offset <= data_.size() && count <= data_.size() - offset;
  }
  uint8_t u8(std::size_t offset) const { return has(offset, 1) ? data_[offset] : 0; }
  uint16_t u16(std::size_t offset) const {
    return static_cast<uint16_t>(u8(offset) | (u8(offset + 1) << 8));
  }
  uint32_t u32(std::size_t offset) const {
    return static_cast<uint32_t>(u16(offset)) | (static_cast<uint32_t>(u16(offset + 2)) << 16);
  }
  std::size_t size() const { return data_.size(); }
  const std::vector<uint8_t>& data() const { return data_; }

 private:
  const std::vector<uint8_t>& data_;
};

struct Section {
  uint32_t virtualAddress = 0;
  uint32_t virtualSize = 0;
  uint32_t rawOffset = 0;
  uint32_t rawSize = 0;
};

class Reader {
 public:
  Reader(const std::vector<uint8_t>& file, std::string& error) : bytes_(file), error_(error) {}

  std::optional<Image> read() {
    Image image;
    if (!readHeaders(image)) return std::nullopt;
    if (!readExports(image) || !readImports(image) || !readResources(image)) return std::nullopt;
    return image;
  }

 private:
  bool fail(const std::string& what) {
    error_ = what;
    return false;
  }

  // File offset of an address relative to the image base; nullopt when no section holds it.
  std::optional<std::size_t> offsetOf(uint32_t rva, uint32_t count = 1) const {
    for (const Section& s : sections_) {
      const uint32_t extent = s.virtualSize ? s.virtualSize : s.rawSize;
      if (rva >= s.virtualAddress && rva - s.virtualAddress < extent &&
          rva - s.virtualAddress + count <= s.rawSize) {
        const std::size_t offset = s.rawOffset + (rva - s.virtualAddress);
        if (bytes_.has(offset, count)) return offset;
      }
    }
    return std::nullopt;
  }

  std::optional<std::string> asciiAt(uint32_t rva) const {
    auto offset = offsetOf(rva);
    if (!offset) return std::nullopt;
    std::string text;
    for (std::size_t i = *offset; i < bytes_.size() && bytes_.u8(i) != 0; ++i) {
      text.push_back(static_cast<char>(bytes_.u8(i)));
    }
    return text;
  }

  bool readHeaders(Image& image) {
    if (bytes_.size() < 64 || bytes_.u16(0) != 0x5A4D) return fail("no MZ header");
    const uint32_t pe = bytes_.u32(0x3C);
    if (!bytes_.has(pe, 24) || bytes_.u32(pe) != 0x00004550) return fail("no PE signature");
    const std::size_t coff = pe + 4;
    image.machine = bytes_.u16(coff);
    const uint16_t sectionCount = bytes_.u16(coff + 2);
    const uint16_t optionalSize = bytes_.u16(coff + 16);
    image.characteristics = bytes_.u16(coff + 18);
    const std::size_t optional = coff + 20;
    image.optionalMagic = bytes_.u16(optional);
    if (image.optionalMagic != 0x10b) return fail("not a PE32 (32-bit) optional header");
    const uint32_t directoryCount = bytes_.u32(optional + 92);
    for (uint32_t i = 0; i < directoryCount && i < 16; ++i) {
      directories_[i][0] = bytes_.u32(optional + 96 + i * 8);
      directories_[i][1] = bytes_.u32(optional + 100 + i * 8);
    }
    const std::size_t table = optional + optionalSize;
    if (!bytes_.has(table, std::size_t{sectionCount} * 40)) return fail("truncated section table");
    for (uint16_t i = 0; i < sectionCount; ++i) {
      const std::size_t s = table + i * 40u;
      sections_.push_back(
          {bytes_.u32(s + 12), bytes_.u32(s + 8), bytes_.u32(s + 20), bytes_.u32(s + 16)});
    }
    return true;
  }

  bool readExports(Image& image) {
    const uint32_t rva = directories_[0][0];
    if (rva == 0) return true;
    auto dir = offsetOf(rva, 40);
    if (!dir) return fail("export directory outside the sections");
    image.exportDllName = asciiAt(bytes_.u32(*dir + 12)).value_or("");
    image.ordinalBase = bytes_.u32(*dir + 16);
    const uint32_t functionCount = bytes_.u32(*dir + 20);
    const uint32_t nameCount = bytes_.u32(*dir + 24);
    auto functions = offsetOf(bytes_.u32(*dir + 28), functionCount * 4);
    auto names = offsetOf(bytes_.u32(*dir + 32), nameCount * 4);
    auto ordinals = offsetOf(bytes_.u32(*dir + 36), nameCount * 2);
    if ((functionCount && !functions) || (nameCount && (!names || !ordinals))) {
      return fail("export tables outside the sections");
    }
    std::vector<bool> named(functionCount, false);
    for (uint32_t i = 0; i < nameCount; ++i) {
      const uint16_t index = bytes_.u16(*ordinals + i * 2);
      auto name = asciiAt(bytes_.u32(*names + i * 4));
      if (!name || index >= functionCount) return fail("bad export name entry");
      named[index] = true;
      image.exports.push_back({*name, image.ordinalBase + index});
    }
    for (uint32_t i = 0; i < functionCount; ++i) {
      if (bytes_.u32(*functions + i * 4) == 0) continue;
      ++image.exportSlotsInUse;
      if (!named[i]) image.exports.push_back({"", image.ordinalBase + i});
    }
    return true;
  }

  bool readImportNames(uint32_t rva, uint32_t entrySize, uint32_t nameField,
                       std::vector<std::string>& out) {
    if (rva == 0) return true;
    for (uint32_t at = rva;; at += entrySize) {
      auto entry = offsetOf(at, entrySize);
      if (!entry) return fail("import directory outside the sections");
      bool allZero = true;
      for (uint32_t i = 0; i < entrySize; i += 4) allZero = allZero && bytes_.u32(*entry + i) == 0;
      if (allZero) return true;
      auto name = asciiAt(bytes_.u32(*entry + nameField));
      if (!name) return fail("import name outside the sections");
      out.push_back(*name);
    }
  }

  bool readImports(Image& image) {
    return readImportNames(directories_[1][0], 20, 12, image.importedDlls) &&
           readImportNames(directories_[13][0], 32, 4, image.delayImportedDlls);
  }

  // A resource directory name: a numeric id, or (high bit set) an offset to a counted
  // UTF-16 string from the start of the resource section.
  void entryName(uint32_t field, std::size_t base, uint32_t& id, std::string& name) const {
    if (field & 0x80000000u) {
      const std::size_t at = base + (field & 0x7FFFFFFFu);
      const uint16_t length = bytes_.u16(at);
      for (uint16_t i = 0; i < length; ++i)
        name.push_back(static_cast<char>(bytes_.u16(at + 2 + i * 2u)));
    } else {
      id = field;
    }
  }

  bool readResources(Image& image) {
    const uint32_t rva = directories_[2][0];
    if (rva == 0) return true;
    auto base = offsetOf(rva, 16);
    if (!base) return fail("resource directory outside the sections");
    return walkResources(image, *base, 0, 0, Resource{});
  }

  bool walkResources(Image& image, std::size_t base, uint32_t offset, int level,
                     Resource resource) {
    const std::size_t dir = base + offset;
    if (!bytes_.has(dir, 16) || level > 2) return fail("bad resource directory");
    const uint32_t count = uint32_t{bytes_.u16(dir + 12)} + bytes_.u16(dir + 14);
    for (uint32_t i = 0; i < count; ++i) {
      const std::size_t entry = dir + 16 + i * 8u;
      if (!bytes_.has(entry, 8)) return fail("truncated resource directory");
      Resource next = resource;
      const uint32_t nameField = bytes_.u32(entry);
      const uint32_t target = bytes_.u32(entry + 4);
      if (level == 0) entryName(nameField, base, next.type, next.typeName);
      if (level == 1) entryName(nameField, base, next.id, next.name);
      if (level == 2) next.language = nameField;
      if (target & 0x80000000u) {
        if (!walkResources(image, base, target & 0x7FFFFFFFu, level + 1, next)) return false;
        continue;
      }
      if (level != 2) return fail("resource data above the language level");
      const std::size_t data = base + target;
      const uint32_t size = bytes_.u32(data + 4);
      auto bytesAt = offsetOf(bytes_.u32(data), size);
      if (!bytes_.has(data, 16) || !bytesAt) return fail("resource data outside the sections");
      next.codePage = bytes_.u32(data + 8);
      next.bytes.assign(bytes_.data().begin() + static_cast<std::ptrdiff_t>(*bytesAt),
                        bytes_.data().begin() + static_cast<std::ptrdiff_t>(*bytesAt + size));
      image.resources.push_back(std::move(next));
    }
    return true;
  }

  Bytes bytes_;
  std::string& error_;
  std::vector<Section> sections_;
  uint32_t directories_[16][2] = {};
};

// Reads resource data: UTF-16 strings, ordinals, alignment.
class ResourceCursor {
 public:
  explicit ResourceCursor(const std::vector<uint8_t>& data) : bytes_(data) {}
  bool ok() const { return ok_; }
  bool atEnd() const { return at_ >= bytes_.size(); }
  uint16_t u16() { return take(2) ? bytes_.u16(at_ - 2) : 0; }
  uint32_t u32() { return take(4) ? bytes_.u32(at_ - 4) : 0; }
  void alignTo4() { at_ = (at_ + 3) & ~std::size_t{3}; }
  std::string wideString() {
    std::string text;
    for (uint16_t c = u16(); ok_ && c != 0; c = u16()) text.push_back(static_cast<char>(c));
    return text;
  }
  // A name-or-ordinal field: 0xFFFF followed by an ordinal, or a string.
  void nameOrOrdinal(uint16_t& ordinal, std::string& name) {
    const uint16_t first = u16();
    if (first == 0xFFFF) {
      ordinal = u16();
      return;
    }
    for (uint16_t c = first; ok_ && c != 0; c = u16()) name.push_back(static_cast<char>(c));
  }
  void skip(std::size_t count) { take(count); }

 private:
  bool take(std::size_t count) {
    if (!bytes_.has(at_, count)) ok_ = false;
    at_ += count;
    return ok_;
  }
  Bytes bytes_;
  std::size_t at_ = 0;
  bool ok_ = true;
};

constexpr uint16_t kMenuPopup = 0x10;
constexpr uint16_t kMenuEnd = 0x80;

bool decodeMenuLevel(ResourceCursor& in, std::vector<MenuItem>& out, int depth) {
  if (depth > 16) return false;
  for (;;) {
    MenuItem item;
    const uint16_t flags = in.u16();
    item.popup = flags & kMenuPopup;
    item.flags = flags & static_cast<uint16_t>(~(kMenuPopup | kMenuEnd));
    if (!item.popup) item.id = in.u16();
    item.text = in.wideString();
    if (!in.ok()) return false;
    if (item.popup && !decodeMenuLevel(in, item.children, depth + 1)) return false;
    out.push_back(std::move(item));
    if (flags & kMenuEnd) return true;
  }
}

}  // namespace

std::optional<Image> readImage(const std::vector<uint8_t>& file, std::string& error) {
  return Reader(file, error).read();
}

std::vector<uint8_t> readFileBytes(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

std::optional<std::vector<MenuItem>> decodeMenu(const std::vector<uint8_t>& data) {
  ResourceCursor in(data);
  const uint16_t version = in.u16();
  const uint16_t headerSize = in.u16();
  if (version != 0 || !in.ok()) return std::nullopt;  // only classic MENU templates
  in.skip(headerSize);
  std::vector<MenuItem> items;
  if (!decodeMenuLevel(in, items, 0)) return std::nullopt;
  return items;
}

std::vector<std::optional<std::string>> decodeStringBlock(const std::vector<uint8_t>& data) {
  ResourceCursor in(data);
  std::vector<std::optional<std::string>> strings;
  for (int i = 0; i < 16; ++i) {
    const uint16_t length = in.u16();
    if (!in.ok()) break;
    if (length == 0) {
      strings.emplace_back();
      continue;
    }
    std::string text;
    for (uint16_t c = 0; c < length; ++c) text.push_back(static_cast<char>(in.u16()));
    strings.emplace_back(std::move(text));
  }
  strings.resize(16);
  return strings;
}

std::optional<Dialog> decodeDialog(const std::vector<uint8_t>& data) {
  ResourceCursor in(data);
  Dialog dialog;
  uint16_t count = 0;
  const uint32_t first = in.u32();
  dialog.extended = first == 0xFFFF0001u;  // dlgVer 1, signature 0xFFFF
  if (dialog.extended) {
    in.u32();  // help id
    in.u32();  // extended style
    dialog.style = in.u32();
  } else {
    dialog.style = first;
    in.u32();  // extended style
  }
  count = in.u16();
  dialog.x = static_cast<int16_t>(in.u16());
  dialog.y = static_cast<int16_t>(in.u16());
  dialog.cx = static_cast<int16_t>(in.u16());
  dialog.cy = static_cast<int16_t>(in.u16());
  uint16_t ordinal = 0;
  std::string ignored;
  in.nameOrOrdinal(ordinal, ignored);  // menu
  in.nameOrOrdinal(ordinal, ignored);  // window class
  dialog.title = in.wideString();
  if (dialog.style & 0x40) {  // DS_SETFONT
    dialog.pointSize = in.u16();
    if (dialog.extended) in.skip(4);  // weight, italic, charset
    dialog.font = in.wideString();
  }
  for (uint16_t i = 0; i < count && in.ok(); ++i) {
    in.alignTo4();
    DialogItem item;
    if (dialog.extended) {
      in.u32();  // help id
      in.u32();  // extended style
      item.style = in.u32();
    } else {
      item.style = in.u32();
      in.u32();  // extended style
    }
    item.x = static_cast<int16_t>(in.u16());
    item.y = static_cast<int16_t>(in.u16());
    item.cx = static_cast<int16_t>(in.u16());
    item.cy = static_cast<int16_t>(in.u16());
    item.id = dialog.extended ? static_cast<int32_t>(in.u32())
                              : static_cast<int32_t>(static_cast<int16_t>(in.u16()));
    in.nameOrOrdinal(item.classAtom, item.className);
    uint16_t textOrdinal = 0;
    in.nameOrOrdinal(textOrdinal, item.text);
    in.skip(in.u16());  // creation data
    dialog.items.push_back(std::move(item));
  }
  if (!in.ok()) return std::nullopt;
  return dialog;
}

std::optional<BitmapHeader> decodeBitmap(const std::vector<uint8_t>& data) {
  ResourceCursor in(data);
  BitmapHeader header;
  header.headerSize = in.u32();
  header.width = static_cast<int32_t>(in.u32());
  header.height = static_cast<int32_t>(in.u32());
  header.planes = in.u16();
  header.bitCount = in.u16();
  header.compression = in.u32();
  if (!in.ok()) return std::nullopt;
  return header;
}

}  // namespace quorrel::pe
