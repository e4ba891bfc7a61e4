#!/usr/bin/env bash
# Runs one case of the quorrel command in a fresh directory and compares its output
# with the golden files beside it.
#   NAME.qs: `quorrel run --echo --no-notes NAME.qs`, which prints each E line beside its result;
#            stdout against NAME.out, stderr against NAME.err (no NAME.err: nothing
#            on stderr, exit status 0; else exit status 2 if it reports an error, 0
#            if it only warns).
#   NAME.sh: run with $QUORREL set; stdout and stderr together against NAME.out,
#            exit status 0 (the session prints the statuses it wants to check).
# $QUORREL_EXAMPLES names the examples folder. The sessions share the helpers below.
set -u
# Texts print as UTF-8 and --echo draws its arrow whatever locale the tests run in.
export LC_ALL=C.UTF-8
quorrel=$1 case=$2 work=$3 examples=${4:-}
dir=$(dirname "$case")
name=$(basename "$case")
stem=${name%.*}
rm -rf "$work" && mkdir -p "$work"
cp "$case" "$work"/
cd "$work" || exit 1

fail=0
compare() {  # golden actual label
  diff -u "$1" "$2" >diff.txt 2>&1 && return
  echo "== $3 differs from $(basename "$1"):"
  cat diff.txt
  fail=1
}

# q runs the command and prints its exit status; run runs the script on standard
# input, bad the lines given; dump prints a file's size and bytes. Scripts run
# without the module's notes, which only notes.sh checks: the shipped DLL, which the
# Windows runs of these cases load, has none.
q() {
  case $1 in
    run | shell) "$QUORREL" "$1" --no-notes "${@:2}" ;;
    *) "$QUORREL" "$@" ;;
  esac
  echo "status $?"
}
run() { cat >s.qs; q run s.qs; }
bad() { printf '%s\n' "$@" >bad.qs; q run bad.qs; }
dump() { echo "$1: $(wc -c <"$1") bytes"; od -An -tx1 -v "$1"; }
export -f q run bad dump

expected_status=0
if [[ $name == *.qs ]]; then
  "$quorrel" run --echo --no-notes "$name" >stdout.txt 2>stderr.txt
  status=$?
  err_golden=$dir/$stem.err
  [[ -f $err_golden ]] || err_golden=/dev/null
  grep -q ': error: ' "$err_golden" && expected_status=2
  compare "$dir/$stem.out" stdout.txt stdout
  compare "$err_golden" stderr.txt stderr
else
  QUORREL=$quorrel QUORREL_EXAMPLES=$examples bash "$name" >stdout.txt 2>&1
  status=$?
  compare "$dir/$stem.out" stdout.txt output
fi
[[ $status == "$expected_status" ]] || { echo "== exit status $status, expected $expected_status"; fail=1; }
exit $fail
