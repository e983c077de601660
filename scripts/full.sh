#!/usr/bin/env bash
# full.sh [SECONDS]: all checks before a release: the static checks, all builds with all tests, a
# save with a fault at each of its system calls, the page of `tevpf report` in a browser (pictures of it
# are left in build/report), and each fuzz target for SECONDS (default 1800).
# Takes about 20 minutes plus twice SECONDS on two cores. Inputs found by fuzzing are kept in
# build/fuzz/found; copy them to tests/fuzz/corpus to test them in every run.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case ${1:-} in
  -h | --help) sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "${BASH_SOURCE[0]}"; exit ;;
esac
seconds=${1:-1800}
[[ $seconds =~ ^[0-9]+$ ]] || { echo "full.sh: '$seconds' is no number of seconds" >&2; exit 2; }

scripts/check.sh
scripts/test.sh dev asan x86 mingw wine

scripts/install-packages.sh build test fuzz browser
echo "== kill sweep"
cmake --build --preset dev --target save_once
tests/robustness/kill_sweep.py build/dev/tests/robustness/save_once

echo "== report in a browser"
# The packages of Debian are for its own Python.
/usr/bin/python3 tests/tools/report_browser.py build/dev/tools/tevpf build/report

cmake --preset fuzz
cmake --build --preset fuzz
mkdir -p build/fuzz/found
for target in file text; do
  echo "== fuzzing: $target, $seconds seconds"
  mkdir -p "build/fuzz/$target"
  build/fuzz/tests/fuzz/"${target}_fuzz" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=1024 \
    -print_final_stats=1 -artifact_prefix=build/fuzz/found/ \
    "build/fuzz/$target" "tests/fuzz/corpus/$target"
done
