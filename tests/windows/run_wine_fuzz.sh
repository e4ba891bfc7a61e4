#!/usr/bin/env bash
# Replays the fuzz corpora (seeds and minimised findings, as the fuzz.replay.NAME tests
# do natively) through the Windows builds under Wine: every fuzz target's replay
# program (fuzz_NAME.exe), the script and session ones driving the quorrel.dll beside
# them. A crash, a broken invariant (a trap), a hang or a replay that did not read every
# input fails. Exits 77 (skipped) when Wine or the Windows build is missing.
#   run_wine_fuzz.sh BUILD64 BUILD32 SOURCE WORK
# BUILD64 and BUILD32 are the cross builds mingw64 and mingw (the shipped 32-bit DLL,
# run where 32-bit Wine is set up). $QUORREL_WINE_FUZZ_TIMEOUT: seconds each program may
# take (default 300; one takes about a second, the 32-bit qemu route about four times
# longer).
set -u
source "$(dirname "$0")/wine_session.sh"
build64=$(absolute "$1") build32=$(absolute "$2") source=$(cd "$3" && pwd) work=$(absolute "$4")
limit=${QUORREL_WINE_FUZZ_TIMEOUT:-300}

# Every target of fuzz/targets; a build that made none of them predates the Windows
# replay programs.
targets=()
for target in "$source"/fuzz/targets/*.cpp; do targets+=("$(basename "$target" .cpp)"); done
built() {  # build: whether it holds any of the replay programs
  local name
  for name in "${targets[@]}"; do [[ -f $1/fuzz_$name.exe ]] && return 0; done
  return 1
}

wine_session_start "$work"
built "$build64" ||
  skip "$build64 has no fuzz replay programs (build it: cmake --preset mingw64 && cmake --build --preset mingw64)"
# The programs trap when anything appears in their working folder; ctest's is shared
# with the other Wine tests' work folders.
mkdir -p "$work/cwd" && cd "$work/cwd" || exit 1

# A target's corpus folders, as fuzz/CMakeLists.txt gives them to fuzz.replay.NAME; the
# script target's seeds are the quorrel command's test scripts.
corpora() {
  local seeds=$source/fuzz/corpus/$1 dir
  [[ $1 == script ]] && seeds=$source/tests/tools/cases
  for dir in "$seeds" "$source/fuzz/regressions/$1"; do [[ -d $dir ]] && echo "$dir"; done
}

# Runs WINE PROGRAM ARG... with the time limit; its output (Wine's line ends made Unix
# ones) in $output, its exit status in $status (124: it hung).
replay() {
  output=$(timeout -k 10 "$limit" "$@" 2>&1 </dev/null | tr -d '\r'; exit "${PIPESTATUS[0]}")
  status=$?
}

# Names the inputs that fail on their own (at most 5), after a run over all of them failed.
culprits() {  # wine program dirs...
  local wine=$1 program=$2 file found=0
  shift 2
  while IFS= read -r file; do
    replay "$wine" "$program" "$file"
    if [[ $status -ne 0 ]]; then
      echo "   fails alone (exit status $status): $file"
      found=$((found + 1))
      ((found == 5)) && return
    fi
  done < <(find "$@" -type f | sort)
  ((found)) || echo "   no input fails alone (the empty input, or the inputs together)"
}

failed=0
replay_all() {  # wine build label
  local wine=$1 build=$2 label=$3 start=$SECONDS total=0 bad=0 name program expected count
  for name in "${targets[@]}"; do
    program=$build/fuzz_$name.exe
    [[ -f $program ]] || { echo "== $label: $name failed: $program was not built"; bad=$((bad + 1)); continue; }
    mapfile -t dirs < <(corpora "$name")
    expected=$(find "${dirs[@]}" -type f | wc -l)
    replay "$wine" "$program" "${dirs[@]}"
    count=$(sed -n 's/^replayed \([0-9]*\) inputs$/\1/p' <<<"$output")
    if [[ $status -eq 0 && $count == "$expected" ]]; then
      total=$((total + count))
      continue
    fi
    bad=$((bad + 1))
    if [[ $status -eq 124 || $status -eq 137 ]]; then
      echo "== $label: $name hung: no end after $limit s"
    elif [[ $status -ne 0 ]]; then
      echo "== $label: $name failed (exit status $status)"
    else
      echo "== $label: $name replayed ${count:-no} inputs of the $expected in ${dirs[*]}"
    fi
    # Wine's report of a crash starts with the exception and the backtrace.
    head -20 <<<"$output"
    (($(wc -l <<<"$output") > 20)) && echo "   ($(($(wc -l <<<"$output") - 20)) more lines)"
    [[ $status -ne 0 && $status -ne 124 && $status -ne 137 ]] && culprits "$wine" "$program" "${dirs[@]}"
  done
  echo "$label: $total replayed by ${#targets[@]} programs, $bad failed ($((SECONDS - start)) s)"
  failed=$((failed + bad))
}

built32() { built "$build32" || { WINE32_WHY="$build32 has no fuzz replay programs: run scripts/build-dll"; return 1; }; }
each_build replay_all "$build64" "$build32" built32
exit $((failed > 0))
