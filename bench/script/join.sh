#!/bin/sh
# SPDX-License-Identifier: Apache-2.0
# The exchanges of a join as an administrator would script them with curl and busctl: the same requests to the server, the
# same messages to the services and the same commands, in the same order. Runs inside a sandbox world, in the program's
# place. Prints the milliseconds that it took, and ends with 1 where an answer is not that of a join that works.
set -eu

log=$VESK_SANDBOX_STATE/journal.log
port=$(sed -n 's/.*enrolment port \([0-9]*\).*/\1/p' "$log" | tail -n 1)
server=https://localhost:$port
machine=$(cat /usr/share/vesk/machine.txt)
staged=/tmp/vesk
umask 077
mkdir -p "$staged"

session() { busctl --address="$DBUS_SESSION_BUS_ADDRESS" "$@" >/dev/null; }
system() { busctl --address="$DBUS_SYSTEM_BUS_ADDRESS" "$@" >/dev/null; }
fetch() { curl --silent --show-error --fail --cacert "$staged/clientapi_ca.crt" "$@"; }
accepted() { case "$1" in *'"code":0'*) ;; *) echo "refused: $1" >&2; exit 1 ;; esac; }
# decoded NAME REPLY: a member of the reply that holds a file in base64.
decoded() { printf '%s' "$2" | sed -n "s/.*\"$1\":\"\([^\"]*\)\".*/\1/p" | base64 -d; }

begin=$(date +%s%N)

session call com.morvek.daemon.Network /com/morvek/daemon/Network com.morvek.daemon.Network GetActiveConnectionInfo
reply=$(curl --silent --show-error --fail --insecure "$server/apiauth/v1/client/ca_cert")
accepted "$reply"
decoded ca_cert "$reply" >"$staged/clientapi_ca.crt"
accepted "$(fetch "$server/uim/v3/client/status?machine_id=$machine&keyword=join")"
accepted "$(printf '{"username":"liming","password":"Terminal-7"}' | fetch --data @- "$server/uim/v3/client/auth")"
accepted "$(fetch "$server/uim/v3/client/config?key=pc_name_rules")"

gsettings set com.morvek.mde.control-center auto-login-visable false
gsettings set com.morvek.mde.control-center nopasswd-login-visable false
system call com.morvek.vesk.veskg /com/morvek/vesk/veskg com.morvek.vesk.veskg onDomainConfig s join
systemctl --global enable vesks
systemctl --global enable mmcs
session call com.morvek.daemon.Network /com/morvek/daemon/Network com.morvek.daemon.Network GetActiveConnectionInfo
reply=$(fetch --data "{\"machine_id\":\"$machine\",\"name\":\"terminal-01\",\"username\":\"liming\",\"mac\":\"\"}" \
    "$server/uim/v3/client/join")
accepted "$reply"
decoded cert "$reply" >"$staged/client.crt"
decoded key "$reply" >"$staged/client.key"
printf '{"is_Domain": true}\n' >"$staged/userinfo.json"
system call com.morvek.vesk.veskg /com/morvek/vesk/veskg com.morvek.vesk.veskg onDomainConfig s copyConfig
system set-property com.morvek.vesk.iam /com/morvek/vesk/iam com.morvek.vesk.iam Enable b true

end=$(date +%s%N)
echo $(((end - begin) / 1000000))
