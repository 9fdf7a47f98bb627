#!/usr/bin/env bash
# The program from the outside: figures against what awk makes of the same files, and every refusal.
# Usage: workarea_test.sh PROGRAM DATA_DIRECTORY
. "$(dirname "$0")/../../console/program_test.sh"
terrain=$data/jacksboro.asc
boundary=$data/boundary.csv

# figure LABEL: the first number on the report's line that begins with the label, separators removed
figure() {
    awk -v label="$1" 'index($0, "  " label) == 1 {
        rest = substr($0, length(label) + 3); gsub(",", "", rest); split(rest, word, " "); print word[1]; exit }' out
}

# near LABEL EXPECTED TOLERANCE
near() { close_to "$1" "$(figure "$1")" "$2" "$3"; }

# is LABEL EXPECTED
is() {
    [ "$(figure "$1")" = "$2" ] || fail "$1: $(figure "$1"), expected $2"
}

# model VIEW GRADE [BOUNDARY]: count, minimum, maximum, mean, area, slope %, cut and fill of the sample terrain.
# The whole grid is held, so slopes and positions come straight from their definitions, in a plane that touches the
# ellipsoid at the grid's middle; the boundary test counts windings, not crossings.
model() {
    awk -v view="$1" -v grade="$2" -v boundary="${3:-}" -v OFMT=%.12g '
        function place(lon, lat,   f, l, v) {  # east and north, from the difference in longitude to the middle
            f = lat * pi / 180; l = (lon - lon0) * pi / 180; v = 6378137 / sqrt(1 - e2 * sin(f) ^ 2)
            E = v * cos(f) * sin(l)
            N = cos(f0) * ((1 - e2) * v * sin(f) - z0) - sin(f0) * (v * cos(f) * cos(l) - p0)
        }
        function left(i, j) { return (bx[j] - bx[i]) * (N - by[i]) - (E - bx[i]) * (by[j] - by[i]) }
        function winding(   i, j, w) {
            for (i = 0; i < n; i++) {
                j = (i + 1) % n
                if (by[i] <= N && by[j] > N && left(i, j) > 0) w++
                if (by[i] > N && by[j] <= N && left(i, j) < 0) w--
            }
            return w
        }
        BEGIN {
            rows = n = 0
            while (boundary != "" && (getline line < boundary) > 0)
                if (line ~ /^-/) { split(line, p, ","); bx[n] = p[1] + 0; by[n++] = p[2] + 0 }
            split(view, v, ",")
        }
        NF == 2 { head[$1] = $2; next }
        { for (x = 1; x <= NF; x++) z[rows, x] = $x; columns = NF; rows++ }
        END {
            pi = atan2(0, -1); size = head["cellsize"]; e2 = 0.00669437999014
            f0 = (head["yllcorner"] + rows * size / 2) * pi / 180; lon0 = head["xllcorner"] + columns * size / 2
            v0 = 6378137 / sqrt(1 - e2 * sin(f0) ^ 2); p0 = v0 * cos(f0); z0 = (1 - e2) * v0 * sin(f0)
            for (i = 0; i < n; i++) { place(bx[i], by[i]); bx[i] = E; by[i] = N }
            half = int(columns / 2)
            for (r = 0; r < rows; r++) {  # each row by its middle cell: a trapezium
                south = head["yllcorner"] + (rows - r - 1) * size; west = head["xllcorner"] + half * size
                place(west, south); x1 = E; y1 = N; place(west + size, south); x2 = E; y2 = N
                place(west + size, south + size); x3 = E; y3 = N; place(west, south + size); x4 = E; y4 = N
                cell[r] = ((x3 - x1) * (y4 - y2) - (x4 - x2) * (y3 - y1)) / 2
                place(west + size / 2, south + size / 2); x1 = E; y1 = N
                place(west + 1.5 * size, south + size / 2); de[r] = sqrt((E - x1) ^ 2 + (N - y1) ^ 2)
                place(west + size / 2, south + 1.5 * size); dn[r] = sqrt((E - x1) ^ 2 + (N - y1) ^ 2)
            }
            for (r = 0; r < rows; r++) for (x = 1; x <= columns; x++) {
                lon = head["xllcorner"] + (x - 0.5) * size
                lat = head["yllcorner"] + (rows - r - 0.5) * size
                if (lon < v[1] || lat < v[2] || lon > v[3] || lat > v[4]) continue
                if (n) { place(lon, lat); if (!winding()) continue }
                h = z[r, x]; count++; area += cell[r]; sum += h * cell[r]
                if (count == 1 || h < low) low = h
                if (count == 1 || h > high) high = h
                if (h > grade) cut += (h - grade) * cell[r]; else fill += (grade - h) * cell[r]
                a = x > 1 ? x - 1 : x; b = x < columns ? x + 1 : x
                c = r > 0 ? r - 1 : r; d = r < rows - 1 ? r + 1 : r
                east = (z[r, b] - z[r, a]) / ((b - a) * de[r]); north = (z[c, x] - z[d, x]) / ((d - c) * dn[r])
                slope += cell[r] * sqrt(east ^ 2 + north ^ 2)
            }
            print count, low, high, sum / area, area, 100 * slope / area, cut, fill
        }' "$terrain"
}

# matches COUNT LOW HIGH MEAN AREA SLOPE CUT FILL
matches() {
    is "Cells counted" "$1"
    near "Lowest" "$2" 0
    near "Highest" "$3" 0
    near "Mean elevation" "$4" 0.000501
    near "Area" "$5" 0.1
    near "Mean slope" "$6" 0.00501
    near "Cut " "$7" 2
    near "Fill" "$8" 2
}

everything=-90,30,-80,40
window=-84.3,36.5,-84.2,36.6

succeeds "$terrain" --grade 500
matches $(model $everything 500)
is "Grid" 138632
is "Cells with elevation" 138632
is "Blocks selected" 572 # 26 x 22
is "Grade" 500.000
succeeds "$terrain" --view $everything # cut to the grid
is "Cells counted" 138632

succeeds "$terrain" --view $window --grade=612.5
matches $(model $window 612.5)
is "Cells in view" "$(figure "Cells counted")"

succeeds "$terrain" --boundary "$boundary" --grade 500
matches $(model $everything 500 "$boundary")

succeeds "$terrain" --boundary "$boundary" --view $window
mean=$(model $window 0 "$boundary" | cut -d' ' -f4)
matches $(model $window "$mean" "$boundary")
near "Grade" "$(figure "Mean elevation")" 0
near "Cut less fill" 0 0
grep -q "the mean elevation (no --grade given)" out || fail "the default grade is not named"

# A 4 x 3 grid at the equator with one cell missing, in the forms the format allows. 10, 20, ... 110 has mean 60;
# a row a degree off the middle counts cos(1 deg)^2 of the middle's: once on the earth, once in the plane.
cat >plain.asc <<'GRID'
ncols 4
nrows 3
xllcorner 10
yllcorner -1.5
cellsize 1
NODATA_value -1
10 20 30 40
50 60 70 80
90 100 110 -1
GRID
sed 's/^\(.*\)$/\1\r/' plain.asc >crlf.asc
{ printf '\xef\xbb\xbf'; sed -n 6p plain.asc; sed -n 5p plain.asc; echo "YLLCENTER -1"; echo "XllCenter +10.5"; echo; \
    echo "NROWS 3"; echo " nCols   4"; sed -n '7,$p' plain.asc; printf '\n\n'; } >shuffled.asc
sed '/NODATA/d; s/-1$/-9999/' plain.asc | head -c -1 >default.asc
sed 's/-1$/nan/; s/^10 /nan /' plain.asc >nan.asc
succeeds plain.asc
sed '/Source/d; /^Store/,$d' out >expected
for form in crlf shuffled default; do
    succeeds $form.asc
    sed '/Source/d; /^Store/,$d' out | cmp -s - expected || fail "$form.asc reads otherwise than plain.asc"
done
is "Cells counted" 11
is "Mean elevation" 60.001 # (400 w + 260) / (7 w + 4), w = cos(1 deg)^2
is "Steepest slope" 0.04 # 40 m over one degree north
grep -q "Highest *110.000 m  at 12.500000, -1.000000" out || fail "the highest cell is elsewhere"
succeeds nan.asc
is "Cells counted" 10
succeeds plain.asc --view 10.5,-1,11.5,0 # edges through cell centres
is "Cells counted" 4

sed '7,$s/[0-9-]\+/5/g' plain.asc >flat.asc
succeeds flat.asc # ties go south, then west
grep -q "Lowest *5.000 m  at 10.500000, -1.000000" out || fail "the lowest of equal cells is elsewhere"
grep -q "Highest *5.000 m  at 10.500000, -1.000000" out || fail "the highest of equal cells is elsewhere"
sed 's/cellsize 1/cellsize 1e-9/' plain.asc >tiny.asc
succeeds tiny.asc --grade 100
is "Cut less fill" 0 # not -0

# Boundaries. 10,-1.5 to 12,0.5 holds the two western columns of the two southern rows.
border() { printf "$1" >border.csv; }
border 'x,y\r\n# corner posts\r\n 10 , -1.5 # first\r\n\r\n12,-1.5\r\n+12,0.5\r\n10,0.5\r\n10,-1.5\r\n'
succeeds plain.asc --boundary border.csv
is "Cells counted" 4
is "Boundary vertices" 4
is "Mean elevation" 74.997 # (190 w + 110) / (2 w + 2)
border 'Nantes,Info\n10,-1.5\n12,-1.5\n12,0.5\n10,0.5\n'
succeeds plain.asc --boundary border.csv
is "Boundary vertices" 4

# Pictures, as another program reads them
succeeds plain.asc --picture picture.bmp
is "Width" 680
is "Height" 507 # three degrees north at the equator, of 110.574 km, to four east, of 111.320 km, less a fifth of a pixel
rm picture.bmp
# a boundary around the two western columns of the two southern rows
border '10,-1.5\n12,-1.5\n12,0.5\n10,0.5\n'
succeeds plain.asc --boundary border.csv --picture=picture.bmp --legend
[ "$(figure "Width")" -gt 680 ] || fail "the picture is too narrow for a legend: $(figure "Width")"
cp plain.asc input.asc
fails "cannot write to no/picture.bmp: No such file or directory" plain.asc --picture no/picture.bmp
if convert -version >/dev/null 2>&1; then
    # pixel X Y: colour as RRGGBB; strongest X Y: its largest channel
    pixel() { convert picture.bmp -format "%[hex:u.p{$1,$2}]" info: | cut -c1-6; }
    strongest() {
        local p=$(pixel $1 $2)
        local red=$((16#${p:0:2})) green=$((16#${p:2:2})) blue=$((16#${p:4:2}))
        if [ $red -gt $green ] && [ $red -gt $blue ]; then echo red; elif [ $green -gt $blue ]; then echo green; else echo blue; fi
    }
    shows() { [ "$($1 $2 $3)" = $4 ] || fail "pixel $2, $3 is $(pixel $2 $3), not $4"; }

    succeeds plain.asc --grade 60 --picture picture.bmp
    [[ "$(identify picture.bmp)" == *" BMP"*" 680x507 "* ]] || fail "identify says: $(identify picture.bmp)"
    shows strongest 85 84 blue   # 10 m
    shows strongest 425 422 red  # 110 m
    shows pixel 595 422 DEDEDE   # no elevation

    succeeds plain.asc --grade 60 --boundary border.csv --view 10.5,-1.5,14,1.5 --picture picture.bmp
    shows strongest 425 84 green # 30 m, outside the boundary: ground in its own colour
    shows strongest 255 422 red  # 100 m, inside
    shows strongest 255 253 red  # 60 m, inside; 50 m to the west
    shows pixel 340 330 262626   # the boundary's eastern side
    shows pixel 200 168 262626   # and its northern side, at 0.5 degrees
    shows pixel 88 0 262626      # the view's first dash

    succeeds flat.asc --grade 5 --picture picture.bmp
    shows pixel 340 250 78B2FF   # nothing to fill, under the light of level ground
    succeeds flat.asc --grade 4 --picture picture.bmp
    shows pixel 340 250 623523   # the deepest cut: 255, 138 and 92 by 2.6

    # Ground that faces the light from the north-west is brighter than level ground, 78B2FF, other ground darker.
    slope() { printf 'ncols 3\nnrows 3\nxllcorner 10\nyllcorner 0\ncellsize 0.001\n%s\n%s\n%s\n' "$@" >slope.asc; }
    light() {
        succeeds slope.asc --grade 50 --picture picture.bmp
        local p=$(pixel 340 340)
        echo $((16#${p:0:2} - 16#78 > 0))
    }
    slope "0 50 100" "0 50 100" "0 50 100"; [ "$(light)" = 1 ] || fail "a slope that faces west is dark"
    slope "100 50 0" "100 50 0" "100 50 0"; [ "$(light)" = 0 ] || fail "a slope that faces east is bright"
    slope "0 0 0" "50 50 50" "100 100 100"; [ "$(light)" = 1 ] || fail "a slope that faces north is dark"
    slope "100 100 100" "50 50 50" "0 0 0"; [ "$(light)" = 0 ] || fail "a slope that faces south is bright"
else
    echo "SKIPPED: the pictures' colours: no ImageMagick"
fi

# Bad terrains and boundaries, and the command line
refused "no terrain file given (--help shows how)"
refuse_terrain() { sed "$1" plain.asc >bad.asc; refused "bad.asc$2" bad.asc; }
refuse_border() { printf "$1" >bad.csv; refused "bad.csv$2" plain.asc --boundary bad.csv; }
refuses_each "$here/workarea.facts"
head -c 5000 /dev/zero >bad.asc
refused "bad.asc:1:1: not text: '????????????????????????????????????????...' has no end" bad.asc
{ sed 's/ncols 4/ncols 200000/; s/nrows 3/nrows 1/; s/cellsize 1/cellsize 1e-6/; 7,$d' plain.asc
    awk 'BEGIN { for (i = 1; i < 200000; i++) printf "1000 "; print "?" }'; } >bad.asc # a row longer than a piece
refused "bad.asc:7:999996: '?' is not a number" bad.asc
cp plain.asc -- -odd.asc
succeeds -- -odd.asc

for cells in 1 2 3 1000 100003; do
    succeeds --synthetic $cells
    is "Cells counted" $cells
done
near "Mean elevation" 300 100
near "Cut less fill" 0 0

answers_to_everyone plain.asc
finish
