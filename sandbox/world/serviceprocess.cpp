// SPDX-License-Identifier: Apache-2.0
#include "serviceprocess.h"

#include "services/servicehost.h"
#include "tools.h"

namespace sandbox {

ServiceProcess::ServiceProcess(QString name, const QString &errorLog)
    : m_name(std::move(name))
    , m_process(errorLog)
{
}

bool ServiceProcess::start(const QString &statePath, const QProcessEnvironment &environment, QString *error)
{
    const QString program = findTool(QStringLiteral("vesk-sandbox"), error);
    if (program.isEmpty())
        return false;
    m_process.setProcessEnvironment(environment);
    const QString line = m_process.startAndReadLine(
        program, {QStringLiteral("service"), m_name, QStringLiteral("--state"), statePath}, error);
    if (line != QLatin1String(ServiceHost::kReady)) {
        *error = QStringLiteral("service %1: %2").arg(m_name, *error);
        return false;
    }
    connect(&m_process, &QProcess::readyReadStandardOutput, this, &ServiceProcess::readLines);
    connect(&m_process, qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this,
            &ServiceProcess::ended);
    return true;
}

void ServiceProcess::stop()
{
    m_process.disconnect(this);
    m_process.end();
}

void ServiceProcess::readLines()
{
    while (m_process.canReadLine()) {
        if (m_process.readLine().trimmed() == ServiceHost::kReboot)
            Q_EMIT rebootAsked();
    }
}

} // namespace sandbox
