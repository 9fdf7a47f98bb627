#!/usr/bin/env bash
# Measures the geodesy against independent programs and writes the tables of docs/accuracy.md.
# Usage: scripts/accuracy.sh            the tables, from 40,000 points and 40,000 lines
#        scripts/accuracy.sh --data     the few hundred rows of tests/data/ that the tests compare with
# COUNT is the number of points and lines, BUILD the build folder (build/accuracy).
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" libbenchmark-dev geographiclib-tools proj-bin python3
build=${BUILD:-build/accuracy}
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DBASALT_BUILD_BENCHMARKS=ON \
    -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF >/dev/null
cmake --build "$build" --target accuracy >"$build/build.log" || { cat "$build/build.log"; exit 1; }
accuracy=$build/bench/accuracy/accuracy

geographiclib=$(GeodSolve --version | sed 's/.*GeographicLib version/GeographicLib/')
proj=$(cct --version 2>&1 | sed -n 's/.*Rel\. \([0-9.]*\).*/PROJ \1/p')
columns() { tr -s ' \t' ',' ; }

# Points, with their Cartesian coordinates.
write_points() {  # count, file
    "$accuracy" points "$1" >"$build/points.txt"
    {
        echo "# Made by CartConvert -p 10 ($geographiclib, WGS84)."
        echo "# Columns: latitude, longitude (degrees), height, x, y, z (metres)."
        paste -d' ' "$build/points.txt" <(CartConvert -p 10 <"$build/points.txt") | columns
    } >"$2"
}

# Lines, their ends by the exact solver, and the shortest line to each end.
write_lines() {  # count, file
    "$accuracy" lines "$1" >"$build/lines.txt"
    GeodSolve -E -p 10 <"$build/lines.txt" >"$build/ends.txt"
    paste -d' ' "$build/lines.txt" "$build/ends.txt" | cut -d' ' -f1,2,5,6 | GeodSolve -E -i -p 10 | cut -d' ' -f1,3 >"$build/shortest.txt"
    {
        echo "# Made by GeodSolve -E -p 10 and GeodSolve -E -i -p 10 ($geographiclib, WGS84)."
        echo "# Columns: start latitude, longitude, azimuth (degrees), distance (metres), end latitude, longitude, azimuth"
        echo "# (degrees); azimuth (degrees) and length (metres) of the shortest line between the two."
        paste -d' ' "$build/lines.txt" "$build/ends.txt" "$build/shortest.txt" | columns
    } >"$2"
}

# Pairs of places, and the shortest line between them.
write_pairs() {  # count, file
    "$accuracy" pairs "$1" >"$build/pairs.txt"
    {
        echo "# Made by GeodSolve -E -i -p 10 ($geographiclib, WGS84). Of every eight rows: anywhere, near, nearly opposite,"
        echo "# along a meridian, along the equator, from a pole, up to 1400 km, nearly opposite beside the equator."
        echo "# Columns: start latitude, longitude, end latitude, longitude (degrees), azimuth at start and end (degrees),"
        echo "# distance (metres)."
        paste -d' ' "$build/pairs.txt" <(GeodSolve -E -i -p 10 <"$build/pairs.txt") | columns
    } >"$2"
}

if [ "${1:-}" = --data ]; then
    write_points "${COUNT:-240}" tests/data/cartesian_geodetic.csv
    write_lines "${COUNT:-240}" tests/data/geodesics.csv
    write_pairs "${COUNT:-280}" tests/data/geodesic_inverse.csv
    exit 0
fi

write_points "${COUNT:-40000}" "$build/points.csv"
write_lines "${COUNT:-40000}" "$build/lines.csv"
write_pairs "${COUNT:-40000}" "$build/pairs.csv"
# A second program, in case the first is wrong.
apart=$(awk '{ print $2, $1, $3, 0 }' "$build/points.txt" | cct -d 12 +proj=cart +ellps=WGS84 |
    paste -d' ' - <(grep -v '^#' "$build/points.csv" | tr , ' ') |
    awk '{ d = sqrt(($1-$8)^2 + ($2-$9)^2 + ($3-$10)^2); if (d > most) most = d } END { printf "%.1e", most }')
series=$(paste -d' ' <(GeodSolve -i -p 10 <"$build/pairs.txt") <(grep -v '^#' "$build/pairs.csv" | tr , ' ') |
    awk '{ d = $3 > $10 ? $3 - $10 : $10 - $3; if (d > most) most = d } END { printf "%.1e", most }')
{
    echo "References: $geographiclib (\`CartConvert\`, \`GeodSolve -E\`). $proj (\`cct +proj=cart\`) puts the same"
    echo "points at most $apart m elsewhere; \`GeodSolve\` without \`-E\` finds distances at most $series m different."
    echo "${COUNT:-40000} points, lines and pairs each. Each cell: median / RMS / largest."
    echo
    "$accuracy" ellipsoid "$build/points.csv"
    "$accuracy" geodesic "$build/lines.csv"
    "$accuracy" inverse "$build/pairs.csv"
    "$accuracy" variance "$build/points.csv"
    "$accuracy" spiral
} >"$build/tables.md"
python3 - "$build/tables.md" docs/accuracy.md <<'PYTHON'
import sys
tables, page = (open(path).read() for path in sys.argv[1:3])
before, rest = page.split("<!-- tables -->\n")
after = rest.split("<!-- end of tables -->\n")[1]
open(sys.argv[2], "w").write(before + "<!-- tables -->\n" + tables.rstrip() + "\n<!-- end of tables -->\n" + after)
PYTHON
python3 scripts/accuracy_chart.py
