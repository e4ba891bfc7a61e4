// Driving the module's dialogs where there is no window system.
//
// DialogBoxParamA builds the dialog from its template, runs the dialog procedure's
// initialisation, then hands the dialog to the installed script, which plays the
// author: it clicks buttons, types into fields and presses Enter or Escape, and may
// read the controls in between with the usual dialog functions (IsDlgButtonChecked,
// GetDlgItemTextA, IsWindowEnabled(GetDlgItem(...))). When the script returns and
// the dialog is still open, Escape is pressed; a dialog that still does not end is
// given up with -1. Without a script the dialog is therefore cancelled at once.
// Implemented by the portable stand-ins (portable_dialog.cpp), which only builds
// without Windows have.
#pragma once

#include "platform/windows_services.h"

extern "C" {

using QuorrelDialogScript = void (*)(HWND dialog, void* user);

// Installs the script that answers the next dialogs (null removes it).
QUORREL_PLATFORM_API void QuorrelSetDialogScript(QuorrelDialogScript script, void* user);

// A mouse click on an enabled button: an automatic radio button takes the check
// from the others of its group, then the dialog is told. FALSE when the control
// is missing, disabled, not a button, or the dialog has ended.
QUORREL_PLATFORM_API BOOL QuorrelDialogClick(HWND dialog, int id);

// Typing into an enabled edit field, replacing what it holds. Characters a
// digits-only field refuses and control characters are dropped, as is anything
// past 32767 characters, the field's typing limit.
QUORREL_PLATFORM_API BOOL QuorrelDialogType(HWND dialog, int id, LPCSTR text);

// VK_RETURN presses the default push button (OK when there is none);
// VK_ESCAPE presses Cancel.
QUORREL_PLATFORM_API BOOL QuorrelDialogKey(HWND dialog, UINT key);

// TRUE while the dialog has not been ended.
QUORREL_PLATFORM_API BOOL QuorrelDialogIsOpen(HWND dialog);

}  // extern "C"
