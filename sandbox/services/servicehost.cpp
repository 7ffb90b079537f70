// SPDX-License-Identifier: Apache-2.0
#include "servicehost.h"

#include "journal/commandline.h"
#include "journal/error.h"
#include "scenario/scenario.h"

#include <QCoreApplication>
#include <QDBusError>

#include <algorithm>
#include <cstdio>

namespace sandbox {

void servicehost::tellLauncher(const char *line)
{
    std::puts(line);
    std::fflush(stdout);
}

int servicehost::run(const QString &name, const QString &statePath)
{
    const auto *entry =
        std::find_if(all().begin(), all().end(), [&name](const Entry &each) { return name == each.name; });
    std::unique_ptr<Service> service;
    const auto start = [&] {
        if (entry == all().end())
            throw Error(QStringLiteral("no service %1; there are network, veskg, iam, login").arg(name));
        const StateDirectory state(statePath);
        service = entry->make(state, Scenario::load(state.scenarioFile()).service(name), *entry);
        QDBusConnection bus =
            entry->isOnSystemBus ? QDBusConnection::systemBus() : QDBusConnection::sessionBus();
        if (!bus.isConnected() || !service->publish(bus) || !bus.registerService(entry->busName))
            throw Error(bus.lastError().isValid() ? bus.lastError().message()
                                                  : QStringLiteral("the bus does not grant the name"));
    };
    QString error;
    if (!attempt(&error, start))
        return commandline::fail(error, 1);
    tellLauncher(kReady);
    return QCoreApplication::exec();
}

} // namespace sandbox
