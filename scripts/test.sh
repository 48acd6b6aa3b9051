#!/usr/bin/env bash
# Set-up as for the program, then the whole test suite through CTest.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cd build
ctest --output-on-failure -j"$(nproc 2>/dev/null || echo 2)" "$@"
