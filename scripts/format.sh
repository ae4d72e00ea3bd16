#!/usr/bin/env bash
# Applies .clang-format to every C and C++ file in the repository.
set -euo pipefail
cd "$(dirname "$0")/.."
git ls-files '*.h' '*.cpp' '*.c' | xargs clang-format -i
