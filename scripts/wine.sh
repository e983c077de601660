#!/usr/bin/env bash
# wine.sh PROGRAM [ARGUMENT...]: runs a 64-bit Windows program, without a display and in a Wine prefix
# of its own, which the first run makes in the build folder.
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
wine=/usr/lib/wine
export WINEPREFIX=$root/build/wine-prefix WINEDEBUG=-all WINEDLLOVERRIDES='mscoree=;mshtml=;winemenubuilder.exe='
export LC_ALL=C.UTF-8  # of which Wine takes the encoding of names
unset DISPLAY

# Wine's own processes serve all programs, and go half a minute after the last one. They must not write
# into the output of the program that happens to start them.
if ! "$wine/wineserver64" -k0 2>/dev/null; then
  mkdir -p "$WINEPREFIX"
  (
    flock 9
    if ! "$wine/wineserver64" -k0; then
      "$wine/wineserver64" -p30 9>&-
      "$wine/wine64" cmd /c exit 9>&-
    fi
  ) 9>"$WINEPREFIX.lock" >"$WINEPREFIX.log" 2>&1 </dev/null
fi
exec "$wine/wine64" "$@"
