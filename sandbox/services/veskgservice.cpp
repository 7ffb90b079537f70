// SPDX-License-Identifier: Apache-2.0
#include "veskgservice.h"

#include "configinstaller.h"
#include "veskgadaptor.h"

namespace sandbox {

VeskgService::VeskgService(const StateFolder &state, const ServiceScript &script)
    : Service(state, script, QStringLiteral("com.morvek.vesk.veskg"))
{
    new VeskgAdaptor(this);
}

bool VeskgService::publish(QDBusConnection bus)
{
    return bus.registerObject(QStringLiteral("/com/morvek/vesk/veskg"), this);
}

int VeskgService::onDomainConfig(const QString &operation)
{
    const QString call = QStringLiteral("onDomainConfig(\"%1\")").arg(operation);
    if (!begin(operation, call))
        return -1;
    const bool good = carryOut(operation);
    const int result = script().operation(operation).result.value_or(good ? 0 : -1);
    note(call, QString::number(result));
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

} // namespace sandbox
