// SPDX-License-Identifier: Apache-2.0
#include "backend.h"

#include "guard.h"
#include "rundirectory.h"
#include "syscallfilter.h"
#include "view.h"

#include "journal/smallfile.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <unistd.h>

namespace sandbox {

namespace {

QStringList bindArguments(const QString &host, const QString &inside)
{
    return {QStringLiteral("-b"), host + QLatin1Char(':') + inside};
}

// What proot binds has to exist at first; the stage removes it.
QStringList absentArguments(const RunDirectory &run, const QString &path)
{
    const QString empty = run.scratch("absent") + QString(path).replace(QLatin1Char('/'), QLatin1Char('-'));
    QFile(empty).open(QIODevice::WriteOnly);
    return bindArguments(empty, path);
}

void setEnvironment(const RunDirectory &run)
{
    // Read by later versions than 5.1, which knows /tmp only.
    qputenv("PROOT_TMP_DIR", QFile::encodeName(run.scratch(".")));
    // Else it makes the mount points that the machine lacks, for root in the machine's own directories.
    qputenv("PROOT_DONT_POLLUTE_ROOTFS", "1");
    // A traced process cannot be traced once more by the leak checker.
    QByteArray sanitizer = qgetenv("ASAN_OPTIONS");
    sanitizer += sanitizer.isEmpty() ? "detect_leaks=0" : ":detect_leaks=0";
    qputenv("ASAN_OPTIONS", sanitizer);
}

// Its loader and its mount points, which it makes in /tmp and leaves there when it is killed.
void removeRemains(pid_t proot)
{
    const QStringList names{QStringLiteral("proot-%1-*").arg(proot),
                            QStringLiteral("prooted-%1-*").arg(proot)};
    const QDir temporary(QStringLiteral("/tmp"));
    for (const QFileInfo &entry : temporary.entryInfoList(names, QDir::AllEntries | QDir::System)) {
        if (entry.ownerId() == ::geteuid())
            smallfile::removeAll(entry.filePath());
    }
}

} // namespace

QStringList Proot::trialArguments()
{
    return {QStringLiteral("-v"), QStringLiteral("-1"), QStringLiteral("true")};
}

QStringList Proot::commandLine(const View &view, const RunDirectory &run, const QStringList &stage)
{
    setEnvironment(run);
    QStringList arguments{QStringLiteral("proot"), QStringLiteral("-v"), QStringLiteral("-1"),
                          QStringLiteral("-w"), view.workingDirectory()};
    for (const QString &path : view.absent())
        arguments += absentArguments(run, path);
    for (const Bind &bind : view.binds())
        arguments += bindArguments(bind.host, bind.inside);
    return arguments + stage;
}

bool Proot::enter() const
{
    leaveGuardBehind(removeRemains);
    return dropCapabilities() && withholdUntranslatedCalls();
}

} // namespace sandbox
