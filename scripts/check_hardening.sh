#!/usr/bin/env bash
# Sees that the shared library is built to be hard to attack, asks for nothing it does not name, and comes out the
# same, byte for byte, from another folder.
# Usage: scripts/check_hardening.sh LIBRARY [ANOTHER_BUILD_OF_IT]
set -euo pipefail
cd "$(dirname "$0")/.."
[ -f "${1:-}" ] || { sed -n 's/^# //p' "$0"; exit 2; }

library=$1
complain() { echo "$library: $*"; exit 1; }

headers=$(readelf -lW "$library")
grep -q 'GNU_STACK.* RW ' <<<"$headers" || complain "its stack is executable"
grep -q GNU_RELRO <<<"$headers" || complain "its tables stay writable"
! grep -q ' LOAD .* RWE ' <<<"$headers" || complain "pages are writable and executable at once"
[[ $(readelf -dW "$library") == *FLAGS*NOW* ]] || complain "functions are bound late, through writable tables"
[[ ! $(readelf -dW "$library") =~ RPATH|RUNPATH|TEXTREL ]] || complain "it searches folders of its own, or patches its code"
imported=$(nm -D --undefined-only "$library")
grep -q __stack_chk_fail <<<"$imported" || complain "stacks are not guarded"
grep -q '__mem[a-z]*_chk\|__[a-z]*printf_chk\|__[a-z]*read_chk' <<<"$imported" || complain "calls are not fortified"
if [ "$(uname -m)" = x86_64 ]; then
    objdump -d --no-show-raw-insn "$library" | awk '/^[0-9a-f]+ <.*>:$/ {start = 1; next}
        start {functions++; if (/endbr64/) marked++; start = 0}
        END {exit marked < functions / 2}' || complain "branch targets are not marked"
fi
missing=$(ldd -r "$library" 2>&1 | grep -E 'undefined symbol|not found' || true)
[ -z "$missing" ] || complain "$missing"
if [ -n "${2:-}" ]; then
    cmp "$library" "$2" || complain "$2 has other bytes"
fi
echo "$library: guarded, read-only tables, nothing undefined${2:+, the same bytes twice}"
