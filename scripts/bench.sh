#!/usr/bin/env bash
# Measures the library beside its peers in one run and prints a table of medians and ratios (peer / ours).
# Usage: scripts/bench.sh [subject ...]          subjects are the files of bench/: plane rtree sparse memory ...
# REPETITIONS (5) and MIN_TIME (0.1 seconds a repetition) may be set; a longer run is a quieter one.
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${PEER_PACKAGES[@]}" python3
cmake --preset bench >/dev/null
subjects=("$@")
if [ ${#subjects[@]} -eq 0 ]; then
    for file in bench/*.cpp; do subjects+=("$(basename "$file" .cpp)"); done
fi
for subject in "${subjects[@]}"; do
    [ -f "bench/$subject.cpp" ] || { echo "bench.sh: no such subject: $subject" >&2; exit 2; }
    cmake --build --preset bench --target "bench_$subject" >build/bench/build.log || { cat build/bench/build.log; exit 1; }
    "build/bench/bench/bench_$subject" --benchmark_repetitions="${REPETITIONS:-5}" \
        --benchmark_min_time="${MIN_TIME:-0.1}" --benchmark_enable_random_interleaving=true --benchmark_report_aggregates_only=true \
        --benchmark_out="build/bench/$subject.json" --benchmark_out_format=json >build/bench/run.log
    python3 scripts/bench_table.py "build/bench/$subject.json"
done
