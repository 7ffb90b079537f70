// SPDX-License-Identifier: Apache-2.0
#include "servicehost.h"

#include "iamservice.h"
#include "methodservices.h"

#include "journal/commandline.h"

#include <QCoreApplication>
#include <QDBusError>

#include <algorithm>
#include <cstdio>
#include <iterator>

namespace sandbox {

namespace {

template <typename T>
std::unique_ptr<Service> make(const StateDirectory &state, const QJsonObject &script)
{
    return std::make_unique<T>(state, script);
}

struct Entry
{
    const char *name = nullptr;
    const char *busName = nullptr;
    bool onSystemBus = false;
    std::unique_ptr<Service> (*make)(const StateDirectory &, const QJsonObject &) = nullptr;
};

constexpr Entry kServices[] = {
    {"network", "com.morvek.daemon.Network", false, make<NetworkService>},
    {"veskg", "com.morvek.vesk.veskg", true, make<VeskgService>},
    {"iam", "com.morvek.vesk.iam", true, make<IamService>},
    {"login", "org.freedesktop.login1", true, make<LoginService>},
};

// An empty one for an unknown name.
Entry entryOf(const QString &name)
{
    const auto *entry = std::find_if(std::begin(kServices), std::end(kServices), [&](const Entry &candidate) {
        return name == QLatin1String(candidate.name);
    });
    return entry == std::end(kServices) ? Entry() : *entry;
}

} // namespace

QStringList ServiceHost::names()
{
    QStringList result;
    for (const Entry &entry : kServices)
        result.append(QLatin1String(entry.name));
    return result;
}

bool ServiceHost::isOnSystemBus(const QString &name)
{
    return entryOf(name).onSystemBus;
}

QString ServiceHost::busName(const QString &name)
{
    return QLatin1String(entryOf(name).busName);
}

void ServiceHost::tellLauncher(const char *line)
{
    std::puts(line);
    std::fflush(stdout);
}

int ServiceHost::run(const QString &name, const QString &statePath)
{
    const Entry entry = entryOf(name);
    if (entry.make == nullptr)
        return commandline::fail(
            QStringLiteral("no service %1; there are %2").arg(name, names().join(QStringLiteral(", "))), 1);
    const StateDirectory state(statePath);
    QString error;
    const std::optional<Scenario> scenario = state.scenario(&error);
    if (!scenario)
        return commandline::fail(error, 1);

    QDBusConnection bus = entry.onSystemBus ? QDBusConnection::systemBus() : QDBusConnection::sessionBus();
    const std::unique_ptr<Service> service = entry.make(state, scenario->service(name));
    if (!bus.isConnected() || !service->publish(bus) || !bus.registerService(busName(name)))
        return commandline::fail(bus.lastError().isValid()
                                     ? bus.lastError().message()
                                     : QStringLiteral("the bus does not grant the name"),
                                 1);
    tellLauncher(kReady);
    return QCoreApplication::exec();
}

} // namespace sandbox
