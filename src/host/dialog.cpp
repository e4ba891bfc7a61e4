// The setup dialog procedure. It talks to its controls only through the dialog
// services, so the same procedure runs under the Windows dialog manager and under
// the portable headless dialog.
#include "host/dialog.h"

#include "host/editor_module.h"
#include "host/entry_points.h"
#include "host/run_record.h"

namespace abi = quorrel::abi;

namespace quorrel::host {
namespace {

// What the dialog edits and whom it asks for help; kept in the dialog's user slot
// for its whole life.
struct DialogContext {
  void* setupRecord;
  void* editorContext;
};

DialogContext& contextOf(HWND dialog) {
  return *reinterpret_cast<DialogContext*>(GetWindowLongPtrA(dialog, DWLP_USER));
}

void setChecked(HWND dialog, int id, bool checked) {
  CheckDlgButton(dialog, id, checked ? BST_CHECKED : BST_UNCHECKED);
}

bool isChecked(HWND dialog, int id) {
  return IsDlgButtonChecked(dialog, id) == BST_CHECKED;
}

void enableFields(HWND dialog, bool x, bool y) {
  EnableWindow(GetDlgItem(dialog, kControlX), x ? TRUE : FALSE);
  EnableWindow(GetDlgItem(dialog, kControlY), y ? TRUE : FALSE);
}

// X needs two dimensions, Y three.
void enableFieldsForCheckedDimension(HWND dialog) {
  if (isChecked(dialog, kControl3D)) {
    enableFields(dialog, true, true);
  } else if (isChecked(dialog, kControl2D)) {
    enableFields(dialog, true, false);
  } else {
    enableFields(dialog, false, false);
  }
}

void showDimensions(HWND dialog, int32_t dimensionCount) {
  setChecked(dialog, kControl3D, dimensionCount == 3);
  setChecked(dialog, kControl2D, dimensionCount == 2);
  setChecked(dialog, kControl1D, dimensionCount != 3 && dimensionCount != 2);
  enableFields(dialog, dimensionCount == 3 || dimensionCount == 2, dimensionCount == 3);
}

void initialise(HWND dialog, DialogContext* context) {
  SetWindowLongPtrA(dialog, DWLP_USER, reinterpret_cast<LONG_PTR>(context));
  const void* record = context->setupRecord;
  char delimiter[abi::kSetupListDelimiterSize + 1];
  SetDlgItemTextA(dialog, kControlDelimiter, setupListDelimiter(record, delimiter));
  const SetupFields setup = readSetup(record);
  SetDlgItemInt(dialog, kControlX, static_cast<UINT>(setup.xBoundary), TRUE);
  SetDlgItemInt(dialog, kControlY, static_cast<UINT>(setup.yBoundary), TRUE);
  showDimensions(dialog, setup.dimensionCount);
  setChecked(dialog, kControlCaseInsensitive, setup.caseSensitive == 0);
  setChecked(dialog, kControlCaseSensitive, setup.caseSensitive != 0);
  setChecked(dialog, kControlLiteral, setup.wildcardSearch == 0);
  setChecked(dialog, kControlWildcard, setup.wildcardSearch != 0);
  setChecked(dialog, kControlAutoSelectOn, setup.autoSelectRows == 1);
  setChecked(dialog, kControlAutoSelectOff, setup.autoSelectRows != 1);
}

int32_t fieldNumber(HWND dialog, int id) {
  return static_cast<int32_t>(GetDlgItemInt(dialog, id, nullptr, TRUE));
}

// OK writes every field, in this order, then ends the dialog.
void store(HWND dialog) {
  void* record = contextOf(dialog).setupRecord;
  GetDlgItemTextA(dialog, kControlDelimiter, static_cast<char*>(record) + abi::kSetupListDelimiter,
                  static_cast<int>(abi::kSetupDialogDelimiterSize));
  if (isChecked(dialog, kControl3D)) {
    writeField<int32_t>(record, abi::kSetupDimensionCount, 3);
    writeField<int32_t>(record, abi::kSetupXBoundary, fieldNumber(dialog, kControlX));
    writeField<int32_t>(record, abi::kSetupYBoundary, fieldNumber(dialog, kControlY));
  } else if (isChecked(dialog, kControl2D)) {
    writeField<int32_t>(record, abi::kSetupDimensionCount, 2);
    writeField<int32_t>(record, abi::kSetupXBoundary, fieldNumber(dialog, kControlX));
  } else {
    writeField<int32_t>(record, abi::kSetupDimensionCount, 1);
  }
  writeField<int32_t>(record, abi::kSetupCaseSensitive,
                      isChecked(dialog, kControlCaseInsensitive) ? 0 : 1);
  writeField<int32_t>(record, abi::kSetupWildcardSearch,
                      isChecked(dialog, kControlLiteral) ? 0 : 1);
  writeField<int32_t>(record, abi::kSetupAutoSelectRows,
                      isChecked(dialog, kControlAutoSelectOn) ? 1 : 0);
  EndDialog(dialog, 0);
}

void showHelp(HWND dialog) {
  void* editor = contextOf(dialog).editorContext;
  if (!editor) return;
  auto help = readField<abi::HelpService>(editor, abi::kEditorHelpService);
  if (help) help(GetHelpFileName(), 0, 0);
}

void command(HWND dialog, int id) {
  switch (id) {
    case kControl1D:
    case kControl2D:
    case kControl3D:
      enableFieldsForCheckedDimension(dialog);
      break;
    case kControlOk:
      store(dialog);
      break;
    case kControlCancel:
      EndDialog(dialog, -1);
      break;
    case kControlHelp:
      showHelp(dialog);
      break;
    default:
      break;
  }
}

INT_PTR CALLBACK setupDialogProcedure(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam) {
  try {
    switch (message) {
      case WM_INITDIALOG:
        initialise(dialog, reinterpret_cast<DialogContext*>(lParam));
        return TRUE;  // the first tab stop, OK, takes the focus
      case WM_COMMAND:
        command(dialog, LOWORD(wParam));
        return TRUE;
      default:
        return FALSE;
    }
  } catch (...) {
    return FALSE;
  }
}

}  // namespace

INT_PTR showSetupDialog(void* editorContext, void* setupRecord) {
  if (!setupRecord) return -1;
  DialogContext context{setupRecord, editorContext};
  HWND owner = editorContext ? readField<HWND>(editorContext, abi::kEditorWindow) : nullptr;
  return DialogBoxParamA(moduleInstance(), MAKEINTRESOURCEA(kSetupDialogId), owner,
                         setupDialogProcedure, reinterpret_cast<LPARAM>(&context));
}

}  // namespace quorrel::host
