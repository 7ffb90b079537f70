// SPDX-License-Identifier: Apache-2.0
#include "child.h"

#include "journal/error.h"

#include <QElapsedTimer>
#include <QFileInfo>

#include <csignal>

#include <sys/prctl.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kStartLimitMs = 20000;

} // namespace

Child::Child(const QString &errorLog, QObject *parent)
    : vesk::base::Process(parent)
{
    setStandardErrorFile(errorLog, QIODevice::Append);
}

Child::~Child()
{
    end();
}

void Child::startIn(const QProcessEnvironment &environment, const QString &program,
                    const QStringList &arguments)
{
    setProcessEnvironment(environment);
    start(program, arguments);
    if (!waitForStarted(kStartLimitMs))
        throw Error(QStringLiteral("cannot start %1: %2").arg(program, errorString()));
}

QString Child::startAndReadLine(const QString &program, const QStringList &arguments)
{
    startIn(processEnvironment(), program, arguments);
    QElapsedTimer timer;
    timer.start();
    while (!canReadLine() && state() == QProcess::Running && timer.elapsed() < kStartLimitMs)
        waitForReadyRead(static_cast<int>(kStartLimitMs - timer.elapsed()));
    if (!canReadLine())
        throw Error(QStringLiteral("%1 %2").arg(program, state() == QProcess::Running
                                                             ? QStringLiteral("is not ready in time")
                                                             : QStringLiteral("ended at its start")));
    return QString::fromUtf8(readLine()).trimmed();
}

void Child::end(int graceMs)
{
    if (state() == QProcess::NotRunning)
        return;
    terminate();
    if (waitForFinished(graceMs))
        return;
    kill();
    waitForFinished(graceMs);
}

void Child::setupChildProcess()
{
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
}

QString findTool(const QString &name)
{
    const QString here = QCoreApplication::applicationDirPath();
    for (const QString &directory : {here, here + QStringLiteral("/../bin")}) {
        const QFileInfo candidate(directory + QLatin1Char('/') + name);
        if (candidate.isExecutable())
            return candidate.canonicalFilePath();
    }
    throw Error(
        QStringLiteral("there is no %1 beside %2").arg(name, QCoreApplication::applicationFilePath()));
}

} // namespace sandbox
