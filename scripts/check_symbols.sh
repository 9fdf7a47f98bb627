#!/usr/bin/env bash
# Compares the symbols the shared library exports with the list in tests/, and sees that none pins the library.
# Usage: scripts/check_symbols.sh LIBRARY [--update]
set -euo pipefail
cd "$(dirname "$0")/.."

# nothing of the standard library's own templates and inlines, which every C++ library shares by weak symbols
exported() { nm -D --defined-only -C "$1" | sed -E 's/^[0-9a-f]+ //' | grep -vE '^[WVw] +std::|^[WVw] +__gnu_cxx::' | sort; }

if nm -D "$1" | grep ' u '; then
    echo "a unique symbol keeps the library from being unloaded"
    exit 1
fi
if [ "${2:-}" = --update ]; then
    exported "$1" >tests/exported_symbols.txt
else
    diff -u tests/exported_symbols.txt <(exported "$1")
fi
