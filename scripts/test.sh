#!/usr/bin/env bash
# Builds everything and runs all tests; ends with the test runner's closing lines.
# Usage: scripts/test.sh [ctest options]         e.g. -R Sparse
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}"
cmake --preset dev
cmake --build --preset dev
ctest --preset dev -j "$(nproc)" "$@"
