#!/usr/bin/env bash
# Builds the library and a host program and runs it on its sample: workarea, which measures a terrain, or
# fieldbook, which computes a traverse and sets out an axis.
# Usage: scripts/demo.sh [workarea options]      e.g. --grade 620 --view -84.3,36.5,-84.2,36.6
#        scripts/demo.sh fieldbook [options]     e.g. --wgs84 K1,47.5,8.5,450 --interval 10
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}"
mkdir -p build
cmake -S . -B build/demo -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF >build/demo.log
program=workarea
if [ "${1:-}" = fieldbook ]; then
    program=fieldbook
    shift
fi
cmake --build build/demo --target $program >>build/demo.log || { cat build/demo.log; exit 1; }
if [ $program = fieldbook ]; then
    exec build/demo/examples/fieldbook/fieldbook examples/data/fieldbook.csv \
        --alignment examples/data/axis.csv "$@"
fi
exec build/demo/examples/workarea/workarea examples/data/jacksboro.asc --boundary examples/data/boundary.csv \
    --grade 500 "$@"
