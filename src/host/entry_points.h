// Declarations of every exported entry point, one for each row of entry_points.inc: C
// linkage, the host's calling convention and the row's function type from abi.h, which
// host programs call it through. Each definition catches everything: no exception
// crosses into the host.
#pragma once

#include <cstddef>
#include <type_traits>

#include "host/abi.h"

#if defined(_WIN32)
#define QUORREL_EXPORT  // exported through the module-definition file
#else
#define QUORREL_EXPORT __attribute__((visibility("default")))
#endif

extern "C" {
#define QUORREL_ENTRY_POINT(name, ordinal, bytes, side, Type) \
  QUORREL_EXPORT std::remove_pointer_t<quorrel::abi::Type> name;
#ifdef QUORREL_NOTES
#define QUORREL_NOTES_ENTRY_POINT QUORREL_ENTRY_POINT
#endif
#include "host/entry_points.inc"
#undef QUORREL_ENTRY_POINT
#undef QUORREL_NOTES_ENTRY_POINT
}  // extern "C"

// Every row's argument bytes are those of its declaration, checked in every build: the
// 32-bit Windows build links against them (_name@bytes), the others would not notice.
namespace quorrel::abi::check {
// A 32-bit Windows caller pushes every argument an entry point takes (a pointer, a
// HostWord, an integer of 32 bits or fewer) in one 4-byte slot. Anything wider is
// refused here rather than counted wrongly.
template <typename T>
constexpr std::size_t slotBytes32() {
  static_assert(std::is_pointer_v<T> || std::is_same_v<T, HostWord> ||
                    (std::is_integral_v<T> && sizeof(T) <= 4),
                "an argument that does not fit one 32-bit stack slot");
  return 4;
}
template <typename Result, typename... Args>
constexpr std::size_t argumentBytes32(Result(QUORREL_CALL*)(Args...)) {
  return (std::size_t{0} + ... + slotBytes32<Args>());
}
#define QUORREL_ENTRY_POINT(name, ordinal, bytes, side, Type) \
  static_assert(argumentBytes32(&name) == (bytes), #name ": argument bytes");
#ifdef QUORREL_NOTES
#define QUORREL_NOTES_ENTRY_POINT QUORREL_ENTRY_POINT
#endif
#include "host/entry_points.inc"
#undef QUORREL_ENTRY_POINT
#undef QUORREL_NOTES_ENTRY_POINT
}  // namespace quorrel::abi::check
