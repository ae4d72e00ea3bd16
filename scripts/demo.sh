#!/usr/bin/env bash
# The main job: installs what is missing, builds everything and runs the demo host,
# which renders into out/.
set -euo pipefail
cd "$(dirname "$0")/.."

bash scripts/deps.sh
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo
cmake --build build -j"$(nproc 2>/dev/null || echo 2)"
./build/examples/hello
