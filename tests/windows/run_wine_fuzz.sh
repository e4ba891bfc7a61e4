#!/usr/bin/env bash
# Replays the fuzz corpora (seeds and minimised findings) through the Windows builds
# under Wine: the file loaders, and the script and session targets, which load the
# quorrel.dll beside them. A crash, a broken invariant (a trap) or a hang fails.
# Exits 77 (skipped) when Wine or the Windows build is missing.
#   run_wine_fuzz.sh BUILD64 BUILD32 SOURCE WORK
set -u
here=$(cd "$(dirname "$0")" && pwd)
absolute() { [[ $1 == /* ]] && echo "$1" || echo "$PWD/$1"; }
build64=$(absolute "$1") build32=$(absolute "$2") source=$(absolute "$3") work=$(absolute "$4")
source "$here/wine_session.sh"

wine_session_start "$work" || exit 77
if [[ ! -f $build64/fuzz_session.exe ]]; then
  echo "SKIPPED: $build64/fuzz_session.exe is missing (build it: cmake --preset mingw64 && cmake --build --preset mingw64)"
  exit 77
fi

# Each target with its corpus folders; a folder that does not exist is left out.
corpora() {
  local name=$1 seeds=$source/fuzz/corpus/$1
  [[ $name == script ]] && seeds=$source/tests/tools/cases
  for dir in "$seeds" "$source/fuzz/regressions/$name"; do [[ -d $dir ]] && echo "$dir"; done
}

failed=0
replay_all() {  # wine build label
  local wine=$1 build=$2 label=$3 start=$SECONDS total=0 program name output status count
  for program in "$build"/fuzz_*.exe; do
    name=$(basename "$program" .exe)
    name=${name#fuzz_}
    mapfile -t dirs < <(corpora "$name")
    # Minutes, not seconds: the 32-bit route may run through qemu.
    output=$(set -o pipefail; timeout 600 "$wine" "$program" "${dirs[@]}" 2>&1 | tr -d '\r')
    status=$?
    if [[ $status -ne 0 || $output != *"replayed "* ]]; then
      echo "== $label: $name failed (exit status $status$([[ $status == 124 ]] && echo ': hung'))"
      echo "$output" | tail -20
      failed=$((failed + 1))
      continue
    fi
    count=$(sed -n 's/^replayed \([0-9]*\) inputs$/\1/p' <<<"$output")
    total=$((total + ${count:-0}))
  done
  echo "$label: $total inputs replayed ($((SECONDS - start)) s)"
}

replay_all "$WINE64" "$build64" win64
if wine32_runs "$build32/quorrel.exe" --module "$build32/quorrel.dll" menu actions; then
  replay_all "$WINE32" "$build32" win32
else
  echo "win32: not run ($WINE32_WHY)"
fi
echo "$failed failed"
exit $((failed > 0))
