#!/usr/bin/env bash
# Every action and every expression of the table must be called by number at least
# once across the cases (lines "A CODE ..." and "E CODE ...").
#   check_coverage.sh CASES TABLE
set -u
cases=$1 table=$2
declare -A seen
while read -r verb code; do
  seen[$verb$code]=1
done < <(cat "$cases"/*.qs "$cases"/*.sh 2>/dev/null |
  sed -nE 's/^[[:space:]]*([AE])[[:space:]]+\+?0*([0-9]+)([[:space:]].*)?$/\1 \2/p')

rows=$(sed -nE 's/^(ACTION|EXPRESSION)\(([0-9]+),.*/\1 \2/p' "$table" |
  sed -e 's/^ACTION/A/' -e 's/^EXPRESSION/E/')
[[ -n $rows ]] || { echo "no rows in $table"; exit 1; }
missing=()
while read -r verb code; do
  [[ -n ${seen[$verb$code]:-} ]] || missing+=("$verb $code")
done <<<"$rows"
if ((${#missing[@]})); then
  echo "codes never called by a case: ${missing[*]}"
  exit 1
fi
echo "all $(grep -c '^A' <<<"$rows") actions and $(grep -c '^E' <<<"$rows") expressions are called"
