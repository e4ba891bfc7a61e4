// Internal helpers of the loaders: putting texts that are views into a file (not
// zero-terminated) into the array with the same result as the zero-terminated forms.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "array/element_array.h"
#include "recordset/table.h"

namespace quorrel::io_detail {

// The text a zero-terminated copy of the view would hold: up to its first zero byte.
inline std::string_view textOf(std::string_view bytes) {
  const void* zero = std::memchr(bytes.data(), '\0', bytes.size());
  return zero == nullptr
             ? bytes
             : bytes.substr(
                   0, static_cast<std::size_t>(static_cast<const char*>(zero) - bytes.data()));
}

// The String operand of a view's text, as insertString of a zero-terminated copy
// would store it. A view that ends without a zero byte is copied into `spill`.
inline ElementValue textOperand(const char* data, int32_t held, std::string& spill) {
  if (data == nullptr) return {};
  const std::string_view text = textOf({data, static_cast<std::size_t>(held)});
  if (text.size() == static_cast<std::size_t>(held)) {
    spill.assign(text);
    data = spill.c_str();
  }
  return {ElementType::String, 0, data, static_cast<int32_t>(text.size() + 1)};
}

// Collects loaded elements and appends them in runs, so that the capacity and the
// row states are brought up to date once per run instead of once per element.
// flush() before anything else reads the array.
class AppendRun {
 public:
  explicit AppendRun(ElementArray& array) : array_(array) { pending_.reserve(kLength); }

  void add(Element&& element) {
    pending_.push_back(std::move(element));
    if (pending_.size() == kLength) flush();
  }
  void flush() {
    array_.appendElements(pending_);
    pending_.clear();
  }
  // Room for `count` elements to come, taken at once.
  void expect(int64_t count) { array_.reserveAppends(size() + count - array_.size()); }
  // Where the elements' records come from.
  RecordSlab* slab() { return &slab_; }
  // The array's size once the pending elements are in.
  int64_t size() const { return int64_t{array_.size()} + static_cast<int64_t>(pending_.size()); }

 private:
  static constexpr std::size_t kLength = 4096;
  ElementArray& array_;
  RecordSlab slab_;
  std::vector<Element> pending_;
};

// What the binary loaders' sinks share: the array they fill, whether the load replaces
// it, and the run of elements it appends.
struct BinaryLoad {
  BinaryLoad(ElementArray& target, bool replacing)
      : array(target), replace(replacing), run(target) {}

  ElementArray& array;
  bool replace;
  AppendRun run;
  bool borrowed = false;  // an element points into the file's bytes
  bool headerSeen = false;

  // Puts the last elements in, keeping the file's bytes when an element borrows them; a
  // replacing load of a file without a usable header leaves 0 dimensions.
  void finish(const std::shared_ptr<const void>& bytes) {
    if (borrowed) array.keepBlock(bytes);
    run.flush();
    if (replace && !headerSeen) array.setDimensions(0);
  }
};

// setLabel, which leaves the labels of a table past kMaxLabelColumns alone (only a
// damaged file asks for one that wide).
inline void applyLabel(ElementArray& array, const std::string& text, int32_t column) {
  setLabel(array, text.c_str(), column);
}

}  // namespace quorrel::io_detail
