// SPDX-License-Identifier: Apache-2.0
#include "processes.h"

#include <QCoreApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QThread>

QStringList processesWith(const QString &mark)
{
    QStringList found;
    for (const QString &pid : QDir(QStringLiteral("/proc")).entryList(QDir::Dirs)) {
        if (pid.toLongLong() == 0 || pid.toLongLong() == QCoreApplication::applicationPid())
            continue;
        QFile file(QStringLiteral("/proc/%1/cmdline").arg(pid));
        if (!file.open(QIODevice::ReadOnly))
            continue;
        const QString line = QString::fromLocal8Bit(file.readAll().replace('\0', ' '));
        if (line.contains(mark))
            found.append(line);
    }
    return found;
}

QStringList processesLeftWith(const QString &mark)
{
    QElapsedTimer timer;
    timer.start();
    QStringList left = processesWith(mark);
    while (!left.isEmpty() && timer.elapsed() < 8000) {
        QThread::msleep(20);
        left = processesWith(mark);
    }
    return left;
}
