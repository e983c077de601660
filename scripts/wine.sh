#!/usr/bin/env bash
# wine.sh PROGRAM [ARGUMENT...]: runs a 64-bit Windows program, without a display and in a Wine prefix
# of its own.
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
export WINEPREFIX=$root/build/wine-prefix WINEDEBUG=-all WINEDLLOVERRIDES='mscoree=;mshtml=;winemenubuilder.exe='
unset DISPLAY
exec /usr/lib/wine/wine64 "$@"
