// SPDX-License-Identifier: Apache-2.0
#include "servicehost.h"

#include "iamservice.h"
#include "loginservice.h"
#include "networkservice.h"
#include "veskgservice.h"

#include <QCoreApplication>
#include <QDBusError>

#include <cstdio>

namespace sandbox {

namespace {

struct Entry
{
    const char *name;
    const char *busName;
    bool onSystemBus;
};

constexpr Entry kServices[] = {
    {"network", "com.morvek.daemon.Network", false},
    {"veskg", "com.morvek.vesk.veskg", true},
    {"iam", "com.morvek.vesk.iam", true},
    {"login", "org.freedesktop.login1", true},
};

const Entry *find(const QString &name)
{
    for (const Entry &entry : kServices) {
        if (name == QLatin1String(entry.name))
            return &entry;
    }
    return nullptr;
}

void tellLauncher(const char *line)
{
    std::puts(line);
    std::fflush(stdout);
}

std::unique_ptr<Service> make(const QString &name, const StateFolder &state, const ServiceScript &script)
{
    if (name == QLatin1String("network"))
        return std::make_unique<NetworkService>(state, script);
    if (name == QLatin1String("veskg"))
        return std::make_unique<VeskgService>(state, script);
    if (name == QLatin1String("iam"))
        return std::make_unique<IamService>(state, script);
    auto login = std::make_unique<LoginService>(state, script);
    QObject::connect(login.get(), &LoginService::rebootAsked, [] { tellLauncher(ServiceHost::kReboot); });
    return login;
}

int fail(const QString &name, const QString &reason)
{
    std::fprintf(stderr, "service %s: %s\n", qPrintable(name), qPrintable(reason));
    return 1;
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
    const Entry *entry = find(name);
    return entry && entry->onSystemBus;
}

QString ServiceHost::busName(const QString &name)
{
    const Entry *entry = find(name);
    return entry ? QLatin1String(entry->busName) : QString();
}

int ServiceHost::run(const QString &name, const QString &statePath)
{
    const Entry *entry = find(name);
    if (!entry)
        return fail(name, QStringLiteral("unknown; there are %1").arg(names().join(QStringLiteral(", "))));
    const StateFolder state(statePath);
    QString error;
    const std::optional<Scenario> scenario = state.scenario(&error);
    if (!scenario)
        return fail(name, error);

    QDBusConnection bus = entry->onSystemBus ? QDBusConnection::systemBus() : QDBusConnection::sessionBus();
    const std::unique_ptr<Service> service = make(name, state, scenario->service(name));
    if (!bus.isConnected() || !service->publish(bus) || !bus.registerService(QLatin1String(entry->busName)))
        return fail(name, bus.lastError().isValid()
                              ? bus.lastError().message()
                              : QStringLiteral("the bus gives the name to nobody else"));
    tellLauncher(ServiceHost::kReady);
    return QCoreApplication::exec();
}

} // namespace sandbox
