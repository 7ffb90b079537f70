// SPDX-License-Identifier: Apache-2.0
#include "methodservices.h"

#include "configinstaller.h"
#include "veskgadaptor.h"

#include "state/userunits.h"

#include <QDeadlineTimer>
#include <QThread>

namespace sandbox {

namespace {

constexpr int kLimitMs = 10000;
constexpr int kPollMs = 50;

bool usesKeys(const StateDirectory &state)
{
    const UserUnits units(state);
    for (const QString &unit : UserUnits::names()) {
        if (units.isEnabled(unit) || units.isRunning(unit))
            return true;
    }
    return false;
}

} // namespace

VeskgService::VeskgService(const StateDirectory &state, const QJsonObject &script)
    : Service(state, script, QStringLiteral("com.morvek.vesk.veskg"))
{
    new VeskgAdaptor(this);
}

int VeskgService::onDomainConfig(const QString &operation)
{
    const QString call = QStringLiteral("onDomainConfig(\"%1\")").arg(operation);
    if (operation == QLatin1String("remove"))
        awaitEndOfUserServices();
    if (!begin(operation, call))
        return -1;
    const bool good = carryOut(operation);
    const int result = json::number(now(operation), "result", good ? 0 : -1);
    note(call, QString::number(result));
    leave(operation, result);
    return result;
}

bool VeskgService::carryOut(const QString &operation) const
{
    const ConfigInstaller installer(state());
    if (operation == QLatin1String("join"))
        return installer.prepare();
    if (operation == QLatin1String("copyConfig"))
        return installer.install();
    if (operation == QLatin1String("remove"))
        return installer.remove();
    return false;
}

// The user's services use the keys, so they go first. Who asks for the removal has them stopped and disabled
// by commands that run on their own; where those fail, the removal does not wait endlessly.
void VeskgService::awaitEndOfUserServices() const
{
    const QDeadlineTimer limit(kLimitMs);
    while (!limit.hasExpired() && usesKeys(state()))
        QThread::msleep(kPollMs);
}

} // namespace sandbox
