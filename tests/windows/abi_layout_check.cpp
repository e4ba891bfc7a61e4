// The host's record layouts, byte for byte, as the 32-bit builds (the Windows DLL and the
// native -m32 build) see them. Compiled only where pointers are 4 bytes wide; a wrong
// offset stops the build.
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "host/abi.h"

namespace quorrel::abi {

static_assert(sizeof(void*) == 4, "these are the 32-bit layouts");
static_assert(sizeof(HostWord) == 4);
static_assert(sizeof(ActionRoutine) == 4 && sizeof(ExpressionRoutine) == 4);

// SetupRecord: 1076 bytes, the host's header first.
static_assert(kSetupRecordSize == 1076);
static_assert(kSetupHostHeaderSize == 20);
static_assert(kSetupObjectWidth == 20);
static_assert(kSetupObjectHeight == 22);
static_assert(kSetupDimensionCount == 24);
static_assert(kSetupXBoundary == 28);
static_assert(kSetupYBoundary == 32);
static_assert(kSetupCaseSensitive == 36);
static_assert(kSetupWildcardSearch == 40);
static_assert(kSetupListDelimiter == 44 && kSetupListDelimiterSize == 1028);
static_assert(kSetupDialogDelimiterSize == 1024);
static_assert(kSetupAutoSelectRows == 1072);

// RunRecord: 192 bytes, the host's 184 first; runHeader at 8, hostFlags at 124.
static_assert(kRunRecordSize == 192);
static_assert(kRunHostPartSize == 184);
static_assert(kRunHeader == 8);
static_assert(kRunHostFlags == 124);
static_assert(kRunElementArray == 184);
static_assert(kRunBetweenColumn == 188);
static_assert(kResultIsString == 0x8000);

// The host services in the run-time header.
static_assert(kFetchFirstParameter == 876);
static_assert(kFetchNextParameter == 880);
static_assert(kAllocateResultString == 916);

// RunInfo: every field GetRunObjectInfos writes.
static_assert(kInfoConditionRoutines == 0);
static_assert(kInfoActionRoutines == 4);
static_assert(kInfoExpressionRoutines == 8);
static_assert(kInfoConditionCount == 12);
static_assert(kInfoActionCount == 14);
static_assert(kInfoExpressionCount == 16);
static_assert(kInfoSetupSize == 18);
static_assert(kInfoHostWord1 == 20);
static_assert(kInfoHostByte == 24 && kInfoHostByteValue == 10);
static_assert(kInfoHostWord2 == 26);
static_assert(kInfoIdentifier == 28);
static_assert(kInfoHostWord3 == 32);
static_assert(kRunInfoWrittenSize == 34);
static_assert((kIdentifier & 0xFF) == 'R' && ((kIdentifier >> 8) & 0xFF) == 'Q' &&
              ((kIdentifier >> 16) & 0xFF) == 'U' && (kIdentifier >> 24) == 'Z');

// The editor context: the dialog's owner window and the help service.
static_assert(kEditorWindow == 20);
static_assert(kEditorHelpService == 272);

// InfoEntry: six 16-bit fields, 12 bytes.
static_assert(sizeof(InfoEntry) == 12);
static_assert(offsetof(InfoEntry, code) == 0);
static_assert(offsetof(InfoEntry, flags) == 2);
static_assert(offsetof(InfoEntry, paramTypes) == 4);
static_assert(offsetof(InfoEntry, titleIds) == 8);

}  // namespace quorrel::abi
