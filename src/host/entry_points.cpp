// Entry points of object information, the run-time instance and the information
// entries.
#include "host/entry_points.h"

#include <array>
#include <cstddef>
#include <memory>
#include <new>

#include "array/element_array.h"
#include "array/int32.h"
#include "host/routine_support.h"
#include "host/run_record.h"
#include "host/tables.h"

using quorrel::ElementArray;
using quorrel::abi::HostWord;
using quorrel::abi::InfoEntry;
namespace abi = quorrel::abi;
namespace host = quorrel::host;

namespace {

constexpr char kHelpFilePath[] = "Help\\Quorrel\\quorrel2.html";

// Answers of GetInfos, by information code.
constexpr int32_t kInfo0 = 512;
constexpr int32_t kInfo6 = 2;
constexpr int32_t kInfo7 = 243;

// A new array takes the setup record's dimensions, boundaries, delimiter, modes and
// automatic selection; out-of-range values fall back as the array's own setters do.
void applySetup(ElementArray& array, const void* setupRecord) {
  const host::SetupFields setup = host::readSetup(setupRecord);
  if (setup.dimensionCount == 3) {
    array.setDimensions(3);
    array.setBoundary(1, setup.xBoundary);
    array.setBoundary(2, setup.yBoundary);
  } else if (setup.dimensionCount == 2) {
    array.setDimensions(2);
    array.setBoundary(1, setup.xBoundary);
  } else {
    array.setDimensions(1);
  }
  char delimiter[abi::kSetupListDelimiterSize + 1];
  if (host::setupListDelimiter(setupRecord, delimiter)[0] != '\0') {
    array.setListDelimiter(delimiter);
  }
  quorrel::ArraySettings& settings = array.settings;
  settings.caseMode = setup.caseSensitive == 0 ? quorrel::CaseInsensitive : quorrel::CaseSensitive;
  settings.searchMode =
      setup.wildcardSearch == 0 ? quorrel::SearchLiteral : quorrel::SearchWildcard;
  settings.autoSelectNewRows = setup.autoSelectRows == 1;
}

// Codes arrive in a full word; the host means its low 16 bits, signed.
int16_t lowCode(int32_t code) {
  return static_cast<int16_t>(code);
}

// The entry of a code in the table; null for any other code, which would otherwise
// point outside it. The condition table holds one empty entry, for code 0.
template <std::size_t N>
const InfoEntry* entryOf(const std::array<InfoEntry, N>& table, int32_t code) {
  const int16_t c = lowCode(code);
  return c >= 0 && static_cast<std::size_t>(c) < N ? table.data() + c : nullptr;
}

int16_t noEffect(void*) {
  return 0;
}

}  // namespace

extern "C" {

QUORREL_EXPORT int32_t QUORREL_CALL GetInfos(int32_t infoCode) {
  switch (infoCode) {
    case 0:
      return kInfo0;
    case 6:
      return kInfo6;
    case 7:
      return kInfo7;
    default:
      return 0;
  }
}

QUORREL_EXPORT const char* QUORREL_CALL GetHelpFileName() {
  return kHelpFilePath;
}

QUORREL_EXPORT void QUORREL_CALL GetObjectRect(HostWord, int32_t* rect, HostWord,
                                               void* setupRecord) {
  if (rect == nullptr || setupRecord == nullptr) return;
  const host::SetupFields setup = host::readSetup(setupRecord);
  rect[2] = quorrel::addWrap(rect[0], setup.objectWidth);
  rect[3] = quorrel::addWrap(rect[1], setup.objectHeight);
}

QUORREL_EXPORT int16_t QUORREL_CALL CreateRunObject(void* runRecord, void* setupRecord, HostWord) {
  if (runRecord == nullptr) return 0;
  host::setElementArray(runRecord, nullptr);
  host::setBetweenColumn(runRecord, 0);
  try {
    auto array = std::make_unique<ElementArray>();
    if (setupRecord != nullptr) applySetup(*array, setupRecord);
    host::setElementArray(runRecord, array.release());  // owned by the instance
    host::objectCreated(runRecord);
  } catch (...) {
    // Without an array every action does nothing and every expression answers 0.
  }
  return 0;
}

QUORREL_EXPORT int16_t QUORREL_CALL DestroyRunObject(void* runRecord, HostWord) {
  if (runRecord == nullptr) return 0;
  // The field is cleared so that a second call, or a routine called after it, finds
  // no array instead of a freed one.
  std::unique_ptr<ElementArray> owned(host::elementArrayOf(runRecord));
  host::setElementArray(runRecord, nullptr);
  host::objectDestroyed(runRecord);
  return 0;
}

QUORREL_EXPORT int16_t QUORREL_CALL HandleRunObject(void*) {
  return 1;
}
QUORREL_EXPORT int16_t QUORREL_CALL DisplayRunObject(void* runRecord) {
  return noEffect(runRecord);
}
QUORREL_EXPORT int16_t QUORREL_CALL ReInitRunObject(void* runRecord) {
  return noEffect(runRecord);
}
QUORREL_EXPORT int16_t QUORREL_CALL PauseRunObject(void* runRecord) {
  return noEffect(runRecord);
}
QUORREL_EXPORT int16_t QUORREL_CALL ContinueRunObject(void* runRecord) {
  return noEffect(runRecord);
}

QUORREL_EXPORT int16_t QUORREL_CALL GetRunObjectInfos(HostWord, void* runInfo) {
  if (runInfo == nullptr) return 1;
  using host::writeField;
  writeField(runInfo, abi::kInfoConditionRoutines, host::ConditionRoutineTable.data());
  writeField(runInfo, abi::kInfoActionRoutines, host::ActionRoutineTable.data());
  writeField(runInfo, abi::kInfoExpressionRoutines, host::ExpressionRoutineTable.data());
  writeField<uint16_t>(runInfo, abi::kInfoConditionCount, abi::kConditionCount);
  writeField<uint16_t>(runInfo, abi::kInfoActionCount, abi::kActionCount);
  writeField<uint16_t>(runInfo, abi::kInfoExpressionCount, abi::kExpressionCount);
  writeField<uint16_t>(runInfo, abi::kInfoSetupSize, abi::kSetupRecordSize);
  writeField<uint32_t>(runInfo, abi::kInfoHostWord1, 0);
  writeField<uint8_t>(runInfo, abi::kInfoHostByte, abi::kInfoHostByteValue);
  writeField<uint16_t>(runInfo, abi::kInfoHostWord2, 0);
  writeField<uint32_t>(runInfo, abi::kInfoIdentifier, abi::kIdentifier);
  writeField<uint16_t>(runInfo, abi::kInfoHostWord3, 0);
  return 1;
}

QUORREL_EXPORT int16_t QUORREL_CALL GetRunObjectDataSize(HostWord, HostWord) {
  return static_cast<int16_t>(abi::kRunRecordSize);
}

QUORREL_EXPORT int32_t QUORREL_CALL QuorrelFileStatus(int32_t* error) {
  if (error != nullptr) *error = host::lastFileStatus.error;
  return host::lastFileStatus.failed;
}

#ifdef QUORREL_NOTES
QUORREL_EXPORT void QUORREL_CALL QuorrelListenNotes(abi::NoteListenerFn listener, void* context) {
  host::listenToNotes(listener, context);
}
#endif

QUORREL_EXPORT const InfoEntry* QUORREL_CALL GetConditionInfos(void*, int32_t code) {
  return entryOf(host::ConditionInfoTable, code);
}
QUORREL_EXPORT const InfoEntry* QUORREL_CALL GetActionInfos(void*, int32_t code) {
  return entryOf(host::ActionInfoTable, code);
}
QUORREL_EXPORT const InfoEntry* QUORREL_CALL GetExpressionInfos(void*, int32_t code) {
  return entryOf(host::ExpressionInfoTable, code);
}

}  // extern "C"
