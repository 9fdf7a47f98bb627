#!/usr/bin/env bash
# Measures the library beside other libraries and prints tables of medians and ratios (peer / ours).
# Usage: scripts/bench.sh [SUBJECT ...]          subjects are the files of bench/: plane rtree sparse memory ...
# Without a subject: all, and the tables and the chart of docs/performance.md are rewritten.
# ROUNDS (7) and MIN_TIME (0.05 seconds a measurement in a round) may be set; longer runs are steadier.
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${PEER_PACKAGES[@]}" python3
cmake --preset bench >/dev/null
subjects=("$@")
page=()
if [ ${#subjects[@]} -eq 0 ]; then
    page=(--page docs/performance.md)
    for file in bench/*.cpp; do subjects+=("$(basename "$file" .cpp)"); done
fi
for subject in "${subjects[@]}"; do
    [ -f "bench/$subject.cpp" ] || { echo "bench.sh: no such subject: $subject" >&2; exit 2; }
    cmake --build --preset bench --target "bench_$subject" >build/bench/build.log || { cat build/bench/build.log; exit 1; }
done

machine() {
    local level2
    level2=$(LC_ALL=C lscpu | sed -n 's/^L2 cache: *\([^ ].*\)/ \1 L2,/p')  # not known on every virtual machine
    echo "$(LC_ALL=C lscpu | sed -n 's/^Model name: *//p'), $(nproc) processors,$level2" \
        "GCC $(g++ -dumpfullversion) at -O3, $(date -u +%F)," \
        "\`ROUNDS=${ROUNDS:-7} MIN_TIME=${MIN_TIME:-0.05} scripts/bench.sh\`"
}

[ ${#page[@]} -eq 0 ] || python3 scripts/bench_table.py "${page[@]}" machine --text "$(machine)"
for subject in "${subjects[@]}"; do
    rounds=${ROUNDS:-7}
    [ "$subject" != scale ] || rounds=1  # takes minutes and has no peer
    rm -f "build/bench/$subject".*.json
    for round in $(seq "$rounds"); do
        "build/bench/bench/bench_$subject" --benchmark_min_time="${MIN_TIME:-0.05}" \
            --benchmark_enable_random_interleaving=true --benchmark_out="build/bench/$subject.$round.json" \
            --benchmark_out_format=json >build/bench/run.log 2>&1 || { cat build/bench/run.log; exit 1; }
    done
    printf '\n### %s\n\n' "$subject"
    python3 scripts/bench_table.py "build/bench/$subject".*.json
    [ ${#page[@]} -eq 0 ] || python3 scripts/bench_table.py "${page[@]}" "$subject" "build/bench/$subject".*.json
done
if [ ${#page[@]} -gt 0 ]; then
    scripts/sizes.sh "${page[@]}"
    python3 scripts/bench_chart.py
fi
