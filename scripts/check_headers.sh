#!/usr/bin/env bash
# Compiles each public header alone, as C++17 and C++20, with GCC and Clang, warnings as errors.
# Usage: scripts/check_headers.sh BUILD_DIRECTORY    (for the generated version.h)
set -euo pipefail
cd "$(dirname "$0")/.."

for header in include/basalt/*.h include/basalt/*/*.h; do
    for standard in c++17 c++20; do
        for compiler in g++ clang++; do
            echo "#include \"${header#include/}\"" |
                $compiler -std=$standard -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror -fsyntax-only \
                    -Iinclude -I"$1/include" -x c++ - || { echo "$header: $compiler $standard"; exit 1; }
        done
    done
done
