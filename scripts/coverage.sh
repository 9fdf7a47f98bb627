#!/usr/bin/env bash
# Runs all tests and reports the lines and branches of the library they reach. Fails below 97 % of the lines.
# Usage: scripts/coverage.sh                     the pages are in build/coverage/report/
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}" gcovr
cmake --preset coverage >/dev/null
build_with_progress "coverage" --preset coverage
# Without the test whose limit on file sizes would cut the counts too.
ctest --preset coverage -j "$(nproc)" -E hostinfo_command_line
mkdir -p build/coverage/report
gcovr --root . --filter src/ --filter include/ --exclude-throw-branches --print-summary --fail-under-line 97 \
    --html-details build/coverage/report/index.html build/coverage
