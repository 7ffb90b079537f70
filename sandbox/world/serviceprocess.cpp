// SPDX-License-Identifier: Apache-2.0
#include "serviceprocess.h"

#include "services/servicehost.h"
#include "tools.h"

namespace sandbox {

ServiceProcess::ServiceProcess(QString name, const QString &errorLog)
    : Child(errorLog)
    , m_name(std::move(name))
{
}

bool ServiceProcess::start(const QString &statePath, const QProcessEnvironment &environment, QString *error)
{
    const QString program = findTool(QStringLiteral("vesk-sandbox"), error);
    if (program.isEmpty())
        return false;
    setProcessEnvironment(environment);
    const QString line = startAndReadLine(
        program, {QStringLiteral("service"), m_name, QStringLiteral("--state"), statePath}, error);
    if (line != QLatin1String(ServiceHost::kReady)) {
        *error = QStringLiteral("service %1: %2").arg(m_name, *error);
        return false;
    }
    connect(this, &QProcess::readyReadStandardOutput, this, &ServiceProcess::readLines);
    connect(this, qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this, &ServiceProcess::ended);
    return true;
}

void ServiceProcess::stop()
{
    disconnect(this);
    end();
}

void ServiceProcess::readLines()
{
    while (canReadLine()) {
        if (readLine().trimmed() == ServiceHost::kReboot)
            Q_EMIT rebootAsked();
    }
}

} // namespace sandbox
