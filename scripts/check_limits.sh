#!/usr/bin/env bash
# Runs the memory family for real where the system is short of file size, address space, descriptors or room on
# the disk: every answer the documented one, no signal, nothing left in the temporary folder.
# Usage: scripts/check_limits.sh BUILD_DIRECTORY    (one with tests, without sanitizers)
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"
probe=$(realpath "${1:?build directory}")/tests/limits_probe
cmake --build "$1" --target limits_probe
folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT

short_of() {  # shortage, command that brings it about
    local status=0
    TMPDIR=$folder bash -c "$2; exec $probe $1" || status=$?
    [ "$status" -eq 0 ] || { echo "$1: exit status $status" >&2; exit 1; }
    [ -z "$(ls -A "$folder")" ] || { echo "$1: files stayed:" "$(ls -A "$folder" | head -n 5)" >&2; exit 1; }
    echo "$1: held"
}
short_of file_size 'ulimit -f 1024'
short_of address_space 'ulimit -v 300000'
short_of no_descriptors 'ulimit -n 40'
short_of few_descriptors 'ulimit -n 40'

# A small file system in a mount table of its own, which ends with the command.
own_mounts=(unshare --mount)
[ "$(id -u)" = 0 ] || own_mounts=(unshare --map-root-user --mount)
mount_small="mount -t tmpfs -o size=8m tmpfs '$folder'"
if "${own_mounts[@]}" bash -c "$mount_small" 2>/dev/null; then
    "${own_mounts[@]}" bash -c "$mount_small && TMPDIR='$folder' '$probe' full_disk && [ -z \"\$(ls -A '$folder')\" ]" ||
        { echo "full_disk: exit status $?, or files stayed" >&2; exit 1; }
    echo "full_disk: held"
else
    echo "full_disk: not checked, no file system can be mounted here"
fi
