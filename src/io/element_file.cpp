#include "io/element_file.h"

#include <new>

namespace quorrel {

void saveElementToFile(const ElementArray& array, int32_t index, const char* path, FileMode mode) {
  ByteBlock block;
  if (!array.getBytes(block, index)) return;
  try {
    SaveFile file(path, mode == FileModeAppend);
    if (!file.isOpen()) return;
    bool written = true;
    if (array.at(index).type() == ElementType::Value) {
      const auto u = static_cast<uint32_t>(array.at(index).number());
      const char le[4] = {static_cast<char>(u & 0xFF), static_cast<char>((u >> 8) & 0xFF),
                          static_cast<char>((u >> 16) & 0xFF), static_cast<char>(u >> 24)};
      written = file.handle().writeAll(le, sizeof le);
    } else if (block.bytes != nullptr && block.length > 0) {
      written = file.handle().writeAll(block.bytes, static_cast<std::size_t>(block.length));
    }
    file.finish(written);
  } catch (const std::bad_alloc&) {
  }
}

std::optional<ByteBuffer> readWholeFile(const char* path) {
  return readFileBytes(path, 0);
}

}  // namespace quorrel
