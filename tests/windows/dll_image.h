// The DLL under test, read once per test program.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "windows/pe_image.h"

namespace quorrel::pe {

inline const Image& dllImage() {
  static const Image image = [] {
    std::string error = "cannot read " QUORREL_DLL_PATH " (build it with scripts/build-dll)";
    const std::vector<uint8_t> bytes = readFileBytes(QUORREL_DLL_PATH);
    std::optional<Image> read = bytes.empty() ? std::nullopt : readImage(bytes, error);
    if (!read) ADD_FAILURE() << error;
    return read.value_or(Image{});
  }();
  return image;
}

}  // namespace quorrel::pe
