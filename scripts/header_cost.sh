#!/usr/bin/env bash
# Prints what including a header costs beside peers: lines after preprocessing and milliseconds of compilation at the
# least of some rounds, whose order is mixed; beyond what an empty file takes.
# Usage: scripts/header_cost.sh [--page PAGE]    also writes the table between the page's marks
# ROUNDS (7) may be set.
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" libgeographiclib-dev libboost1.81-dev libspdlog-dev libopenvdb-dev libtbb-dev \
    python3
work=build/header_cost
mkdir -p $work
cmake -S . -B $work/library -G Ninja -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF \
    -DBASALT_BUILD_TOOLS=OFF >$work/log

headers=(basalt/{geo,sparse,memory,frame,util,files,graphics,basalt}.h GeographicLib/Geodesic.hpp
    GeographicLib/Geocentric.hpp boost/geometry.hpp openvdb/openvdb.h spdlog/spdlog.h filesystem vector)
source_of() { if [ "$1" = empty ]; then echo; else echo "#include <$1>"; fi; }
compile() {  # header, compiler options
    source_of "$1" | g++ -std=c++17 -Iinclude -I$work/library/include "${@:2}" -x c++ -
}

declare -A least lines
for header in empty "${headers[@]}"; do
    compile "$header" -fsyntax-only 2>$work/log || { cat $work/log; exit 1; }
    lines[$header]=$(compile "$header" -E -P | wc -l)
    least[$header]=1000000000
done
for _ in $(seq "${ROUNDS:-7}"); do
    for header in $(printf '%s\n' empty "${headers[@]}" | shuf); do
        began=$(date +%s%N)
        compile "$header" -fsyntax-only
        taken=$((($(date +%s%N) - began) / 1000))
        [ $taken -ge "${least[$header]}" ] || least[$header]=$taken
    done
done

{
    echo "| header | lines | milliseconds |"
    echo "|---|---:|---:|"
    for header in "${headers[@]}"; do
        LC_ALL=C awk -v name="$header" -v lines="${lines[$header]}" -v us=$((least[$header] - least[empty])) \
            'BEGIN { printf "| `%s` | %d | %.0f |\n", name, lines, us / 1000 }'
    done
} >$work/table
cat $work/table
[ "${1:-}" != --page ] || python3 scripts/bench_table.py --page "$2" headers --text "$(cat $work/table)"
