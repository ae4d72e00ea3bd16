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
./build-bench/bench/lite_vrx_bench --benchmark_counters_tabular=true \
    --benchmark_out=build-bench/bench.json --benchmark_out_format=json "$@"

# Fill rate of the span fillers (Span/<filler>, items are pixels), one line per filler.
python3 - build-bench/bench.json <<'PY'
import json, sys
runs = [b for b in json.load(open(sys.argv[1]))["benchmarks"]
        if b["name"].startswith("Span/") and "items_per_second" in b]
if runs:
    print("\nSpan fill rate on 320-pixel spans (Mpixels/s)")
    for b in runs:
        name = b["name"].split("/")[1]
        print(f"  {name:34s} {b['items_per_second'] / 1e6:8.1f}")
PY
