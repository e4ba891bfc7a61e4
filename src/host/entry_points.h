// Declarations of every exported entry point, with C linkage and the host's calling
// convention; entry_points.txt lists the same names for the export files. Each
// definition catches everything: no exception crosses into the host.
#pragma once

#include <type_traits>

#include "host/abi.h"

#if defined(_WIN32)
#define QUORREL_EXPORT  // exported through the module-definition file
#else
#define QUORREL_EXPORT __attribute__((visibility("default")))
#endif

extern "C" {

// Object information and setup.
QUORREL_EXPORT int32_t QUORREL_CALL GetInfos(int32_t infoCode);
QUORREL_EXPORT int32_t QUORREL_CALL CreateObject(void* editorContext, quorrel::abi::HostWord unused,
                                                 void* setupRecord);
QUORREL_EXPORT const char* QUORREL_CALL GetHelpFileName();
QUORREL_EXPORT int32_t QUORREL_CALL EditObject(void* editorContext, quorrel::abi::HostWord unused1,
                                               quorrel::abi::HostWord unused2, void* setupRecord);
QUORREL_EXPORT void QUORREL_CALL GetObjectRect(quorrel::abi::HostWord unused1, int32_t* rect,
                                               quorrel::abi::HostWord unused2, void* setupRecord);
QUORREL_EXPORT int32_t QUORREL_CALL GetObjInfos(quorrel::abi::HostWord unused1,
                                                quorrel::abi::HostWord unused2, char* name,
                                                char* author, char* copyright, char* comment,
                                                char* extra);

// Run-time instance.
QUORREL_EXPORT int16_t QUORREL_CALL CreateRunObject(void* runRecord, void* setupRecord,
                                                    quorrel::abi::HostWord unused);
QUORREL_EXPORT int16_t QUORREL_CALL DestroyRunObject(void* runRecord,
                                                     quorrel::abi::HostWord unused);
QUORREL_EXPORT int16_t QUORREL_CALL HandleRunObject(void* runRecord);
QUORREL_EXPORT int16_t QUORREL_CALL DisplayRunObject(void* runRecord);
QUORREL_EXPORT int16_t QUORREL_CALL ReInitRunObject(void* runRecord);
QUORREL_EXPORT int16_t QUORREL_CALL PauseRunObject(void* runRecord);
QUORREL_EXPORT int16_t QUORREL_CALL ContinueRunObject(void* runRecord);
QUORREL_EXPORT int16_t QUORREL_CALL GetRunObjectInfos(quorrel::abi::HostWord unused, void* runInfo);
QUORREL_EXPORT int16_t QUORREL_CALL GetRunObjectDataSize(quorrel::abi::HostWord unused1,
                                                         quorrel::abi::HostWord unused2);

// Not the host's: what the last file action did, for the quorrel command.
QUORREL_EXPORT int32_t QUORREL_CALL QuorrelFileStatus(int32_t* error);
#ifdef QUORREL_NOTES
// Not the host's, and only where notes are built in: where the module's notes go (a
// null listener stops them).
QUORREL_EXPORT void QUORREL_CALL QuorrelListenNotes(quorrel::abi::NoteListenerFn listener,
                                                    void* context);
#endif

// Information entries.
QUORREL_EXPORT const quorrel::abi::InfoEntry* QUORREL_CALL GetConditionInfos(void* editorContext,
                                                                             int32_t code);
QUORREL_EXPORT const quorrel::abi::InfoEntry* QUORREL_CALL GetActionInfos(void* editorContext,
                                                                          int32_t code);
QUORREL_EXPORT const quorrel::abi::InfoEntry* QUORREL_CALL GetExpressionInfos(void* editorContext,
                                                                              int32_t code);

// Menus, codes, titles and display strings.
QUORREL_EXPORT void* QUORREL_CALL GetConditionMenu(quorrel::abi::HostWord, quorrel::abi::HostWord,
                                                   quorrel::abi::HostWord);
QUORREL_EXPORT void* QUORREL_CALL GetActionMenu(quorrel::abi::HostWord, quorrel::abi::HostWord,
                                                quorrel::abi::HostWord);
QUORREL_EXPORT void* QUORREL_CALL GetExpressionMenu(quorrel::abi::HostWord, quorrel::abi::HostWord,
                                                    quorrel::abi::HostWord);
QUORREL_EXPORT int16_t QUORREL_CALL GetConditionCodeFromMenu(void* editorContext, int32_t menuId);
QUORREL_EXPORT int16_t QUORREL_CALL GetActionCodeFromMenu(void* editorContext, int32_t menuId);
QUORREL_EXPORT int16_t QUORREL_CALL GetExpressionCodeFromMenu(void* editorContext, int32_t menuId);
QUORREL_EXPORT int32_t QUORREL_CALL GetConditionString(void* editorContext, int32_t code,
                                                       char* buffer, int32_t size);
QUORREL_EXPORT int32_t QUORREL_CALL GetActionString(void* editorContext, int32_t code, char* buffer,
                                                    int32_t size);
QUORREL_EXPORT int32_t QUORREL_CALL GetExpressionString(void* editorContext, int32_t code,
                                                        char* buffer, int32_t size);
QUORREL_EXPORT int32_t QUORREL_CALL GetConditionTitle(void* editorContext, int32_t code,
                                                      int32_t param, char* buffer, int32_t size);
QUORREL_EXPORT int32_t QUORREL_CALL GetActionTitle(void* editorContext, int32_t code, int32_t param,
                                                   char* buffer, int32_t size);
QUORREL_EXPORT int32_t QUORREL_CALL GetExpressionTitle(void* editorContext, int32_t code,
                                                       char* buffer, int32_t size);

}  // extern "C"

// The declarations above and the types host programs use must never drift apart.
namespace quorrel::abi::check {
template <auto F, typename T>
inline constexpr bool kHasType = std::is_same_v<decltype(F), T>;

static_assert(kHasType<&GetInfos, GetInfosFn>);
static_assert(kHasType<&CreateObject, CreateObjectFn>);
static_assert(kHasType<&GetHelpFileName, GetHelpFileNameFn>);
static_assert(kHasType<&EditObject, EditObjectFn>);
static_assert(kHasType<&GetObjectRect, GetObjectRectFn>);
static_assert(kHasType<&GetObjInfos, GetObjInfosFn>);
static_assert(kHasType<&CreateRunObject, CreateRunObjectFn>);
static_assert(kHasType<&DestroyRunObject, DestroyRunObjectFn>);
static_assert(kHasType<&HandleRunObject, RunObjectFn>);
static_assert(kHasType<&DisplayRunObject, RunObjectFn>);
static_assert(kHasType<&ReInitRunObject, RunObjectFn>);
static_assert(kHasType<&PauseRunObject, RunObjectFn>);
static_assert(kHasType<&ContinueRunObject, RunObjectFn>);
static_assert(kHasType<&GetRunObjectInfos, GetRunObjectInfosFn>);
static_assert(kHasType<&GetRunObjectDataSize, GetRunObjectDataSizeFn>);
static_assert(kHasType<&QuorrelFileStatus, FileStatusFn>);
#ifdef QUORREL_NOTES
static_assert(kHasType<&QuorrelListenNotes, ListenNotesFn>);
#endif
static_assert(kHasType<&GetConditionInfos, GetInfoEntryFn>);
static_assert(kHasType<&GetActionInfos, GetInfoEntryFn>);
static_assert(kHasType<&GetExpressionInfos, GetInfoEntryFn>);
static_assert(kHasType<&GetConditionMenu, GetMenuFn>);
static_assert(kHasType<&GetActionMenu, GetMenuFn>);
static_assert(kHasType<&GetExpressionMenu, GetMenuFn>);
static_assert(kHasType<&GetConditionCodeFromMenu, GetCodeFromMenuFn>);
static_assert(kHasType<&GetActionCodeFromMenu, GetCodeFromMenuFn>);
static_assert(kHasType<&GetExpressionCodeFromMenu, GetCodeFromMenuFn>);
static_assert(kHasType<&GetConditionString, GetStringFn>);
static_assert(kHasType<&GetActionString, GetStringFn>);
static_assert(kHasType<&GetExpressionString, GetStringFn>);
static_assert(kHasType<&GetConditionTitle, GetParamTitleFn>);
static_assert(kHasType<&GetActionTitle, GetParamTitleFn>);
static_assert(kHasType<&GetExpressionTitle, GetExpressionTitleFn>);
}  // namespace quorrel::abi::check
