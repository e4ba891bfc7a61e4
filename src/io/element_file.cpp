#include "io/element_file.h"

namespace quorrel {

FileStatus saveElementToFile(const ElementArray& array, int32_t index, const char* path,
                             FileMode mode) {
  ByteBlock block;
  const bool there = array.getBytes(block, index);
  return saveWith(path, mode, there, [&](BufferedWriter& out) {
    if (array.at(index).type() == ElementType::Value) {
      out.i32(array.at(index).number());
    } else if (block.bytes != nullptr && block.length > 0) {
      out.bytes(block.bytes, static_cast<std::size_t>(block.length));
    }
  });
}

}  // namespace quorrel
