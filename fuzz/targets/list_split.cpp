// The list splitter and the index transforms: any delimiter, any list, any dimension set-up.
// Input: byte 0 = delimiter length (mod 8), then the delimiter, byte = dimension count,
// four bytes of X boundary, four of Y, then the list text.
#include <cstdint>
#include <cstring>
#include <string>

#include "array/element_array.h"
#include "array/text.h"
#include "fuzz_input.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  quorrel::FuzzInput in(data, size);
  std::string delimiter = in.text(in.byte() % 8);
  quorrel::ElementArray array;
  array.setListDelimiter(delimiter.c_str());
  array.setDimensions(static_cast<int8_t>(in.byte()));
  array.setBoundary(1, in.int32());
  array.setBoundary(2, in.int32());
  std::string list = in.rest();

  // Tokens never contain a separator, are never empty, and lie inside the list.
  quorrel::TokenSplitter tokens(list.c_str(), delimiter);
  while (auto token = tokens.next()) {
    if (token->empty()) __builtin_trap();
    for (char c : *token) {
      if (delimiter.find(c) != std::string::npos) __builtin_trap();
    }
  }
  (void)array.indexOfDimIndex(list.c_str());
  for (int32_t d = -1; d <= 11; ++d) {
    (void)array.dimIndexOfIndex(d, static_cast<int32_t>(list.size()) - 5);
    (void)array.dimIndexOfIndex(d, INT32_MIN);
    (void)array.stride(d);
  }
  (void)array.indexOfXY(INT32_MAX, INT32_MIN);
  return 0;
}
