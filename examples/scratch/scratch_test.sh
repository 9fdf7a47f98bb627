#!/usr/bin/env bash
# The program from the outside: cells against what awk makes of the same scan, a job beyond its memory limit,
# and that nothing stays in the temporary folder however it ends.
# Usage: scratch_test.sh PROGRAM
. "$(dirname "$0")/../../console/program_test.sh"
mkdir temporary
export TMPDIR=$work/temporary

leaves_nothing() {
    [ -z "$(ls -A temporary)" ] || fail "left by $1: $(ls -A temporary)"
}

# The same scan, drawn with the minimal standard generator in floating point, its cells sorted as text.
model() {
    awk -v points="$1" '
        function draw(below) { state = state * 16807 % 2147483647; return state % below }
        BEGIN {
            side = int(sqrt(points / 4)); if (side < 1) side = 1
            for (state = 1; points > 0; points--) {
                north = draw(side * 1000); east = draw(side * 1000); growth = draw(2000)
                print int(north / 1000), int(east / 1000), int(north / 50) + growth
            }
        }' | LC_ALL=C sort -n -k1,1 -k2,2 -k3,3 | awk '
        function finish() {
            if (n) printf "%s,%d,%.3f,%.3f,%.3f\n", cell, n, z[1] / 1000, z[int((n + 1) / 2)] / 1000, z[n] / 1000
        }
        BEGIN { print "row,column,points,lowest,median,highest" }
        { key = $1 "," $2; if (key != cell) { finish(); cell = key; n = 0 } z[++n] = $3 }
        END { finish() }'
}

# 65,536 points fill a block: one run, a run and its first point, several.
for points in 1 2 3 65536 65537 200000; do
    succeeds --points $points --cells cells.csv
    leaves_nothing "$points points"
    model $points >expected.csv
    cmp -s cells.csv expected.csv || fail "other cells for $points points: $(diff cells.csv expected.csv | head -3)"
    is "Points" $points
    is "Most points in a cell" "$(awk -F, 'NR > 1 && $3 > most { most = $3 } END { print most }' expected.csv)"
done

# 183 MiB of points where 48 MiB of memory are allowed; then the proof that the limit holds: the cells' text is
# made in memory, of which there is not enough. A program with a sanitizer in it needs more to begin with.
if (ulimit -d 49152 && "$program" --version >/dev/null 2>&1); then
    (
        ulimit -d 49152
        succeeds --points 12000000
        is "Bytes sorted" "183.1 MiB"
        is "Files of runs" "3, 192.0 MiB"
        fails "out of memory" --points 12000000 --cells cells.csv
        exit $failures
    )
    failures=$?
    leaves_nothing "a job under a memory limit"
else
    echo "SKIPPED: a memory limit, under which the program does not even start"
fi

# A full disk, as a limit on the size of files has it, and no folder at all.
(
    no_room="no file of 64 MiB can be made and mapped in the temporary folder"
    TMPDIR=$work/nowhere fails "$no_room" --points 10
    ulimit -f 1024
    fails "$no_room" --points 100000
    exit $failures
)
failures=$?
leaves_nothing "a job without room"

# interrupt SIGNAL DELAY ARGUMENT...: sends it once the job's first file is there
interrupt() {
    # A shell starts what runs behind it deaf to SIGINT.
    env --default-signal=INT "$program" --points 100000000 "${@:3}" >out 2>err &
    local job=$!
    for _ in $(seq 500); do
        [ -n "$(ls -A temporary)" ] && break
        sleep 0.01
    done
    [ -n "$(ls -A temporary)" ] || fail "no file to be seen before SIG$1"
    sleep "$2"
    kill -s "$1" $job
    wait $job
    code=$?
    [ $code -eq $((128 + $(kill -l "$1"))) ] || fail "exit $code after SIG$1"
    leaves_nothing "SIG$1"
}
for delay in 0 0.3; do
    interrupt INT $delay
    [ "$(cat err)" = "scratch: interrupted, nothing is left behind" ] || fail "after SIGINT: $(cat err)"
done
interrupt TERM 0.1

# Cells are opened ahead of the job, and what is there already stays until they are written.
interrupt INT 0.1 --cells new.csv
[ ! -e new.csv ] || fail "an interrupted job left its cells"
cp cells.csv old.csv
interrupt INT 0.1 --cells old.csv
cmp -s cells.csv old.csv || fail "an interrupted job took the cells of another"
TMPDIR=$work/nowhere fails "cannot write to nowhere/cells.csv: No such file or directory" --cells nowhere/cells.csv
TMPDIR=$work/nowhere fails "cannot write to .: Is a directory" --cells .
[ ! -w /dev/full ] || fails "cannot write to /dev/full: No space left on device" --points 10 --cells /dev/full
succeeds --points 1 --cells old.csv # shorter than before
model 1 | cmp -s - old.csv || fail "cells written over others: $(head -n 3 old.csv)"

# What a killed job has left of mapped blocks goes with the next run, and nothing else does.
touch "temporary/~0000123.mem" temporary/other
run --points 10
[ "$(ls -A temporary)" = other ] || fail "after clean-up: $(ls -A temporary)"
rm -f temporary/*

# On a terminal there is a bar, and it is wiped in the end. Not every system can make one.
if script -qec true /dev/null </dev/null &>/dev/null; then
    script -qec "$program --points 12000000 >report" typescript >/dev/null </dev/null
    grep -q '\[#*\.*\] [0-9]* %' typescript || fail "no progress bar on a terminal"
fi

checks_each "$here/scratch.facts"
answers_to_everyone --points 10
leaves_nothing "the last of them"
finish
