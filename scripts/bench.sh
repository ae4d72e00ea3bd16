#!/usr/bin/env bash
# Builds the benchmarks with optimisation (Release) and runs them, printing one table:
# time per operation and, where a benchmark counts items, items per second (triangles/s
# for the triangle drawers). Extra arguments go to the benchmark program, e.g.
#   scripts/bench.sh --benchmark_filter=Triangle
set -euo pipefail
cd "$(dirname "$0")/.."

bash scripts/deps.sh
jobs=$(nproc 2>/dev/null || echo 2)
cmake -S . -B build-bench -G Ninja -DCMAKE_BUILD_TYPE=Release \
    -DVRX_BUILD_TESTS=OFF -DVRX_BUILD_EXAMPLES=OFF -DVRX_BUILD_BENCH=ON
cmake --build build-bench -j"$jobs" --target lite_vrx_bench
./build-bench/bench/lite_vrx_bench --benchmark_counters_tabular=true "$@"
