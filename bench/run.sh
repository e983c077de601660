#!/usr/bin/env bash
# run.sh [FILTER]: installs what is missing, builds the benchmarks, runs them (all, or those whose
# name matches the regular expression FILTER) and prints the table of ratios.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

scripts/install-packages.sh build bench
cmake -S . -B build/bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DTEVPF_BUILD_BENCH=ON \
  -DTEVPF_BUILD_TOOL=OFF -DTEVPF_BUILD_EXAMPLES=OFF
cmake --build build/bench --parallel

program=build/bench/bench/tevpf_bench
# Three times, the smaller sizes five times, interleaved, so that a noisy minute on a shared machine meets
# ours and theirs alike.
mapfile -t names < <("$program" --benchmark_list_tests --benchmark_filter="${1:-.}")
run() {  # RESULT NAME-SUFFIX-PATTERN OPTIONS...
  local result=$1 pattern=$2 filter
  shift 2
  filter=$(printf '%s\n' "${names[@]}" | grep -E "$pattern" | paste -sd'|') || return 0
  "$program" --benchmark_filter="^($filter)$" --benchmark_out="$result" \
    --benchmark_out_format=json "$@" >build/bench/console.txt
  results+=("$result")
}
results=()
run build/bench/many.json '/1000000/' --benchmark_repetitions=3 --benchmark_enable_random_interleaving=true
run build/bench/few.json '/[0-9]{4,6}/' --benchmark_repetitions=5 --benchmark_min_time=0.02 \
  --benchmark_enable_random_interleaving=true
bench/ratios.py "${results[@]}" | tee build/bench/ratios.md
