// The calling conventions shared by every action and expression routine: parameter
// slots, parameter fetching, text result handover, and the guard that keeps
// exceptions and a missing array away from the host.
#pragma once

#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <tuple>

#include "array/element_array.h"
#include "host/abi.h"
#include "host/run_record.h"
#include "platform/files.h"

namespace quorrel::host {

using abi::HostWord;

// --- Action parameters ---------------------------------------------------------------
inline int32_t numberParam(HostWord slot) {
  return static_cast<int32_t>(slot);
}
inline const char* textParam(HostWord slot) {
  return reinterpret_cast<const char*>(slot);
}

// Runs op on the instance's array; no array means nothing to do. Always answers 0.
template <typename Op>
int16_t runAction(void* runRecord, Op&& op) noexcept {
  if (runRecord == nullptr) return 0;
  try {
    if (ElementArray* array = elementArrayOf(runRecord)) op(*array);
  } catch (...) {
    // Nothing is reported to the host; the array stays as the operation left it.
  }
  return 0;
}

// The outcome of the last file action. The host's interface cannot carry it; the
// quorrel command asks for it (QuorrelFileStatus). The host runs one thread.
inline FileStatus lastFileStatus;

// Runs a file operation as runAction does and keeps what it did, which the host is
// not told. A missing array, or an exception the operation let out, is a failure of
// the file action too.
template <typename Op>
int16_t runFileAction(void* runRecord, Op&& op) noexcept {
  lastFileStatus = {FileStatus::Refused};
  return runAction(runRecord, [&](ElementArray& array) {
    lastFileStatus = {FileStatus::OutOfMemory};  // kept when op throws
    lastFileStatus = op(array);
  });
}

// --- Expression parameters -----------------------------------------------------------
// Declared parameter kinds of an expression, fetched in order.
struct Int {
  using Type = int32_t;
  static constexpr int32_t kFlag = abi::kFetchInteger;
  static Type from(HostWord word) { return static_cast<int32_t>(word); }
};
struct Text {
  using Type = const char*;
  static constexpr int32_t kFlag = abi::kFetchText;
  static Type from(HostWord word) { return reinterpret_cast<const char*>(word); }
};

class ParameterFetcher {
 public:
  ParameterFetcher(void* runRecord, HostWord token) : runRecord_(runRecord), token_(token) {}

  template <typename Kind>
  typename Kind::Type fetch() {
    abi::FetchParameterService service =
        fetched_ == 0 ? fetchFirstParameter(runRecord_) : fetchNextParameter(runRecord_);
    ++fetched_;
    // A host without the service hands over 0 (a null text).
    return Kind::from(service == nullptr ? 0 : service(runRecord_, Kind::kFlag, token_));
  }

 private:
  void* runRecord_;
  HostWord token_;
  int fetched_ = 0;
};

// --- Expression results --------------------------------------------------------------
// A text owned by the array: copied to the host, never freed.
struct Borrowed {
  const char* text;
};
// Copies text into a host buffer and marks the result as text; no text answers the
// number 0 and leaves the flag alone.
inline HostWord handOverText(void* runRecord, const char* text) {
  if (text == nullptr) return 0;
  const std::size_t length = std::strlen(text);
  const abi::AllocateResultStringService allocate = allocateResultString(runRecord);
  if (allocate == nullptr) return 0;
  char* buffer = allocate(runRecord, static_cast<int32_t>(length + 1), 0);
  markResultIsString(runRecord);
  if (buffer == nullptr) return 0;
  std::memcpy(buffer, text, length + 1);
  return reinterpret_cast<HostWord>(buffer);
}

inline HostWord resultWord(void*, int32_t number) {
  return number;
}
inline HostWord resultWord(void* runRecord, Borrowed text) {
  return handOverText(runRecord, text.text);
}
// A fresh text built for this call: copied, then released with the string.
inline HostWord resultWord(void* runRecord, const std::string& text) {
  return handOverText(runRecord, text.c_str());
}
// A fresh text that may be absent.
inline HostWord resultWord(void* runRecord, const std::optional<std::string>& text) {
  return handOverText(runRecord, text ? text->c_str() : nullptr);
}

// Fetches the declared parameters in order, then runs op(array, parameters...) and
// hands its result over. Without an array every expression answers 0.
template <typename... Kinds, typename Op>
HostWord runExpression(void* runRecord, HostWord token, Op&& op) noexcept {
  if (runRecord == nullptr) return 0;
  try {
    ParameterFetcher fetcher(runRecord, token);
    // Braced initialisation fetches left to right.
    std::tuple<typename Kinds::Type...> params{fetcher.fetch<Kinds>()...};
    ElementArray* array = elementArrayOf(runRecord);
    if (array == nullptr) return 0;
    return std::apply([&](auto... values) { return resultWord(runRecord, op(*array, values...)); },
                      params);
  } catch (...) {
    return 0;
  }
}

}  // namespace quorrel::host
