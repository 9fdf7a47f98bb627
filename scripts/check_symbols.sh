#!/usr/bin/env bash
# Compares the symbols the shared library exports with the list in tests/, and sees that none pins the library.
# Usage: scripts/check_symbols.sh LIBRARY [--update]
set -euo pipefail
cd "$(dirname "$0")/.."
[ -f "${1:-}" ] || { sed -n 's/^# //p' "$0"; exit 2; }

# Names alone: a symbol's class and its duplicates (of constructors) depend on the optimisation.
exported() { nm -D --defined-only -C "$1" | cut -d' ' -f3- | LC_ALL=C sort -u; }

if nm -D "$1" | grep ' u '; then
    echo "a unique symbol keeps the library from being unloaded"
    exit 1
fi
if [ "${2:-}" = --update ]; then
    exported "$1" >tests/exported_symbols.txt
else
    diff -u tests/exported_symbols.txt <(exported "$1") ||
        { echo "if meant: $0 $1 --update"; exit 1; }
fi
