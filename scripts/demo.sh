#!/usr/bin/env bash
# Builds the library and an example program, and runs it in the caller's folder, on its sample by default.
# Usage: scripts/demo.sh [workarea options]      e.g. --grade 620 --view -84.3,36.5,-84.2,36.6
#        scripts/demo.sh fieldbook [options]     e.g. --wgs84 K1,47.5,8.5,450 --interval 10
#        scripts/demo.sh scratch [options]       e.g. --points 1000000 --cells cells.csv
#        scripts/demo.sh hostinfo [options]      e.g. --json
#        scripts/demo.sh palette [options]       e.g. FF8800 --picture palette.bmp
# A terrain or field book of your own, or --synthetic, replaces the sample and its boundary, grade and alignment.
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${EXAMPLE_PACKAGES[@]}"
cmake -S . -B build/demo -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF >build/demo.log 2>&1 ||
    { cat build/demo.log >&2; exit 1; }
program=workarea
case "${1:-}" in
    workarea | fieldbook | scratch | hostinfo | palette)
        program=$1
        shift
        ;;
esac
build_with_progress "$program" build/demo --target "$program"

given=' '  # names of the options given, and `input` for an operand
value_follows=false
for argument in "$@"; do
    if $value_follows; then
        value_follows=false
        continue
    fi
    case $argument in
        --legend | --help | --version) given+="$argument " ;;
        --*=*) given+="${argument%%=*} " ;;
        --?*)
            given+="$argument "
            value_follows=true
            ;;
        --)
            given+='input '
            break
            ;;
        *) given+='input ' ;;
    esac
done
is_given() { [[ $given == *" $1 "* ]]; }
data=$(realpath --relative-to="$caller_folder" examples/data)
sample=()
case $program in
    fieldbook)
        if ! is_given input; then
            sample=("$data/fieldbook.csv")
            is_given --alignment || sample+=(--alignment "$data/axis.csv")
        fi
        ;;
    workarea)
        if ! is_given input && ! is_given --synthetic; then
            sample=("$data/jacksboro.asc")
            is_given --boundary || sample+=(--boundary "$data/boundary.csv")
            is_given --grade || sample+=(--grade 500)
        fi
        ;;
esac
run=$PWD/build/demo/examples/$program/$program
cd "$caller_folder"
exec "$run" "${sample[@]}" "$@"
