#!/usr/bin/env bash
# check_install.sh BUILD WORK CMAKE CC TOOLCHAIN CFLAGS: installs the build into a fresh folder,
# then builds and runs a C program against it in the three ways a user would: find_package with
# the shared library, with the static one, and pkg-config. The README's program is built as well.
set -euo pipefail
build=$1 work=$2 cmake=$3 cc=$4 toolchain=$5 cflags=$6
source=$(cd "$(dirname "${BASH_SOURCE[0]}")/consumer" && pwd)

rm -rf "$work"
mkdir -p "$work"
"$cmake" --install "$build" --prefix "$work/moved" >"$work/install.log"
mv "$work/moved" "$work/prefix" # the tree names no absolute path of its own
prefix=$work/prefix

run() { # run LABEL PROGRAM: the program keeps a file in its working folder
  (cd "$work" && "$2") || { echo "$1: the program failed"; exit 1; }
  echo "$1: built and ran"
}

for linkage in shared static; do
  options=(-G Ninja -DCMAKE_PREFIX_PATH="$prefix" -DCMAKE_C_COMPILER="$cc"
    -DCMAKE_C_FLAGS="$cflags" -DCMAKE_CXX_FLAGS="$cflags" -DLINKAGE="$linkage")
  [[ -z $toolchain ]] || options+=(-DCMAKE_TOOLCHAIN_FILE="$toolchain")
  "$cmake" -S "$source" -B "$work/$linkage" "${options[@]}" >"$work/$linkage.log"
  "$cmake" --build "$work/$linkage" >>"$work/$linkage.log" || { cat "$work/$linkage.log"; exit 1; }
  run "find_package, $linkage" "$work/$linkage/consumer"
done

PKG_CONFIG_PATH=$(dirname "$(find "$prefix" -name tevpf.pc)")
export PKG_CONFIG_PATH
read -ra flags <<<"$cflags $(pkg-config --cflags tevpf)"
read -ra libs <<<"$(pkg-config --libs tevpf)"
"$cc" -std=c99 "${flags[@]}" "$source/consumer.c" -o "$work/by_pkg_config" "${libs[@]}"
awk '/^```c$/ { code = 1; next } /^```/ { code = 0 } code' "$source/../../../README.md" \
  >"$work/readme.c"
"$cc" -std=c99 -Wall -Wextra -Werror "${flags[@]}" "$work/readme.c" -o "$work/readme" "${libs[@]}"
LD_LIBRARY_PATH=$(pkg-config --variable=libdir tevpf)
export LD_LIBRARY_PATH
run pkg-config "$work/by_pkg_config"
run "the README's program" "$work/readme" # makes its file
run "the README's program, again" "$work/readme"
