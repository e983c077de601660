#!/usr/bin/env bash
# check_install.sh BUILD WORK CMAKE CC TOOLCHAIN CFLAGS: installs the build into a fresh folder,
# then builds and runs the README's program against it in the three ways a user would: find_package
# with the shared library, with the static one, and pkg-config.
set -euo pipefail
build=$1 work=$2 cmake=$3 cc=$4 toolchain=$5 cflags=$6
source=$(cd "$(dirname "${BASH_SOURCE[0]}")/consumer" && pwd)

rm -rf "$work"
mkdir -p "$work"
"$cmake" --install "$build" --prefix "$work/moved" >"$work/install.log"
mv "$work/moved" "$work/prefix" # the tree names no absolute path of its own
prefix=$work/prefix

program=$work/readme.c
awk '/^```c$/ { code = 1; next } /^```/ { code = 0 } code' "$source/../../../README.md" >"$program"
printf '%s\n' "Thrust is 480 kN" "900 kN is out of range; the value is as before" >"$work/said"

run() { # run LABEL PROGRAM: it makes its file, finds its value there again and keeps it
  for _ in new again; do
    (cd "$work" && "$2") | diff - "$work/said" || { echo "$1: the program failed"; exit 1; }
  done
  rm "$work/engine.pf"
  echo "$1: built and ran"
}

for linkage in shared static; do
  options=(-G Ninja -DCMAKE_PREFIX_PATH="$prefix" -DCMAKE_C_COMPILER="$cc"
    -DCMAKE_C_FLAGS="$cflags" -DCMAKE_CXX_FLAGS="$cflags" -DLINKAGE="$linkage" -DPROGRAM="$program")
  [[ -z $toolchain ]] || options+=(-DCMAKE_TOOLCHAIN_FILE="$toolchain")
  "$cmake" -S "$source" -B "$work/$linkage" "${options[@]}" >"$work/$linkage.log"
  "$cmake" --build "$work/$linkage" >>"$work/$linkage.log" || { cat "$work/$linkage.log"; exit 1; }
  run "find_package, $linkage" "$work/$linkage/consumer"
done

PKG_CONFIG_PATH=$(dirname "$(find "$prefix" -name tevpf.pc)")
export PKG_CONFIG_PATH
read -ra flags <<<"$cflags $(pkg-config --cflags tevpf)"
read -ra libs <<<"$(pkg-config --libs tevpf)"
"$cc" -std=c99 -Wall -Wextra -Werror "${flags[@]}" "$program" -o "$work/by_pkg_config" "${libs[@]}"
LD_LIBRARY_PATH=$(pkg-config --variable=libdir tevpf)
export LD_LIBRARY_PATH
run pkg-config "$work/by_pkg_config"
