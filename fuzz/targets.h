// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>

// What is fed with generated input. Each target takes one input through real code and ends the process by
// require() when an invariant does not hold. Targets write to the program's fixed paths, so they run in an
// isolated view only; see fuzz/run.
namespace fuzz {

using Target = void (*)(const QByteArray &input);

// Replies of the management server, through the pages and the panel that listen for them. Such an input is a
// text that replies.h takes apart.
void serverPage(const QByteArray &input);    // CA, then state before a join
void accountPage(const QByteArray &input);   // account check
void aliasRule(const QByteArray &input);     // alias rule, then check by the server
void aliasPattern(const QByteArray &input);  // alias and the rule's regular expression alone
void joinReply(const QByteArray &input);     // join
void leavePanel(const QByteArray &input);    // state before leaving, then authorisation
void removalReply(const QByteArray &input);  // removal
void replyHeader(const QByteArray &input);   // header lines and body as the transport takes them
void requestTarget(const QByteArray &input); // host and port that a user typed

// Files of the machine.
void recordFile(const QByteArray &input);   // /etc/vesk/userinfo.json
void machineFile(const QByteArray &input);  // /usr/share/vesk/machine.txt
void hostNameFile(const QByteArray &input); // /etc/hostname
void backupConfig(const QByteArray &input); // /etc/vesk/config.ini
void pemFiles(const QByteArray &input);     // CA, certificate and key of the transport
void stagedFiles(const QByteArray &input);  // what the client stages for installation

// The target of this name, null for an unknown one.
Target targetNamed(const QByteArray &name);

} // namespace fuzz
