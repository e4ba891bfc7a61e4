// The array's own binary file: magic "ZUBARRAY", version 1, the dimensions with
// their boundaries, the column labels and every element with its type, bytes and key.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// The first bytes of every native array file.
inline constexpr std::string_view kNativeFileMagic{"ZUBARRAY", 8};

// Writes the whole array.
FileStatus saveNativeFile(const ElementArray& array, const char* path, FileMode mode);
// Append 0 clears the array and takes the file's dimensions and boundaries (a file
// that cannot be used still clears it and sets 0 dimensions); otherwise the file's
// elements are added at the end. Labels of the file replace column labels in both.
FileStatus loadNativeFile(ElementArray& array, const char* path, LoadMode mode);

// One half of an element record as the file holds it: `number` for a Value, else
// `bytes` (a String's with its terminating zero), cut short where the file ends.
struct NativeHalf {
  uint16_t type = 0;
  int32_t size = 0;
  int32_t number = 0;
  std::string_view bytes;
};

// Receives a native file's parts in file order, for a reader that builds no array.
class NativeFileVisitor {
 public:
  virtual ~NativeFileVisitor() = default;
  virtual void header(int32_t dimensions, const int32_t* boundaries) = 0;
  // `text` is null for a label record without text.
  virtual void label(const char* text, int32_t length) = 0;
  // False stops the walk.
  virtual bool element(const NativeHalf& value, const NativeHalf& key) = 0;
};

// Walks the file's bytes with the loader's own reader.
FileExtent scanNativeFile(std::string_view file, NativeFileVisitor& visitor);

// The layout saveNativeFile writes, in pieces, for a writer that holds no array (a big
// document streamed into a native file): the bytes before the first record, and one
// record appended to `out`. `boundaries` holds one per dimension. A half's `bytes` may
// leave out a text's terminating zero: the record holds `size` bytes, completed with
// zeros.
std::string nativeFileHead(int32_t dimensions, const int32_t* boundaries, const LabelList& labels,
                           int32_t count);
void appendNativeRecord(std::string& out, const NativeHalf& value, const NativeHalf& key);

}  // namespace quorrel
