#!/usr/bin/env bash
# Installs the library and its tool, moves the installed tree, runs the tool there, and builds and runs outside
# programs against the library: by find_package, by pkg-config (the README's program too), and as a subproject; each
# shared and static.
# Usage: scripts/check_package.sh
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}"
work=$PWD/build/package
rm -rf "$work"
mkdir -p "$work"
awk -f tests/pages/page_block.awk README.md >"$work/readme.cpp"
warnings=(-Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)

build() {  # source folder, build folder, cmake options
    cmake -S "$1" -B "$2" -G Ninja -DCMAKE_BUILD_TYPE=Release "${@:3}"
    cmake --build "$2"
}

# Moves what was installed and builds programs against it.
check() {  # ON or OFF: shared or static; build folder; folder of libraries
    local kind=$1 prefix=$work/moved-$1 source flags
    cmake --install "$2" --prefix "$work/staged-$kind"
    mv "$work/staged-$kind" "$prefix"
    if grep -rIl "$PWD" "$prefix"; then
        echo "the installed files name the folder they were built or installed in"
        return 1
    fi
    build tests/package/find_package "$work/found-$kind" -DCMAKE_CXX_FLAGS="${warnings[*]}" \
        -Dbasalt_DIR="$prefix/$3/cmake/basalt"
    "$work/found-$kind/consumer"
    flags=$(PKG_CONFIG_PATH=$prefix/$3/pkgconfig pkg-config --cflags --libs basalt)
    for source in tests/package/consumer.cpp "$work/readme.cpp"; do
        # shellcheck disable=SC2086  # the flags are words
        g++ -std=c++17 "${warnings[@]}" "$source" -o "$work/bare-$kind" $flags
        LD_LIBRARY_PATH=$prefix/$3 "$work/bare-$kind"
    done
}

build . "$work/library-ON" -DBUILD_SHARED_LIBS=ON -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF \
    -DCMAKE_INSTALL_LIBDIR=lib
check ON "$work/library-ON" lib
# the moved tool finds the moved library, and its pages are there
[ "$("$work/moved-ON/bin/basalt" hex <<<ok)" = 6f6b ]
grep -q '^\.TH basalt' "$work/moved-ON/share/man/man1/basalt.1"
bash -n "$work/moved-ON/share/bash-completion/completions/basalt"

for kind in ON OFF; do  # one folder: the objects are the same, and compiled quickly
    build tests/package/subdirectory "$work/sub" -DBUILD_SHARED_LIBS=$kind -DBASALT_SOURCE_DIR="$PWD" \
        -DBASALT_INSTALL=ON -DCMAKE_INSTALL_LIBDIR=lib/some/where -DCMAKE_CXX_FLAGS_RELEASE=-O1
    "$work/sub/consumer"
done
check OFF "$work/sub" lib/some/where
echo "shared and static: found by CMake and pkg-config, and as a subproject"
