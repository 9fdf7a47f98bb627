#!/usr/bin/env bash
# The program from the outside: its facts against what the system's own tools say, and every refusal.
# Usage: hostinfo_test.sh PROGRAM
. "$(dirname "$0")/../../console/program_test.sh"
export LC_ALL=C.UTF-8

# is NAME EXPECTED: the fact of that name
is() {
    local line
    line=$(grep -- "^  $1  " out || grep -x -- "  $1" out) || fail "no fact '$1'"
    line=${line#"  $1"}
    [ "${line#"${line%%[! ]*}"}" = "$2" ] || fail "$1: '$line', expected '$2'"
}

TMPDIR=$work succeeds
is version "Host information 04.01.02.305"
is description "What a host program shows in its about box"
is "operating system" 11
is handheld 1
is language 15
is root ""
is inbox ""
is temporary "$work/"
is path "$program"
is name "$(basename "$program")"
is "is file" yes

# Ethernet by the system's own account: no wireless device, in the order of the indexes
addresses=$(for device in /sys/class/net/*; do
    [ "$(cat "$device/type")" = 1 ] && [ ! -e "$device/wireless" ] && [ ! -e "$device/phy80211" ] &&
        echo "$(cat "$device/ifindex") $(tr -d : <"$device/address")"
done 2>/dev/null | sort -n | cut -d' ' -f2 | paste -sd, | sed 's/,/, /g')
is "hardware addresses" "$addresses"

TMPDIR='' succeeds --root 'D:\Root' --product='D:\Product\' 'C:\data\survey\job.tar.gz'
is root 'D:\Root'
is product 'D:\Product\'
is inbox 'D:\Product\\Inbox'
is temporary /tmp/
is drive C:
is directory '\data\survey\'
is name job.tar
is extension .gz
is "composed directory" 'C:\data\survey'
is "composed name" job.tar.gz
is "is file" no
is "is directory" no
is created ""

printf x >"été 日本.txt"
TZ=UTC touch -a -d '2001-02-03 04:05:06' "été 日本.txt"
succeeds "$work/été 日本.txt"
is name "été 日本"
is "is file" yes
is "last read" "2001-02-03 04:05:06"
made=$(TZ=UTC stat -c %w "été 日本.txt")
[ "$made" = - ] || is created "${made%%.*}"
mkdir data.d
succeeds "$work/data.d"
is "is directory" yes
is "composed directory" "\\${work#/}\\data.d"
LC_ALL=C.UTF-8 succeeds "$(printf 'line\nbreak')"
is path 'line?break'

# JSON, read back by whoever can
succeeds --json --root "$(printf 'a"b\\c\td')" 'été 🌍.txt'
grep -qP '[^\x00-\x7F]' out && fail "JSON is not ASCII"
if command -v python3 >/dev/null; then
    python3 - <<'PYTHON' || fail "JSON reads otherwise"
import json
facts = json.load(open("out"))
assert facts["folders"]["root"] == 'a"b\\c\td', facts["folders"]["root"]
assert facts["path"]["path"] == "\u00e9t\u00e9 \U0001F30D.txt", facts["path"]["path"]
assert facts["path"]["name"] == "\u00e9t\u00e9 \U0001F30D"
assert facts["path"]["is file"] is False
assert facts["system"]["handheld"] == 1
assert isinstance(facts["network"]["hardware addresses"], list)
assert [*facts] == ["program", "system", "folders", "network", "path"]
PYTHON
fi

# The log: the text, with carriage returns
succeeds --log host.log "$work/data.d"
sed 's/$/\r/' out | cmp -s - host.log || fail "the log is not the text"
succeeds --json --log host.log "$work/data.d"
grep -q '^  handheld  *1' host.log || fail "the log is not text beside JSON"
mkdir logs
succeeds --log "logs\\été $(printf '\351').log" "$work/data.d"
sed 's/$/\r/' out | cmp -s - "logs/été $(printf '\351').log" || fail "the log is not in its folder"
fails "cannot write the log nowhere/host.log" --log nowhere/host.log
[ ! -w /dev/full ] || fails "cannot write the log /dev/full" --log /dev/full

succeeds --log /dev/null "$work/data.d"
mkfifo pipe
fails "cannot write the log pipe" --log pipe
exec 3<>pipe 4<pipe 3>&- # a reader that waits for nobody
succeeds --log pipe "$work/data.d"
cat <&4 >piped
exec 4<&-
sed 's/$/\r/' out | cmp -s - piped || fail "the log did not go through the pipe"
fails "cannot write the log data.d" --log data.d

# The file that is asked about is no log, by whatever name, and stays.
printf x >asked.txt
mkdir -p folder
ln -s ../asked.txt folder/link.txt
refused "--log would overwrite folder\\link.txt" --log "$work/asked.txt" 'folder\link.txt'
refuses_each "$here/hostinfo.facts"
[ "$(cat asked.txt)" = x ] || fail "the file that is asked about was overwritten"

for option in --root --product; do # 259 characters, which are more bytes
    long=$(printf '\303\251%0258d' 0)
    succeeds $option "$long"
    is "${option#--}" "$long"
    refused "option $option takes a path of at most 259 characters, not '??$(printf '%038d' 0)...'" $option "${long}1"
done
succeeds -- --json
is path --json
succeeds ""
is "composed directory" '\'
answers_to_everyone
finish
