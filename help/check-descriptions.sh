#!/usr/bin/env bash
# The help generator accepts the real descriptions and refuses broken copies: one that
# lacks a row, one that describes a name the table does not have, one that describes a
# row twice, one that describes a parameter, which the table does, and ones whose
# example gives another result or is missing.
set -u
helpgen=$1 descriptions=$2 work=$3
shift 3
args=("$@")  # the generator's other arguments
mkdir -p "$work"

"$helpgen" "${args[@]}" --descriptions "$descriptions" --out "$work/check.html" || {
  echo "FAIL: the real descriptions were refused"; exit 1; }

refused() {  # NAME EXPECTED-MESSAGE: the copy $work/NAME.txt must be refused with it
  if "$helpgen" "${args[@]}" --descriptions "$work/$1.txt" --out "$work/$1.html" 2>"$work/$1.err"; then
    echo "FAIL: $1.txt was accepted"; exit 1
  fi
  grep -qF "$2" "$work/$1.err" || { echo "FAIL: $1.txt: expected \"$2\""; cat "$work/$1.err"; exit 1; }
}

awk '/^== /{skip = ($2 == "deleteAll")} !skip' "$descriptions" > "$work/missing.txt"
refused missing "no description for deleteAll"
{ cat "$descriptions"; printf '\n== size\nNo such row: expressions end in "(".\n'; } > "$work/stray.txt"
refused stray ": size names no row"
{ cat "$descriptions"; printf '\n== get$(\nAgain.\n'; } > "$work/twice.txt"
refused twice ': get$( twice'

# An example must run, call its row and give the result written beside it.
sed 's/^example: E labSum("score") → 555$/example: E labSum("score") → 556/' "$descriptions" > "$work/wrong.txt"
refused wrong 'the example of labSum(, line 7 (E labSum("score")): gives 555, the page says 556'
awk '/^== /{row = $2} !(row == "deleteAll" && /^example: /)' "$descriptions" > "$work/unshown.txt"
refused unshown "no example for deleteAll"

# Parameters are the table's, not the prose's.
sed 's/^== appendString$/== appendString\nparam: the text to append/' "$descriptions" > "$work/params.txt"
refused params "parameters are described in host/table.inc"

# Every bad: line names the notes it leads to, each a real one, and every kind of note
# is named by some line.
sed 's/ \[note: setting-refused\]$/ [note: setting-ignored]/' "$descriptions" > "$work/unknown-note.txt"
refused unknown-note "no note is called setting-ignored"
sed 's/ \[note: setting-refused\]$/ [no note]/' "$descriptions" > "$work/unnamed-note.txt"
refused unnamed-note "no bad: line leads to note setting-refused"
sed 's/ \[no note\]$//' "$descriptions" > "$work/bare-bad.txt"
refused bare-bad "a bad: line ends with the notes it leads to"
echo "help descriptions: every action and expression described and shown, broken copies refused"
