// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <optional>

class QDBusPendingCall;
class QObject;

// Everything that the program asks of D-Bus services, whose names contracts/*.xml declare. Each operation
// makes a proxy of its own and, unless told otherwise, waits for the answer, with no time limit but that of
// the bus library, 25 seconds. A bus or service that is not there is a failed call. `parent` becomes the
// parent of the proxy.
namespace dbusservices {

// The network daemon's JSON text about this machine's connections, "null" when there is none; no value when
// the call failed or is not answered within 5 seconds.
std::optional<QString> activeConnections();

// Has the sibling service prepare the machine. Does not wait: the call ends later, where there is no bus with
// an error. `operation` is "join"; the proxy lives as long as `parent`.
QDBusPendingCall joinDomain(QObject *parent, const QString &operation);

// Has the sibling service install the record and the certificates that were staged. The result is not looked
// at.
void installStagedConfig(QObject *parent);

// Has the sibling service take back what joinDomain() prepared. The result is not looked at.
void leaveDomain(QObject *parent);

// Lets domain accounts log in, or no longer. Whether the identity service took the new state. Asks for its
// introspection data first, and so may wait twice.
bool enableDomainLogin(bool enabled);

// Asks the login manager for a reboot. The answer is not looked at.
void requestReboot();

} // namespace dbusservices
