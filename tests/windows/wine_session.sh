# Sourced by the Wine test scripts: finds Wine and starts one persistent wineserver per
# prefix for every program the script runs (a Wine start then costs a fraction of a
# second).
#   wine_session_start DIR   64-bit prefix in DIR/prefix, 32-bit one in DIR/prefix32;
#                            skips (exit 77, saying why) without wine64
# Sets WINE64 and WINESERVER, and WINE32 (a command running a 32-bit program in the
# 32-bit prefix, through scripts/wine32) where 32-bit Wine is set up; WINE32_WHY otherwise.
#   each_build RUN BUILD64 BUILD32 [TEST...]   RUN WINE BUILD LABEL for win64, then win32
# The drivers share absolute, skip (exit 77 with the reason) and need_build too.

wine_session_repo=$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)
wine32_home=${QUORREL_WINE32_HOME:-/var/lib/quorrel-wine32}
absolute() { [[ $1 == /* ]] && echo "$1" || echo "$PWD/$1"; }
skip() { echo "SKIPPED: $*"; exit 77; }
need_build() {  # build file...: skips unless the cross build holds every file
  local f
  for f in "${@:2}"; do
    [[ -f $1/$f ]] ||
      skip "$1/$f is missing (build it: cmake --preset mingw64 && cmake --build --preset mingw64)"
  done
}

wine_session_stop() {
  [[ -n ${WINESERVER:-} ]] && "$WINESERVER" -k >/dev/null 2>&1
  [[ -n ${WINESERVER32:-} ]] && "$WINESERVER32" -k >/dev/null 2>&1
  return 0
}

# Writes DIR/NAME: a command that runs scripts/wine32 PROGRAM in the 32-bit prefix.
wine32_command() {
  printf '#!/bin/sh\nWINEPREFIX="%s" exec "%s" %s "$@"\n' "$1/prefix32" \
    "$wine_session_repo/scripts/wine32" "$3" >"$1/$2"
  chmod +x "$1/$2"
}

wine32_start() {
  local dir=$1
  WINE32= WINESERVER32=
  if [[ ! -x $wine32_home/root/usr/lib/wine/wine || ! -f $wine32_home/route ]]; then
    WINE32_WHY=$(cat "$wine32_home/why" 2>/dev/null ||
      echo "there is no i386 root with wine32 in $wine32_home")
    WINE32_WHY="32-bit Wine is not set up (scripts/install-wine): $WINE32_WHY"
    return 1
  fi
  wine32_command "$dir" wine32 wine
  wine32_command "$dir" wineserver32 wineserver
  WINESERVER32=$dir/wineserver32
  mkdir -p "$dir/prefix32"
  "$WINESERVER32" -p || { WINE32_WHY="the 32-bit wineserver does not start"; return 1; }
  WINE32=$dir/wine32
  "$WINE32" cmd /c exit >/dev/null 2>&1 </dev/null
}

wine_session_start() {
  local dir=$1
  WINE64=$(command -v wine64 || ls /usr/lib/wine/wine64 2>/dev/null || true)
  WINESERVER=$(command -v wineserver || ls /usr/lib/wine/wineserver 2>/dev/null || true)
  [[ -n $WINE64 && -n $WINESERVER ]] || skip "wine64 is not installed (scripts/install-wine installs it); the Windows
programs did not run"
  WINE32_WHY=
  mkdir -p "$dir/prefix"
  export WINEPREFIX=$dir/prefix WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="
  "$WINESERVER" -p
  trap wine_session_stop EXIT
  # The first start of a new prefix sets it up; do it once, outside any measured case.
  "$WINE64" cmd /c exit >/dev/null 2>&1 </dev/null
  wine32_start "$dir"
}

# The 64-bit build always runs; the 32-bit one (the shipped DLL) where 32-bit Wine starts
# its quorrel.exe and TEST (which sets WINE32_WHY when it fails), if given, passes.
each_build() {  # run build64 build32 [test...]
  "$1" "$WINE64" "$2" win64
  if [[ -z $WINE32 ]]; then
    :  # WINE32_WHY says why
  elif [[ ! -f $3/quorrel.exe ]]; then
    WINE32_WHY="no $3/quorrel.exe"
  elif ! "$WINE32" "$3/quorrel.exe" --module "$3/quorrel.dll" menu actions >/dev/null 2>&1 </dev/null; then
    WINE32_WHY="32-bit programs do not start under this Wine"
  elif (($# < 4)) || "${@:4}"; then
    "$1" "$WINE32" "$3" win32
    return
  fi
  echo "win32: not run ($WINE32_WHY)"
}
