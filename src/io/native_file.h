// The array's own binary file: magic "ZUBARRAY", version 1, the dimensions with
// their boundaries, the column labels and every element with its type, bytes and key.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "array/element_array.h"
#include "io/file_handle.h"

namespace quorrel {

// One column label. `text` holds `length` bytes (not terminated); null when the
// record has no text (a length of 0 or less).
struct LabelRecord {
  int32_t length = 0;
  const char* text = nullptr;
};

// One element (or one host array cell). `number` is the data of a Value (type 1);
// for every other type `data` holds `size` bytes (not terminated), or is null when
// the size is 0 or less. The key half follows the same rule; keyType 0 and keySize 0
// mean no key.
struct ElementRecord {
  const char* data = nullptr;
  const char* keyData = nullptr;
  int32_t size = 0;
  int32_t number = 0;
  int32_t keySize = 0;
  int32_t keyNumber = 0;
  uint16_t type = 0;
  uint16_t keyType = 0;
};

// The description of a native or host array file. The record views point into
// `storage` (the file as read) or `filled` (blocks the file cut short, completed with
// zero bytes); an image built by hand may point anywhere that outlives its use.
struct ArrayImage {
  static constexpr int32_t kBoundarySlots = 10;

  uint16_t version = 0;
  int32_t dimensions = 0;
  int32_t boundaries[kBoundarySlots] = {};  // dimension d at boundaries[d - 1]
  std::vector<LabelRecord> labels;
  std::vector<ElementRecord> elements;

  ByteBuffer storage;
  std::vector<std::unique_ptr<char[]>> filled;

  int32_t labelCount() const { return static_cast<int32_t>(labels.size()); }
  int32_t elementCount() const { return static_cast<int32_t>(elements.size()); }
};

// Writes the whole array; stores `mode` in fileMode (0 create or truncate, 1 append).
void saveNativeFile(ElementArray& array, const char* path, uint16_t mode);
// Append 0 clears the array and takes the file's dimensions and boundaries (a file
// that cannot be used still clears it and sets 0 dimensions); otherwise the file's
// elements are added at the end. Labels of the file replace column labels in both.
void loadNativeFile(ElementArray& array, const char* path, int32_t append);

void writeNativeFile(const char* path, const ArrayImage& image, uint16_t fileMode);
// Nothing when the file cannot be opened, does not start with the magic, has a
// version above 1 or more than 10 dimensions. A short file yields what it holds.
std::optional<ArrayImage> readNativeFile(const char* path);

}  // namespace quorrel
