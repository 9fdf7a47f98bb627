#!/usr/bin/env bash
# The tool from the outside: the facts of basalt.facts, input and output of every kind, and its own help.
# Usage: basalt_test.sh PROGRAM
. "$(dirname "$0")/../console/program_test.sh"
PATH=$(dirname "$program"):$PATH

# gives EXPECTED ARGUMENT... <input: exactly that, and nothing to complain of
gives() {
    local expected=$1
    shift
    succeeds "$@"
    [ "$(cat out)" = "$expected" ] || fail "$*: $(head -c 300 out); expected: ${expected:0:300}"
}
# failed_with EXIT_CODE MESSAGE: what `hex` reported in err
failed_with() { [ "$1: $(cat err)" = "1: basalt hex: $2" ] || fail "$1: $(cat err), expected: $2"; }

# --- there and back
LC_ALL=C seq -f %.9f -400 0.7313 400 >angles
succeeds dms --degrees --precision 4 <angles
mv out dms
gives "$(cat angles)" dms --degrees --inverse <dms

# --- single lines
printf '# north,east\r\n0,0,first\r\n\r\n0,10\r\n10,10\r\n10,0\r\n0,0\r\n' >site.csv
printf '0,0\n0,1\n' >two.csv
printf '0,0\n0,x\n' >bad.csv
# ARGUMENTS < LINE: the output, or error: and what is reported of the line; ARGUMENTS: what is wrong with them
check_line() {
    local want=$2 line=/dev/null
    [[ $1 != *' < '* ]] || { printf '%b\n' "${1#* < }" >line && line=line; }
    eval "run ${1%% < *}" <$line
    case $line,$want in
        line,error:*) want="1,basalt ${1%% *}: line 1: ${want#error: }," ;;
        line,*) want=0,,$(printf '%b' "$want") ;;
        *) want="2,basalt ${1%% *}: ${want#error: }," ;;
    esac
    [ "$code,$(cat err),$(cat out)" = "$want" ] || fail "$1: $code,$(head -c 300 err),$(head -c 300 out)"
}
printf '5 15\n' >outside
checks_each "$here/basalt.facts" line
refused "no command given (--help lists them)"
refused "unexpected argument 'x' (--help shows what is taken)" help dms x
refused "unknown command 'ab' (--help lists them)" ab
refused "unknown command 'llh2xzy': did you mean llh2xyz? (--help lists them)" llh2xzy
BASALT_ANGLES=degrees gives "0.0000" distance <<<"90 2 90 4"
run mjd --inverse < <(seq -f x%g 30)
[ "$(wc -l <err): $(tail -n 1 err)" = "21: basalt mjd: 30 lines were skipped, of which the first 20 are listed" ] ||
    fail "many bad lines: $(tail -n 1 err)"

# --- long lines, bad lines among good ones, every byte, a conversation
head -c 3000 "$program" | tr -d '\n\r' >bytes
gives "$(od -An -v -tx1 bytes | tr -d ' \n')" hex <bytes
mv out hex
succeeds unhex <hex
head -c -1 out | cmp -s - bytes || fail "bytes come back otherwise"
{ echo 5 5; printf '5 5 %01048573d\n' 0; printf '5 5 %02500000d\r\n' 0; echo 5 15; } >line
run contains site.csv <line
[ $code -eq 1 ] && [ "$(cat out)" = $'1\n0' ] && [ "$(grep -c 'longer than 1048576 bytes' err)" -eq 2 ] ||
    fail "long lines: exit $code, $(head -c 300 err)"
{ printf '%01048576d\r\n' 0; printf '%01048576d' 0; } >line
succeeds hex <line
[ "$(wc -lc <out | tr -s ' ')" = " 2 4194306" ] || fail "the longest lines as digits: $(wc out)"
printf '1 2\n1 x\n\0\n3 4\n5' >line
run contains site.csv <line
[ "$code: $(cat out err)" = "1: 1
1
basalt contains: line 2: expected an easting in metres, not 'x'
basalt contains: line 3: expected a northing in metres, not '?'
basalt contains: line 5: expected an easting in metres, but the line ends before it" ] ||
    fail "bad lines: exit $code, $(cat out err)"
coproc basalt mjd
echo 2000-01-01 >&"${COPROC[1]}"
read -r -t 20 answer <&"${COPROC[0]}" && [ "$answer" = 51544 ] || fail "no result before the input has ended"
eval "exec ${COPROC[1]}>&-"

# --- input and output that fail
answers_to_everyone --help
seq 100000 >numbers
if [ -w /dev/full ]; then
    basalt hex <numbers >/dev/full 2>err
    failed_with $? "cannot write to standard output: No space left on device"
fi
{ basalt hex <numbers 2>err; echo "$?" >code; } | head -n 1 >out
[ "$(cat code):$(cat err)" = 141: ] || fail "a closed pipe: $(cat code err)"
basalt hex <numbers >&- 2>err
failed_with $? "cannot write to standard output: Bad file descriptor"
basalt hex <. 2>err >out
failed_with $? "cannot read standard input: Is a directory"

# --- a locale with a decimal comma changes nothing
if localedef -i de_DE -f UTF-8 "$work/de_DE.UTF-8" 2>/dev/null; then
    LOCPATH=$work LC_ALL=de_DE.UTF-8 basalt llh2xyz --precision 2 <<<"1.5 0 0.25" >out
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
# completes TO WORD...: what the completion makes of a command line
completes() {
    COMP_WORDS=("${@:2}") COMP_CWORD=$(($# - 2))
    _basalt
    [ "${COMPREPLY[*]}" = "$1" ] || fail "completion of ${*:2}: ${COMPREPLY[*]}"
}
for command in $commands; do
    succeeds help "$command"
    awk 'length > 110' out | grep . && fail "the help of $command is too wide"
    sed '1,/^For example/d; /^What all/,$d; /^$/d' out >shown
    grep '^  \$ ' shown | cut -c5- >shell
    while IFS= read -r line; do
        { echo "  \$ $line"; bash -c "$line"; } 2>&1
    done <shell >done
    [ -s shell ] && cmp -s shown done || fail "the examples of $command: $(cat done)"
    grep -q "^\.SS $command" man || fail "the manual has no $command"
    completes --help basalt "$command" --h
done
completes llh2xyz basalt llh
finish
