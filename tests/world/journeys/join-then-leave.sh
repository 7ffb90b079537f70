#!/bin/sh
# SPDX-License-Identifier: Apache-2.0
# join-then-leave.sh VESK-SANDBOX SCENARIO: joins in a new world, then plays the scenario in it.
set -eu
state=$(mktemp -d)
trap 'rm -rf "$state"' EXIT
"$1" --state "$state" --headless --autopilot join
"$1" --state "$state" --headless --autopilot leave --scenario "$2"
