// SPDX-License-Identifier: Apache-2.0
#include "proot.h"

#include "guard.h"
#include "runfolder.h"
#include "syscallfilter.h"
#include "view.h"

#include <QFile>

namespace sandbox {

namespace {

void add(QStringList *arguments, const QString &host, const QString &inside)
{
    *arguments << QStringLiteral("-b") << host + QLatin1Char(':') + inside;
}

// The stage removes the copies of files that are to be absent: what proot binds has to exist at first.
void addCopies(QStringList *arguments, const RunFolder &folder)
{
    for (const QString &path : View::copies()) {
        const QString copy =
            folder.scratch("copy") + QString(path).replace(QLatin1Char('/'), QLatin1Char('-'));
        if (!View::canCopy(folder.root() + path)) {
            add(arguments, folder.root() + path, path);
            continue;
        }
        if (!QFile::copy(folder.root() + path, copy))
            QFile(copy).open(QIODevice::WriteOnly);
        add(arguments, copy, path);
    }
}

void setEnvironment(const RunFolder &folder)
{
    qputenv("PROOT_TMP_DIR", QFile::encodeName(folder.scratch(".")));
    // Else it makes the mount points that the machine lacks, for root in the machine's own folders.
    qputenv("PROOT_DONT_POLLUTE_ROOTFS", "1");
    // A traced process cannot be traced once more by the leak checker.
    QByteArray sanitizer = qgetenv("ASAN_OPTIONS");
    sanitizer += sanitizer.isEmpty() ? "detect_leaks=0" : ":detect_leaks=0";
    qputenv("ASAN_OPTIONS", sanitizer);
}

} // namespace

QStringList Proot::trialArguments()
{
    return {QStringLiteral("-v"), QStringLiteral("-1"), QStringLiteral("true")};
}

QStringList Proot::commandLine(const View &view, const RunFolder &folder, const QStringList &stage)
{
    setEnvironment(folder);
    QStringList arguments{QStringLiteral("proot"), QStringLiteral("-v"), QStringLiteral("-1"),
                          QStringLiteral("-w"), view.workingFolder()};
    addCopies(&arguments, folder);
    for (const Bind &bind : view.binds())
        add(&arguments, bind.host, bind.inside);
    return arguments + stage;
}

bool Proot::enter() const
{
    leaveGuardBehind();
    return dropCapabilities() && withholdUntranslatedCalls();
}

} // namespace sandbox
