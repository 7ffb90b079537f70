<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="zh_CN">
<context>
    <name>Text</name>
    <message>
        <source>%1, SHA-256 %2</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the certificate is of another CA, has ended, or is for another name; the clock here says %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is it HTTPS with TLS 1.2 or newer at this port?</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>every request is refused: %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>before a join, /etc/vesk holds at most a CA: a regular file of root&apos;s, mode 0644</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>no CA here: the first call trusts whoever answers</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>install the server&apos;s CA as %1 beforehand</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>every call is verified under %1: %2</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the server&apos;s certificate passes</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>not verified, SHA-256 of the server&apos;s certificate %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>check the name and the resolver of this terminal</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 answers</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>check port, route, firewall and proxy; is the server running?</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the server does not tell its time</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the clock here is %1 seconds ahead of the server&apos;s</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>set the clock: certificates fail where it is wrong</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is it a management server, and nothing in between?</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>status %1, and the reply is not JSON</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>status %1, the server says: %2</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>do as the server says</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the reply holds no CA certificate</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>not under the CA that the server hands out: %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>status %1, no reply to go by %2</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>look at the server&apos;s own log</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this terminal may join</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the server has no place for another terminal</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>remove terminals on the server, or extend the licence</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the server has this machine already: %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>remove it there; or do two machines have the same identity?</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>systemctl cannot be run</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is not installed</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>install its package</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is enabled for all users</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is not enabled: %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>systemctl --global enable %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>id cannot be run</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this user may take the terminal out of the domain</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this user may not take the terminal out of the domain</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>who may is in the groups sudo and vesk</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is not a regular file</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>belongs to another user</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>can be written by others</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is too long</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is empty</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is a symbolic link</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not there</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>restore the file, or remove the terminal on the server and join again</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 holds no certificate, or a damaged one</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>restore the file</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>: %1, issued by %2, SHA-256 %3, ends in %4 days</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not valid yet: it begins on %2</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 has ended: on %2</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>check the clock; have the certificate renewed</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>have the certificate renewed before it ends</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>: others can read this key</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>owner root, a group of those who may leave, mode 0640</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>run this program as %1, whose file it is</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>have it installed again: a regular file of root&apos;s, mode 0644, a key 0640</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this user may not read %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>run this program as root, or as a user who may leave the domain</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>: left over, this terminal has not joined</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>remove it, or restore the record</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>cannot tell whether requests would be made: a file cannot be read</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>no CA here: the first server that is asked is trusted</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>restore CA, certificate and key</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>see the files above: all three or, before a join, at most the CA</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>requests are verified and made with the client certificate</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>requests are verified under the CA, without client certificate</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>no certificate with a key</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>cannot tell whether the key belongs to the certificate</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>damaged, or the key does not belong to the certificate</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>restore the pair: both files of the same join</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the key belongs to the certificate</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 ends on %2, in %3 days: %4</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>cannot tell when %1 ends</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>install vesk-mde-schemas, or what the desktop provides in its place</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is installed, with all keys</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>lacks the keys %1</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this user sees the switch</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this user does not see the switch</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is not installed: the enrolment program is aborted in a join</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is not installed: a leave does not restore the desktop</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not HOST:PORT</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not a number of days</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>One JSON object instead of text.</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>Ask a server whether this terminal would join there.</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>Only tell which certificates end within so many days.</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>Write a report without keys and passwords into a new file.</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>Tells what this terminal is, and what is wrong with it.</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>these arguments do not go together, see --help</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this user has no session bus here</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>the system bus cannot be reached</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>systemctl status dbus</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is there</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is started when it is called</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>is not on the bus</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>install its package, or check its status with systemctl</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not there: a join makes it</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not a sticky directory of root&apos;s</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>systemd-tmpfiles --remove --create veskw.conf, which removes what is in it</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>nothing is staged</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>from a join that waits for its reboot, or was given up; the reboot removes it</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>cannot tell whether this terminal has joined</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this terminal has joined</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>this terminal has not joined</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 does not say whether this terminal has joined</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>restore the record, or remove it and join again</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 names no server of a terminal that has joined</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>restore the record, or remove the terminal on the server and join again</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>let all users read the record: mode 0644</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not a regular file, or is too long</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is empty</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is torn: not a JSON object</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>let all users read it: mode 0644</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>have the identity of this machine written there, in one line</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 is not there or cannot be used</source>
        <translation type="unfinished"></translation>
    </message>
    <message>
        <source>%1 does not hold one identity in one line</source>
        <translation type="unfinished"></translation>
    </message>
</context>
</TS>
