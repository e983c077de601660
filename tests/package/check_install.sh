#!/usr/bin/env bash
# check_install.sh BUILD WORK CMAKE CC CXX TOOLCHAIN CFLAGS CXXFLAGS: installs the build into a fresh folder, then
# builds and runs programs against it in the ways a user would: with find_package, shared and static, and
# with pkg-config, as C99, C++20 and C++23, with CC and CXX and, where there is one, clang.
set -euo pipefail
build=$1 work=$2 cmake=$3 cc=$4 cxx=$5 toolchain=$6 cflags=$7 cxxflags=$8
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
examples=$here/../../examples

rm -rf "$work"
mkdir -p "$work"
"$cmake" --install "$build" --prefix "$work/moved" >"$work/install.log"
mv "$work/moved" "$work/prefix" # the tree names no absolute path of its own
prefix=$work/prefix

# What the README shows are the examples, and what they print.
shown() { # shown LANGUAGE: the README's blocks in it
  awk -v fence="\`\`\`$1" '$0 == fence { inside = 1; next } /^```/ { inside = 0 } inside' \
    "$here/../../README.md"
}
shown c | diff - "$examples/engine.c"
shown cpp | diff - "$examples/engine.cpp"
shown text >"$work/engine.cpp.said"
printf '%s\n' "Thrust is 480 kN" "900 kN is out of range; the value is as before" >"$work/engine.c.said"
: >"$work/interface.cpp.said"

run() { # run LABEL PROGRAM SOURCE: it makes its file; examples find their values there again
  local times=(new) said=$work/${3##*/}.said
  [[ $3 == "$examples"/* ]] && times+=(again)
  for _ in "${times[@]}"; do
    (cd "$work" && "$2") | diff - "$said" || { echo "$1: the program failed"; exit 1; }
  done
  rm -f "$work"/*.pf
  echo "$1: built and ran"
}

for linkage in shared static; do
  for source in "$examples/engine.c" "$examples/engine.cpp"; do
    folder=$work/$linkage.${source##*.}
    options=(-G Ninja -DCMAKE_PREFIX_PATH="$prefix" -DCMAKE_C_COMPILER="$cc"
      -DCMAKE_CXX_COMPILER="$cxx" -DCMAKE_C_FLAGS="$cflags" -DCMAKE_CXX_FLAGS="$cxxflags"
      -DLINKAGE="$linkage" -DPROGRAM="$source")
    [[ -z $toolchain ]] || options+=(-DCMAKE_TOOLCHAIN_FILE="$toolchain")
    "$cmake" -S "$here/consumer" -B "$folder" "${options[@]}" >"$folder.log"
    "$cmake" --build "$folder" >>"$folder.log" || { cat "$folder.log"; exit 1; }
    run "find_package, $linkage, ${source##*/}" "$folder/consumer" "$source"
  done
done

PKG_CONFIG_PATH=$(dirname "$(find "$prefix" -name tevpf.pc)")
export PKG_CONFIG_PATH
LD_LIBRARY_PATH=$(pkg-config --variable=libdir tevpf)
export LD_LIBRARY_PATH
strict=(-Wall -Wextra -Wconversion -Wshadow -Werror)

by_pkg_config() { # by_pkg_config PACKAGE SOURCE COMPILER...: compiled once, linked shared and static
  local package=$1 source=$2 linkage flags libs static base
  shift 2
  read -ra base <<<"$cflags"
  [[ $1 != "$cxx" ]] || read -ra base <<<"$cxxflags"
  read -ra flags <<<"$(pkg-config --cflags "$package")"
  read -ra libs <<<"$(pkg-config --libs "$package")"
  read -ra static <<<"$(pkg-config --static --libs-only-l "$package" | sed 's/-ltevpf//')"
  "$@" "${strict[@]}" "${base[@]}" "${flags[@]}" -c "$source" -o "$work/by_pkg_config.o"
  for linkage in shared static; do
    [[ $linkage == shared ]] || libs=("$LD_LIBRARY_PATH/libtevpf.a" "${static[@]}")
    "$1" "${base[@]}" "$work/by_pkg_config.o" -o "$work/by_pkg_config" "${libs[@]}"
    run "pkg-config, $* ${source##*/}, $linkage" "$work/by_pkg_config" "$source"
  done
}

compilers=("$cxx")
# Programs of clang cannot be linked to a library with the sanitizers of gcc.
[[ $cflags == *-fsanitize* ]] || ! command -v clang++ >/dev/null || compilers+=(clang++)
by_pkg_config tevpf "$examples/engine.c" "$cc" -std=c99
for compiler in "${compilers[@]}"; do
  for standard in c++20 c++2b; do
    by_pkg_config tevpf-cpp "$here/consumer/interface.cpp" "$compiler" "-std=$standard"
  done
done

# The extension of SQLite, under the name that users load it by.
if [[ -e $LD_LIBRARY_PATH/tevpf_sqlite.so && $cflags != *-fsanitize* ]] && command -v sqlite3 >/dev/null; then
  printf '%s\n' '.load tevpf_sqlite' "select name from pragma_module_list where name = 'tevpf';" |
    sqlite3 -batch -init /dev/null | grep -qx tevpf
  echo "extension of SQLite: loaded"
fi
