#!/usr/bin/env bash
# demo.sh: installs missing packages, builds the library, and runs the example programs.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

scripts/install-packages.sh build tool
cmake --preset release
cmake --build --preset release

shopt -s nullglob
for program in build/release/examples/*; do
  [[ -f $program && -x $program ]] || continue
  printf '\n=== %s ===\n\n' "${program##*/}"
  folder=build/release/demo/${program##*/}
  mkdir -p "$folder"
  program=$PWD/$program
  (cd "$folder" && "$program")
done
