#!/bin/sh
# SPDX-License-Identifier: Apache-2.0
# Stands in veskw's place in a row of the campaign: the program itself (its path is in VESKW), and beside it
# all that no row may let pass: another call, other settings, the early end of a service, files and a
# directory of its own, and processes that have a password in their arguments for a moment.
config=$VESK_SANDBOX_STATE/server/config.json
port=$(sed -n 's/.*"enrolment_port": \([0-9]*\).*/\1/p' "$config")
printf 'POST /uim/v3/client/account HTTP/1.1\r\nHost: localhost\r\nContent-Length: 2\r\nConnection: close\r\n\r\n{}' |
    openssl s_client -quiet -connect "localhost:$port" >/dev/null 2>&1
gsettings set com.morvek.mde.control-center nopasswd-login-visable false
PATH=/usr/bin:/bin gsettings set com.morvek.vesk.mde-policy hotspot-enabled false # past the journal
systemctl --global stop vesks
touch /tmp/rogue-file "$HOME/rogue-file"
mkdir /etc/vesk/rogue-directory
for name in one two three; do
    /bin/true "--$name=Terminal-7"
done
exec "$VESKW" "$@"
