#!/usr/bin/env bash
# Runs every case of the quorrel command (tests/tools/cases) through quorrel.exe and the
# Windows DLL under Wine, against the same golden files as the Linux run, in one Wine
# session (a persistent wineserver). Exits 77 (skipped) when Wine or the Windows build
# is missing.
#   run_wine_cases.sh BUILD64 BUILD32 CASES EXAMPLES WORK
# BUILD64 and BUILD32 hold quorrel.exe beside quorrel.dll (cross builds mingw64 and
# mingw); the 32-bit one, the shipped DLL, runs too where 32-bit Wine is set up.
set -u
here=$(cd "$(dirname "$0")" && pwd)
source "$here/wine_session.sh"
build64=$(absolute "$1") build32=$(absolute "$2") cases=$(absolute "$3")
examples=$(absolute "$4") work=$(absolute "$5")
wine_session_start "$work"
need_build "$build64" quorrel.exe quorrel.dll

total_fail=0
run_all() {  # wine build label
  local label=$3 passed=0 failed=0 case name start=$SECONDS command=$work/quorrel-$3
  printf '#!/bin/sh\nexec "%s" "%s" "$@"\n' "$1" "$2/quorrel.exe" >"$command" && chmod +x "$command"
  one() { bash "$here/../tools/run_case.sh" "$command" "$case" "$work/$label/${name%.*}" "$examples" >"$1" 2>&1; }
  for case in "$cases"/*.qs "$cases"/*.sh; do
    name=$(basename "$case")
    # The notes come only from a module built with them, not from the shipped DLL.
    [[ $name == notes.sh ]] && continue
    # Wine itself now and then loses a run (seen once: a silent exit status 1 halfway
    # through a case on a CI machine). A case that passes on its second run counts, and
    # its first failure stays in the log for whoever looks.
    if one "$work/$label.log"; then passed=$((passed + 1)); continue; fi
    if one "$work/$label.retry.log"; then
      passed=$((passed + 1))
      echo "== $label: $name passed only on a second run; the first one said:"
    else
      failed=$((failed + 1))
      echo "== $label: $name failed"
    fi
    cat "$work/$label.log"
  done
  echo "$label: $passed passed, $failed failed ($((SECONDS - start)) s)"
  total_fail=$((total_fail + failed))
}

each_build run_all "$build64" "$build32"
exit $((total_fail > 0))
