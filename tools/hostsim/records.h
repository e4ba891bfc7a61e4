// The records a host hands the module, built as the host builds them: the setup record
// it stores with an object, and the typed arguments of an action or expression call.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "host/abi.h"

namespace quorrel::hostsim {

// The setup fields an author edits in the dialog, at the editor's defaults.
struct SetupFields {
  int32_t dims = 2;
  int32_t x = 10;
  int32_t y = 10;
  int32_t caseSensitive = 0;
  int32_t wildcard = 0;
  int32_t autoSelect = 0;
  std::string delimiter = ",";
};

// The longest delimiter the setup record holds (1024 bytes with the terminator).
inline constexpr size_t kMaxDelimiterLength = 1023;

// A setup record as the host stores it. Fields can be overwritten one by one, with
// any value, to play a host that stored something odd.
class SetupRecord {
 public:
  SetupRecord(const SetupFields& fields = {}) : bytes_(abi::kSetupRecordSize, 0) {  // NOLINT
    abi::writeField(bytes_.data(), abi::kSetupObjectWidth, abi::kDefaultObjectWidth);
    abi::writeField(bytes_.data(), abi::kSetupObjectHeight, abi::kDefaultObjectHeight);
    set(abi::kSetupDimensionCount, fields.dims).set(abi::kSetupXBoundary, fields.x);
    set(abi::kSetupYBoundary, fields.y).set(abi::kSetupCaseSensitive, fields.caseSensitive);
    set(abi::kSetupWildcardSearch, fields.wildcard);
    set(abi::kSetupAutoSelectRows, fields.autoSelect).delimiter(fields.delimiter);
  }
  SetupRecord& set(size_t offset, int32_t value) {
    abi::writeField(bytes_.data(), offset, value);
    return *this;
  }
  // The delimiter, zero-padded; a longer one than the module reads is kept whole as far
  // as the field goes, so that the module's own limit is what applies.
  SetupRecord& delimiter(const std::string& text) {
    unsigned char* field = bytes_.data() + abi::kSetupListDelimiter;
    std::memset(field, 0, abi::kSetupListDelimiterSize);
    std::memcpy(field, text.data(), std::min(text.size(), abi::kSetupListDelimiterSize - 1));
    return *this;
  }
  unsigned char* data() { return bytes_.data(); }
  const unsigned char* data() const { return bytes_.data(); }

 private:
  std::vector<unsigned char> bytes_;
};

// One typed argument of an action or expression call.
struct Argument {
  Argument() = default;
  Argument(int32_t value) : number(value) {}  // NOLINT: arguments read naturally as literals
  Argument(const char* value) : isText(true), text(value) {}         // NOLINT
  Argument(const std::string& value) : isText(true), text(value) {}  // NOLINT
  abi::HostWord word() const {
    return isText ? reinterpret_cast<abi::HostWord>(text.c_str())
                  : static_cast<abi::HostWord>(number);
  }
  bool isText = false;
  int32_t number = 0;
  std::string text;
};

}  // namespace quorrel::hostsim
