#!/usr/bin/env bash
# full.sh [SECONDS]: all checks before a release: the static checks, all builds with all tests, the
# packages in a fresh Debian (downloaded), the binary interface of version 1.0, a save with a fault at
# each of its system calls, the page of `tevpf report` in a browser (pictures of it are left in
# build/report), each fuzz target for SECONDS (default 1800), and the branch coverage. Inputs found by
# fuzzing are kept in build/fuzz/found; copy them to tests/fuzz/corpus to test them in every run.
# The planted faults (scripts/mutation.py) take hours more and are run apart.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case ${1:-} in
  -h | --help) sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "${BASH_SOURCE[0]}"; exit ;;
esac
seconds=${1:-1800}
[[ $seconds =~ ^[0-9]+$ ]] || { echo "full.sh: '$seconds' is no number of seconds" >&2; exit 2; }

scripts/check.sh
scripts/test.sh dev asan x86 mingw wine clang arm64

echo "== packages"
scripts/package.sh --windows
tests/package/check_packages.sh build/packages
echo "== binary interface"
tests/package/check_abi.sh build/dev/libtevpf.so

scripts/install-packages.sh build test fuzz browser
echo "== kill sweep"
cmake --build --preset dev --target save_once short_call
tests/robustness/kill_sweep.py build/dev

echo "== report in a browser"
# The packages of Debian are for its own Python.
/usr/bin/python3 tests/tools/report_browser.py build/dev/tools/tevpf build/report

cmake --preset fuzz
cmake --build --preset fuzz
mkdir -p build/fuzz/found
for target in file text operations; do
  echo "== fuzzing: $target, $seconds seconds"
  mkdir -p "build/fuzz/$target"
  # Sequences that are short and chosen evenly run ten times as often as others do.
  options=()
  [[ $target != operations ]] || options=(-entropic=0 -max_len=256)
  build/fuzz/tests/fuzz/"${target}_fuzz" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=1024 \
    -print_final_stats=1 -artifact_prefix=build/fuzz/found/ "${options[@]}" \
    "build/fuzz/$target" "tests/fuzz/corpus/$target"
done

echo "== branch coverage"
scripts/coverage.sh
