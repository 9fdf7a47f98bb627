# Sourced by the programs' tests: a scratch folder, and what every program has to do.
# Sets program, data (absolute, empty for a test without), here (the test's folder), work (the current folder) and
# failures.

awk() { LC_ALL=C command awk "$@"; }  # numbers as the files write them, whatever the locale
set -u
program=$(realpath "$1")
data=${2:+$(realpath "$2")}
here=$(realpath "$(dirname "$0")")
work=$(realpath "$(mktemp -d)")
trap 'rm -rf "$work"' EXIT
cd "$work" || exit 1
failures=0

fail() {
    echo "FAILED: $*"
    failures=$((failures + 1))
}

# run ARGUMENT...: report in `out`, messages in `err`, exit code in `code`
run() {
    "$program" "$@" >out 2>err
    code=$?
}

succeeds() {
    run "$@"
    [ $code -eq 0 ] && [ ! -s err ] || fail "exit $code from $*: $(cat err)"
}

# ends_with CODE MESSAGE ARGUMENT...: one line that says so, nothing on standard output
ends_with() {
    run "${@:3}"
    [ "$code,$(cat err),$(cat out)" = "$1,${program##*/}: $2," ] || fail "${*:3}: exit $code, $(cat err); expected $1, $2"
}

# refused MESSAGE ARGUMENT...: for what the user did
refused() { ends_with 2 "$@"; }

# fails MESSAGE ARGUMENT...: for what the system did
fails() { ends_with 1 "$@"; }

# checks_each FACTS [KIND]: each line of the file is [KIND: ]INPUT => WANT, for a function check_KIND INPUT WANT
checks_each() {
    local fact kind input
    while IFS= read -r fact; do
        [[ $fact = *' => '* && $fact != '#'* ]] || continue
        kind=${2:-${fact%%: *}} input=${fact%% => *}
        "check_$kind" "${input#"$kind: "}" "${fact#* => }"
    done <"$1"
}
# Of a command line: its refusal; a line of its report
check_options() { eval "refused \"\$2\" $1"; }
check_report() { eval "succeeds $1" && shows "$2"; }

# shows LINE: the report has this line, runs of blanks counting as one
shows() { sed 's/  */ /g; s/^ //; s/ $//' out | grep -qxF -- "$1" || fail "no line '$1' in: $(head -c 900 out)"; }

# figure LABEL: what the report says behind a label, without separators of thousands
figure() { sed -n "s/^  $1  *//p" out | sed 's/\([0-9]\),\([0-9]\)/\1\2/g'; }

# is LABEL EXPECTED: the figure, units aside
is() { [[ "$(figure "$1") " = "$2 "* ]] || fail "$1: $(figure "$1"), expected $2"; }

# size BITMAP, pixels BITMAP X Y COUNT: WIDTHxHEIGHT, and RRGGBB of pixels of 32 bits in a row, one a line
size() { od -An -v -td4 -j18 -N8 "$1" | sed 's/^ *//; s/  */x/'; }
pixels() {
    local header=($(od -An -v -td4 -j18 -N8 "$1"))
    od -An -v -tx4 -w4 -j$((54 + 4 * ((header[1] - 1 - $3) * header[0] + $2))) -N$((4 * $4)) "$1" | cut -c4- | tr a-f A-F
}

# survives FILE ARGUMENT...: 150 damaged copies of the file, named damaged, are read or refused by name
survives() {
    local seed
    for seed in $(seq 150); do
        awk -v seed="$seed" 'function below(n) { return int(rand() * n) }
            BEGIN { srand(seed); n = split("0 9 - . e , inf nan # \t \r \377 1e99 \1", bad, " ") }
            rand() > .15 { print; next }
            { at = below(length + 1); kind = below(5) }
            kind < 3 { print substr($0, 1, at) bad[1 + below(n)] substr($0, at + 1 + kind) }
            kind == 3 { print $0 "\n" $0 }' "$1" >damaged
        code=0
        timeout 20 "$program" "${@:2}" >out 2>err || code=$?
        [ $code -eq 0 ] && ! grep -qwiE 'nan|inf' out || [ "$code $(grep -c "^${program##*/}: damaged" err)" = "2 1" ] ||
            fail "exit $code from $1 damaged by seed $seed: $(head -n 3 err)"
    done
}

# close_to WHAT ACTUAL EXPECTED TOLERANCE
close_to() {
    awk -v a="$2" -v b="$3" -v t="$4" 'BEGIN { exit !(a != "" && a - b <= t && b - a <= t) }' ||
        fail "$1: $2, expected $3"
}

# answers_to_everyone ARGUMENT...: usage, version, and with these arguments a full disk
answers_to_everyone() {
    local name=${program##*/}
    succeeds --help
    grep -q "^Usage: $name" out || fail "--help shows no usage"
    succeeds --version
    grep -Eq "^$name [0-9]+\.[0-9]+\.[0-9]+$" out || fail "--version shows no version"
    refused "unknown option '--colour' (--help lists them)" --colour
    refused "unknown option '-v' (--help lists them)" -v
    [ -w /dev/full ] || return
    "$program" "$@" >/dev/full 2>err
    code=$?
    [ "$code,$(cat err)" = "1,$name: cannot write to standard output: No space left on device" ] ||
        fail "exit $code on a full disk: $(cat err)"
}

finish() {
    [ $failures -eq 0 ] && echo "all passed"
    exit $((failures != 0))
}
