#!/usr/bin/env bash
# Counts the lines of code that git tracks, without blank and comment lines, and fails when the tests are more than
# 40 % of the product. Product: the library and the programs. Tests: tests/, fuzz/ and what is named *test* elsewhere.
# Usage: scripts/weigh.sh [PERCENT]              another limit
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

git ls-files -- '*.h' '*.hpp' '*.cpp' '*.cc' '*.c' '*.inc' '*.py' '*.pyi' '*.sh' '*.cmake' '*.in' '*CMakeLists.txt' ':!docs' |
    while IFS= read -r file; do [ ! -f "$file" ] || printf '%s\n' "$file"; done |
    xargs -d '\n' awk -v limit="${1:-40}" '
FNR == 1 {
    room = FILENAME
    sub("/.*", "", room)
    if (FILENAME ~ "(^|/)(tests?|fuzz)/" || FILENAME ~ "test[^/]*[.](h|cpp|py|sh|cmake)$") kind = "tests"
    else kind = room ~ /^(include|src|tools|console|examples|bindings)$/ ? "product" : "other"
}
!/^[[:space:]]*(\/\/.*|\*.*|\/\*.*|#([^a-z].*)?)?$/ { lines[kind]++; count[sprintf("%-8s %s", kind, room)]++ }
END {
    for (name in count) printf "%8d  %s\n", count[name], name | "sort -k 2"
    close("sort -k 2")
    printf "product %d, tests %d: tests are %d %% of the product, at most %d %% are allowed\n", lines["product"],
        lines["tests"], int(100 * lines["tests"] / lines["product"]), limit
    exit 100 * lines["tests"] > limit * lines["product"]
}'
