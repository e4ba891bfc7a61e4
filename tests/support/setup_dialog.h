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

// What the dialog shows for a stored record and what OK stores after the author's steps
// (a step with text types it into the field, one without clicks the button). The
// dimension picks the boundaries stored: 2D stores X and keeps Y, 3D both, 1D neither.
// Boundaries read as signed numbers; modes show as zero or not and store as 0 or 1.
struct Step {
  int id;
  const char* text;
};
struct OkCase {
  Ints stored;
  const char* shown;  // state(), then the X and Y fields; null: not checked
  std::vector<Step> steps;
  Ints after;
};
inline const std::vector<OkCase>& okCases() {
  static const std::vector<OkCase> cases = {
      {{7, 4, 5, 0, 0, 0}, "1D insensitive literal off | 4 5", {}, {1, 4, 5, 0, 0, 0}},
      {{3, 4, 5, 0, 0, 0}, nullptr, {{kX, "50"}, {kY, "99"}, {k2D, nullptr}}, {2, 50, 5, 0, 0, 0}},
      {{2, 4, 5, 0, 0, 0}, nullptr, {{k3D, nullptr}, {kX, "6"}, {kY, "7"}}, {3, 6, 7, 0, 0, 0}},
      {{3, 6, 7, 0, 0, 0}, nullptr, {{kX, "60"}, {kY, "70"}, {k1D, nullptr}}, {1, 6, 7, 0, 0, 0}},
      // Only a stored record brings a minus sign; the field takes digits only.
      {{3, -5, 12, 0, 0, 0},
       "3D insensitive literal off | X Y -5 12",
       {{kY, "-1a2 3"}},
       {3, -5, 123, 0, 0, 0}},
      {{3, -5, 12, 0, 0, 0}, nullptr, {{kX, ""}}, {3, 0, 12, 0, 0, 0}},
      {{2, 10, 10, 5, -3, 2}, "2D sensitive wildcard off | X 10 10", {}, {2, 10, 10, 1, 1, 0}},
      {{2, 10, 10, 1, 1, 0},
       nullptr,
       {{kCaseInsensitive, nullptr}, {kLiteral, nullptr}, {kOn, nullptr}},
       {2, 10, 10, 0, 0, 1}},
  };
  return cases;
}

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
