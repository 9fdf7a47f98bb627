#!/usr/bin/env bash
# The program from the outside: known errors found again, points against what awk makes of them, every refusal.
# Usage: fieldbook_test.sh PROGRAM DATA_DIRECTORY
. "$(dirname "$0")/../../console/program_test.sh"
cp "$data"/fieldbook.csv book.csv
cp "$data"/axis.csv axis.csv

# The errors that were put into the sample.
succeeds book.csv --alignment axis.csv --wgs84 K1,47.5,8.5,450 --csv points.csv
close_to "bearing of the axis' end" "$(awk '/End misclosure/ { print $(NF - 1) }' out)" 0 0.05
close_to "axis misclosure north" "$(awk '/End misclosure/ { print $6 + 0 }' out)" 0.009 0.0001001
close_to "axis misclosure east" "$(awk '/End misclosure/ { print $8 + 0 }' out)" 0.012 0.0001001

# Every station is off its true place by the errors before it, less its share of the misclosure; a side sight also
# by the turn of its back sight.
awk -F, 'function off(a, b) { return a > b ? a - b : b - a }
    FNR == 1 { next }
    NR == FNR { n[$1] = $2; e[$1] = $3; h[$1] = $4; next }
    $1 == "axis" { next }
    {
        k = split("K1 T1 T2 T3 K3", route, " "); split("0 0 1 1 1", distance, " "); split("0 0 0 1 1", rise, " ")
        sum = 0; for (i = 2; i <= k; i++)
            reached[route[i]] = sum += sqrt((n[route[i]] - n[route[i-1]])^2 + (e[route[i]] - e[route[i-1]])^2)
        for (i = 1; i <= k; i++) if (route[i] == $2) {
            part = reached[$2] / sum; found++
            if (off($3 - n[$2], .018 * (distance[i] - part)) > .0003 || off($4 - e[$2], .024 * (distance[i] - part)) > .0003 ||
                off($5 - h[$2], .006 * (rise[i] - part)) > .0003) print "station " $0
        }
        if ($1 == "side") { found++; if (off($3, n[$2]) > .02 || off($4, e[$2]) > .02 || off($5, h[$2]) > .004) print "side " $0 }
    }
    END { if (found != 9) print found " stations and side sights, not 9" }' "$data"/fieldbook_truth.csv points.csv >wrong
[ ! -s wrong ] || fail "$(cat wrong)"

# On the earth
grep -qx 'station,T1,5047.9957,2135.9943,103.2486,,,,,,,,4269699.0965,638248.3101,4679864.3413,47.500431647,8.501804876,453.2502,0.0021,0.0023,0.0021,0.000000019062,0.000000030101,0.0021' \
    points.csv || fail "station T1 is: $(grep ^station,T1 points.csv)"

# A wide interval leaves the chords to the sagitta: 12 m each, 1 + 5 + 10 + 5 + 1 of them.
succeeds book.csv --alignment axis.csv --interval 1000 --sagitta 0.1 --csv wide.csv
awk -F, '$1 == "axis" && $7 > .1' wide.csv | grep . && fail "a chord stands off by more than the sagitta"
[ "$(grep -c ^axis wide.csv)" -eq 23 ] || fail "$(grep -c ^axis wide.csv) points, not 23"

# A left bend is a right one in the mirror.
sed 's/48-30-00/0/; s/^end.*//' axis.csv >right.csv
sed 's/,right/,left/' right.csv >left.csv
succeeds book.csv --alignment right.csv --csv right.out
succeeds book.csv --alignment left.csv --csv left.out
awk -F, '$1 == "axis" && NR == FNR { n[$2] = $3; e[$2] = $4; next }
    $1 == "axis" && (n[$2] != $3 || (e[$2] + $4 - 4060)^2 > .0001001^2)' right.out left.out | grep . &&
    fail "left and right differ"

# Forms of the same book: CRLF, byte order mark, comments, blanks, decimal degrees; another order of the faces.
succeeds book.csv
cp out expected
{ printf '\xef\xbb\xbf# again\r\n\r\n'; sed 's/,/ ,\t/g; s/$/ # so\r/; s/^# .*//' book.csv; } >same.csv
succeeds same.csv
cmp -s out expected || fail "the same book in another form reads otherwise"
awk -F, -v OFS=, '/^(back|fore|side)/ { for (i = 4; i <= 5; i++) { split($i, d, "-"); $i = sprintf("%.9f", d[1] + (d[2] + d[3] / 60) / 60) } } 1' \
    book.csv >same.csv
succeeds same.csv
cmp -s out expected || fail "decimal degrees read otherwise"
for locale in $(locale -a 2>/dev/null | grep -iE '^(de|fr)_.*utf' | head -n 1); do
    LC_ALL=$locale run book.csv
    cmp -s out expected || fail "another locale, another report"
done

# Open ends.
sed '/^station,K3/,$d' book.csv >open.csv
sed '/^station,T1/,$d' book.csv >one.csv
sed '/^fore,K4/d' book.csv >blind.csv
succeeds blind.csv
grep -q 'Ratio  *1 : ' out || fail "no ratio without a closing bearing"

# Bad books and alignments, and the command line
check_book() { sed "$1" book.csv >bad.csv; refused "bad.csv:$2" bad.csv; }
check_axis() { sed "$1" axis.csv >bad.csv; refused "bad.csv:$2" book.csv --alignment bad.csv; }
checks_each "$here/fieldbook.facts"
fore=$(grep -n '^fore,K4' book.csv | head -n 1 | cut -d: -f1)
check_book "$(grep -n '^point,K4' book.csv | cut -d: -f1)s/.*/point,K4,5110,2560,96.4/" \
    "$fore:6: expected a control point at another place than 'K3', not 'K4'"
head -c 5000 /dev/zero >bad.csv
refused "bad.csv:1:1: the line is longer than 4096 bytes: '????????????????????????????????????????...'" bad.csv
{ printf '# %04094d\n' 0; cat book.csv; } >long.csv # the longest
succeeds long.csv
refused "no field book given (--help shows how)"
cmp -s book.csv "$data"/fieldbook.csv || fail "the book was overwritten"
cp book.csv -- -odd.csv
succeeds -- -odd.csv

# The scale shortens what was measured on the ground, and setting out undoes it.
succeeds open.csv --scale 0.9996 --alignment axis.csv --csv scaled.csv
close_to "scaled leg" "$(awk '$1 == "K1" && $2 == "T1" && $3 ~ /-..-/ { print $4 }' out)" 144.16441 0.0001
awk -F, '$1 == "control" || $1 == "station" { n[$2] = $3; e[$2] = $4 }
    $1 == "axis" { run = sqrt(($3 - n[$8])^2 + ($4 - e[$8])^2); d = $12 * sin($11 * atan2(0, -1) / 180) * .9996 - run
        if (d * d > .0003 ^ 2) print }' scaled.csv >wrong
[ ! -s wrong ] || fail "setting out on a scaled grid: $(head -n 1 wrong)"

answers_to_everyone book.csv
[ ! -w /dev/full ] || fails "cannot write to /dev/full: No space left on device" book.csv --csv /dev/full
survives book.csv damaged
survives axis.csv book.csv --alignment damaged
finish
