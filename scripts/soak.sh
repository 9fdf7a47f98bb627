#!/usr/bin/env bash
# Works a site with the library for minutes, at low priority and a machine's pace, and says whether memory or
# descriptors grew: exit status 1 when the one did by more than 1 % or the other at all.
# Usage: scripts/soak.sh [MINUTES (60) [PERCENT of a processor at most (25; 100: without a rest)]]
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}"
cmake --preset dev >/dev/null
cmake --build --preset dev --target soak >build/soak-build.log || { cat build/soak-build.log; exit 1; }
folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
status=0
TMPDIR=$folder nice -n 19 build/dev/tests/soak "${1:-60}" "${2:-25}" "$folder" || status=$?
rm -f "$folder/soak.log"
[ -z "$(ls -A "$folder")" ] || { echo "files stayed:" "$(ls -A "$folder" | head -n 5)" >&2; exit 1; }
exit "$status"
