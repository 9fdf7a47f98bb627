#!/usr/bin/env bash
# Runs a page's program in an empty folder and compares what it writes with the output that the page shows.
# Usage: page_test.sh PROGRAM PAGE [N]          the page's N-th program (1)
set -euo pipefail

blocks=$(cd "$(dirname "$0")" && pwd)/page_block.awk
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
awk -v output=1 -v program="${3:-1}" -f "$blocks" "$2" >"$scratch/shown"
[ -s "$scratch/shown" ] || { echo "$2 shows no output behind its program"; exit 1; }

mkdir "$scratch/run"
cd "$scratch/run"
"$1" >"$scratch/written" || { echo "$1: exit status $?"; exit 1; }
diff -u --label "$2" --label "what the program writes" "$scratch/shown" "$scratch/written"
