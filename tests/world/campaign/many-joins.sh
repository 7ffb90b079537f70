#!/bin/sh
# SPDX-License-Identifier: Apache-2.0
# many-joins.sh VESK-SANDBOX N: N joins in a row, each in a new world. Nothing of any is left: no process, no temporary
# file, no socket. Processes are known by their environment.
set -eu
directory=$(mktemp -d)
trap 'rm -rf "$directory"' EXIT
left() {
    for process in /proc/[0-9]*; do
        { tr '\0' '\n' <"$process/environ" | grep -qxF -e "TMPDIR=$TMPDIR" -e "VESK_SANDBOX_STATE=$directory/world"; } 2>/dev/null ||
            continue
        [ "${process#/proc/}" = $$ ] || { tr '\0' ' ' <"$process/cmdline"; } 2>/dev/null || :
    done
    find "$TMPDIR" -mindepth 1
    find "$directory/world" -type s
}
for number in $(seq "$2"); do
    export TMPDIR="$directory/scratch"
    mkdir "$TMPDIR"
    "$1" --state "$directory/world" --headless --autopilot join >"$directory/said" 2>&1 ||
        { echo "join $number:"; cat "$directory/said"; exit 1; }
    seconds=0 # what is about to end gets the time to do so
    while [ -n "$(left)" ]; do
        [ "$seconds" -lt 5 ] || { echo "left by join $number:"; left; exit 1; }
        seconds=$((seconds + 1))
        sleep 1
    done
    rm -rf "$directory/world" "$TMPDIR"
done
