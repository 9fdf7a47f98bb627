#!/usr/bin/env bash
# The program from the outside: its figures and pictures, and every refusal.
# Usage: workarea_test.sh PROGRAM DATA_DIRECTORY
. "$(dirname "$0")/../../console/program_test.sh"
terrain=$data/jacksboro.asc
boundary=$data/boundary.csv

everything=-90,30,-80,40
window=-84.3,36.5,-84.2,36.6

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
sed '7,$s/[0-9-]\+/5/g' plain.asc >flat.asc
sed 's/cellsize 1/cellsize 1e-9/' plain.asc >tiny.asc
succeeds plain.asc
sed '/Source/d; /^Store/,$d' out >expected
for form in crlf shuffled default; do
    succeeds $form.asc
    sed '/Source/d; /^Store/,$d' out | cmp -s - expected || fail "$form.asc reads otherwise than plain.asc"
done

# Boundaries of the two western columns of the two southern rows
printf 'x,y\r\n# corner posts\r\n 10 , -1.5 # first\r\n\r\n12,-1.5\r\n+12,0.5\r\n10,0.5\r\n10,-1.5\r\n' >closed.csv
printf 'Nantes,Info\n10,-1.5\n12,-1.5\n12,0.5\n10,0.5\n' >border.csv

# Pictures
succeeds plain.asc --boundary border.csv --picture=picture.bmp --legend
[ "$(figure Width | cut -d' ' -f1)" -gt 680 ] || fail "the picture is too narrow for a legend: $(figure Width)"
cp plain.asc input.asc
fails "cannot write to no/picture.bmp: No such file or directory" plain.asc --picture no/picture.bmp
succeeds plain.asc --grade 60 --picture picture.bmp
is "Width" 680
is "Height" 507 # three degrees north at the equator, of 110.574 km, to four east, of 111.320 km, less a fifth of a pixel
[ "$(size picture.bmp)" = 680x507 ] || fail "the picture has $(size picture.bmp) pixels"
# X Y ARGUMENTS: the pixel's colour as RRGGBB
check_pixel() {
    local x=${1%% *} rest=${1#* }
    eval "succeeds ${rest#* } --picture picture.bmp"
    local colour=$(pixels picture.bmp "$x" "${rest%% *}" 1)
    [ "$colour" = "$2" ] || fail "pixel $1: $colour, not $2"
}
# Rows of 3 x 3 cells, separated by slashes: whether a slope is brighter than level ground, 78B2FF
check_slope() {
    printf 'ncols 3\nnrows 3\nxllcorner 10\nyllcorner 0\ncellsize 0.001\n%s\n' "$(tr / '\n' <<<"$1")" >slope.asc
    succeeds slope.asc --grade 50 --picture picture.bmp
    local colour=$(pixels picture.bmp 340 340 1)
    [ $((16#${colour:0:2} > 16#78)) = "$2" ] || fail "slope $1: $colour"
}

# Bad terrains and boundaries, and the command line
refused "no terrain file given (--help shows how)"
check_terrain() { sed "$1" plain.asc >bad.asc; refused "bad.asc$2" bad.asc; }
check_border() { printf "$1" >bad.csv; refused "bad.csv$2" plain.asc --boundary bad.csv; }
checks_each "$here/workarea.facts"
head -c 5000 /dev/zero >bad.asc
refused "bad.asc:1:1: not text: '????????????????????????????????????????...' has no end" bad.asc
{ sed 's/ncols 4/ncols 200000/; s/nrows 3/nrows 1/; s/cellsize 1/cellsize 1e-6/; 7,$d' plain.asc
    awk 'BEGIN { for (i = 1; i < 200000; i++) printf "1000 "; print "?" }'; } >bad.asc # a row longer than a piece
refused "bad.asc:7:999996: '?' is not a number" bad.asc
cp plain.asc -- -odd.asc
succeeds -- -odd.asc

survives plain.asc damaged
survives border.csv plain.asc --boundary damaged
succeeds --synthetic 100003
close_to "Mean elevation" "$(figure "Mean elevation")" 300 100

answers_to_everyone plain.asc
finish
