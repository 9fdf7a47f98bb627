#!/usr/bin/env bash
# Builds the library and its first host program and measures the sample terrain with it.
# Usage: scripts/demo.sh [workarea options]      e.g. --grade 620 --view -84.3,36.5,-84.2,36.6
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}"
mkdir -p build
cmake -S . -B build/demo -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF >build/demo.log
cmake --build build/demo --target workarea >>build/demo.log || { cat build/demo.log; exit 1; }
exec build/demo/examples/workarea/workarea examples/data/jacksboro.asc --boundary examples/data/boundary.csv \
    --grade 500 "$@"
