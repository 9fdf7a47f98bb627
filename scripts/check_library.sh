#!/usr/bin/env bash
# Checks a shared library that has been built.
# Usage: scripts/check_library.sh symbols LIBRARY [--update]
#            it exports what tests/exported_symbols.txt lists (--update writes the list), and no symbol pins it
#        scripts/check_library.sh hardening LIBRARY [ANOTHER_BUILD]
#            stacks and calls are guarded, tables read-only, nothing undefined; both builds have the same bytes
#        scripts/check_library.sh abi LIBRARY RELEASED
#            calls, layouts and virtual tables are compatible with a released library or its description; both built
#            with debug information
#        scripts/check_library.sh describe LIBRARY FILE
#            writes that description, to be kept with a release
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"
library=${2:-}
[ -f "$library" ] || { echo "check_library.sh: no such library: $library" >&2; exit 2; }
complain() { echo "$library: $*"; exit 1; }
need_debug_information() { [[ $(readelf -SW "$1") == *.debug_info* ]] || { echo "$1: no debug information" >&2; exit 2; }; }

# Names alone: a symbol's class and a constructor's duplicates depend on the optimisation.
exported() { nm -D --defined-only -C "$library" | cut -d' ' -f3- | LC_ALL=C sort -u; }

check_symbols() {
    ! nm -D "$library" | grep ' u ' || complain "a unique symbol keeps it from being unloaded"
    if [ "${1:-}" = --update ]; then
        exported >tests/exported_symbols.txt
    else
        diff -u tests/exported_symbols.txt <(exported) || complain "other symbols; if meant: $0 symbols $library --update"
    fi
}

check_hardening() {
    local headers imported missing
    headers=$(readelf -lW "$library")
    grep -q 'GNU_STACK.* RW ' <<<"$headers" || complain "executable stack"
    grep -q GNU_RELRO <<<"$headers" || complain "writable tables"
    ! grep -q ' LOAD .* RWE ' <<<"$headers" || complain "pages both writable and executable"
    [[ $(readelf -dW "$library") == *FLAGS*NOW* ]] || complain "lazy binding"
    [[ ! $(readelf -dW "$library") =~ RPATH|RUNPATH|TEXTREL ]] || complain "a run path or text relocations"
    imported=$(nm -D --undefined-only "$library")
    grep -q __stack_chk_fail <<<"$imported" || complain "no stack protector"
    grep -q '__mem[a-z]*_chk\|__[a-z]*printf_chk\|__[a-z]*read_chk' <<<"$imported" || complain "no fortified calls"
    if [ "$(uname -m)" = x86_64 ]; then
        objdump -d --no-show-raw-insn "$library" | awk '/^[0-9a-f]+ <.*>:$/ {start = 1; next}
            start {functions++; if (/endbr64/) marked++; start = 0}
            END {exit marked < functions / 2}' || complain "branch targets are not marked"
    fi
    missing=$(ldd -r "$library" 2>&1 | grep -E 'undefined symbol|not found' || true)
    [ -z "$missing" ] || complain "$missing"
    [ -z "${1:-}" ] || cmp "$library" "$1" || complain "$1 has other bytes"
    echo "$library: guarded, read-only tables, nothing undefined${1:+, the same bytes twice}"
}

case $1 in
    symbols) check_symbols "${3:-}" ;;
    hardening) check_hardening "${3:-}" ;;
    abi)
        need_packages abigail-tools
        need_debug_information "$library"
        abidiff --exported-interfaces-only --no-show-locs "${3:?a released library or description}" "$library" ||
            complain "programs linked with the released library may break"
        echo "the binary interface is that of $3"
        ;;
    describe)
        need_packages abigail-tools
        need_debug_information "$library"
        abidw --exported-interfaces-only --drop-undefined-syms --no-corpus-path --no-comp-dir-path --no-show-locs \
            --no-parameter-names --out-file "${3:?a file}" "$library"
        ;;
    *) echo "check_library.sh: no such check: $1" >&2; exit 2 ;;
esac
