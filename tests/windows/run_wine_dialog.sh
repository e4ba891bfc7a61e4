#!/usr/bin/env bash
# Runs the setup dialog test (quorrel_dialog_test.exe on quorrel.dll) under Wine on a
# virtual X display. Exits 77 (skipped) when Wine, xvfb-run or the Windows build is
# missing.
#   run_wine_dialog.sh BUILD64 BUILD32 WORK
set -u
source "$(dirname "$0")/wine_session.sh"
build64=$(absolute "$1") build32=$(absolute "$2") work=$(absolute "$3")

if [[ -z ${QUORREL_UNDER_XVFB:-} ]]; then
  command -v xvfb-run >/dev/null || skip "xvfb-run is not installed (scripts/install-wine installs it); the setup
dialog needs a display"
  need_build "$build64" quorrel_dialog_test.exe quorrel.dll
  QUORREL_UNDER_XVFB=1 exec xvfb-run -a bash "$0" "$build64" "$build32" "$work"
fi

wine_session_start "$work"
# Windows in a Wine desktop of their own: with no window manager on the display, every
# dialog that closes would wait two seconds for one to acknowledge it (the first 32-bit
# run took a minute without it). Each prefix keeps the setting once it has it.
use_own_desktop() {  # wine prefix wineserver
  [[ -f $2/desktop-set ]] && return 0
  "$1" reg add 'HKCU\Software\Wine\Explorer' /v Desktop /d Default /f >/dev/null &&
    "$1" reg add 'HKCU\Software\Wine\Explorer\Desktops' /v Default /d 800x600 /f >/dev/null &&
    touch "$2/desktop-set"
  "$3" -k && "$3" -w && "$3" -p
}
use_own_desktop "$WINE64" "$WINEPREFIX" "$WINESERVER"
[[ -n $WINE32 ]] && use_own_desktop "$WINE32" "$work/prefix32" "$WINESERVER32"

status=0
dialog() { echo "$3:"; "$1" "$2/quorrel_dialog_test.exe" "$2/quorrel.dll" || status=1; }
each_build dialog "$build64" "$build32"
exit $status
