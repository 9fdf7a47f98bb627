#!/usr/bin/env bash
# Runs all tests and reports which lines and branches of the library they reach. Fails where what they do not reach is
# not explained in tests/uncovered.txt.
# Usage: scripts/coverage.sh                     the pages are in build/coverage/report/
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}" gcovr python3
cmake --preset coverage >/dev/null
cmake --build --preset coverage
ctest --preset coverage -j "$(nproc)"
mkdir -p build/coverage/report
gcovr --root . --filter src/ --filter include/ --exclude-throw-branches --print-summary \
    --html-details build/coverage/report/index.html --json build/coverage/report/coverage.json build/coverage
scripts/uncovered.py build/coverage/report/coverage.json
