// The calling conventions shared by every action and expression routine: the shapes
// of the routines, parameter slots, parameter fetching, text result handover, and the
// guard that keeps exceptions and a missing array away from the host.
#pragma once

#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>
#include <variant>

#include "array/element_array.h"
#include "host/abi.h"
#include "host/call_notes.h"
#include "host/run_record.h"
#include "platform/files.h"

namespace quorrel::host {

using abi::HostWord;

// --- Routine shapes ------------------------------------------------------------------
// A parameter as a row of host/table.inc declares it, and what a routine receives for it.
enum class Param { None, Number, Text };
template <Param P>
using ParamOf = std::conditional_t<P == Param::Text, const char*, int32_t>;

// What an action works on: the instance's array, and its run record for the state an
// action keeps there.
struct Instance {
  ElementArray& array;
  void* runRecord;
};

// The function type of a routine: First, then the declared parameters.
template <typename Answer, typename First, Param P1, Param P2>
struct Signature {
  using Type = Answer(First, ParamOf<P1>, ParamOf<P2>);
};
template <typename Answer, typename First, Param P1>
struct Signature<Answer, First, P1, Param::None> {
  using Type = Answer(First, ParamOf<P1>);
};
template <typename Answer, typename First>
struct Signature<Answer, First, Param::None, Param::None> {
  using Type = Answer(First);
};

// A routine's parameter from the host word that carries it, the one decoding for both
// kinds of routine: an action receives the words as arguments, an expression fetches
// them. A number is the word's low 32 bits; a text is the word's address.
template <Param P>
ParamOf<P> paramFrom(HostWord word) {
  if constexpr (P == Param::Text) {
    return reinterpret_cast<const char*>(word);
  } else {
    return static_cast<int32_t>(word);
  }
}

// --- Actions -------------------------------------------------------------------------

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

// What an action's routine answers, by the file column of its row: a file action tells
// what it did, any other action nothing.
enum class FileUse { None, Read, Write, Extend };
template <FileUse F>
using ActionAnswer = std::conditional_t<F == FileUse::None, void, FileStatus>;

template <auto Routine, Param P1, Param P2>
auto invokeAction(const Instance& instance, HostWord param1, HostWord param2) {
  if constexpr (P1 == Param::None) {
    return Routine(instance);
  } else if constexpr (P2 == Param::None) {
    return Routine(instance, paramFrom<P1>(param1));
  } else {
    return Routine(instance, paramFrom<P1>(param1), paramFrom<P2>(param2));
  }
}

// The path a file action names: its first text parameter.
template <Param P1>
const char* pathParameter(HostWord param1, HostWord param2) {
  return paramFrom<Param::Text>(P1 == Param::Text ? param1 : param2);
}

// The routine the host calls for an action: its parameters as declared, then the
// action's routine on the instance. A file action's outcome is kept: no array, or an
// exception the routine let out, is a failure of the file action too.
template <auto Routine, Param P1, Param P2, int32_t Code>
int16_t QUORREL_CALL callAction(void* runRecord, [[maybe_unused]] HostWord param1,
                                [[maybe_unused]] HostWord param2) noexcept {
  using Answer = decltype(invokeAction<Routine, P1, P2>(std::declval<const Instance&>(), 0, 0));
  if constexpr (std::is_same_v<Answer, FileStatus>) lastFileStatus = {FileStatus::Refused};
  return runAction(runRecord, [&](ElementArray& array) {
    const CallScope scope(true, Code, runRecord, &array);
    const Instance instance{array, runRecord};
    if constexpr (std::is_same_v<Answer, FileStatus>) {
      lastFileStatus = {FileStatus::OutOfMemory};  // kept when the routine throws
      lastFileStatus = invokeAction<Routine, P1, P2>(instance, param1, param2);
      if (notesWanted()) reportFile(pathParameter<P1>(param1, param2), lastFileStatus);
    } else {
      invokeAction<Routine, P1, P2>(instance, param1, param2);
    }
  });
}

// --- Expression parameters -----------------------------------------------------------
// Fetches an expression's declared parameters in order, telling the host each one's type.
class ParameterFetcher {
 public:
  ParameterFetcher(void* runRecord, HostWord token) : runRecord_(runRecord), token_(token) {}

  template <Param P>
  ParamOf<P> fetch() {
    abi::FetchParameterService service =
        fetched_ == 0 ? fetchFirstParameter(runRecord_) : fetchNextParameter(runRecord_);
    ++fetched_;
    constexpr int32_t flag = P == Param::Text ? abi::kFetchText : abi::kFetchInteger;
    // A host without the service hands over 0 (a null text).
    return paramFrom<P>(service == nullptr ? 0 : service(runRecord_, flag, token_));
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
  if (text == nullptr) {
    note(NoteKind::NoText, {});
    return 0;
  }
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

// What an expression routine answers: a number or a text.
struct Result {
  Result(int32_t number) : value(number) {}
  Result(Borrowed text) : value(text) {}
  Result(std::string text) : value(std::move(text)) {}
  // No text answers as a null borrowed one.
  Result(std::optional<std::string> text) : value(Borrowed{nullptr}) {
    if (text) value = std::move(*text);
  }
  std::variant<int32_t, Borrowed, std::string> value;
};
inline HostWord resultWord(void* runRecord, const Result& result) {
  return std::visit([&](const auto& value) { return resultWord(runRecord, value); }, result.value);
}

// Fetches the declared parameters in order, then runs op(array, parameters...) and
// hands its result over. Without an array every expression answers 0.
template <Param... Params, typename Op>
HostWord runExpression(void* runRecord, HostWord token, Op&& op) noexcept {
  if (runRecord == nullptr) return 0;
  try {
    ParameterFetcher fetcher(runRecord, token);
    // Braced initialisation fetches left to right.
    std::tuple<ParamOf<Params>...> params{fetcher.fetch<Params>()...};
    ElementArray* array = elementArrayOf(runRecord);
    if (array == nullptr) return 0;
    return std::apply([&](auto... values) { return resultWord(runRecord, op(*array, values...)); },
                      params);
  } catch (...) {
    return 0;
  }
}

// The routine the host calls for an expression: its parameters fetched as declared, then
// the expression's routine.
template <auto Routine, Param P1, Param P2, int32_t Code>
HostWord QUORREL_CALL callExpression(void* runRecord, HostWord parameterToken) noexcept {
  const CallScope scope(false, Code, runRecord, nullptr);
  if constexpr (P1 == Param::None) {
    return runExpression<>(runRecord, parameterToken, Routine);
  } else if constexpr (P2 == Param::None) {
    return runExpression<P1>(runRecord, parameterToken, Routine);
  } else {
    return runExpression<P1, P2>(runRecord, parameterToken, Routine);
  }
}

}  // namespace quorrel::host
