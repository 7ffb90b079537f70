// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/smallfile.h"
#include "state/statedirectory.h"
#include "world/busdaemon.h"
#include "world/child.h"
#include "world/runtimedirectory.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QTemporaryDir>

// A state directory, a private bus and, on it, one service in its own process.
class ServiceFixture
{
public:
    explicit ServiceFixture(const QString &service);
    ~ServiceFixture();
    Q_DISABLE_COPY_MOVE(ServiceFixture)

    // Empty when all went well. Both buses of the service are one here.
    QString start();

    QDBusMessage call(const char *service, const char *path, const char *interface, const char *method,
                      const QVariantList &arguments) const;

    const sandbox::StateDirectory &state() const { return m_state; }
    // Journal lines without their time.
    QStringList journal() const;
    QProcessEnvironment environment() const;

private:
    QTemporaryDir m_directory;
    sandbox::StateDirectory m_state;
    QString m_error;
    sandbox::RuntimeDirectory m_runtime;
    sandbox::BusDaemon m_bus;
    sandbox::Child m_service;
};
