#!/usr/bin/env bash
# The program from the outside: its figures, its picture, and every refusal.
# Usage: palette_test.sh PROGRAM
. "$(dirname "$0")/../../console/program_test.sh"

succeeds --picture chart.bmp
shows "pixels of the scene 134,400"
[ "$(size chart.bmp)" = 944x716 ] || fail "the chart has $(size chart.bmp) pixels"
# fields of 38 x 24 pixels, ten downwards for each of 24 hues: their full colours go round the circle of hues
hue=0
for colour in FF0000 FF3F00 FF7F00 FFBF00 FFFF00 BFFF00 7FFF00 3FFF00 00FF00 00FF3F 00FF7F 00FFBF \
    00FFFF 00BFFF 007FFF 003FFF 0000FF 3F00FF 7F00FF BF00FF FF00FF FF00BF FF007F FF003F; do
    [ "$(pixels chart.bmp $((18 + 38 * hue)) 122 1)" = $colour ] || fail "hue $hue is not $colour"
    hue=$((hue + 1))
done
# the scene on the right has colours of the fields above only, and as many as the report says
for y in $(seq 16 359); do pixels chart.bmp 0 $y 944; done | sort -u >fields
for y in $(seq 400 699); do pixels chart.bmp 480 $y 448; done | sort -u >matched
[ -z "$(comm -13 fields matched)" ] || fail "colours outside the palette: $(comm -13 fields matched)"
shows "colours used $(wc -l <matched)"

fails "cannot write to no/chart.bmp: No such file or directory" --picture no/chart.bmp
[ ! -c /dev/full ] || fails "cannot write all of /dev/full" --picture /dev/full
checks_each "$here/palette.facts"
answers_to_everyone FF0000
finish
