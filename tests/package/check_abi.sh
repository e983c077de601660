#!/usr/bin/env bash
# check_abi.sh LIBRARY: programs built with version 1.0 run with this library, a shared one with debugging
# information for 64-bit x86: no function of abi-1.0.xml.xz is gone, and none takes or returns something
# else, as far as the installed headers say. Additions are welcome. check_abi.sh --write LIBRARY makes
# abi-1.0.xml.xz, and is for a new SONAME only. Part of scripts/full.sh.
set -euo pipefail
library=$(realpath -e "${@: -1}")
cd "$(dirname "${BASH_SOURCE[0]}")"
headers=../../include

# What the library offers, as far as the installed headers declare it.
interface() {
  abidw --headers-dir "$headers" --drop-private-types --exported-interfaces-only --no-corpus-path \
    --no-comp-dir-path --no-show-locs --no-elf-needed --no-parameter-names --no-write-default-sizes \
    --type-id-style hash "$library"
}

if [[ $1 == --write ]]; then
  interface | xz -9 >abi-1.0.xml.xz
else
  work=$(mktemp -d)
  trap 'rm -rf "$work"' EXIT
  xz -dc abi-1.0.xml.xz >"$work/1.0.xml"
  interface >"$work/now.xml"
  abidiff --no-added-syms "$work/1.0.xml" "$work/now.xml"
  echo "programs built with version 1.0 run with this library"
fi
