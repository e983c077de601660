#!/usr/bin/env bash
# check_exports.sh LIBRARY: an exported function stands in a header, in the section of cmake/exports.map
# for that header, and in operations.txt or additions.txt; and the shared library (.so or .dll) exports
# it, with the version that the map gives it (.so). No function is missing in any of these places.
set -euo pipefail
export LC_ALL=C
library=$(realpath -e "$1")
cd "$(dirname "${BASH_SOURCE[0]}")/../.."
status=0

# compare A "NAMES OF A" B "NAMES OF B": the same lines, or those that only one has are named.
compare() {
  local only
  only=$(comm -23 <(sort <<<"$2") <(sort <<<"$4"))
  [[ -z $only ]] || { printf 'in %s, but not in %s:\n%s\n' "$1" "$3" "$only"; status=1; }
  only=$(comm -13 <(sort <<<"$2") <(sort <<<"$4"))
  [[ -z $only ]] || { printf 'in %s, but not in %s:\n%s\n' "$3" "$1" "$only"; status=1; }
}

# declared SECTION HEADER...: the functions that headers export, and the section they belong to.
declared() {
  local section=$1
  shift
  cat "$@" | tr '\n' ' ' | grep -oP 'TEVPF_API [^;#]*?\b(TEV8R1|tevpf)_\w+(?=\()' |
    awk -v section="$section" '{ print $NF, section }' | tr -d '*'
}

# The map, a line for each function: its name, its section, its version.
map=$(awk '
  /^[A-Z].*\{$/ { version = $1 }
  /^ *\/\*/ { section = $2; sub(/:$/, "", section) }
  /^ *[A-Za-z0-9_]+;$/ { sub(/;/, ""); print $1, section, version }' cmake/exports.map)

exported() {
  case $library in
    *.dll) objdump -p "$library" | awk '
             /\[Ordinal\/Name Pointer\] Table/ { names = 1; next }
             names && NF == 0 { names = 0 }
             names { print $NF }' ;;
    *) nm -D --defined-only --format=posix "$library" |
      awk '$2 != "A" { sub(/@+/, " ", $1); print $1 }' ;;
  esac
}
case $library in
  *.dll) mapped=$(awk '{ print $1 }' <<<"$map") ;;
  *) mapped=$(awk '{ print $1, $3 }' <<<"$map") ;;
esac

compare "the lists" "$(cat tests/package/{operations,additions}.txt)" \
  cmake/exports.map "$(awk '{ print $1 }' <<<"$map")"
mapfile -t inner < <(find core values lists tables reports -name '*.h')
headers=$(for header in include/*.h; do declared "$header" "$header"; done
  declared folders "${inner[@]}")
compare "the headers" "$headers" cmake/exports.map "$(awk '{ print $1, $2 }' <<<"$map")"
compare "$(basename "$library")" "$(exported)" cmake/exports.map "$mapped"
exit "$status"
