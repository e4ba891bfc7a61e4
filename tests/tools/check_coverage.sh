#!/usr/bin/env bash
# Every action and every expression the command lists (quorrel list) must be called by
# name at least once across the cases (lines "A NAME ..." and "E NAME ..."; an
# expression's "(" may be left out). Calls by code do not count: the cases are read by
# people, who read names. Every `A name` and `E name` quoted in the DOCS must name one
# of them as well.
#   check_coverage.sh CASES QUORREL [DOCS...]
set -u
cases=$1 quorrel=$2
shift 2
declare -A seen
while read -r verb name; do
  seen[$verb${name%(}]=1
done < <(cat "$cases"/*.qs "$cases"/*.sh 2>/dev/null |
  sed -nE 's/^[[:space:]]*([AE])[[:space:]]+([A-Za-z][A-Za-z0-9$]*\(?)([[:space:]].*)?$/\1 \2/p')

# The listing's entries: "A12 name(parameters)  [menu]" and "E3 name$(parameters) ...".
rows=$("$quorrel" list | sed -nE 's/^([AE])[0-9]+ ([A-Za-z][A-Za-z0-9$]*)\(.*/\1 \2/p')
[[ -n $rows ]] || { echo "quorrel list listed nothing"; exit 1; }
missing=()
while read -r verb name; do
  [[ -n ${seen[$verb$name]:-} ]] || missing+=("$verb $name")
done <<<"$rows"
for doc in "$@"; do
  while read -r call; do
    grep -qFx "$call" <<<"$rows" || { echo "$doc names no action or expression: $call"; exit 1; }
  done < <(grep -oE '`[AE] [a-z][A-Za-z0-9$]*' "$doc" | tr -d '`')
done
if ((${#missing[@]})); then
  echo "never called by name in a case: ${missing[*]}"
  exit 1
fi
echo "all $(grep -c '^A' <<<"$rows") actions and $(grep -c '^E' <<<"$rows") expressions are called by name"
