# Sourced by check.sh: the steps that need a build of their own or many minutes.

# Each public header compiles alone, as C++17 and C++20, under GCC and Clang, without a warning.
header_alone() {  # header
    local standard compiler
    for standard in c++17 c++20; do
        for compiler in g++ clang++; do
            $compiler -std=$standard -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror -fsyntax-only \
                -Iinclude -Ibuild/dev/include -x c++ - <<<"#include \"${1#include/}\"" ||
                { echo "$1: $compiler $standard"; return 255; }
        done
    done
}
export -f header_alone
step_headers() {
    need_packages clang
    cmake --preset dev >/dev/null  # generates version.h
    printf '%s\n' include/basalt/*.h include/basalt/*/*.h | xargs -P "$(nproc)" -I {} bash -c 'header_alone {}'
}

step_tidy() {
    need_packages clang clang-tidy
    cmake --preset asan -B build/tidy -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_FUZZERS=OFF -DBASALT_BUILD_TOOLS=ON \
        -DCMAKE_EXPORT_COMPILE_COMMANDS=ON >/dev/null
    git ls-files 'src/*.cpp' 'tools/*.cpp' 'console/*.cpp' | xargs -P "$(nproc)" -n 2 clang-tidy -p build/tidy --quiet
}

# The programs' tests under the address sanitizer.
step_programs() {
    need_packages clang libclang-rt-14-dev llvm "${EXAMPLE_PACKAGES[@]}"
    cmake --preset asan -B build/asan-programs -DBASALT_BUILD_TESTS=ON -DBASALT_BUILD_FUZZERS=OFF \
        -DBASALT_BUILD_EXAMPLES=ON -DBASALT_BUILD_TOOLS=ON
    for folder in examples tools; do cmake --build build/asan-programs --target $folder/all; done
    ctest --test-dir build/asan-programs --output-on-failure -R command_line
}

# A time zone off the full hour, on both sides of its changes, and a locale with a decimal comma. Without the test of
# loading and unloading: glibc keeps a copy of LOCPATH for each newlocale(), which that test would count as ours.
step_elsewhere() {
    localedef -i de_DE -f UTF-8 build/de_DE.UTF-8 || [ -d build/de_DE.UTF-8 ]
    build_preset dev
    TZ='<+1245>-12:45<+1345>,M9.5.0/2:45,M4.1.0/3:45' LOCPATH=$PWD/build LC_ALL=de_DE.UTF-8 \
        ctest --preset dev -j "$(nproc)" -E '^(faults|stress.*|fuzz_.*|scratch_command_line|ModuleLoad\..*)$'
}

# The memory family with little file size, address space, descriptors or disk: no signal, nothing left behind.
step_limits() {
    local folder own_mounts=(unshare --mount) probe=$PWD/build/dev/tests/limits_probe shortage
    build_preset dev --target limits_probe
    folder=$(mktemp -d)
    [ "$(id -u)" = 0 ] || own_mounts=(unshare --map-root-user --mount)
    "${own_mounts[@]}" true || own_mounts=()  # then full_disk is left out
    for shortage in 'file_size ulimit -f 1024' 'address_space ulimit -v 300000' 'no_descriptors ulimit -n 40' \
        'few_descriptors ulimit -n 40' ${own_mounts[0]:+"full_disk mount -t tmpfs -o size=8m tmpfs $folder"}; do
        TMPDIR=$folder "${own_mounts[@]}" bash -c \
            "${shortage#* } && '$probe' ${shortage%% *} && [ -z \"\$(ls -A '$folder')\" ]" ||
            { echo "$shortage: failed, or left files behind"; return 1; }
        echo "${shortage%% *}: passed"
    done
    rmdir "$folder"
}

# Guarded, and the same bytes when built in another folder.
step_hardening() {
    local again=build/again
    [ -d $installed ] || step_package
    rm -rf $again
    mkdir -p $again/basalt
    git ls-files -z | xargs -0 cp --parents -t $again/basalt
    cmake -S $again/basalt -B $again/build -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF \
        -DBASALT_BUILD_EXAMPLES=OFF -DBASALT_BUILD_TOOLS=OFF
    cmake --build $again/build --target basalt
    scripts/check_library.sh hardening $installed/libbasalt.so $again/build/src/libbasalt.so
}

# Results to the bit, and the elementary functions in one lane, two and four: both compilers at three levels, with the C
# library's FMA and AVX2 forms masked, then the installed library. Time scales need the platform's calendar.
exact_test=tests/geo/exact_results_test.cpp
exact_sources() {
    find src/geo -name '*.cpp'
    echo src/platform/{clock/calendar,errors/last_error,system/output,text/utf8}.cpp
}
exact_options=(-std=c++20 -ffp-contract=off -I. -Iinclude "-DBASALT_TEST_DATA=\"$PWD/tests/data\"")
step_exact() {
    local program=build/exact_results
    for level in -O0 -O2 -O3; do
        for compiler in g++ clang++; do
            # shellcheck disable=SC2046  # one file a word
            $compiler "${exact_options[@]}" $level $(exact_sources) $exact_test tests/geo/elementary_test.cpp -o $program \
                -lgtest -lgtest_main
            $program --gtest_brief=1
            GLIBC_TUNABLES=glibc.cpu.hwcaps=-FMA,-AVX2,-FMA4 $program --gtest_brief=1
        done
    done
    [ -d $installed ] || step_package
    g++ "${exact_options[@]}" $exact_test -o $program-installed -lgtest -lgtest_main -L$installed -lbasalt
    LD_LIBRARY_PATH=$installed $program-installed --gtest_brief=1
}
# The same on aarch64, and on an x86-64 processor without AVX and FMA.
step_aarch64() {
    need_packages g++-aarch64-linux-gnu qemu-user googletest
    local compiler program=build/exact_results
    for compiler in aarch64-linux-gnu-g++ g++; do
        # shellcheck disable=SC2046
        $compiler "${exact_options[@]}" -O2 -static -I/usr/src/googletest/googletest $(exact_sources) $exact_test \
            tests/geo/elementary_test.cpp /usr/src/googletest/googletest/src/gtest{-all,_main}.cc -o $program-$compiler
    done
    qemu-aarch64 $program-aarch64-linux-gnu-g++ --gtest_brief=1
    qemu-x86_64 -cpu Westmere $program-g++ --gtest_brief=1
}

# The binary interface is that of the last release: RELEASED names its library or description, else its tag is built.
step_abi() {
    local released=${RELEASED:-} tag
    build_preset dev --target basalt
    if [ -z "$released" ]; then
        tag=$(git describe --tags --abbrev=0 --match 'v*' 2>/dev/null) || { echo "no release to compare with"; return; }
        rm -rf build/released
        mkdir build/released
        git archive "$tag" | tar -x -C build/released
        (cd build/released && build_preset dev --target basalt)
        released=build/released/build/dev/src/libbasalt.so
    fi
    scripts/check_library.sh abi build/dev/src/libbasalt.so "$released"
}

step_compilers() {
    need_packages clang
    for compiler in g++ clang++; do
        for level in -O0 -O2 -O3; do
            folder=build/compilers/$compiler$level
            cmake -S . -B "$folder" -G Ninja -DCMAKE_CXX_COMPILER=$compiler -DCMAKE_BUILD_TYPE=Debug \
                -DCMAKE_CXX_FLAGS_DEBUG=$level -DBASALT_BUILD_EXAMPLES=OFF -DBASALT_BUILD_TOOLS=OFF
            cmake --build "$folder"
            ctest --test-dir "$folder" -j "$(nproc)" --output-on-failure
        done
    done
}

# Reads of uninitialised memory, and leaks. Without the tests of loading, as valgrind does not unmap all; those that
# measure errors in long double, which valgrind rounds to double; and one in whose children a thread's texts are lost.
step_valgrind() {
    need_packages valgrind
    build_preset dev
    for program in build/dev/tests/*_tests; do
        valgrind -q --error-exitcode=9 --leak-check=full --show-leak-kinds=definite --errors-for-leak-kinds=definite \
            --soname-synonyms=somalloc=nouserintercepts --suppressions=tests/support/valgrind.supp \
            "$program" --gtest_brief=1 --gtest_filter='-ModuleLoad.*:Elementary.*:FileLog.children_forked*'
    done
}

step_coverage() { scripts/coverage.sh; }

# Hours of use in minutes: memory and descriptors stay flat. SOAK_SECONDS for each subject (300).
step_soak() {
    build_preset dev --target stress
    build/dev/tests/stress "${SOAK_SECONDS:-300}"
}

step_debian() { scripts/check_debian.sh; }
