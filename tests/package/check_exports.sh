#!/usr/bin/env bash
# check_exports.sh LIBRARY LIST...: the symbols that the shared library (.so or .dll) exports are those
# of the lists, no more and no fewer.
set -euo pipefail
export LC_ALL=C
library=$1
shift
listed=$(sort -u "$@")

exported() {
  case $library in
    *.dll) objdump -p "$library" | awk '
             /\[Ordinal\/Name Pointer\] Table/ { names = 1; next }
             names && NF == 0 { names = 0 }
             names { print $NF }' ;;
    *) nm -D --defined-only --format=posix "$library" | awk '{ sub(/@.*/, "", $1); print $1 }' ;;
  esac | sort -u
}

found=$(exported)
strangers=$(comm -13 <(printf '%s\n' "$listed") <(printf '%s\n' "$found"))
missing=$(comm -23 <(printf '%s\n' "$listed") <(printf '%s\n' "$found"))
status=0
if [[ -n $strangers ]]; then
  printf 'exported, but not in the lists:\n%s\n' "$strangers"
  status=1
fi
if [[ -n $missing ]]; then
  printf 'in the lists, but not exported:\n%s\n' "$missing"
  status=1
fi
exit "$status"
