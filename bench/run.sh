#!/usr/bin/env bash
# run.sh [FILTER]: installs what is missing, builds the benchmarks, runs them (all, or those whose
# name matches the regular expression FILTER) and prints the table of ratios.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

scripts/install-packages.sh build bench
cmake -S . -B build/bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DTEVPF_BUILD_BENCH=ON \
  -DTEVPF_BUILD_TOOL=OFF -DTEVPF_BUILD_EXAMPLES=OFF
cmake --build build/bench --parallel

result=build/bench/result.json
# Interleaved, so that a noisy minute on a shared machine meets ours and theirs alike.
build/bench/bench/tevpf_bench --benchmark_filter="${1:-.}" --benchmark_min_time=0.1 \
  --benchmark_repetitions=3 --benchmark_enable_random_interleaving=true \
  --benchmark_out="$result" --benchmark_out_format=json >build/bench/console.txt
bench/ratios.py "$result" | tee build/bench/ratios.md
