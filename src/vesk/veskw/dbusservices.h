// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDBusInterface>
#include <QDBusPendingCall>

// Every D-Bus service that the program talks to, under the names that contracts/*.xml declare. Each call of
// these makes a proxy of its own, on the stack or, through `new`, on the heap of the caller; nothing is
// cached. Making a proxy asks the service for its introspection data and so waits for it. A bus or service
// that is not there shows in the reply of the call that follows. No call has a time limit but that of the bus
// library.
namespace dbusservices {

// Session bus: the connections of this machine.
QDBusInterface networkDaemon();

// System bus: the sibling service that prepares the machine and installs what the program has staged.
QDBusInterface veskg(QObject *parent);

// Starts onDomainConfig(operation) on a proxy from veskg(). The call ends in any case, where there is no bus
// with an error: the bus library alone would never report on one.
QDBusPendingCall startDomainConfig(QDBusInterface *veskg, const QString &operation);

// System bus: the identity service; its property "Enable" lets domain accounts log in.
QDBusInterface iam();

// Asks the login manager for a reboot and waits for its answer, which is not looked at.
void requestReboot();

} // namespace dbusservices
