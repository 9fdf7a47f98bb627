#!/usr/bin/env bash
# Compiles each public header alone, as C++17 and C++20, with GCC and Clang, warnings as errors.
# Usage: scripts/check_headers.sh BUILD_DIRECTORY    (for the generated version.h)
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"
[ -f "${1:-}/include/basalt/version.h" ] || { echo "check_headers.sh: no such build directory: ${1:-}" >&2; exit 2; }

alone() {  # build directory, header
    local standard compiler
    for standard in c++17 c++20; do
        for compiler in g++ clang++; do
            echo "#include \"${2#include/}\"" |
                $compiler -std=$standard -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror -fsyntax-only \
                    -Iinclude -I"$1/include" -x c++ - || { echo "$2: $compiler $standard"; return 255; }
        done
    done
}
export -f alone
printf '%s\n' include/basalt/*.h include/basalt/*/*.h | xargs -P "$(nproc)" -I {} bash -c 'alone "$@"' alone "$1" {}
