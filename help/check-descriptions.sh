#!/usr/bin/env bash
# The help generator accepts the real descriptions and refuses two broken copies: one that
# lacks a code, one that describes a code the module does not have, and one that
# describes a parameter, which the table does.
set -u
helpgen=$1 descriptions=$2 work=$3
shift 3
mkdir -p "$work"

"$helpgen" "$@" --descriptions "$descriptions" --out "$work/check.html" || {
  echo "FAIL: the real descriptions were refused"; exit 1; }

# Drop the block of action 17.
awk '/^== /{skip = ($2 == "A17")} !skip' "$descriptions" > "$work/missing.txt"
if "$helpgen" "$@" --descriptions "$work/missing.txt" --out "$work/missing.html" 2>"$work/missing.err"; then
  echo "FAIL: descriptions without A17 were accepted"; exit 1
fi
grep -q "no description for A17" "$work/missing.err" || { cat "$work/missing.err"; exit 1; }

# Add a block for expression 60, which does not exist.
{ cat "$descriptions"; printf '\n== E60\nNothing.\n'; } > "$work/stray.txt"
if "$helpgen" "$@" --descriptions "$work/stray.txt" --out "$work/stray.html" 2>"$work/stray.err"; then
  echo "FAIL: a description of E60 was accepted"; exit 1
fi
grep -q "E60 names no code" "$work/stray.err" || { cat "$work/stray.err"; exit 1; }

# Parameters are the table's, not the prose's.
sed 's/^== A8$/== A8\nparam: the text to append/' "$descriptions" > "$work/params.txt"
if "$helpgen" "$@" --descriptions "$work/params.txt" --out "$work/params.html" 2>"$work/params.err"; then
  echo "FAIL: a param line in the prose was accepted"; exit 1
fi
echo "help descriptions: every action and expression described, broken copies refused"
