#!/usr/bin/env bash
# Redraws the pictures in docs/pictures: the sample work area and the palette.
# Usage: scripts/pictures.sh
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${EXAMPLE_PACKAGES[@]}" imagemagick
mkdir -p docs/pictures
cmake -S . -B build/demo -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF >build/pictures.log
cmake --build build/demo --target workarea palette >>build/pictures.log || { cat build/pictures.log; exit 1; }

convert_picture() {  # name, options of convert ...
    local name=$1
    shift
    convert "build/$name.bmp" -strip "$@" -define png:compression-level=9 -define png:exclude-chunks=date,time \
        "docs/pictures/$name.png"
    rm "build/$name.bmp"
    identify "docs/pictures/$name.png"
}

build/demo/examples/workarea/workarea examples/data/jacksboro.asc --boundary examples/data/boundary.csv \
    --view -84.35,36.51,-84.13,36.66 --grade 500 --picture build/workarea.bmp --legend >>build/pictures.log
convert_picture workarea +dither -colors 256  # a third of the size, and no visible difference
build/demo/examples/palette/palette --picture build/palette.bmp >>build/pictures.log
convert_picture palette
