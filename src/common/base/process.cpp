// SPDX-License-Identifier: Apache-2.0
#include "process.h"

namespace vesk::base {

bool Process::run(const QString &program, const QStringList &arguments, int timeoutMs)
{
    m_complaint.clear();
    start(program, arguments);
    if (waitForFinished(timeoutMs))
        return true;
    if (error() == QProcess::FailedToStart)
        m_complaint = QStringLiteral("cannot start %1: %2").arg(program, errorString());
    else
        m_complaint = QStringLiteral("%1 does not end within %2 s").arg(program).arg(timeoutMs / 1000);
    return false;
}

int Process::execute(const QString &program, const QStringList &arguments)
{
    setProcessChannelMode(QProcess::ForwardedChannels);
    if (!run(program, arguments, -1))
        return kNotStarted;
    return exitStatus() == QProcess::NormalExit ? exitCode() : kCrashed;
}

bool Process::launch(const QString &program, const QStringList &arguments)
{
    m_complaint.clear();
    setProgram(program);
    setArguments(arguments);
    if (startDetached())
        return true;
    m_complaint = QStringLiteral("cannot start %1").arg(program);
    return false;
}

} // namespace vesk::base
