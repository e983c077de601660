#!/usr/bin/env bash
# coverage.sh [--list]: builds with clang's coverage, runs the tests, and prints the branch coverage of each
# folder: of the two ways that each condition can turn out, how many did. --list names the conditions that
# did not turn out both ways. Takes a quarter of an hour on two cores.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case ${1:-} in
  -h | --help) sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "${BASH_SOURCE[0]}"; exit ;;
  "" | --list) ;;
  *) echo "coverage.sh: what is '$1'? See --help" >&2; exit 2 ;;
esac
scripts/install-packages.sh build tool test fuzz

# Counters that lie in the profile's own pages count for processes that are ended, too.
flags="-fprofile-instr-generate -fcoverage-mapping -mllvm -runtime-counter-relocation"
flags+=" -Wno-unused-command-line-argument"  # of the linker
cmake --preset dev -B build/coverage -DTEVPF_STRICT=OFF -DTEVPF_BUILD_EXAMPLES=OFF -DTEVPF_BUILD_ONCE=ON \
  -DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_CXX_FLAGS_DEBUG=-O1 \
  -DCMAKE_C_FLAGS="$flags" -DCMAKE_CXX_FLAGS="$flags" >/dev/null
cmake --build build/coverage --parallel "$(nproc)"
mkdir -p build/coverage/raw
rm -f build/coverage/raw/*
# What is installed and what programs include is tested elsewhere.
LLVM_PROFILE_FILE=$PWD/build/coverage/raw/%m%c.profraw ctest --test-dir build/coverage \
  --parallel "$(nproc)" --exclude-regex '^(package|example)' --progress --output-on-failure
llvm-profdata merge -sparse build/coverage/raw/*.profraw -o build/coverage/all.profdata
scripts/coverage.py build/coverage "$@"
