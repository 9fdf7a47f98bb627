#!/usr/bin/env bash
# Builds the library and a host program and runs it on its sample.
# Usage: scripts/demo.sh [workarea options]      e.g. --grade 620 --view -84.3,36.5,-84.2,36.6
#        scripts/demo.sh fieldbook [options]     e.g. --wgs84 K1,47.5,8.5,450 --interval 10
#        scripts/demo.sh scratch [options]       e.g. --points 1000000 --cells cells.csv
#        scripts/demo.sh hostinfo [options]      e.g. --json
#        scripts/demo.sh palette [options]       e.g. FF8800 --picture palette.bmp
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}"
mkdir -p build
cmake -S . -B build/demo -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF >build/demo.log
program=workarea
case "${1:-}" in
    fieldbook | scratch | hostinfo | palette)
        program=$1
        shift
        ;;
esac
cmake --build build/demo --target $program >>build/demo.log || { cat build/demo.log; exit 1; }
sample=()
case $program in
    fieldbook) sample=(examples/data/fieldbook.csv --alignment examples/data/axis.csv) ;;
    workarea) sample=(examples/data/jacksboro.asc --boundary examples/data/boundary.csv --grade 500) ;;
esac
exec "build/demo/examples/$program/$program" "${sample[@]}" "$@"
