// What the setup dialog's two tests share: the headless one on the portable dialog
// services and the Windows one on the real dialog manager. Include it after the dialog
// services' declarations (windows.h or platform/headless_dialog.h).
#pragma once

#include <array>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "host/abi.h"

namespace quorrel::setup_dialog_test {

namespace abi = quorrel::abi;

using Record = std::array<unsigned char, abi::kSetupRecordSize>;
using Ints = std::vector<int32_t>;

inline int32_t readInt(const Record& record, std::size_t offset) {
  return abi::readField<int32_t>(record.data(), offset);
}
inline std::string delimiterOf(const Record& record) {
  return reinterpret_cast<const char*>(record.data() + abi::kSetupListDelimiter);
}
// The number fields: dimension count, X and Y boundaries, case sensitive, wildcard
// search, automatic row selection.
inline constexpr std::size_t kFields[] = {abi::kSetupDimensionCount, abi::kSetupXBoundary,
                                          abi::kSetupYBoundary,      abi::kSetupCaseSensitive,
                                          abi::kSetupWildcardSearch, abi::kSetupAutoSelectRows};
inline Ints fieldsOf(const Record& record) {
  Ints values;
  for (std::size_t offset : kFields) values.push_back(readInt(record, offset));
  return values;
}
// A record as the host keeps it: its header bytes are the host's.
inline Record storedRecord(const Ints& fields, const char* delimiter = ";") {
  Record record;
  record.fill(0xEE);
  std::memset(record.data(), 0xAB, abi::kSetupHostHeaderSize);
  for (std::size_t i = 0; i < fields.size(); ++i) {
    abi::writeField(record.data(), kFields[i], fields[i]);
  }
  std::strcpy(reinterpret_cast<char*>(record.data() + abi::kSetupListDelimiter), delimiter);
  return record;
}

// The controls of dialog 20003.
inline constexpr int kOk = 1, kCancel = 2, kHelp = 20100;
inline constexpr int k1D = 1000, k2D = 1001, k3D = 1002, kX = 1003, kY = 1004;
inline constexpr int kCaseInsensitive = 1005, kCaseSensitive = 1006, kLiteral = 1007,
                     kWildcard = 1008;
inline constexpr int kDelimiter = 1009, kOn = 1010, kOff = 1011;

// The checked radio buttons of all four groups and the enabled boundary fields, e.g.
// "2D insensitive literal off | X".
inline std::string state(HWND dialog) {
  const char* names[] = {"1D",        "2D",      "3D",       nullptr, nullptr, "insensitive",
                         "sensitive", "literal", "wildcard", nullptr, "on",    "off"};
  std::string out;
  for (int id = k1D; id <= kOff; ++id) {
    if (names[id - k1D] && IsDlgButtonChecked(dialog, id) == BST_CHECKED) {
      out += std::string(out.empty() ? "" : " ") + names[id - k1D];
    }
  }
  out += " |";
  if (IsWindowEnabled(GetDlgItem(dialog, kX))) out += " X";
  if (IsWindowEnabled(GetDlgItem(dialog, kY))) out += " Y";
  return out;
}

}  // namespace quorrel::setup_dialog_test
