#!/usr/bin/env bash
# Runs all tests as each compiler builds them at each optimisation, and once under valgrind, which tells what is read
# before it is written and what leaks. Half an hour on two processors; goes on after a failure and counts them.
# Usage: scripts/compilers.sh [build ...]        all, or some of:
#        g++-O0 g++-O2 g++-O3 clang++-O0 clang++-O2 clang++-O3 valgrind
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" "${TEST_PACKAGES[@]}" clang valgrind
builds=("$@")
[ ${#builds[@]} -gt 0 ] || builds=({g++,clang++}-O{0,2,3} valgrind)
work=build/compilers
mkdir -p $work

tests_of() {  # compiler, optimisation
    local folder=$work/$1-$2
    cmake -S . -B "$folder" -G Ninja -DCMAKE_CXX_COMPILER="$1" -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_FLAGS_DEBUG="-$2" &&
        cmake --build "$folder" &&
        ctest --test-dir "$folder" -j "$(nproc)" --output-on-failure
}
# Left out is what valgrind itself changes: it loads without unmapping all, and puts memory elsewhere than at an
# address that is asked for.
not_under_valgrind=ModuleLoad.a_thousand_loads_leave_nothing_behind:VirtualMemory.an_address_of_ones_own
not_under_valgrind+=:SharedMemoryAllocator.a_failing_piece_ends_it_and_is_reported
under_valgrind() {
    local program status=0
    cmake --preset dev && cmake --build --preset dev || return 1
    for program in build/dev/tests/*_tests; do
        # the tests' own operator new stays, which fails where they say
        valgrind -q --error-exitcode=9 --leak-check=full --show-leak-kinds=definite --errors-for-leak-kinds=definite \
            --soname-synonyms=somalloc=nouserintercepts --suppressions=tests/support/valgrind.supp \
            "$program" --gtest_brief=1 --gtest_filter="-$not_under_valgrind" || { echo "$program: exit status $?"; status=1; }
    done
    echo "$(grep -c PASSED $work/valgrind.log) programs of tests passed"
    return $status
}

failed=0
for build in "${builds[@]}"; do
    started=$SECONDS
    outcome=passed
    case $build in
        valgrind) under_valgrind >"$work/$build.log" 2>&1 || outcome=FAILED ;;
        g++-O[0-3] | clang++-O[0-3]) tests_of "${build%-*}" "${build##*-}" >"$work/$build.log" 2>&1 || outcome=FAILED ;;
        *) echo "compilers.sh: no such build: $build" >&2; exit 2 ;;
    esac
    [ $outcome = passed ] || failed=$((failed + 1))
    echo "$build: $outcome, $((SECONDS - started)) s: $(grep -E 'tests (passed|failed)' "$work/$build.log" || tail -n 1 "$work/$build.log")"
done
exit $((failed > 0))
