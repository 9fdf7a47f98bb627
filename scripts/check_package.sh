#!/usr/bin/env bash
# Installs the library and its tool, moves the installed tree, runs the tool there, and builds outside programs
# against the library: by find_package, by a bare compiler line with pkg-config (the README's program too), and as a
# subproject; each shared and static.
# Usage: scripts/check_package.sh
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

work=$PWD/build/package
rm -rf "$work"
mkdir -p "$work"
awk '/^```cpp/ {inside = 1; next} /^```/ {inside = 0} inside' README.md >"$work/readme.cpp"
[ -s "$work/readme.cpp" ] || { echo "README.md shows no program"; exit 1; }
warnings=(-Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)

build() {  # source directory, build directory, cmake options
    cmake -S "$1" -B "$2" -G Ninja -DCMAKE_BUILD_TYPE=Release "${@:3}"
    cmake --build "$2"
}

check() {  # ON or OFF: shared or static
    local kind=$1 staged=$work/staged-$1 prefix=$work/moved-$1 libdir=lib
    [ "$kind" = ON ] || libdir=lib/some/where
    build . "$work/library-$kind" -DBUILD_SHARED_LIBS="$kind" -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF \
        -DBASALT_BUILD_TOOLS="$kind" -DCMAKE_INSTALL_PREFIX="$staged" -DCMAKE_INSTALL_LIBDIR="$libdir"
    cmake --install "$work/library-$kind"
    mv "$staged" "$prefix"
    if grep -rIl "$PWD" "$prefix"; then
        echo "the installed files name the place they were built or installed in"
        return 1
    fi

    if [ "$kind" = ON ]; then
        # the moved tool finds the moved library, and its pages came along
        [ "$("$prefix/bin/basalt" hex <<<ok)" = 6f6b ]
        grep -q '^\.TH basalt' "$prefix/share/man/man1/basalt.1"
        bash -n "$prefix/share/bash-completion/completions/basalt"
    fi

    build tests/package/find_package "$work/found-$kind" -DCMAKE_PREFIX_PATH="$prefix" \
        -DCMAKE_CXX_FLAGS="${warnings[*]}" -Dbasalt_DIR="$prefix/$libdir/cmake/basalt"
    # one folder for both kinds: the objects are the same
    build tests/package/subdirectory "$work/sub" -DBUILD_SHARED_LIBS="$kind" -DBASALT_SOURCE_DIR="$PWD" \
        -DCMAKE_BUILD_TYPE=None -DBASALT_JOIN_SOURCES=ON
    "$work/sub/consumer"

    local flags
    flags=$(PKG_CONFIG_PATH=$prefix/$libdir/pkgconfig pkg-config --cflags --libs basalt)
    for source in tests/package/consumer.cpp "$work/readme.cpp"; do
        # shellcheck disable=SC2086  # the flags are words
        g++ -std=c++17 "${warnings[@]}" "$source" -o "$work/bare-$kind-$(basename "$source" .cpp)" $flags
    done
}

for kind in ON OFF; do
    # in a shell of its own and outside any condition, where errexit holds
    set +e
    (set -e; check "$kind") >"$work/log-$kind" 2>&1
    failed=$?
    set -e
    [ $failed -eq 0 ] || { cat "$work/log-$kind"; exit 1; }
    "$work/found-$kind/consumer"
    for program in consumer readme; do
        LD_LIBRARY_PATH=$work/moved-$kind/lib "$work/bare-$kind-$program"
    done
done
