// String resources and local allocations where Windows has none.
#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "platform/allocation.h"
#include "platform/resource_data.h"
#include "platform/windows_services.h"

namespace {

const char* findString(UINT id) {
  auto strings = quorrel::platform::moduleResources().strings;
  auto wanted = static_cast<uint16_t>(id & 0xFFFF);
  auto found = std::lower_bound(
      strings.begin(), strings.end(), wanted,
      [](const quorrel::platform::StringResource& entry, uint16_t key) { return entry.id < key; });
  return found != strings.end() && found->id == wanted ? found->text : nullptr;
}

}  // namespace

extern "C" {

// Copies at most size - 1 characters and a terminator; answers the number copied,
// 0 for a missing string (the buffer then holds the empty text).
int LoadStringA(HINSTANCE, UINT id, LPSTR buffer, int size) {
  if (!buffer || size <= 0) return 0;
  const char* text = findString(id);
  std::size_t length = text ? std::strlen(text) : 0;
  auto copied = std::min(length, static_cast<std::size_t>(size - 1));
  if (copied > 0) std::memcpy(buffer, text, copied);
  buffer[copied] = '\0';
  return static_cast<int>(copied);
}

HLOCAL LocalAlloc(UINT flags, SIZE_T bytes) {
  std::size_t size = bytes == 0 ? 1 : bytes;
  return (flags & LMEM_ZEROINIT) ? quorrel::allocateZeroed(1, size) : quorrel::allocateBytes(size);
}

HLOCAL LocalFree(HLOCAL memory) {
  std::free(memory);
  return nullptr;
}

}  // extern "C"
