// Shared fixture of the file format tests: a fresh temporary directory per test and
// helpers to write and read raw file bytes.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "array/element_array.h"
#include "support/array_text.h"

namespace quorrel {

class IoTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (std::filesystem::temp_directory_path() / "quorrel-io-XXXXXX").string();
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    dir_ = pattern;
  }
  void TearDown() override {
    std::error_code ignored;
    std::filesystem::permissions(dir_, std::filesystem::perms::owner_all,
                                 std::filesystem::perm_options::add, ignored);
    std::filesystem::remove_all(dir_, ignored);
  }

  std::string path(const std::string& name) const { return (dir_ / name).string(); }

  static std::string readBytes(const std::string& file) {
    std::ifstream in(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  }
  static void writeBytes(const std::string& file, const std::string& bytes) {
    std::ofstream(file, std::ios::binary | std::ios::trunc) << bytes;
  }
  static bool exists(const std::string& file) { return std::filesystem::exists(file); }

  // The array after loading the bytes into it from a file.
  template <typename Load>
  ElementArray loaded(Load load, const std::string& bytes, ElementArray a = {},
                      LoadMode mode = LoadReplace) {
    writeBytes(path("in"), bytes);
    load(a, path("in").c_str(), mode);
    return a;
  }
  // The bytes of the file "out" after saving the array into it.
  template <typename Save>
  std::string saved(Save save, ElementArray& a, FileMode mode = FileModeTruncate) {
    save(a, path("out").c_str(), mode);
    return readBytes(path("out"));
  }
  std::filesystem::path dir_;
};

// Every element as key=value, as INI files hold them: "~" for a None value, "#n" for a number; keys
// must be texts.
inline std::string entriesOf(ElementArray& a) {
  std::string out;
  for (int32_t i = 0; i < a.size(); ++i) {
    const Element& e = a.at(i);
    EXPECT_EQ(e.hasKey() ? e.key()->type() : ElementType::None, ElementType::String) << i;
    out += (i == 0 ? "" : "|") + std::string(e.hasKey() ? a.getKeyString(i) : "") + "=";
    out += e.type() == ElementType::None    ? "~"
           : e.type() == ElementType::Value ? "#" + std::to_string(e.number())
                                            : std::string(a.getString(i));
  }
  return out;
}

// Little-endian field builders for hand-made files.
inline std::string le16(uint16_t v) {
  return {static_cast<char>(v & 0xFF), static_cast<char>(v >> 8)};
}
inline std::string le32(int32_t v) {
  const auto u = static_cast<uint32_t>(v);
  return le16(static_cast<uint16_t>(u & 0xFFFF)) + le16(static_cast<uint16_t>(u >> 16));
}
inline std::string bytesOf(std::initializer_list<int> values) {
  std::string s;
  for (int v : values) s.push_back(static_cast<char>(v));
  return s;
}

}  // namespace quorrel
