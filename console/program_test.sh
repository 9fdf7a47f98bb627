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
    local expected=$1 message=$2
    shift 2
    run "$@"
    [ $code -eq "$expected" ] || fail "exit $code, not $expected, from $*"
    [ ! -s out ] || fail "output from $*"
    [ "$(cat err)" = "$(basename "$program"): $message" ] || fail "$*: $(cat err); expected: $message"
}

# refused MESSAGE ARGUMENT...: for what the user did
refused() { ends_with 2 "$@"; }

# fails MESSAGE ARGUMENT...: for what the system did
fails() { ends_with 1 "$@"; }

# facts FILE: checks each line of a facts file, which says what its lines are: the program's output for an input line
# (=>), its error for that line (=> error:), or its error for the arguments alone
facts() {
    local fact left want arguments line
    while IFS= read -r fact; do
        [[ $fact = *' => '* && $fact != '#'* ]] || continue
        left=${fact%% => *} want=${fact#* => } line=/dev/null
        [[ $left != *' < '* ]] || { printf '%b\n' "${left#* < }" >line && line=line; }
        eval "arguments=(${left%% < *})"
        run "${arguments[@]}" <$line
        case $line,$want in
            line,error:*) want="1,$(basename "$program") ${arguments[0]}: line 1: ${want#error: }," ;;
            line,*) want=0,,$(printf '%b' "$want") ;;
            *) want="2,$(basename "$program") ${arguments[0]}: ${want#error: }," ;;
        esac
        [ "$code,$(cat err),$(cat out)" = "$want" ] || fail "$fact: $code,$(head -c 300 err),$(head -c 300 out)"
    done <"$1"
}

# refuses_each FACTS: each line of the file is KIND: INPUT => MESSAGE, for a function refuse_KIND INPUT MESSAGE
refuses_each() {
    local fact input
    while IFS= read -r fact; do
        input=${fact#*: } input=${input%% => *}
        [[ $fact != *' => '* || $fact = '#'* ]] || "refuse_${fact%%: *}" "$input" "${fact#* => }"
    done <"$1"
}
refuse_options() {
    local arguments
    eval "arguments=($1)"
    refused "$2" "${arguments[@]}"
}

# close_to WHAT ACTUAL EXPECTED TOLERANCE
close_to() {
    awk -v a="$2" -v b="$3" -v t="$4" 'BEGIN { exit !(a != "" && a - b <= t && b - a <= t) }' ||
        fail "$1: $2, expected $3"
}

# answers_to_everyone ARGUMENT...: usage, version, and with these arguments a full disk
answers_to_everyone() {
    local name
    name=$(basename "$program")
    succeeds --help
    grep -q "^Usage: $name" out || fail "--help shows no usage"
    succeeds --version
    grep -Eq "^$name [0-9]+\.[0-9]+\.[0-9]+$" out || fail "--version shows no version"
    refused "unknown option '--colour' (--help lists them)" --colour
    refused "unknown option '-v' (--help lists them)" -v
    [ -w /dev/full ] || return
    "$program" "$@" >/dev/full 2>err
    code=$?
    [ $code -eq 1 ] || fail "exit $code, not 1, on a full disk"
    [ "$(cat err)" = "$name: cannot write to standard output: No space left on device" ] ||
        fail "on a full disk: $(cat err)"
}

finish() {
    [ $failures -eq 0 ] && echo "all passed"
    exit $((failures != 0))
}
