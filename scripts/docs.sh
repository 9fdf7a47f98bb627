#!/usr/bin/env bash
# Makes the reference from docs/ and the docstrings of the public headers, and prints the path of its first page.
# A warning of Doxygen is an error, and so is a dead link.
# Usage: scripts/docs.sh
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" doxygen python3
make_reference() {
    cmake -S . -B build/docs -G Ninja -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF -DBASALT_BUILD_TOOLS=OFF \
        -DBASALT_BUILD_DOCS=ON &&
        cmake --build build/docs --target docs &&
        python3 scripts/check_links.py build/docs/docs/html
}
make_reference >build/docs.log 2>&1 || { cat build/docs.log; exit 1; }
echo "$PWD/build/docs/docs/html/index.html"
