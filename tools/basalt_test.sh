#!/usr/bin/env bash
# The tool from the outside: results against other programs' rows, every refusal, every kind of line, and
# standard output that fails.
# Usage: basalt_test.sh PROGRAM DATA
. "$(dirname "$0")/../console/program_test.sh"
PATH=$(dirname "$program"):$PATH

# gives EXPECTED ARGUMENT... <input: exactly that, and nothing to complain of
gives() {
    local expected=$1
    shift
    succeeds "$@"
    [ "$(cat out)" = "$expected" ] || fail "$*: $(head -c 300 out); expected: ${expected:0:300}"
}
# of LINE EXPECTED ARGUMENT...: of a single line
of() {
    printf '%s\n' "$1" >line
    gives "${@:2}" <line
}
# leaves_out LINE WHY COMMAND ARGUMENT...: told, and no output
leaves_out() {
    printf '%s\n' "$1" >line
    run "${@:3}" <line
    [ $code -eq 1 ] && [ ! -s out ] && [ "$(cat err)" = "basalt $3: line 1: $2" ] ||
        fail "'$1' through ${*:3}: exit $code, $(cat out err); expected: $2"
}
# misused WHY COMMAND ARGUMENT...
misused() {
    run "${@:2}" </dev/null
    [ $code -eq 2 ] && [ ! -s out ] && [ "$(cat err)" = "basalt $2: $1" ] ||
        fail "${*:2}: exit $code, $(cat out err); expected: $1"
}
# rows AWK_CONDITION: `out` has rows, and in each the condition holds
rows() {
    awk -F, 'function abs(x) { return x < 0 ? -x : x }
             function apart(a, b) { a = abs(a - b); a -= 360 * int(a / 360); return a > 180 ? 360 - a : a }
             function shrink(latitude) { return cos(latitude * atan2(0, -1) / 180) }
             /^#/ { next } { ++rows } !('"$1"') { print; bad = 1 } END { exit bad || rows < 50 }' out >bad ||
        fail "not $1: $(head -n 3 bad)"
}

# --- against the rows of independent programs; what is not read stays behind the results
cartesian=$data/cartesian_geodetic.csv
succeeds llh2xyz --degrees --csv --precision 6 <"$cartesian"
rows 'abs($1 - $4) <= 1e-6 && abs($2 - $5) <= 1e-6 && abs($3 - $6) <= 1e-6'
awk -F, -v OFS=, '!/^#/ && $3 > -5e6 { print $4, $5, $6, $1, $2, $3 }' "$cartesian" >xyz
succeeds xyz2llh --degrees --csv --precision 8 <xyz
rows 'abs($1 - $4) <= 2e-13 * 180 && apart($2, $5) * shrink($4) <= 3e-12 && abs($3 - $6) <= 2e-8 + 5e-15 * abs($6)'
succeeds direct --degrees --csv --precision 7 <"$data/geodesics.csv"
rows 'abs($1 - $4) <= 2e-9 && apart($2, $5) * shrink($4) <= 2e-9 && apart($3, $6) * shrink($4) <= 2e-9'
awk -F, -v OFS=, '!/^#/ && $9 > 1 && $9 < 1e7 { print $1, $2, $5, $6, $8, $9 }' "$data/geodesics.csv" >pairs
succeeds distance --degrees --csv <pairs
rows 'abs($1 - $3) <= 0.0057 * $3'
succeeds bearing --degrees --csv --keep <pairs
rows 'apart($7, $5) * shrink($1) <= 0.2 && $7 >= 0 && $7 < 360'

# --- coordinates and lines where the result is known
of "0 0 0" "6378137.0000 0.0000 0.0000" llh2xyz # which the library takes for a record never set
of "-90 45 0" "0.0000 0.0000 -6356752.3142" llh2xyz --degrees
of "1.57079633 0 0" "0.00 0.00 6356752.31" llh2xyz --precision 2 # a pole, rounded upwards
of "0 540 0" "-6378137.0000 0.0000 0.0000" llh2xyz --degrees
of "0 0 6356752.3142" "90.000000000 0.000000000 0.0000" xyz2llh --degrees
of "5 6 7 O" "5 6 7 O 0.000 0.000 0.000" neu 5,6,7 --geodetic --degrees --keep --precision 3
of "0.001 0.5" "111.195" crosstrack 0,0 0,1 --degrees --precision 3
of "0.001 0.5" "-111.195" crosstrack 0,1 0,0 --degrees --precision 3
of "0 0 0 180" "20015086.796" distance --degrees --precision 3 # half of 2 pi 6371 km
of "1 2 1 2" "0.0000000" bearing --precision 0
of "0 0 1e-9 -1e-18" "0.000000" bearing --degrees --precision 1 # no 360
of "10 20 359.999999999 0" "10.0000000 20.0000000 0.0000000" direct --degrees --precision 2
of "0 179.5 90 111319.49079327357" "0.0000000 -179.5000000 90.0000000" direct --degrees --precision 2

# --- units
of "0.5" "28 38 52.403124" dms
of "-0.5125" "-0 30 45.000000" dms --degrees
of "29.99999999" "30 0 0.00" dms --degrees --precision 0
of "-59.999999999" "-60 0 0.0000" dms --degrees --precision 2
of "29.999999999" "29 59 59.99999640" dms --degrees --precision 6 # within what the library counts as a minute
of "-1e-12" "0 0 0.000" dms --degrees --precision 1
of "-0 30 45 x" "-0.512500000 x" dms --degrees --inverse
of "180 0 0" "3.14159265359" dms --inverse
LC_ALL=C seq -f %.9f -400 0.7313 400 >angles
succeeds dms --degrees --precision 4 <angles
mv out dms
gives "$(cat angles)" dms --degrees --inverse <dms
of "304.8006096012" "1000 0.0000" ftin # 1200/3937 m a foot
of "-0.0254000508" "-0 1.0000" ftin
of "0.30480060" "1 0.00" ftin --precision 2
of "0.3047" "1 0 0/1" ftin --denominator 16  # 11 and 31.9/32 inches
of "-0.7" "-2 3 9/16" ftin --denominator 32
of "-0 6 1/2 x" "-0.16510033 x" ftin --inverse --precision 8
of "1,6,1/2,x" "0.46990094,x" ftin --inverse --csv --precision 8
of "1 6 left/right" "0.4572 left/right" ftin --inverse

# --- times: date(1) knows the same days and seconds
of "1858-11-17" 0 mjd
of "2000-01-01" 51544 mjd
of "65535-12-31" 23257590 mjd
of "2024-02-29T23:59:59.9999Z" "60370.00000" mjd --precision 0
of "60369.99999999999" "2024-03-01T00:00:00.00" mjd --inverse --precision 2
of "1980-01-06" "0 0.0000" gps
of "2159-06-11T23:59:59.99" "9362 172800.0" gps --precision 1
of "9362 172799.5" "2159-06-11T23:59:59.5000" gps --inverse
of "2024-06-01T23:59:59.99" "2317 0.0" gps --precision 1 # Saturday's end
of "1970-01-01T00:00:00.001999" "1" javatime
for i in $(seq 0 250); do
    seconds=$((315964800 + i * 22111333 % 5000000000))
    when=$(date -u -d "@$seconds" +%Y-%m-%dT%H:%M:%S)
    echo "$when,$((seconds / 86400 + 40587)),$(((seconds - 315964800) / 604800)),$(((seconds - 315964800) % 604800)),${seconds}000"
done >times
succeeds gps --csv --precision 0 <times
rows '$1 == $4 && $2 == $5'
cut -d, -f3-4 times >gps
gives "$(cut -d, -f1 times)" gps --csv --inverse --precision 0 <gps
cut -dT -f1 times >days
gives "$(cut -d, -f2 times)" mjd <days
cut -d, -f2 times >mjd
gives "$(cat days)" mjd --inverse <mjd
cut -d, -f1 times >when
gives "$(cut -d, -f5 times)" javatime <when
cut -d, -f5 times >java
gives "$(sed 's/$/.000Z/' when)" javatime --inverse <java
succeeds mjd --precision 6 <when
mv out mjd
gives "$(sed 's/$/.00000/' when)" mjd --inverse --precision 5 <mjd

# --- texts and colours
head -c 3000 "$program" | tr -d '\n\r' >bytes
gives "$(od -An -v -tx1 bytes | tr -d ' \n')" hex <bytes
mv out hex
succeeds unhex <hex
head -c -1 out | cmp -s - bytes || fail "bytes come back otherwise"
printf '\n#a\r\n' >line
gives $'\n2361' hex <line
of 'C:\a b/c.d,"e".tgz' $'C:\t\\a b/\tc.d,"e"\t.tgz' path
of 'C:\a b/c.d,"e".tgz' 'C:,\a b/,"c.d,""e""",.tgz' path --csv
of '/a,b/c "d".e' '"/a,b/c ""d"".e",,"/a,b/","c ""d""",.e' path --csv --keep
of '/a b/c.d' '/a b/c.d,,/a b/,c,.d' path --csv --keep
of '/a,b/c.d' $'/a,b/c.d\t\t/a,b/\tc\t.d' path --keep
of '#a' $'\t\t#a\t' path
of $'/\xe9\xff.x' $'\t/\t\xe9\xff\t.x' path
of "#fe0000 roof" "0 #FF0000 roof" palette nearest
printf '%s\n' ffffff 000000 848484 >line
gives $'6 #FFFFFF\n249 #000000\n252 #848484' palette nearest <line
of "249" "#000000" palette colour

# --- polygons
printf '# north,east\r\n0,0,first\r\n\r\n0,10\r\n10,10\r\n10,0\r\n0,0\r\n' >site.csv
of "5 5" 1 contains site.csv
of "10 10 corner" "1 corner" contains site.csv
of "5 10.5" 0 contains site.csv
of "5 10.5" 1 contains site.csv --tolerance 0.5
of "5 10.6" 0 contains site.csv --tolerance=0.5
printf '0,0\n0,1\n' >two.csv
printf '0,0\n0,x\n' >bad.csv
misused "two.csv: a polygon has three vertices at least" contains two.csv
misused "bad.csv:2:3: expected an easting in metres, not 'x'" contains bad.csv
misused "none.csv: cannot be opened: No such file or directory" contains none.csv
misused "--tolerance takes metres from 0 on, not '-1'" contains site.csv --tolerance -1

# --- lines of every kind
printf '\xef\xbb\xbf1 2\r\n\n  # 3 4\n\t3\t 4  two  words \n5 6' >line
gives $'1\n\n  # 3 4\n1 two  words\n1' contains site.csv <line
printf '1 , 2\n+3,4e0,a, b\n' >line
gives $'1\n1,a, b' contains site.csv --csv <line
gives $'1 , 2,1\n+3,4e0,a, b,1' contains site.csv --csv --keep <line
printf '1,2,\n1,2, ,\n1,2, \n1,2,a,\n' >line
gives $'1,\n1,,\n1,\n1,a,' contains site.csv --csv <line # the last field may be empty
gives $'1,2,,1\n1,2, ,,1\n1,2, ,1\n1,2,a,,1' contains site.csv --csv --keep <line
of "1 2 " 1 contains site.csv
gives "" contains site.csv </dev/null
{ echo 5 5; printf '5 5 %01048573d\n' 0; printf '5 5 %02500000d\r\n' 0; echo 5 15; } >line
run contains site.csv <line
[ $code -eq 1 ] && [ "$(cat out)" = $'1\n0' ] && [ "$(grep -c 'longer than 1048576 bytes' err)" -eq 2 ] ||
    fail "long lines: exit $code, $(head -c 300 err)"
{ printf '%01048576d\r\n' 0; printf '%01048576d' 0; } >line
succeeds hex <line
[ "$(wc -lc <out | tr -s ' ')" = " 2 4194306" ] || fail "the longest lines as digits: $(wc out)"
printf '1 2\n1 x\n\0\n3 4\n5' >line
run contains site.csv <line
[ $code -eq 1 ] && [ "$(cat out)" = $'1\n1' ] || fail "bad lines: exit $code, $(cat out)"
cat >expected <<'END'
basalt contains: line 2: expected an easting in metres, not 'x'
basalt contains: line 3: expected a northing in metres, not '?'
basalt contains: line 5: expected an easting in metres, but the line ends before it
END
cmp -s err expected || fail "bad lines: $(cat err)"
coproc basalt mjd
echo 2000-01-01 >&"${COPROC[1]}"
read -r -t 20 answer <&"${COPROC[0]}" || fail "no answer before the input has ended"
[ "$answer" = 51544 ] || fail "the answer is $answer"
eval "exec ${COPROC[1]}>&-"

# --- what is refused
leaves_out "1,2" "expected a latitude, not '1,2' (--csv reads commas)" distance
leaves_out "91 0 0" "latitude 91 is beyond 90 degrees" llh2xyz --degrees
leaves_out "1.6 0 0" "latitude 1.6 is beyond pi/2 radians (--degrees reads degrees)" llh2xyz
leaves_out "0 0 inf" "expected a height in metres, not 'inf'" llh2xyz
leaves_out "1,,3" "expected y in metres, not ''" xyz2llh --csv
leaves_out "0 0 0" "the point is too near the earth's centre to have a latitude" xyz2llh
leaves_out "1e200 1e200 1e200" "the result is not finite" xyz2llh
leaves_out "1 60 0" "expected whole minutes, 0 to 59, not '60'" dms --inverse
leaves_out "1e300" "the angle is too large for degrees, minutes and seconds" dms
leaves_out "1e300" "the length is too large for feet and inches" ftin
leaves_out "1 2 3/2" "expected a fraction below 1, not '3/2'" ftin --inverse
for day in 2023-02-29 1858-11-16 2024-00-01 2024-13-01 2024-01-00 65536-01-01 99999-12-31; do
    leaves_out $day "expected a date from 1858-11-17 to 65535-12-31, not '$day'" mjd
done
for time in 2024-1-01 2024-01-01T24:00:00 2024-01-01T00:60:00 2016-12-31T23:59:60 2024-01-01T00:00 \
    2024-01-01T00:00:1 2024-01-01T00:00:00. 2024-01-01T00:00:00ZZ 2024-01-01Z -024-01-01; do
    leaves_out $time "expected a time like 2024-02-29 or 2024-02-29T23:59:59.5, not '$time'" javatime
done
for command in mjd gps javatime; do # no midnight with the time behind it
    leaves_out "2024-02-29 12:00:00" "expected nothing but a T between the date and '12:00:00'" $command
    leaves_out $'2024-02-29\t 9:05 x' "expected nothing but a T between the date and '9:05 x'" $command
    leaves_out "2024-02-29 T12:00:00.5Z" "expected nothing but a T between the date and 'T12:00:00.5Z'" $command
    leaves_out "2024-02-29, 12:00:00,x" "expected nothing but a T between the date and '12:00:00,x'" $command --csv
    leaves_out "2024-02-29 12:00" "expected nothing but a T between the date and '12:00'" $command --keep
done
for rest in 1:500 123:45 12: :30 12 T t:30 noon 12:3; do
    of "2000-01-01 $rest" "51544 $rest" mjd
done
of "2000-01-01T12:00:00 12:00:00" "51544.50000 12:00:00" mjd --precision 0
for day in -1 +1 23257591 1. 1.5e3 .5 1.-5; do
    leaves_out $day "expected an MJD from 0 to below 23257591, not '$day'" mjd --inverse
done
leaves_out 23257590.9999999 "the day is behind 65535-12-31" mjd --inverse --precision 1
leaves_out 1980-01-05 "GPS time is known from 1980-01-06 to 2159-06-11" gps
leaves_out 2159-06-12 "GPS time is known from 1980-01-06 to 2159-06-11" gps
leaves_out "9362 172800" "GPS time is known from 1980-01-06 to 2159-06-11" gps --inverse
leaves_out 1969-12-31 "expected a time from 1970 to 30827" javatime
leaves_out 910670515200000 "expected milliseconds, 0 to 910670515199999, not '910670515200000'" javatime --inverse
of 910670515199999 "30827-12-31T23:59:59.999Z" javatime --inverse
leaves_out "3g" "expected hexadecimal digits only" unhex
leaves_out "313" "expected two digits for each byte, but the last has one" unhex
leaves_out "310a" "the bytes are more than one line" unhex
leaves_out "$(printf '%0256d' 0)" "a part of the path is longer than 255 bytes" path
leaves_out "ff00000" "expected a colour RRGGBB or #RRGGBB, not 'ff00000'" palette nearest
leaves_out 256 "expected a number from 0 to 255, not '256'" palette colour
misused "unknown option '--degrees' (--help lists them)" hex --degrees
misused "--precision takes a whole number from 0 to 9, not '10'" ftin --precision 10
misused "--denominator takes a whole number from 1 to 1000000, not '0'" ftin --denominator 0
misused "unexpected argument '5' (--help shows what is taken)" dms 5
misused "POLYGON.csv is missing (--help shows what is taken)" contains
misused "B is missing (--help shows what is taken)" crosstrack 0,1
misused "ORIGIN '-1,2': expected z in metres, but the line ends before it" neu -1,2
misused "ORIGIN '0,0,0': the point is too near the earth's centre to have a latitude" neu 0,0,0
misused "ORIGIN '1,2,3e6,': expected its end, not ''" neu 1,2,3e6,
misused "B '1,2,3': expected its end, not '3'" crosstrack 0,1 1,2,3
misused "expected nearest or colour, not 'all'" palette all
refused "no command given (--help lists them)"
refused "unknown command 'llh' (--help lists them)" llh

# --- input and output that fail
answers_to_everyone --help
seq 100000 >numbers
if [ -w /dev/full ]; then
    basalt hex <numbers >/dev/full 2>err
    [ "$?: $(cat err)" = "1: basalt hex: cannot write to standard output: No space left on device" ] ||
        fail "on a full disk: $(cat err)"
fi
{ basalt hex <numbers 2>err; echo "$?" >code; } | head -n 1 >out
[ "$(cat code): $(cat err)" = "1: basalt hex: cannot write to standard output: Broken pipe" ] ||
    fail "with a pipe that was closed: $(cat code err)"
basalt hex <numbers >&- 2>err
[ "$?: $(cat err)" = "1: basalt hex: cannot write to standard output: Bad file descriptor" ] ||
    fail "without an output: $(cat err)"
run hex <.
[ $code -eq 1 ] && [ "$(cat err)" = "basalt hex: cannot read standard input: Is a directory" ] ||
    fail "from a folder: exit $code, $(cat err)"

# --- a locale with a decimal comma changes nothing
echo "1.5 0 0.25" >line
if localedef -i de_DE -f UTF-8 "$work/de_DE.UTF-8" 2>/dev/null; then
    LOCPATH=$work LC_ALL=de_DE.UTF-8 basalt llh2xyz --precision 2 <line >out
    [ "$(cat out)" = "452681.73 0.00 6340721.90" ] || fail "with a decimal comma: $(cat out)"
fi

# --- every example of the help does what it says, and the manual and the completion know every command
succeeds --help
commands=$(awk '/^  [a-z]/ { print $1 }' out)
[ "$(wc -w <<<"$commands")" -ge 17 ] || fail "the help shows only: $commands"
succeeds --man
mv out man
succeeds --completion
. ./out
for command in $commands; do
    succeeds "$command" --help
    awk 'length > 110' out | grep . && fail "the help of $command is too wide"
    sed '1,/^For example/d; /^What all/,$d; /^$/d' out >told
    grep '^  \$ ' told | cut -c5- >shell
    : >done
    while IFS= read -r line; do
        { echo "  \$ $line"; bash -c "$line"; } >>done 2>&1
    done <shell
    [ -s shell ] && cmp -s told done || fail "the examples of $command: $(cat done)"
    grep -q "^\.SS $command" man || fail "the manual has no $command"
    COMP_WORDS=(basalt "$command" --h) COMP_CWORD=2
    _basalt
    [ "${COMPREPLY[*]}" = --help ] || fail "completion of $command: ${COMPREPLY[*]}"
done
COMP_WORDS=(basalt llh) COMP_CWORD=1
_basalt
[ "${COMPREPLY[*]}" = llh2xyz ] || fail "completion of llh: ${COMPREPLY[*]}"
finish
