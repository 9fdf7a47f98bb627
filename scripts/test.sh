#!/usr/bin/env bash
# Builds everything and runs all tests. Ends with ctest's summary.
# Usage: scripts/test.sh [ctest options]         e.g. -R Sparse
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}"
cmake --preset dev >build/configure.log 2>&1 || { cat build/configure.log; exit 1; }
build_with_progress "library, programs and tests" --preset dev
ctest --preset dev -j "$(nproc)" "$@"
