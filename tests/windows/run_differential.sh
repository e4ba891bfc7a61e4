#!/usr/bin/env bash
# Differential check of the Linux and Windows builds: the same random scripts
# (differential_scripts.py), each in a fresh copy of the same seed files, run under the
# Linux quorrel and under the 64-bit and 32-bit quorrel.exe with Wine; standard output,
# standard error, exit status and every file left in the folder (names and bytes) must
# be the same. A difference prints the script, the seed and a diff, and the run goes
# on. Exits 1 on any difference, 77 (skipped) when no Windows build could run at all.
#   run_differential.sh [--count N] [--seed S] [--linux QUORREL] [--win64 BUILD64]
#                       [--win32 BUILD32] [--work DIR]
set -u
here=$(cd "$(dirname "$0")" && pwd)
root=$(cd "$here/../.." && pwd)
count=300 seed=1 linux=$root/build/release/tools/quorrel
build64=$root/build/mingw64 build32=$root/build/mingw work=$root/build/differential
while (($#)); do
  case $1 in
    --count) count=$2 ;; --seed) seed=$2 ;; --linux) linux=$2 ;;
    --win64) build64=$2 ;; --win32) build32=$2 ;; --work) work=$2 ;;
    *) echo "usage: $0 [--count N] [--seed S] [--linux QUORREL] [--win64 DIR] [--win32 DIR] [--work DIR]" >&2
       exit 2 ;;
  esac
  shift 2
done
source "$here/wine_session.sh"
linux=$(absolute "$linux") build64=$(absolute "$build64") build32=$(absolute "$build32")
work=$(absolute "$work")
[[ -x $linux ]] || skip "no Linux quorrel at $linux (cmake --build --preset release)"
command -v python3 >/dev/null || skip "python3 is not installed: no scripts to run"
wine_session_start "$work"

# The seed files: the fuzz corpora's own saves in every format, and raw element files.
rm -rf "$work/seed" "$work/scripts" "$work/runs"
mkdir -p "$work/seed/sub"
cp "$root"/fuzz/corpus/array_file/table.* "$root"/fuzz/corpus/array_file/cube.{arr,mmf} \
  "$root"/fuzz/corpus/element_file/*.bin "$work/seed/"
cp "$root/fuzz/corpus/array_file/cube.csv" "$work/seed/sub/"
"$linux" list >"$work/catalog.txt" || exit 1
python3 "$here/differential_scripts.py" "$work/catalog.txt" "$work/seed" "$work/scripts" \
  --seed "$seed" --count "$count" || exit 1

run_one() {  # label k command...
  local dir=$work/runs/$1/$2 script=$work/scripts/$2.qs
  shift 2
  rm -rf "$dir" && mkdir -p "$dir" && cp -r "$work/seed" "$dir/files"
  (cd "$dir/files" && timeout 120 "$@" run --no-notes - <"$script" >"$dir/stdout" 2>"$dir/stderr"
   echo $? >"$dir/status")
}
same() {  # label k [run folder]
  local a=$work/runs/linux/$2 b=${3:-$work/runs/$1/$2} f
  for f in stdout stderr status; do cmp -s "$a/$f" "$b/$f" || return 1; done
  diff -rq "$a/files" "$b/files" >/dev/null
}
show() {  # label k [run folder]
  local a=$work/runs/linux/$2 b=${3:-$work/runs/$1/$2} f
  echo "== $1: script $2 of seed $seed differs from Linux (status $(<"$a/status") vs $(<"$b/status")):"
  sed 's/^/  /' "$work/scripts/$2.qs" | cut -c1-200
  for f in stdout stderr; do diff -u --label "linux $f" --label "$1 $f" "$a/$f" "$b/$f" | head -40; done
  diff -rq "$a/files" "$b/files" | sed "s|$work/runs/||g"
  for f in $(cd "$a/files" && find . -type f); do
    [[ -f $b/files/$f ]] && ! cmp -s "$a/files/$f" "$b/files/$f" &&
      diff -u --label "linux $f" --label "$1 $f" <(od -An -c "$a/files/$f") <(od -An -c "$b/files/$f") | head -20
  done
}

start=$SECONDS
for ((k = 0; k < count; k++)); do run_one linux "$k" "$linux"; done
echo "linux: $count scripts ($((SECONDS - start)) s)"

compared=0 differences=0 labels=
check_build() {  # wine build label
  local label=$3 k bad=0 start=$SECONDS
  if [[ ! -f $2/quorrel.exe || ! -f $2/quorrel.dll ]]; then
    echo "$label: skipped (no quorrel.exe and quorrel.dll in $2: cmake --build --preset mingw64)"
    return
  fi
  for ((k = 0; k < count; k++)); do run_one "$label" "$k" "$1" "$2/quorrel.exe"; done
  for ((k = 0; k < count; k++)); do
    same "$label" "$k" && continue
    # Wine itself now and then loses a run (see run_wine_cases.sh): a second run decides,
    # and a first run that differed alone is shown too.
    rm -rf "$work/runs/$label/$k.first" && mv "$work/runs/$label/$k" "$work/runs/$label/$k.first"
    run_one "$label" "$k" "$1" "$2/quorrel.exe"
    if same "$label" "$k"; then
      echo "== $label: script $k matched only on a second run; the first run:"
      show "$label" "$k" "$work/runs/$label/$k.first" | sed 1d
    else
      show "$label" "$k"
      bad=$((bad + 1))
    fi
  done
  echo "$label: $count scripts, $bad differences ($((SECONDS - start)) s)"
  compared=$((compared + count)) differences=$((differences + bad)) labels+=" $label"
}

each_build check_build "$build64" "$build32"
((compared > 0)) || skip "no Windows build could run"
echo "differential: $compared scripts, $differences differences (${labels# } against linux)"
((differences == 0))
