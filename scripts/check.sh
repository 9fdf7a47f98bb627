#!/usr/bin/env bash
# The deeper checks, each a step: format, include directions, Clang, headers, clang-tidy, another time zone and
# locale, a system short of everything, the package, exported symbols, the binary interface, the Python package,
# hardening and the same bytes from another folder, results to the bit, sanitizers, every call that can fail failing,
# many threads at once (STRESS_SECONDS=N each, 5), documentation, the fuzzers, two at a time (FUZZ_SECONDS=N each, 60,
# or FUZZ_UNTIL=T, seconds since 1970: by then, 10 to 60 each).
# Stops at the first step that fails.
# Usage: scripts/check.sh [step ...]             all steps, or only those named:
#        format includes clang headers tidy elsewhere limits package symbols abi python hardening exact asan tsan
#        stress docs fuzz
#        faults (alone; among the tests of clang and asan it runs anyway)
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

step_format() { git ls-files '*.h' '*.cpp' | xargs clang-format --dry-run -Werror; }
step_includes() { python3 scripts/check_includes.py; }
test_with() {  # preset
    cmake --preset "$1"
    cmake --build --preset "$1"
    ctest --preset "$1" -j "$(nproc)"
}
step_clang() { test_with clang; }
step_headers() {
    cmake --preset clang >/dev/null  # makes version.h
    scripts/check_headers.sh build/clang
}
step_tidy() {
    # for the command that compiles each source alone
    cmake --preset asan -B build/tidy -DBASALT_JOIN_SOURCES=OFF -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_FUZZERS=OFF \
        -DBASALT_BUILD_EXAMPLES=OFF -DCMAKE_EXPORT_COMPILE_COMMANDS=ON >/dev/null
    git ls-files 'src/*.cpp' 'tools/*.cpp' 'console/*.cpp' | xargs -P "$(nproc)" -n 2 clang-tidy -p build/tidy --quiet
}
step_elsewhere() {
    # a time zone off the full hour, on both sides of the year's changes; a locale whose decimal sign is a comma
    localedef -i de_DE -f UTF-8 build/de_DE.UTF-8 || [ -d build/de_DE.UTF-8 ]
    cmake --preset dev >/dev/null
    cmake --build --preset dev
    TZ='<+1245>-12:45<+1345>,M9.5.0/2:45,M4.1.0/3:45' LOCPATH=$PWD/build LC_ALL=de_DE.UTF-8 \
        ctest --preset dev -j "$(nproc)" -E '^(faults|stress.*|scratch_command_line)$'
}
step_limits() { scripts/check_limits.sh build/clang; }
step_package() { scripts/check_package.sh; }
installed=build/package/library-ON/src  # what the package step built
step_symbols() {
    [ -d $installed ] || step_package
    scripts/check_symbols.sh $installed/libbasalt.so
}
step_abi() {
    cmake --preset dev >/dev/null
    cmake --build --preset dev --target basalt
    scripts/check_abi.sh build/dev/src/libbasalt.so
}
step_python() {
    local static=$PWD/build/package/library-OFF
    [ -f "$static/src/libbasalt.a" ] || step_package
    BASALT_LIBRARY=$static scripts/python.sh
}
step_hardening() {
    [ -d $installed ] || step_package
    # once more from another folder
    local again=build/again
    rm -rf $again
    mkdir -p $again/basalt
    git ls-files -z | xargs -0 cp --parents -t $again/basalt
    cmake -S $again/basalt -B $again/build -G Ninja -DCMAKE_BUILD_TYPE=Release -DBUILD_SHARED_LIBS=ON \
        -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF -DBASALT_BUILD_TOOLS=OFF
    cmake --build $again/build --target basalt
    scripts/check_hardening.sh $installed/libbasalt.so $again/build/src/libbasalt.so
}
step_exact() {
    # one number folded from thousands of results: whoever compiles it, and as the optimised library gives it
    local test=tests/geo/exact_results_test.cpp program=build/exact_results sources level compiler running compilation
    # time scales hold whole numbers alone, and need the platform's clock
    sources=$(ls src/geo/*.cpp | grep -v time_scales)
    for level in -O0 -O2 -O3; do
        running=()
        for compiler in g++ clang++; do
            # shellcheck disable=SC2086  # the sources are words
            $compiler -std=c++20 $level -ffp-contract=off -I. -Iinclude $sources $test -o $program-$compiler \
                -lgtest -lgtest_main &
            running+=($!)
        done
        # each by its number: a bare wait forgets who failed, and an older program would run
        for compilation in "${running[@]}"; do
            wait "$compilation"
        done
        for compiler in g++ clang++; do
            $program-$compiler --gtest_brief=1
        done
    done
    [ -d $installed ] || step_package
    g++ -std=c++20 -ffp-contract=off -I. -Iinclude $test -o $program -lgtest -lgtest_main -L$installed -lbasalt
    LD_LIBRARY_PATH=$installed $program --gtest_brief=1
}
step_asan() { test_with asan; }
step_tsan() {
    cmake --preset tsan
    cmake --build --preset tsan
    TSAN_OPTIONS=halt_on_error=1 ctest --preset tsan -j "$(nproc)" -E '^(faults|stress.*)$'
}
step_faults() {  # as it is, where other libraries' allocations fail too, and under the sanitizers
    local preset
    for preset in clang asan; do
        cmake --preset $preset >/dev/null
        cmake --build --preset $preset --target faults
        build/$preset/tests/faults
    done
}
step_stress() {
    local try
    cmake --preset tsan >/dev/null
    cmake --build --preset tsan --target stress
    export TSAN_OPTIONS=halt_on_error=1
    for try in $(seq 20); do build/tsan/tests/stress 1 first_use; done | tail -n 1
    build/tsan/tests/stress "${STRESS_SECONDS:-5}"
}
step_docs() { scripts/docs.sh; }
step_fuzz_one() {  # program; begins with the kept inputs, and what is found goes into the first folder
    local name corpus
    name=$(basename "$1")
    corpus=("build/asan/corpus/$name" "fuzz/corpus/${name#fuzz_}")
    mkdir -p "${corpus[0]}"
    [ -d "${corpus[1]}" ] || unset "corpus[1]"
    [ "$name" != fuzz_code_page ] || export LOCPATH=$PWD/build/asan/locales ASAN_OPTIONS=detect_leaks=0
    "$1" "${corpus[@]}" -max_total_time="$FUZZ_SECONDS" -max_len=2000 -len_control=0 -timeout=30 \
        -print_final_stats=1 -artifact_prefix="build/asan/$name-" 2>"$1.log" ||
        { tail -n 40 "$1.log"; return 255; }
    echo "$name: $(grep -c . "$1.log") lines, $(grep executed_units "$1.log")"
}
step_fuzz() {
    local encoding targets left
    cmake --preset asan >/dev/null
    cmake --build --preset asan
    # the encodings that the text fuzzer opens beside the system's own; the C library never frees what it reads
    # of them, which is no leak of this library's
    mkdir -p build/asan/locales
    for encoding in ISO-8859-1 EUC-KR; do
        [ -d "build/asan/locales/$encoding" ] ||
            localedef -c -i POSIX -f $encoding "build/asan/locales/$encoding" || true
    done
    mapfile -t targets < <(find build/asan/fuzz -maxdepth 1 -name 'fuzz_*' -type f -executable | sort)
    if [ -z "${FUZZ_SECONDS:-}" ] && [ -n "${FUZZ_UNTIL:-}" ]; then
        left=$(((FUZZ_UNTIL - $(date +%s)) * 2 / (${#targets[@]} + 1)))  # an odd one runs alone
        FUZZ_SECONDS=$((left < 10 ? 10 : left > 60 ? 60 : left))
    fi
    export FUZZ_SECONDS=${FUZZ_SECONDS:-60}
    # two at a time; 255 ends the others as well
    printf '%s\n' "${targets[@]}" | xargs -P 2 -I {} bash scripts/check.sh --step fuzz_one {}
}

if [ "${1:-}" = --step ]; then  # one step in a shell of its own, where errexit holds
    "step_$2" "${@:3}"
    exit
fi
steps=("$@")
if [ ${#steps[@]} -eq 0 ]; then
    steps=(format includes clang headers tidy elsewhere limits package symbols abi python hardening exact asan tsan stress
        docs fuzz)
fi
need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}" "${CHECK_PACKAGES[@]}"
mkdir -p build
for step in "${steps[@]}"; do
    declare -F "step_$step" >/dev/null || { echo "check.sh: no such step: $step" >&2; exit 2; }
    echo "== $step"
    started=$SECONDS
    failed=
    bash scripts/check.sh --step "$step" >"build/check-$step.log" 2>&1 || failed=yes
    if [ -n "$failed" ]; then
        tail -n 60 "build/check-$step.log"
        grep -nE 'error|FAILED|warning' "build/check-$step.log" | head -n 40 || true
        echo "check.sh: $step failed; its whole output is in build/check-$step.log" >&2
        exit 1
    fi
    tail -n 4 "build/check-$step.log"
    echo "   $((SECONDS - started)) s"
done
echo "All checks passed."
