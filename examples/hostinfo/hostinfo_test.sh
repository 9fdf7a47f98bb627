#!/usr/bin/env bash
# The program from the outside: its facts against what the system's own tools say, and every refusal.
# Usage: hostinfo_test.sh PROGRAM
. "$(dirname "$0")/../../console/program_test.sh"
export LC_ALL=C.UTF-8

TMPDIR='' succeeds
shows "temporary /tmp/"
TMPDIR=$work succeeds
shows "temporary $work/"
shows "path $program"
# Ethernet by the system's own account: no wireless device, in the order of the indexes
addresses=$(for device in /sys/class/net/*; do
    [ "$(cat "$device/type")" = 1 ] && [ ! -e "$device/wireless" ] && [ ! -e "$device/phy80211" ] &&
        echo "$(cat "$device/ifindex") $(tr -d : <"$device/address")"
done 2>/dev/null | sort -n | cut -d' ' -f2 | paste -sd, | sed 's/,/, /g')
[ ! -d /sys/class/net ] || shows "hardware addresses${addresses:+ $addresses}"

printf x >"été 日本.txt"
TZ=UTC touch -a -d '2001-02-03 04:05:06' "été 日本.txt"
succeeds "$work/été 日本.txt"
shows "last read 2001-02-03 04:05:06"
made=$(TZ=UTC stat -c %w "été 日本.txt")
[ "$made" = - ] || shows "created ${made%%.*}"
mkdir data.d
succeeds "$work/data.d"
shows "composed directory \\${work#/}\\data.d"
for option in root product; do # 259 characters, which are more bytes
    long=$(printf '\303\251%0258d' 0)
    succeeds --$option "$long"
    shows "$option $long"
    refused "--$option takes a path of 1 to 259 characters, not '??$(printf '%038d' 0)...'" --$option "${long}1"
done

# JSON, read back by whoever can
succeeds --json --root "$(printf 'a"b\\c\td')" 'été 🌍.txt'
grep -qP '[^\x00-\x7F]' out && fail "JSON is not ASCII"
if command -v python3 >/dev/null; then
    python3 - <<'PYTHON' || fail "JSON reads otherwise"
import json
facts = json.load(open("out"))
assert [*facts] == ["program", "system", "folders", "network", "path"]
assert (facts["folders"]["root"], facts["system"]["handheld"]) == ('a"b\\c\td', 1)
assert (facts["path"]["name"], facts["path"]["is file"]) == ("\u00e9t\u00e9 \U0001F30D", False)
assert isinstance(facts["network"]["hardware addresses"], list)
PYTHON
fi

# The log: the text, with carriage returns
logs() { sed 's/$/\r/' out | cmp -s - "$1" || fail "$1 is not the text"; }
succeeds --log host.log "$work/data.d"
logs host.log
succeeds --json --log host.log "$work/data.d"
grep -q '^  handheld  *1' host.log || fail "the log is not text beside JSON"
mkdir logs
succeeds --log "logs\\été $(printf '\351').log" "$work/data.d"
logs "logs/été $(printf '\351').log"
for log in nowhere/host.log data.d; do fails "cannot write the log $log" --log "$log"; done
long=$(printf %0259d 0)
(
    ulimit -f 1 # KiB, as a full disk
    fails "cannot write the log full.log" --log full.log --root "$long" --product "$long"
    exit $failures
)
failures=$?
mkfifo pipe
for log in pipe /dev/null; do refused "--log takes a file, not a device or a pipe: $log" --log "$log"; done

# The file that is asked about is no log, by whatever name, and stays.
printf x >asked.txt
mkdir -p folder
ln -s ../asked.txt folder/link.txt
refused "--log would overwrite folder\\link.txt" --log "$work/asked.txt" 'folder\link.txt'
checks_each "$here/hostinfo.facts"
[ "$(cat asked.txt)" = x ] || fail "the file that is asked about was overwritten"
answers_to_everyone
finish
