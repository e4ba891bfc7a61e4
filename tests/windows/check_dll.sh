#!/usr/bin/env bash
# Reads the built Windows DLL back with binutils and checks it against its sources:
#   check_dll.sh DLL ENTRY_POINTS_INC RESOURCE_SCRIPT RESOURCE_DIR OBJDUMP WINDRES
# (RESOURCE_DIR holds the pictures the script names)
# - a 32-bit x86 DLL (PE32) named quorrel.dll;
# - exports: exactly the entry points of entry_points.inc, each by its plain name at its
#   ordinal, none by ordinal alone, names in byte order (GetProcAddress bisects them);
# - imports: system DLLs only (the runtimes are linked in statically);
# - resources: what windres reads out of the DLL is what it reads out of the script.
# - the shipped DLL has no note log: it has no notes to write;
# - with a seventh argument "checked", the checked DLL: the same, plus the listener
#   QuorrelListenNotes at ordinal 201 and its note log.
# Exits 77 (skipped) when binutils for mingw-w64 are not installed.
set -uo pipefail
dll=$1 entry_points=$2 script=$3 resource_dir=$4 objdump=$5 windres=$6 kind=${7:-shipped}
for tool in "$objdump" "$windres"; do
  command -v "$tool" >/dev/null || { echo "skipped: $tool is not installed (binutils-mingw-w64-i686)"; exit 77; }
done
[[ -f $dll ]] || { echo "no DLL at $dll (build it with scripts/build-dll)"; exit 1; }

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
fail=0
check() {  # description command...: runs the command, reports a failure
  if ! "${@:2}" >"$work/out" 2>&1; then
    echo "FAILED: $1"
    cat "$work/out"
    fail=1
  fi
}

"$objdump" -p "$dll" >"$work/headers" || exit 1
has() { grep -Eq "$1" "$work/headers"; }
check "file format pei-i386" has 'file format pei-i386$'
check "PE32 optional header" has '^Magic[[:space:]]+010b'
check "DLL flag" has '^[[:space:]]DLL$'
check "export name quorrel.dll" has '^Name[[:space:]]+[0-9a-f]+ quorrel\.dll$'

# Exports as "name ordinal"; objdump prints table indices, the ordinal adds the base.
awk '
  /^Ordinal Base/ { base = $3 }
  /^\[Ordinal\/Name Pointer\] Table/ { names = 1; next }
  names && /^$/ { names = 0 }
  names { gsub(/[\[\]]/, " "); print $2, $1 + base }
  /^Export Address Table -- Ordinal Base/ { slots = 1; next }
  slots && /^$/ { slots = 0 }
  slots && /Export RVA/ { ++used }
  END { print used > "/dev/stderr" }' "$work/headers" >"$work/exports" 2>"$work/slots"
{
  sed -nE 's/^QUORREL_ENTRY_POINT\(([A-Za-z]+), ([0-9]+),.*/\1 \2/p' "$entry_points"
  [[ $kind == checked ]] && sed -nE 's/^QUORREL_NOTES_ENTRY_POINT\(([A-Za-z]+), ([0-9]+),.*/\1 \2/p' "$entry_points"
} | LC_ALL=C sort >"$work/expected"
LC_ALL=C sort "$work/exports" >"$work/exports.sorted"
check "exports equal entry_points.inc" diff "$work/expected" "$work/exports.sorted"
check "nothing exported by ordinal alone" test "$(cat "$work/slots")" -eq "$(wc -l <"$work/expected")"
cut -d' ' -f1 "$work/exports" >"$work/names"
check "export names in byte order" env LC_ALL=C sort -c "$work/names"

# Imports: Windows's own DLLs, never libgcc, libstdc++ or libwinpthread.
sed -n 's/^[[:space:]]*DLL Name: //p' "$work/headers" | tr 'A-Z' 'a-z' | sort >"$work/imports"
check "imports KERNEL32 and USER32" grep -qx -e kernel32.dll "$work/imports"
check "imports USER32" grep -qx -e user32.dll "$work/imports"
check "imports system DLLs only" \
  sh -c "! grep -Evx 'kernel32\.dll|user32\.dll|msvcrt\.dll|ucrtbase\.dll|api-ms-win-crt-.*' '$work/imports'"

# The note log is found by its variable; only the checked DLL has one.
if [[ $kind == checked ]]; then
  check "the checked DLL writes notes" grep -qa QUORREL_NOTES_LOG "$dll"
else
  check "the shipped DLL writes no notes" sh -c "! grep -qa QUORREL_NOTES_LOG '$dll'"
fi

# Resources. The two readings differ only in spelling: memory flags are not kept in the
# binary, an id of -1 reads back as 65535, and an empty command item as a separator.
normalise() {
  sed -E -e 's/ (MOVEABLE|PURE|DISCARDABLE|PRELOAD|LOADONCALL|FIXED|IMPURE)\b//g' \
    -e 's/^(  CONTROL "[^"]*", )65535,/\1-1,/' \
    -e 's/^(  *)MENUITEM "", 0$/\1MENUITEM SEPARATOR/' \
    -e 's/\b10 \/\* RT_RCDATA \*\//RCDATA/'
}
"$windres" -i "$dll" -O rc | normalise >"$work/dll.rc" || fail=1
"$windres" -I "$resource_dir" -i "$script" -O rc | normalise \
  >"$work/script.rc" || fail=1
check "resources equal the script's" diff -u "$work/script.rc" "$work/dll.rc"
check "resources read back" test "$(wc -l <"$work/dll.rc")" -gt 500

if ((fail)); then exit 1; fi
echo "quorrel.dll: $(wc -l <"$work/exports") exports, $(wc -l <"$work/imports") system imports, $(wc -l <"$work/dll.rc") lines of resources"
