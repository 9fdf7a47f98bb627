#!/usr/bin/env bash
# The program from the outside: known errors found again, points against what awk makes of them, every refusal.
# Usage: fieldbook_test.sh PROGRAM DATA_DIRECTORY
. "$(dirname "$0")/../../console/program_test.sh"
cp "$data"/fieldbook.csv book.csv
cp "$data"/axis.csv axis.csv

# shows LINE: the report has this line, runs of blanks counting as one
shows() {
    grep -qxF -- "$1" <<<"$(sed 's/  */ /g; s/^ //' out)" || fail "no line '$1'"
}

# The errors that were put into the sample.
succeeds book.csv --alignment axis.csv --wgs84 K1,47.5,8.5,450 --csv points.csv
shows 'Mean collimation 4.0 "'
shows 'Mean index -6.0 "'
shows 'Angular misclosure 10.0 " taken out as -2.0 " an angle'
shows 'Linear misclosure 0.0300 m north 0.0180, east 0.0240; taken out by the compass rule'
shows 'Height misclosure 0.0060 m'
shows 'T2 T3 109-21-32.4 156.8694 3.3560 0.1 12.0'
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

# The axis: multiples of the interval, the circle, chords within the sagitta, observations that lead to the points.
awk -F, 'function off(a, b) { return a > b ? a - b : b - a }
    BEGIN { pi = atan2(0, -1); degree = pi / 180 }
    $1 != "axis" { n[$2] = $3; e[$2] = $4; h[$2] = $5; next }
    {
        if ($2 % 20 == 0) multiples++
        if ($2 == 1160) { cn = $3 - 180 * sin($6 * degree); ce = $4 + 180 * cos($6 * degree) }
        if ($2 >= 1160 && $2 <= 1280 && off(sqrt(($3 - cn)^2 + ($4 - ce)^2), 180) > .0003) print "off the circle: " $0
        if ($2 > 1100 && $2 <= 1340) { # no flatter than at the bent end of each chord
            radius = $2 <= 1160 ? 10800 / ($2 - 1100) : $2 <= 1280 ? 180 : 10800 / (1340 - last)
            sagitta = radius - sqrt(radius^2 - (($3 - north)^2 + ($4 - east)^2) / 4)
            if (sagitta > .0101 || off(sagitta, $7) > .0002) print "stand-off: " $0
        }
        last = $2; north = $3; east = $4
        bearing = atan2(e[$9] - e[$8], n[$9] - n[$8]) + $10 * degree; run = $12 * sin($11 * degree)
        height = $8 == "T1" ? 1.487 : $8 == "T2" ? 1.605 : $8 == "T3" ? 1.534 : $8 == "K1" ? 1.562 : 1.578
        if (off(n[$8] + run * cos(bearing), $3) > .0003 || off(e[$8] + run * sin(bearing), $4) > .0003 ||
            off(h[$8] + height + $12 * cos($11 * degree) - 1.5, $5) > .0003) print "set out elsewhere: " $0
        for (s in n) if (s ~ /^(T.|K1|K3)$/ && (n[s] - $3)^2 + (e[s] - $4)^2 < (n[$8] - $3)^2 + (e[$8] - $4)^2) print "nearer " s ": " $0
    }
    END { if (multiples != 22) print multiples " multiples of 20 m, not 22" }' points.csv >wrong
[ ! -s wrong ] || fail "$(head -n 3 wrong)"

# On the earth: Cartesian from geodetic coordinates, back to the plane of the anchor; variances of the first leg.
awk -F, 'function off(a, b) { return a > b ? a - b : b - a }
    NR == 1 { next }
    {
        degree = atan2(0, -1) / 180; e2 = 0.00669437999014; p = $16 * degree; l = $17 * degree
        w = 6378137 / sqrt(1 - e2 * sin(p)^2)
        if (off((w + $18) * cos(p) * cos(l), $13) > .0003 || off((w + $18) * cos(p) * sin(l), $14) > .0003 ||
            off((w * (1 - e2) + $18) * sin(p), $15) > .0003) print "geodetic: " $0
        if (NR == 2) { x = $13; y = $14; z = $15 }
        sp = sin(47.5 * degree); cp = cos(47.5 * degree); sl = sin(8.5 * degree); cl = cos(8.5 * degree)
        dx = $13 - x; dy = $14 - y; dz = $15 - z
        if (off(-sp * cl * dx - sp * sl * dy + cp * dz, $3 - 5000) > .0003 || off(-sl * dx + cl * dy, $4 - 2000) > .0003 ||
            off(cp * cl * dx + cp * sl * dy + sp * dz, $5 - 100) > .0003) print "plane: " $0
        m = w^3 * (1 - e2) / 6378137^2
        if (off($22 * degree * (m + $18), $19) > .00006 || off($23 * degree * (w + $18) * cos(p), $20) > .00006) print "sigma: " $0
        if ($2 == "T1") {
            along = .002 + 2e-6 * 144.258; across = 3 / 3600 * degree * 144.222; c = 48 / 144.222; s = 136 / 144.222
            if (off(sqrt((along * c)^2 + (across * s)^2), $19) > .0001 || off(sqrt((along * s)^2 + (across * c)^2), $20) > .0001 ||
                off(3 / 3600 * degree * 144.258, $21) > .0001) print "sigma of the first leg: " $0
        }
    }' points.csv >wrong
[ ! -s wrong ] || fail "$(head -n 3 wrong)"

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
succeeds open.csv
shows 'Angular misclosure none: the last fore sight is not between control points'
shows 'Linear misclosure none: the last station is no control point'
sed '/^station,T1/,$d' book.csv >one.csv
succeeds one.csv
shows 'P1 5061.2000 2018.4000 101.3300'
shows 'T1 5047.9987 2136.0005 103.2500' # 1.4 mm to the side, by the first angle's 2 seconds
sed '/^fore,K4/d' book.csv >blind.csv
succeeds blind.csv
shows 'Angular misclosure none: the last fore sight is not between control points'
grep -q 'Ratio  *1 : ' out || fail "no ratio without a closing bearing"

# Bad books and alignments, and the command line
refuse_book() { sed "$1" book.csv >bad.csv; refused "bad.csv:$2" bad.csv; }
refuse_axis() { sed "$1" axis.csv >bad.csv; refused "bad.csv:$2" book.csv --alignment bad.csv; }
refuses_each "$here/fieldbook.facts"
fore=$(grep -n '^fore,K4' book.csv | head -n 1 | cut -d: -f1)
refuse_book "$(grep -n '^point,K4' book.csv | cut -d: -f1)s/.*/point,K4,5110,2560,96.4/" \
    "$fore:6: expected a control point at another place than 'K3', not 'K4'"
head -c 5000 /dev/zero >bad.csv
refused "bad.csv:1:1: the line is longer than 4096 bytes: '????????????????????????????????????????...'" bad.csv
{ printf '# %04094d\n' 0; cat book.csv; } >long.csv # the longest
succeeds long.csv
refused "no field book given (--help shows how)"
succeeds book.csv --precision 3,2,2 --wgs84 K1,47.5,8.5,450
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
if [ -w /dev/full ]; then
    run book.csv --csv /dev/full
    [ $code -eq 1 ] && [ ! -s out ] || fail "exit $code, not 1, for points on a full disk"
    [ "$(cat err)" = "fieldbook: cannot write to /dev/full: No space left on device" ] || fail "points on a full disk: $(cat err)"
fi
run book.csv --csv nowhere/points.csv
[ $code -eq 1 ] || fail "exit $code, not 1, without the folder"
[ "$(cat err)" = "fieldbook: cannot write to nowhere/points.csv: No such file or directory" ] || fail "$(cat err)"

finish
