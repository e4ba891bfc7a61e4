// The binary interface between the host and the extension module: record layouts,
// codes, calling convention and the types of every exported entry point, routine and
// host service. Header-only and free of the core, so that host programs (the quorrel
// command, test hosts) include it on its own.
//
// The 32-bit layouts are the host's and byte-exact. On 64-bit builds pointers are
// 8 bytes wide and the layouts widen as follows:
//  - RunRecord: the host's first 184 bytes keep their offsets (runHeader at 8,
//    hostFlags at 124); elementArray stays at 184 and betweenColumn follows the
//    pointer at 192; the record is rounded up to pointer alignment (200 bytes), which
//    GetRunObjectDataSize answers.
//  - RunInfo: the three table pointers widen to 8 bytes each and every later field
//    moves back by the 12 bytes gained.
//  - The host's run-time header and editor context are tables of pointer-sized
//    words: a field at byte o on 32-bit lies at byte o / 4 * 8 on 64-bit.
// Every other record (SetupRecord, InfoEntry) holds no pointer and is the same on
// both widths. All integers are little-endian.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#if defined(_WIN32) && !defined(_WIN64)
#define QUORREL_CALL __stdcall
#else
#define QUORREL_CALL
#endif

namespace quorrel::abi {

static_assert(std::endian::native == std::endian::little,
              "the host's records are little-endian and read in place");

// A field of a host record at its byte offset. The records are byte arrays whose fields
// need not be aligned, so they are copied, never cast.
template <typename T>
T readField(const void* record, std::size_t offset) {
  T value;
  std::memcpy(&value, static_cast<const char*>(record) + offset, sizeof value);
  return value;
}

template <typename T>
void writeField(void* record, std::size_t offset, T value) {
  std::memcpy(static_cast<char*>(record) + offset, &value, sizeof value);
}

inline constexpr std::size_t kPointerSize = sizeof(void*);
inline constexpr bool kWide = kPointerSize == 8;
static_assert(kPointerSize == 4 || kPointerSize == 8);

// One argument or result slot of the host: 32 bits on the 32-bit build, wide enough
// for a pointer elsewhere (action parameters and expression results carry texts).
using HostWord = std::intptr_t;

constexpr std::size_t alignUp(std::size_t offset, std::size_t alignment) {
  return (offset + alignment - 1) / alignment * alignment;
}

// Where a pointer-holding field of a host structure lies on this build.
constexpr std::size_t hostWordOffset(std::size_t offset32) {
  return offset32 / 4 * kPointerSize;
}

// --- Counts and codes ----------------------------------------------------------------
inline constexpr int kConditionCount = 0;
// One per row of table.inc.
inline constexpr int kActionCount = 0
#define ACTION(...) +1
#include "host/table.inc"
    ;
inline constexpr int kExpressionCount = 0
#define EXPRESSION(...) +1
#include "host/table.inc"
    ;

// Resource ids the host asks for: the three menus, each item's command id (base plus
// the row's code), and the display strings and expression names (base plus code).
inline constexpr int kActionMenuId = 20000;
inline constexpr int kConditionMenuId = 20001;
inline constexpr int kExpressionMenuId = 20002;
inline constexpr int kActionCommandBase = 25000;
inline constexpr int kConditionCommandBase = 26000;
inline constexpr int kExpressionCommandBase = 27000;
inline constexpr int kConditionStringBase = 28000;
inline constexpr int kActionStringBase = 28200;
inline constexpr int kExpressionStringBase = 28400;

// Parameter types in the information entries.
inline constexpr uint16_t kActionParamNumber = 22;
inline constexpr uint16_t kActionParamText = 45;
inline constexpr uint16_t kExpressionParamInteger = 1;
inline constexpr uint16_t kExpressionParamText = 3;

// Type flags of the parameter fetch services.
inline constexpr int32_t kFetchInteger = 0;
inline constexpr int32_t kFetchText = 1;

// Bit of hostFlags that marks an expression result as text.
inline constexpr uint16_t kResultIsString = 0x8000;

// --- SetupRecord: stored by the host with every object -------------------------------
inline constexpr std::size_t kSetupRecordSize = 1076;
inline constexpr std::size_t kSetupHostHeaderSize = 20;
inline constexpr std::size_t kSetupObjectWidth = 20;     // int16
inline constexpr std::size_t kSetupObjectHeight = 22;    // int16
inline constexpr std::size_t kSetupDimensionCount = 24;  // int32
inline constexpr std::size_t kSetupXBoundary = 28;       // int32
inline constexpr std::size_t kSetupYBoundary = 32;       // int32
inline constexpr std::size_t kSetupCaseSensitive = 36;   // int32
inline constexpr std::size_t kSetupWildcardSearch = 40;  // int32
inline constexpr std::size_t kSetupListDelimiter = 44;   // zero-terminated text
inline constexpr std::size_t kSetupListDelimiterSize = 1028;
inline constexpr std::size_t kSetupDialogDelimiterSize = 1024;  // what the dialog writes
inline constexpr std::size_t kSetupAutoSelectRows = 1072;       // int32
static_assert(kSetupListDelimiter + kSetupListDelimiterSize == kSetupAutoSelectRows);
static_assert(kSetupAutoSelectRows + 4 == kSetupRecordSize);

// Defaults that CreateObject writes.
inline constexpr int16_t kDefaultObjectWidth = 32;
inline constexpr int16_t kDefaultObjectHeight = 32;
inline constexpr int32_t kDefaultDimensionCount = 2;
inline constexpr int32_t kDefaultBoundary = 10;
inline constexpr char kDefaultListDelimiter[] = ",";

// --- RunRecord: allocated by the host per instance -----------------------------------
inline constexpr std::size_t kRunHeader = 8;       // pointer to the run-time header
inline constexpr std::size_t kRunHostFlags = 124;  // uint16
inline constexpr std::size_t kRunHostPartSize = 184;
inline constexpr std::size_t kRunElementArray = 184;  // pointer, owned by the instance
inline constexpr std::size_t kRunBetweenColumn = kRunElementArray + kPointerSize;  // int32
inline constexpr std::size_t kRunRecordSize = alignUp(kRunBetweenColumn + 4, kPointerSize);

// --- Run-time header: the host services an expression calls --------------------------
inline constexpr std::size_t kFetchFirstParameter = hostWordOffset(876);
inline constexpr std::size_t kFetchNextParameter = hostWordOffset(880);
inline constexpr std::size_t kAllocateResultString = hostWordOffset(916);
inline constexpr std::size_t kRunHeaderMinSize = kAllocateResultString + kPointerSize;

// --- RunInfo: filled by GetRunObjectInfos --------------------------------------------
inline constexpr std::size_t kInfoConditionRoutines = 0;  // pointer
inline constexpr std::size_t kInfoActionRoutines = kPointerSize;
inline constexpr std::size_t kInfoExpressionRoutines = 2 * kPointerSize;
inline constexpr std::size_t kInfoCounts = 3 * kPointerSize;          // 12 on 32-bit
inline constexpr std::size_t kInfoConditionCount = kInfoCounts + 0;   // uint16
inline constexpr std::size_t kInfoActionCount = kInfoCounts + 2;      // uint16
inline constexpr std::size_t kInfoExpressionCount = kInfoCounts + 4;  // uint16
inline constexpr std::size_t kInfoSetupSize = kInfoCounts + 6;        // uint16
inline constexpr std::size_t kInfoHostWord1 = kInfoCounts + 8;        // uint32, 0
inline constexpr std::size_t kInfoHostByte = kInfoCounts + 12;        // uint8, 10
inline constexpr std::size_t kInfoHostWord2 = kInfoCounts + 14;       // uint16, 0
inline constexpr std::size_t kInfoIdentifier = kInfoCounts + 16;      // uint32
inline constexpr std::size_t kInfoHostWord3 = kInfoCounts + 20;       // uint16, 0
inline constexpr std::size_t kRunInfoWrittenSize = kInfoCounts + 22;  // bytes past stay
inline constexpr uint8_t kInfoHostByteValue = 10;
inline constexpr uint32_t kIdentifier = 0x5A555152;  // reads "RQUZ" in memory

// --- Editor context: the two fields the setup dialog uses ----------------------------
inline constexpr std::size_t kEditorWindow = hostWordOffset(20);
inline constexpr std::size_t kEditorHelpService = hostWordOffset(272);

// --- InfoEntry -----------------------------------------------------------------------
struct InfoEntry {
  uint16_t code;
  uint16_t flags;
  uint16_t paramTypes[2];
  uint16_t titleIds[2];
};
inline constexpr std::size_t kInfoEntrySize = 12;
static_assert(sizeof(InfoEntry) == kInfoEntrySize);

// --- Routines and host services ------------------------------------------------------
// An action: RunRecord, parameter 1, parameter 2 (a number or a pointer to text).
using ActionRoutine = int16_t(QUORREL_CALL*)(void* runRecord, HostWord param1, HostWord param2);
// An expression: RunRecord and the token handed back to the fetch services; answers a
// number or a pointer to a buffer from AllocateResultString.
using ExpressionRoutine = HostWord(QUORREL_CALL*)(void* runRecord, HostWord parameterToken);
using ConditionRoutine = HostWord(QUORREL_CALL*)(void* runRecord, HostWord param1, HostWord param2);

// FetchFirstParameter and FetchNextParameter: a number, or a pointer to host text.
using FetchParameterService = HostWord(QUORREL_CALL*)(void* runRecord, int32_t typeFlag,
                                                      HostWord parameterToken);
using AllocateResultStringService = char*(QUORREL_CALL*)(void* runRecord, int32_t byteCount,
                                                         int32_t reserved);
// The host's help service in the editor context: help file path and two zeros.
using HelpService = void(QUORREL_CALL*)(const char* path, HostWord, HostWord);

// --- Exported entry points -----------------------------------------------------------
// Codes and menu ids arrive as full words whose low 16 bits are read as signed;
// "16-bit" results are declared int16_t.
using GetInfosFn = int32_t(QUORREL_CALL*)(int32_t infoCode);
using CreateObjectFn = int32_t(QUORREL_CALL*)(void* editorContext, HostWord unused,
                                              void* setupRecord);
using GetHelpFileNameFn = const char*(QUORREL_CALL*)();
using EditObjectFn = int32_t(QUORREL_CALL*)(void* editorContext, HostWord unused1, HostWord unused2,
                                            void* setupRecord);
// rect: left, top, right, bottom as int32.
using GetObjectRectFn = void(QUORREL_CALL*)(HostWord unused1, int32_t* rect, HostWord unused2,
                                            void* setupRecord);
using GetObjInfosFn = int32_t(QUORREL_CALL*)(HostWord unused1, HostWord unused2, char* name,
                                             char* author, char* copyright, char* comment,
                                             char* extra);
using CreateRunObjectFn = int16_t(QUORREL_CALL*)(void* runRecord, void* setupRecord,
                                                 HostWord unused);
using DestroyRunObjectFn = int16_t(QUORREL_CALL*)(void* runRecord, HostWord unused);
// HandleRunObject, DisplayRunObject, ReInitRunObject, PauseRunObject, ContinueRunObject.
using RunObjectFn = int16_t(QUORREL_CALL*)(void* runRecord);
using GetRunObjectInfosFn = int16_t(QUORREL_CALL*)(HostWord unused, void* runInfo);
using GetRunObjectDataSizeFn = int16_t(QUORREL_CALL*)(HostWord unused1, HostWord unused2);
// QuorrelFileStatus, which the host never calls: the quorrel command's way to learn what
// the last file action did. The failed step (0 when it was done) and the system's error
// number.
using FileStatusFn = int32_t(QUORREL_CALL*)(int32_t* error);
// QuorrelListenNotes, exported only by a module built with notes: the listener gets each
// note's id, the name of the call it comes from and its message.
using NoteListenerFn = void(QUORREL_CALL*)(void* context, const char* id, const char* call,
                                           const char* message);
using ListenNotesFn = void(QUORREL_CALL*)(NoteListenerFn listener, void* context);
// GetConditionInfos, GetActionInfos, GetExpressionInfos.
using GetInfoEntryFn = const InfoEntry*(QUORREL_CALL*)(void* editorContext, int32_t code);
// GetConditionMenu, GetActionMenu, GetExpressionMenu: a menu the host owns.
using GetMenuFn = void*(QUORREL_CALL*)(HostWord, HostWord, HostWord);
using GetCodeFromMenuFn = int16_t(QUORREL_CALL*)(void* editorContext, int32_t menuId);
// GetConditionString, GetActionString, GetExpressionString: characters copied.
using GetStringFn = int32_t(QUORREL_CALL*)(void* editorContext, int32_t code, char* buffer,
                                           int32_t size);
// GetConditionTitle, GetActionTitle.
using GetParamTitleFn = int32_t(QUORREL_CALL*)(void* editorContext, int32_t code, int32_t param,
                                               char* buffer, int32_t size);
using GetExpressionTitleFn = int32_t(QUORREL_CALL*)(void* editorContext, int32_t code, char* buffer,
                                                    int32_t size);

// --- The layouts of both widths, checked whichever is built --------------------------
namespace check {
constexpr std::size_t wordOffset(std::size_t offset32, std::size_t pointer) {
  return offset32 / 4 * pointer;
}
static_assert(wordOffset(876, 4) == 876 && wordOffset(880, 4) == 880);
static_assert(wordOffset(916, 4) == 916);
static_assert(wordOffset(876, 8) == 1752 && wordOffset(880, 8) == 1760);
static_assert(wordOffset(916, 8) == 1832);
static_assert(wordOffset(20, 4) == 20 && wordOffset(272, 4) == 272);
static_assert(wordOffset(20, 8) == 40 && wordOffset(272, 8) == 544);
static_assert(alignUp(184 + 4 + 4, 4) == 192);        // run record, 32-bit
static_assert(alignUp(184 + 8 + 4, 8) == 200);        // run record, 64-bit
static_assert(3 * 4 + 22 == 34 && 3 * 8 + 22 == 46);  // RunInfo bytes written
}  // namespace check

static_assert(kWide || (kRunRecordSize == 192 && kRunBetweenColumn == 188));
static_assert(!kWide || (kRunRecordSize == 200 && kRunBetweenColumn == 192));
static_assert(kWide || (kFetchFirstParameter == 876 && kFetchNextParameter == 880 &&
                        kAllocateResultString == 916));
static_assert(kWide || (kEditorWindow == 20 && kEditorHelpService == 272));
static_assert(kWide ||
              (kInfoConditionCount == 12 && kInfoActionCount == 14 && kInfoExpressionCount == 16 &&
               kInfoSetupSize == 18 && kInfoHostWord1 == 20 && kInfoHostByte == 24 &&
               kInfoHostWord2 == 26 && kInfoIdentifier == 28 && kInfoHostWord3 == 32 &&
               kRunInfoWrittenSize == 34));
static_assert(!kWide || (kInfoConditionCount == 24 && kInfoIdentifier == 40));
static_assert(kRunBetweenColumn % 4 == 0 && kRunElementArray % kPointerSize == 0);
static_assert(kFetchFirstParameter % kPointerSize == 0);
static_assert(kAllocateResultString % kPointerSize == 0);

}  // namespace quorrel::abi
