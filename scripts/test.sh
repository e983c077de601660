#!/usr/bin/env bash
# test.sh [LEG...]: installs missing packages, builds, and runs all tests. The legs, all by default:
#   dev     64-bit debug build            asan    the same under address and UB sanitizers
#   x86     32-bit x86 build              mingw   32-bit Windows cross-build, its DLL checked
# When none is named, they are built quickly rather than wholly: docs/testing.md says what is left out.
# On request:
#   wine    64-bit Windows build, its tests and transcripts run by Wine
#   clang   64-bit build by clang with libc++
#   arm64   64-bit ARM build, its tests run by QEMU
# The last lines are ctest's summary over all legs.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case ${1:-} in
  -h | --help) sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "${BASH_SOURCE[0]}"; exit ;;
esac
legs=("$@")
all=ON quick=OFF
((${#legs[@]})) || { legs=(dev asan x86 mingw); all=OFF quick=ON; }

declare -A packages=([dev]="test python" [asan]="test python" [x86]="test x86" [mingw]=windows [wine]=wine
  [clang]="test clang" [arm64]="test arm64")
# Said in both cases, because a build folder remembers what it was told.
declare -A options=([dev]="-DTEVPF_BUILD_PYTHON=ON -DTEVPF_BUILD_ONCE=ON"
  [asan]="-DTEVPF_BUILD_TOOL=$all -DTEVPF_BUILD_PYTHON=$all -DTEVPF_BUILD_EXAMPLES=$all"
  [x86]="-DTEVPF_BUILD_TOOL=$all -DTEVPF_BUILD_EXAMPLES=$all" [mingw]=-DTEVPF_BUILD_TOOL=$all)
# For a compiler cache to keep what is compiled with precompiled headers.
export CCACHE_SLOPPINESS=${CCACHE_SLOPPINESS:-pch_defines,time_macros}
groups=(build tool)
for leg in "${legs[@]}"; do
  [[ -n ${packages[$leg]:-} ]] || { echo "test.sh: no leg '$leg'; see --help" >&2; exit 2; }
  read -ra more <<<"${packages[$leg]}"
  groups+=("${more[@]}")
done
scripts/install-packages.sh "${groups[@]}"

jobs=$(nproc)
mkdir -p build/all
: >build/all/CTestTestfile.cmake
for leg in "${legs[@]}"; do
  read -ra more <<<"${options[$leg]:-}"
  cmake --preset "$leg" -DTEVPF_BUILD_QUICKLY=$quick "${more[@]}"
  cmake --build --preset "$leg" --parallel "$jobs"
  echo "subdirs(../$leg)" >>build/all/CTestTestfile.cmake
done

# One ctest run over all legs, for a single summary.
ctest --test-dir build/all --parallel "$jobs" --output-on-failure --no-tests=error --progress
