// Reading and writing the host's records by offset: the run record of an instance, its
// run-time header with the host services, and the setup record.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "host/abi.h"

namespace quorrel {
class ElementArray;
}

namespace quorrel::host {

using abi::readField;
using abi::writeField;

// --- Run record ----------------------------------------------------------------------
inline ElementArray* elementArrayOf(const void* runRecord) {
  return readField<ElementArray*>(runRecord, abi::kRunElementArray);
}
inline void setElementArray(void* runRecord, ElementArray* array) {
  writeField(runRecord, abi::kRunElementArray, array);
}
inline int32_t betweenColumnOf(const void* runRecord) {
  return readField<int32_t>(runRecord, abi::kRunBetweenColumn);
}
inline void setBetweenColumn(void* runRecord, int32_t column) {
  writeField(runRecord, abi::kRunBetweenColumn, column);
}
// Only ever set: clearing the bit between expression calls is the host's part.
inline void markResultIsString(void* runRecord) {
  auto flags = readField<uint16_t>(runRecord, abi::kRunHostFlags);
  writeField<uint16_t>(runRecord, abi::kRunHostFlags, flags | abi::kResultIsString);
}

// --- Host services, through the run-time header --------------------------------------
// Null when the record has no run-time header.
template <typename Service>
Service hostService(const void* runRecord, std::size_t offset) {
  const void* header = readField<const void*>(runRecord, abi::kRunHeader);
  return header == nullptr ? nullptr : readField<Service>(header, offset);
}
inline abi::FetchParameterService fetchFirstParameter(const void* runRecord) {
  return hostService<abi::FetchParameterService>(runRecord, abi::kFetchFirstParameter);
}
inline abi::FetchParameterService fetchNextParameter(const void* runRecord) {
  return hostService<abi::FetchParameterService>(runRecord, abi::kFetchNextParameter);
}
inline abi::AllocateResultStringService allocateResultString(const void* runRecord) {
  return hostService<abi::AllocateResultStringService>(runRecord, abi::kAllocateResultString);
}

// --- Setup record --------------------------------------------------------------------
struct SetupFields {
  int16_t objectWidth;
  int16_t objectHeight;
  int32_t dimensionCount;
  int32_t xBoundary;
  int32_t yBoundary;
  int32_t caseSensitive;
  int32_t wildcardSearch;
  int32_t autoSelectRows;
};

inline SetupFields readSetup(const void* setupRecord) {
  return {readField<int16_t>(setupRecord, abi::kSetupObjectWidth),
          readField<int16_t>(setupRecord, abi::kSetupObjectHeight),
          readField<int32_t>(setupRecord, abi::kSetupDimensionCount),
          readField<int32_t>(setupRecord, abi::kSetupXBoundary),
          readField<int32_t>(setupRecord, abi::kSetupYBoundary),
          readField<int32_t>(setupRecord, abi::kSetupCaseSensitive),
          readField<int32_t>(setupRecord, abi::kSetupWildcardSearch),
          readField<int32_t>(setupRecord, abi::kSetupAutoSelectRows)};
}

// The stored delimiter; a record without a terminator inside its field is cut at the
// field's end rather than read past it.
inline const char* setupListDelimiter(const void* setupRecord,
                                      char (&copy)[abi::kSetupListDelimiterSize + 1]) {
  std::memcpy(copy, static_cast<const char*>(setupRecord) + abi::kSetupListDelimiter,
              abi::kSetupListDelimiterSize);
  copy[abi::kSetupListDelimiterSize] = '\0';
  return copy;
}

}  // namespace quorrel::host
