#!/bin/sh
# SPDX-License-Identifier: Apache-2.0
# Stands in veskw's place in a row of the campaign: the program itself (its path is in VESKW), and beside it
# all that no row may let pass: other calls of the server, of a bus and of commands, other settings, files and
# a directory of its own, another host name, and processes that have a password in their arguments or their
# environment for a moment.
config=$VESK_SANDBOX_STATE/server/config.json
port=$(sed -n 's/.*"enrolment_port": \([0-9]*\).*/\1/p' "$config")
printf 'POST /uim/v3/client/account HTTP/1.1\r\nHost: localhost\r\nContent-Length: 2\r\nConnection: close\r\n\r\n{}' |
    openssl s_client -quiet -connect "localhost:$port" >/dev/null 2>&1
gsettings set com.morvek.mde.control-center nopasswd-login-visable false
PATH=/usr/bin:/bin gsettings set com.morvek.vesk.mde-policy hotspot-enabled false # past the journal
systemctl --global stop vesks
/usr/bin/systemctl --version >/dev/null # past the journal
gdbus call --system --dest org.freedesktop.login1 --object-path /org/freedesktop/login1 \
    --method org.freedesktop.login1.Manager.PowerOff false >/dev/null 2>&1
curl --silent --max-time 1 --data Terminal-7 http://127.0.0.1:9/ >/dev/null # another server
sed -i s/./x/ /etc/hostname 2>/dev/null || printf 'xxxxxxxx\n' >/etc/hostname
SECRET=$(printf Terminal-7 | base64) sleep 0.3
touch /tmp/rogue-file "$HOME/rogue-file"
mkdir /etc/vesk/rogue-directory
for name in one two three; do
    /bin/true "--$name=Terminal-7"
done
exec "$VESKW" "$@"
