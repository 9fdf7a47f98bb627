#!/usr/bin/env bash
# The program from the outside: its figures, its picture as another program reads it, and every refusal.
# Usage: palette_test.sh PROGRAM
. "$(dirname "$0")/../../console/program_test.sh"

# line TEXT: some line of the report has these words
line() {
    grep -qx " $1" <<<"$(tr -s ' ' <out)" || fail "no line '$1' in: $(cat out)"
}

succeeds
line "second 0 8 basic colours"
line "large 9 248 hues and shades"
line "third 249 254 greys"

# An equal colour; hundredths that round to the same (0, not 9); the first of equals (6, not 255); text over each.
succeeds FF0000 "#fe0000" ffffff 000000 848484
line "#FF0000 0 #FF0000 second #FFFFFF"
line "#FE0000 0 #FF0000 second #FFFFFF"
line "#FFFFFF 6 #FFFFFF second #505050"
line "#000000 249 #000000 third #FFFFFF"
line "#848484 252 #848484 third #505050"

succeeds --picture chart.bmp
grep -q 'pixels of the scene *134,400' out || fail "the scene has another size: $(cat out)"
if convert -version >/dev/null 2>&1; then
    pixel() { convert chart.bmp -format "%[hex:u.p{$1,$2}]" info: | cut -c1-6; }
    [ "$(identify -format '%m %wx%h' chart.bmp)" = "BMP3 944x716" ] ||
        [ "$(identify -format '%m %wx%h' chart.bmp)" = "BMP 944x716" ] || fail "the chart is $(identify chart.bmp)"
    # fields of 38 x 24 pixels, ten downwards for each of 24 hues: their full colours go round the circle of hues
    hue=0
    for colour in FF0000 FF3F00 FF7F00 FFBF00 FFFF00 BFFF00 7FFF00 3FFF00 00FF00 00FF3F 00FF7F 00FFBF \
        00FFFF 00BFFF 007FFF 003FFF 0000FF 3F00FF 7F00FF BF00FF FF00FF FF00BF FF007F FF003F; do
        [ "$(pixel $((16 + 38 * hue + 2)) 122)" = $colour ] || fail "hue $hue is not $colour"
        hue=$((hue + 1))
    done
    # the scene on the right has colours of the fields above only, and as many as the report says
    colours() { convert chart.bmp -crop "$1" +repage -unique-colors txt: | grep -o '#[0-9A-F]\{6\}' | sort -u; }
    colours 944x344+0+16 >fields
    colours 448x300+480+400 >matched
    [ -z "$(comm -13 fields matched)" ] || fail "colours outside the palette: $(comm -13 fields matched)"
    used=$(wc -l <matched)
    grep -q "colours used *$used$" out || fail "$used colours are in the picture: $(cat out)"
else
    echo "SKIPPED: the picture's colours: no ImageMagick"
fi
cp chart.bmp again.bmp
succeeds --picture=chart.bmp
cmp -s chart.bmp again.bmp || fail "a second run draws otherwise"

fails "cannot write to no/chart.bmp: No such file or directory" --picture no/chart.bmp
[ ! -c /dev/full ] || fails "cannot write all of /dev/full" --picture /dev/full
refuses_each "$here/palette.facts"
answers_to_everyone FF0000
finish
