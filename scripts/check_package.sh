#!/usr/bin/env bash
# Installs the library and builds an outside program against it: find_package, a bare compiler line with
# pkg-config, and as a subproject; each shared and static.
# Usage: scripts/check_package.sh
set -euo pipefail
cd "$(dirname "$0")/.."

work=build/package
rm -rf "$work"
mkdir -p "$work"
for shared in ON OFF; do
    prefix=$PWD/$work/root-$shared
    {
        cmake -S . -B "$work/library-$shared" -G Ninja -DCMAKE_BUILD_TYPE=Release -DBUILD_SHARED_LIBS=$shared \
            -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF -DCMAKE_INSTALL_PREFIX="$prefix"
        cmake --build "$work/library-$shared" --target install

        cmake -S tests/package/find_package -B "$work/found-$shared" -G Ninja -DCMAKE_PREFIX_PATH="$prefix"
        cmake --build "$work/found-$shared"

        cmake -S tests/package/subdirectory -B "$work/sub-$shared" -G Ninja -DBUILD_SHARED_LIBS=$shared \
            -DBASALT_SOURCE_DIR="$PWD"
        cmake --build "$work/sub-$shared"

        pc=$(find "$prefix" -name pkgconfig)
        # shellcheck disable=SC2046
        PKG_CONFIG_PATH=$pc g++ -std=c++17 tests/package/consumer.cpp -o "$work/bare-$shared" \
            $(PKG_CONFIG_PATH=$pc pkg-config --cflags --libs basalt)
    } >"$work/log-$shared" 2>&1 || { cat "$work/log-$shared"; exit 1; }
    "$work/found-$shared/consumer"
    "$work/sub-$shared/consumer"
    LD_LIBRARY_PATH=$(dirname "$pc") "$work/bare-$shared"
done
