#!/usr/bin/env bash
# check_exports.sh complete|subset LIBRARY LIST: the symbols that the shared library (.so or .dll)
# exports are those of the list; "subset" lets operations be missing but no others appear.
set -euo pipefail
export LC_ALL=C
mode=$1 library=$2 list=$3

exported() {
  case $library in
    *.dll) i686-w64-mingw32-objdump -p "$library" | awk '
             /\[Ordinal\/Name Pointer\] Table/ { names = 1; next }
             names && NF == 0 { names = 0 }
             names { print $NF }' ;;
    *) nm -D --defined-only --format=posix "$library" | awk '{ sub(/@.*/, "", $1); print $1 }' ;;
  esac | sort -u
}

found=$(exported)
strangers=$(comm -13 "$list" <(printf '%s\n' "$found" | sed '/^$/d'))
missing=$(comm -23 "$list" <(printf '%s\n' "$found"))
status=0
if [[ -n $strangers ]]; then
  printf 'exported, but not in the list:\n%s\n' "$strangers"
  status=1
fi
if [[ $mode == complete && -n $missing ]]; then
  printf 'in the list, but not exported:\n%s\n' "$missing"
  status=1
fi
printf '%s names in the list, %s missing\n' "$(wc -l <"$list")" \
  "$(printf '%s' "$missing" | grep -c . || true)"
exit "$status"
