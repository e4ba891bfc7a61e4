// The module's allocations that do not go through operator new. They are routed here
// so that a test can make any one of them fail, as if memory had run out, and check
// what the module does then (fuzz/alloc_faults.cpp; it fails operator new the same way).
#pragma once

#include <cstddef>
#include <cstdlib>

namespace quorrel {

// Asked before every allocation while set; true refuses it. Only tests set it.
using AllocationFaultHook = bool (*)();
inline AllocationFaultHook allocationFaultHook = nullptr;

inline bool allocationRefused() {
  return allocationFaultHook != nullptr && allocationFaultHook();
}
inline void* allocateBytes(std::size_t count) {
  return allocationRefused() ? nullptr : std::malloc(count);
}
inline void* allocateZeroed(std::size_t count, std::size_t size) {
  return allocationRefused() ? nullptr : std::calloc(count, size);
}
inline void* reallocateBytes(void* block, std::size_t count) {
  return allocationRefused() ? nullptr : std::realloc(block, count);
}

}  // namespace quorrel
