# Sourced by the Wine test scripts: finds Wine and starts one persistent wineserver
# for every program the script runs (a Wine start then costs a fraction of a second).
#   wine_session_start DIR   prefix in DIR/prefix; returns 1 (and says why) without wine64
# Sets WINE64, and WINE32 where Wine runs 32-bit programs (WINE32_WHY otherwise).

wine_session_stop() {
  [[ -n ${WINESERVER:-} ]] && "$WINESERVER" -k >/dev/null 2>&1
  return 0
}

wine_session_start() {
  local dir=$1
  WINE64=$(command -v wine64 || ls /usr/lib/wine/wine64 2>/dev/null || true)
  WINESERVER=$(command -v wineserver || ls /usr/lib/wine/wineserver 2>/dev/null || true)
  if [[ -z $WINE64 || -z $WINESERVER ]]; then
    echo "SKIPPED: wine64 is not installed (scripts/install-wine installs it); the Windows"
    echo "programs did not run"
    return 1
  fi
  WINE32=$(ls /usr/lib/wine/wine 2>/dev/null || true)
  WINE32_WHY=
  [[ -z $WINE32 ]] && WINE32_WHY="wine32 is not installed: the i386 architecture is not usable here"
  mkdir -p "$dir/prefix"
  export WINEPREFIX=$dir/prefix WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="
  "$WINESERVER" -p
  trap wine_session_stop EXIT
  # The first start of a new prefix sets it up; do it once, outside any measured case.
  "$WINE64" cmd /c exit >/dev/null 2>&1 </dev/null
  return 0
}

# Succeeds when 32-bit Wine runs the 32-bit program EXE (given its arguments);
# otherwise sets WINE32_WHY.
wine32_runs() {
  [[ -n $WINE32 ]] || return 1
  if [[ ! -f $1 ]]; then
    WINE32_WHY="no $1"
    return 1
  fi
  "$WINE32" "$@" >/dev/null 2>&1 </dev/null && return 0
  WINE32_WHY="32-bit programs do not start under this Wine"
  return 1
}
