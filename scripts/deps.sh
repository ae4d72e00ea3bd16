#!/usr/bin/env bash
# Installs the Debian packages that the build, the tests, the examples, the benchmarks
# and the font generator need. Idempotent: packages already present are skipped.
set -euo pipefail

packages=(
    build-essential cmake ninja-build pkg-config clang clang-format
    zlib1g-dev libgtest-dev libgmock-dev libbenchmark-dev libpng-dev
    binutils python3 console-setup-linux
)

missing=()
for p in "${packages[@]}"; do
    if ! dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed'; then
        missing+=("$p")
    fi
done

if [ ${#missing[@]} -eq 0 ]; then
    echo "deps: all packages present"
    exit 0
fi

SUDO=""
if [ "$(id -u)" -ne 0 ]; then SUDO="sudo"; fi
echo "deps: installing ${missing[*]}"
$SUDO apt-get update
DEBIAN_FRONTEND=noninteractive $SUDO apt-get install -y --no-install-recommends "${missing[@]}"
