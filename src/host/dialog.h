// The setup dialog: edits an object's setup record in place and writes it only when
// the author presses OK.
#pragma once

#include <cstdint>

#include "platform/windows_services.h"

namespace quorrel::host {

inline constexpr int kSetupDialogId = 20003;

// Control ids of the setup dialog template.
enum SetupControl : int {
  kControlOk = 1,
  kControlCancel = 2,
  kControlHelp = 20100,
  kControl1D = 1000,
  kControl2D = 1001,
  kControl3D = 1002,
  kControlX = 1003,
  kControlY = 1004,
  kControlCaseInsensitive = 1005,
  kControlCaseSensitive = 1006,
  kControlLiteral = 1007,
  kControlWildcard = 1008,
  kControlDelimiter = 1009,
  kControlAutoSelectOn = 1010,
  kControlAutoSelectOff = 1011,
};

// Shows the dialog modally over the editor's window for this record. Answers 0
// after OK, -1 after Cancel or when the dialog cannot be shown.
INT_PTR showSetupDialog(void* editorContext, void* setupRecord);

}  // namespace quorrel::host
