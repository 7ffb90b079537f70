#!/bin/sh
# SPDX-License-Identifier: Apache-2.0
# sees.sh VESK-SANDBOX ROW PATTERN...: with rogue.sh in veskw's place the row fails, and a line of what it
# says matches each pattern.
set -eu
directory=$(mktemp -d)
trap 'rm -rf "$directory"' EXIT
sandbox=$1
row=$2
shift 2
code=0
said=$(TMPDIR=$directory "$sandbox" run "$row" --program "$(dirname "$0")/rogue.sh" 2>&1) || code=$?
printf '%s\n' "$said"
[ "$code" -ne 77 ] || exit 77
[ "$code" -eq 1 ]
for pattern in "$@"; do
    printf '%s\n' "$said" | grep -Eq -e "$pattern" || { echo "no line matches: $pattern"; exit 1; }
done
