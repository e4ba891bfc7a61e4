// The Windows user-interface and memory services the extension uses: menus, string
// resources, a local allocation and a modal dialog with its controls.
//
// On Windows this is <windows.h>. Elsewhere the module brings its own small
// implementation of the same functions, with the same names, arguments and
// results, over the resources of the module's resource script (generated/quorrel.rc,
// which tools/rcgen writes from resources/quorrel.rc); the module exports them so
// that a host program (the quorrel command, the tests) can walk the menus the
// module hands out and drive its dialog (see headless_dialog.h).
#pragma once

#ifdef _WIN32

#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#include <windows.h>

#else

#include <cstddef>
#include <cstdint>

#define QUORREL_PLATFORM_API __attribute__((visibility("default")))
#define WINAPI
#define CALLBACK

using BOOL = int;
using UINT = unsigned int;
using WORD = uint16_t;
using DWORD = uint32_t;
using LONG = int32_t;
using INT_PTR = intptr_t;
using UINT_PTR = uintptr_t;
using LONG_PTR = intptr_t;
using WPARAM = uintptr_t;
using LPARAM = intptr_t;
using SIZE_T = std::size_t;
using LPSTR = char*;
using LPCSTR = const char*;

struct HMENU__;
struct HWND__;
struct HINSTANCE__;
using HMENU = HMENU__*;
using HWND = HWND__*;
using HINSTANCE = HINSTANCE__*;
using HMODULE = HINSTANCE;
using HLOCAL = void*;

using DLGPROC = INT_PTR (*)(HWND, UINT, WPARAM, LPARAM);

#define TRUE 1
#define FALSE 0

#define MAKEINTRESOURCEA(id) \
  (reinterpret_cast<LPSTR>(static_cast<uintptr_t>(static_cast<WORD>(id))))
#define IS_INTRESOURCE(name) ((reinterpret_cast<uintptr_t>(name) >> 16) == 0)
#define LOWORD(value) (static_cast<WORD>(static_cast<uintptr_t>(value) & 0xFFFF))
#define HIWORD(value) (static_cast<WORD>((static_cast<uintptr_t>(value) >> 16) & 0xFFFF))

// Menu item flags.
#define MF_BYCOMMAND 0x0000
#define MF_STRING 0x0000
#define MF_GRAYED 0x0001
#define MF_DISABLED 0x0002
#define MF_CHECKED 0x0008
#define MF_POPUP 0x0010
#define MF_MENUBARBREAK 0x0020
#define MF_MENUBREAK 0x0040
#define MF_BYPOSITION 0x0400
#define MF_SEPARATOR 0x0800

// Local allocation.
#define LMEM_FIXED 0x0000
#define LMEM_ZEROINIT 0x0040
#define LPTR (LMEM_FIXED | LMEM_ZEROINIT)

// Dialog messages, commands and button states.
#define WM_INITDIALOG 0x0110
#define WM_COMMAND 0x0111
#define BN_CLICKED 0
#define IDOK 1
#define IDCANCEL 2
#define BST_UNCHECKED 0
#define BST_CHECKED 1
#define DWL_USER 8
#define DWLP_USER DWL_USER

// Window and control styles the dialog template uses.
#define WS_DISABLED 0x08000000L
#define WS_GROUP 0x00020000L
#define WS_TABSTOP 0x00010000L
#define BS_TYPEMASK 0x0000000FL
#define BS_PUSHBUTTON 0x0L
#define BS_DEFPUSHBUTTON 0x1L
#define BS_AUTORADIOBUTTON 0x9L
#define ES_NUMBER 0x2000L

// Keys a headless dialog understands.
#define VK_RETURN 0x0D
#define VK_ESCAPE 0x1B

extern "C" {

QUORREL_PLATFORM_API HMENU LoadMenuA(HINSTANCE instance, LPCSTR name);
QUORREL_PLATFORM_API HMENU CreatePopupMenu(void);
QUORREL_PLATFORM_API BOOL DestroyMenu(HMENU menu);
QUORREL_PLATFORM_API HMENU GetSubMenu(HMENU menu, int position);
QUORREL_PLATFORM_API int GetMenuItemCount(HMENU menu);
QUORREL_PLATFORM_API UINT GetMenuItemID(HMENU menu, int position);
QUORREL_PLATFORM_API int GetMenuStringA(HMENU menu, UINT item, LPSTR buffer, int size, UINT flags);
QUORREL_PLATFORM_API UINT GetMenuState(HMENU menu, UINT item, UINT flags);
QUORREL_PLATFORM_API BOOL AppendMenuA(HMENU menu, UINT flags, UINT_PTR idOrPopup, LPCSTR text);

QUORREL_PLATFORM_API int LoadStringA(HINSTANCE instance, UINT id, LPSTR buffer, int size);
QUORREL_PLATFORM_API HLOCAL LocalAlloc(UINT flags, SIZE_T bytes);
QUORREL_PLATFORM_API HLOCAL LocalFree(HLOCAL memory);

QUORREL_PLATFORM_API INT_PTR DialogBoxParamA(HINSTANCE instance, LPCSTR name, HWND owner,
                                             DLGPROC procedure, LPARAM parameter);
QUORREL_PLATFORM_API BOOL EndDialog(HWND dialog, INT_PTR result);
QUORREL_PLATFORM_API LONG_PTR SetWindowLongA(HWND window, int index, LONG_PTR value);
QUORREL_PLATFORM_API LONG_PTR GetWindowLongA(HWND window, int index);
// The pointer-sized forms that Windows code uses (64-bit Windows keeps a LONG in the
// ...LongA slots); here the slots are pointer-sized already.
inline LONG_PTR SetWindowLongPtrA(HWND window, int index, LONG_PTR value) {
  return SetWindowLongA(window, index, value);
}
inline LONG_PTR GetWindowLongPtrA(HWND window, int index) {
  return GetWindowLongA(window, index);
}
QUORREL_PLATFORM_API HWND GetDlgItem(HWND dialog, int id);
QUORREL_PLATFORM_API BOOL SetDlgItemTextA(HWND dialog, int id, LPCSTR text);
QUORREL_PLATFORM_API UINT GetDlgItemTextA(HWND dialog, int id, LPSTR buffer, int size);
QUORREL_PLATFORM_API BOOL SetDlgItemInt(HWND dialog, int id, UINT value, BOOL isSigned);
QUORREL_PLATFORM_API UINT GetDlgItemInt(HWND dialog, int id, BOOL* translated, BOOL isSigned);
QUORREL_PLATFORM_API BOOL CheckDlgButton(HWND dialog, int id, UINT state);
QUORREL_PLATFORM_API UINT IsDlgButtonChecked(HWND dialog, int id);
QUORREL_PLATFORM_API BOOL EnableWindow(HWND window, BOOL enable);
QUORREL_PLATFORM_API BOOL IsWindowEnabled(HWND window);

}  // extern "C"

#endif
