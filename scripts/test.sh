#!/usr/bin/env bash
# Builds and runs the whole suite through CTest, then builds and runs it again under
# AddressSanitizer and UndefinedBehaviorSanitizer. Installs missing packages first.
set -euo pipefail
cd "$(dirname "$0")/.."

bash scripts/deps.sh
jobs=$(nproc 2>/dev/null || echo 2)

echo "== build and test (release with debug info)"
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo
cmake --build build -j"$jobs"
ctest --test-dir build --output-on-failure -j"$jobs"

echo "== build and test (AddressSanitizer + UndefinedBehaviorSanitizer)"
cmake -S . -B build-san -G Ninja -DCMAKE_BUILD_TYPE=Debug -DVRX_SANITIZE=ON -DVRX_BUILD_BENCH=OFF
cmake --build build-san -j"$jobs"
ASAN_OPTIONS=detect_leaks=1:abort_on_error=1 UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1 \
    ctest --test-dir build-san --output-on-failure -j"$jobs" -E install_package_test

echo "== format check"
if command -v clang-format >/dev/null; then
    files=$(git ls-files '*.h' '*.cpp' '*.c' 2>/dev/null || true)
    if [ -n "$files" ] && ! clang-format --dry-run --Werror $files; then
        echo "clang-format: files need formatting (run scripts/format.sh)"
        exit 1
    fi
fi
echo "all tests passed"
