#!/usr/bin/env bash
# The deeper checks: format, include directions, headers, symbols, Clang, clang-tidy, sanitizers, another time
# zone and locale, documentation, the package, and a minute of each fuzzer. Stops at the first that fails.
# Usage: scripts/check.sh [step ...]             all steps, or only those named
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

step_format() { git ls-files '*.h' '*.cpp' | xargs clang-format --dry-run -Werror; }
step_includes() { python3 scripts/check_includes.py; }
step_clang() {
    cmake --preset clang >/dev/null
    cmake --build --preset clang
    ctest --preset clang -j "$(nproc)" | tail -n 4
}
step_headers() { scripts/check_headers.sh build/clang; }
step_tidy() {
    git ls-files 'src/*.cpp' | xargs -P "$(nproc)" -n 2 clang-tidy -p build/clang --quiet 2>/dev/null
}
step_asan() {
    cmake --preset asan >/dev/null
    cmake --build --preset asan
    ctest --preset asan -j "$(nproc)" | tail -n 4
}
step_tsan() {
    cmake --preset tsan >/dev/null
    cmake --build --preset tsan
    TSAN_OPTIONS=halt_on_error=1 ctest --preset tsan -j "$(nproc)" | tail -n 4
}
step_elsewhere() {
    # a time zone with half hours, and a locale whose decimal sign is a comma
    mkdir -p build/locale
    localedef -i de_DE -f UTF-8 build/locale/de_DE.UTF-8 2>/dev/null || true
    TZ=Asia/Kathmandu LOCPATH=$PWD/build/locale LC_ALL=de_DE.UTF-8 ctest --preset clang -j "$(nproc)" | tail -n 4
}
step_package() { scripts/check_package.sh; }
step_symbols() { scripts/check_symbols.sh build/package/library-ON/src/libbasalt.so; }
step_docs() {
    cmake -S . -B build/docs -G Ninja -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF -DBASALT_BUILD_DOCS=ON >/dev/null
    cmake --build build/docs --target docs
}
step_fuzz() {
    [ -f fuzz/CMakeLists.txt ] || { echo "no fuzzer yet"; return; }
    cmake --preset fuzz >/dev/null
    cmake --build --preset fuzz
    for program in build/fuzz/fuzz/fuzz_*; do
        [ -x "$program" ] || continue
        "$program" -max_total_time="${FUZZ_SECONDS:-60}" -timeout=10 -print_final_stats=1 2>"$program.log" ||
            { tail -n 40 "$program.log"; return 1; }
        echo "$(basename "$program"): $(grep -c . "$program.log") lines, $(grep executed_units "$program.log")"
    done
}

if [ "${1:-}" = --step ]; then  # one step in a shell of its own, where errexit holds
    "step_$2"
    exit
fi
steps=("$@")
if [ ${#steps[@]} -eq 0 ]; then
    steps=(format includes clang headers elsewhere package symbols asan tsan docs fuzz)
fi
need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}" "${CHECK_PACKAGES[@]}" git
mkdir -p build
for step in "${steps[@]}"; do
    declare -F "step_$step" >/dev/null || { echo "check.sh: no such step: $step" >&2; exit 2; }
    echo "== $step"
    started=$SECONDS
    failed=
    bash scripts/check.sh --step "$step" >"build/check-$step.log" 2>&1 || failed=yes
    tail -n 12 "build/check-$step.log"
    if [ -n "$failed" ]; then
        grep -nE 'error|FAILED|warning' "build/check-$step.log" | head -n 40 || true
        echo "check.sh: $step failed; its whole output is in build/check-$step.log" >&2
        exit 1
    fi
    echo "   $((SECONDS - started)) s"
done
echo "All checks passed."
