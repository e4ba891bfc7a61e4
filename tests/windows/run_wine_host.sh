#!/bin/sh
# Runs the Windows test host on the DLL under Wine; exits 77 (skipped) without Wine.
host_exe=$1
dll=$2
wine=$(command -v wine || command -v wine32 || command -v wine-stable || true)
if [ -z "$wine" ]; then
  echo "SKIPPED: Wine is not installed (it needs 32-bit packages from the i386 architecture);"
  echo "the Windows test host did not run. The DLL's export, import and resource checks ran."
  exit 77
fi
for f in "$host_exe" "$dll"; do
  if [ ! -f "$f" ]; then
    echo "missing $f: build it with scripts/build-dll"
    exit 1
  fi
done
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cp "$host_exe" "$dll" "$work/"
cd "$work" || exit 1
WINEPREFIX="$work/prefix" WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml=" \
  "$wine" "$(basename "$host_exe")" "$(basename "$dll")"
