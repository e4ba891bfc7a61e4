#!/usr/bin/env bash
# The checked DLL under 32-bit Wine: the notes case (tests/tools/cases/notes.sh) through
# quorrel.exe beside it, against the Linux golden file, its log read back; then every
# mistake of that case through the shipped DLL, which must answer the same and write no
# log. Exits 77 (skipped) when 32-bit Wine or either build is missing.
#   run_wine_notes.sh BUILD32 CHECKED32 CASES EXAMPLES WORK
set -u
here=$(cd "$(dirname "$0")" && pwd)
source "$here/wine_session.sh"
build32=$(absolute "$1") checked=$(absolute "$2") cases=$(absolute "$3")
examples=$(absolute "$4") work=$(absolute "$5")
need_build "$build32" quorrel.exe quorrel.dll
need_build "$checked" quorrel.exe quorrel.dll
wine_session_start "$work"
[[ -n $WINE32 ]] || skip "$WINE32_WHY"
for kind in checked shipped; do
  dir=$build32 && [[ $kind == checked ]] && dir=$checked
  printf '#!/bin/sh\nexec "%s" "%s" "$@"\n' "$WINE32" "$dir/quorrel.exe" >"$work/quorrel-$kind"
  chmod +x "$work/quorrel-$kind"
done
bash "$here/../tools/run_case.sh" "$work/quorrel-checked" "$cases/notes.sh" "$work/case" \
  "$examples" || exit 1
cd "$work/case" || exit 1
for kind in checked shipped; do
  QUORREL_NOTES_LOG=$kind.log "$work/quorrel-$kind" run --no-notes --no-warn-files all.qs \
    >"$kind.out" 2>&1
done
cmp checked.out shipped.out || { echo "the shipped DLL answers otherwise:"; diff checked.out shipped.out; exit 1; }
[[ -s checked.log && ! -e shipped.log ]] || { echo "only the checked DLL must write a log"; exit 1; }
echo "checked DLL: notes and log as on Linux; shipped DLL: the same answers, no log"
