// Entry points of the editor side that place and edit an object: CreateObject and
// EditObject with the setup dialog, and the object's name and description.
#include <cstring>

#include "host/dialog.h"
#include "host/editor_module.h"
#include "host/entry_points.h"
#include "host/run_record.h"

using quorrel::abi::HostWord;
namespace abi = quorrel::abi;
namespace host = quorrel::host;

namespace {

constexpr UINT kObjectNameString = 128;
constexpr int kObjectInfoCount = 5;  // 128 to 132; there is no string 132
constexpr int kObjectInfoSize = 255;

void writeDefaults(void* record) {
  using host::writeField;
  writeField<int16_t>(record, abi::kSetupObjectWidth, abi::kDefaultObjectWidth);
  writeField<int16_t>(record, abi::kSetupObjectHeight, abi::kDefaultObjectHeight);
  writeField<int32_t>(record, abi::kSetupXBoundary, abi::kDefaultBoundary);
  writeField<int32_t>(record, abi::kSetupYBoundary, abi::kDefaultBoundary);
  writeField<int32_t>(record, abi::kSetupDimensionCount, abi::kDefaultDimensionCount);
  std::memcpy(static_cast<char*>(record) + abi::kSetupListDelimiter, abi::kDefaultListDelimiter,
              sizeof abi::kDefaultListDelimiter);
  writeField<int32_t>(record, abi::kSetupCaseSensitive, 0);
  writeField<int32_t>(record, abi::kSetupWildcardSearch, 0);
  writeField<int32_t>(record, abi::kSetupAutoSelectRows, 0);
}

}  // namespace

extern "C" {

QUORREL_EXPORT int32_t QUORREL_CALL CreateObject(void* editorContext, HostWord, void* setupRecord) {
  if (!setupRecord) return -1;
  try {
    writeDefaults(setupRecord);
    return static_cast<int32_t>(host::showSetupDialog(editorContext, setupRecord));
  } catch (...) {
    return -1;
  }
}

QUORREL_EXPORT int32_t QUORREL_CALL EditObject(void* editorContext, HostWord, HostWord,
                                               void* setupRecord) {
  try {
    return host::showSetupDialog(editorContext, setupRecord) == 0 ? 1 : 0;
  } catch (...) {
    return 0;
  }
}

QUORREL_EXPORT int32_t QUORREL_CALL GetObjInfos(HostWord, HostWord, char* name, char* author,
                                                char* copyright, char* comment, char* extra) {
  char* buffers[kObjectInfoCount] = {name, author, copyright, comment, extra};
  int32_t loaded = 0;
  try {
    for (int i = 0; i < kObjectInfoCount; ++i) {
      loaded = LoadStringA(host::moduleInstance(), kObjectNameString + static_cast<UINT>(i),
                           buffers[i], kObjectInfoSize);
    }
  } catch (...) {
    return 0;
  }
  return loaded;
}

}  // extern "C"
