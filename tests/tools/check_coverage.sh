#!/usr/bin/env bash
# Every action code 0..78 and every expression code 0..59 must be called by number
# at least once across the cases (lines "A CODE ..." and "E CODE ...").
set -u
cases=$1
declare -A seen
while read -r verb code; do
  seen[$verb$code]=1
done < <(cat "$cases"/*.qs "$cases"/*.sh 2>/dev/null |
  sed -nE 's/^[[:space:]]*([AE])[[:space:]]+\+?0*([0-9]+)([[:space:]].*)?$/\1 \2/p')

missing=()
for ((code = 0; code <= 78; code++)); do [[ -n ${seen[A$code]:-} ]] || missing+=("A $code"); done
for ((code = 0; code <= 59; code++)); do [[ -n ${seen[E$code]:-} ]] || missing+=("E $code"); done
if ((${#missing[@]})); then
  echo "codes never called by a case: ${missing[*]}"
  exit 1
fi
echo "all 79 actions and 60 expressions are called"
