// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "world/busdaemon.h"
#include "world/runtimedirectory.h"
#include "world/serviceprocess.h"
#include "world/statefolder.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QTemporaryDir>

#include <memory>
#include <vector>

// A state folder, a private bus and, on it, the services that a test asks for, each in its own process.
class ServiceFixture
{
public:
    // scenario: JSON of the parts beside "title".
    explicit ServiceFixture(const QByteArray &scenario = "{}");
    ~ServiceFixture();
    Q_DISABLE_COPY_MOVE(ServiceFixture)

    // Empty when all went well. Both buses of the services are one here.
    QString start(const QStringList &services);

    QDBusConnection bus() const;
    QDBusMessage call(const char *service, const char *path, const char *interface, const char *method,
                      const QVariantList &arguments) const;

    const sandbox::StateFolder &state() const { return m_state; }
    // Journal lines without their time.
    QStringList journal() const;
    QProcessEnvironment environment() const;
    sandbox::ServiceProcess &service(int index) { return *m_services.at(static_cast<size_t>(index)); }

    static QByteArray read(const QString &path);
    static bool write(const QString &path, const QByteArray &content);

private:
    QTemporaryDir m_folder;
    sandbox::StateFolder m_state;
    QString m_trouble;
    sandbox::RuntimeDirectory m_runtime;
    sandbox::BusDaemon m_bus;
    std::vector<std::unique_ptr<sandbox::ServiceProcess>> m_services;
};
