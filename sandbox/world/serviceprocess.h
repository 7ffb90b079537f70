// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"

namespace sandbox {

// A D-Bus service of a world, seen from the launcher.
class ServiceProcess : public Child
{
    Q_OBJECT

public:
    ServiceProcess(QString name, const QString &errorLog);

    // environment: holds the addresses of both buses.
    bool start(const QString &statePath, const QProcessEnvironment &environment, QString *error);
    void stop();
    QString name() const { return m_name; }

Q_SIGNALS:
    void rebootAsked();
    void ended(); // by itself, not by stop()

private:
    void readLines();

    QString m_name;
};

} // namespace sandbox
