#!/usr/bin/env bash
# The checks beyond the tests, each a step. Stops at the first that fails; its output is in build/check-STEP.log.
# Usage: scripts/check.sh                        the quick steps, in about six minutes on two cores
#        scripts/check.sh --full                 those and the long steps, before a release: some hours
#        scripts/check.sh STEP ...               these steps alone
# Quick:  format     the layout is clang-format's
#         includes   folders include only what they may; sources are ASCII
#         weight     tests are at most 40 % of the product
#         asan       the tests under Clang with the address, leak and undefined-behaviour sanitizers
#         fuzz       each fuzzer for FUZZ_SECONDS (10; 600 in --full), two at a time
#         tsan       many threads at once under the thread sanitizer, each subject for STRESS_SECONDS (2; 60 in --full)
#         package    outside programs build against the installed library and run
#         symbols    the exported symbols are those of tests/exported_symbols.txt
#         python     the Python package and its tests
#         docs       the reference builds without a warning, and no link is dead
# Long:   headers tidy programs elsewhere limits hardening exact aarch64 abi compilers valgrind coverage soak debian;
#         scripts/check_full.sh describes them.
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"
. scripts/check_full.sh

QUICK=(format includes weight asan fuzz tsan package symbols python docs)
LONG=(headers tidy programs elsewhere limits hardening exact aarch64 abi compilers valgrind coverage soak debian)

build_preset() {  # preset, further arguments of cmake --build
    cmake --preset "$1" && cmake --build --preset "$@"
}

step_format() {
    need_packages clang-format
    git ls-files '*.h' '*.cpp' | xargs clang-format --dry-run -Werror
}
step_includes() { python3 scripts/check_includes.py; }
step_weight() { scripts/weigh.sh | tail -n 1; }

step_asan() {
    need_packages clang libclang-rt-14-dev llvm
    build_preset asan
    ctest --preset asan -j "$(nproc)"
}
fuzz_one() {  # program; starts from the kept inputs
    local name corpus
    name=$(basename "$1")
    corpus=("build/asan/corpus/$name" "fuzz/corpus/${name#fuzz_}")
    mkdir -p "${corpus[0]}"
    [ -d "${corpus[1]}" ] || unset "corpus[1]"
    # glibc never frees the locales that this target loads
    [ "$name" != fuzz_code_page ] || export LOCPATH=$PWD/build/asan/locales ASAN_OPTIONS=detect_leaks=0
    "$1" "${corpus[@]}" -max_total_time="$FUZZ_SECONDS" -max_len=2000 -len_control=0 -timeout=30 \
        -print_final_stats=1 -artifact_prefix="build/asan/$name-" 2>"$1.log" ||
        { tail -n 40 "$1.log"; return 255; }
    echo "$name: $(grep executed_units "$1.log")"
}
export -f fuzz_one
step_fuzz() {
    need_packages clang libclang-rt-14-dev llvm
    build_preset asan
    mkdir -p build/asan/locales
    for encoding in ISO-8859-1 EUC-KR; do
        [ -d "build/asan/locales/$encoding" ] ||
            localedef -c -i POSIX -f $encoding "build/asan/locales/$encoding" || true
    done
    export FUZZ_SECONDS=${FUZZ_SECONDS:-10}
    find build/asan/fuzz -maxdepth 1 -name 'fuzz_*' -type f -executable | sort |
        xargs -P 2 -I {} bash -c 'set -euo pipefail; fuzz_one {}'  # 255 ends the others too
}
step_tsan() {
    build_preset tsan --target stress
    export TSAN_OPTIONS=halt_on_error=1
    for _ in $(seq 5); do build/tsan/tests/stress 1 first_use; done | tail -n 1
    build/tsan/tests/stress "${STRESS_SECONDS:-2}"
}

step_package() { scripts/check_package.sh; }
installed=build/package/library-ON/src  # made by the package step
step_symbols() {
    [ -d $installed ] || step_package
    scripts/check_library.sh symbols $installed/libbasalt.so
}
step_python() {
    local static=$PWD/build/package/sub/basalt
    [ -f "$static/src/libbasalt.a" ] || step_package
    BASALT_LIBRARY=$static scripts/python.sh
}
step_docs() { scripts/docs.sh; }

if [ "${1:-}" = --step ]; then  # in a shell of its own, where errexit holds
    "step_$2"
    exit
fi
steps=("$@")
[ $# -gt 0 ] || steps=("${QUICK[@]}")
if [ "${1:-}" = --full ]; then
    steps=("${QUICK[@]}" "${LONG[@]}")
    export FUZZ_SECONDS=${FUZZ_SECONDS:-600} STRESS_SECONDS=${STRESS_SECONDS:-60}
fi
need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}" git python3
for step in "${steps[@]}"; do
    declare -F "step_$step" >/dev/null || { echo "check.sh: no such step: $step" >&2; exit 2; }
    echo "== $step"
    started=$SECONDS
    bash scripts/check.sh --step "$step" >"build/check-$step.log" 2>&1 || {
        tail -n 60 "build/check-$step.log"
        grep -nE '(error|warning): |FAILED' "build/check-$step.log" | head -n 40 || true
        echo "check.sh: $step failed; its whole output is in build/check-$step.log" >&2
        exit 1
    }
    tail -n 3 "build/check-$step.log"
    echo "   $((SECONDS - started)) s"
done
echo "All checks passed."
