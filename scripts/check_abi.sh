#!/usr/bin/env bash
# Compares the binary interface of a shared library, built with debug information, with the description of the release
# that tests/libbasalt.abi is: calls, layouts of records and classes, virtual tables. Prints what a change breaks.
# Usage: scripts/check_abi.sh LIBRARY [--update]
# A release with a new number writes the description anew; before that, a program linked with the last one must run.
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"
need_packages abigail-tools
[ -f "${1:-}" ] || { echo "check_abi.sh: no such library: ${1:-}" >&2; exit 2; }
[[ $(readelf -SW "$1") == *.debug_info* ]] || { echo "$1: has no debug information" >&2; exit 2; }

kept=tests/libbasalt.abi
if [ "${2:-}" = --update ]; then
    abidw --exported-interfaces-only --drop-undefined-syms --no-corpus-path --no-comp-dir-path --no-show-locs \
        --no-parameter-names --out-file $kept "$1"
    exit
fi
status=0
abidiff --exported-interfaces-only --no-show-locs $kept "$1" || status=$?
if [ $status -eq 0 ]; then
    echo "the binary interface is that of the release"
else
    echo "the binary interface differs; what takes away, moves or resizes breaks programs that are linked already"
    echo "if meant: $0 $1 --update"
fi
exit $status
