// SPDX-License-Identifier: Apache-2.0
#include "play/needs.h"

#include "isolation/backend.h"
#include "journal/error.h"
#include "process.h"

#include <QCoreApplication>
#include <QStandardPaths>

#include <unistd.h>

namespace sandbox {

namespace {

// A command in a mount namespace of its own: as root, or in a user namespace in which we stay who we are.
int runUnshared(const QStringList &command)
{
    QStringList arguments{QStringLiteral("--mount")};
    if (::getuid() != 0)
        arguments += QStringList{QStringLiteral("--user"), QStringLiteral("--map-current-user"),
                                 QStringLiteral("--keep-caps")};
    return vesk::base::Process().execute(QStringLiteral("unshare"), arguments + command);
}

} // namespace

QString needs::lacking(const QStringList &needs)
{
    QString error;
    if (needs.contains(QStringLiteral("root")) && ::getuid() != 0)
        return QStringLiteral("only root can make files of another user");
    if (needs.contains(QStringLiteral("isolation")) &&
        !attempt(&error, [] { Backend::choose(IsolationOptions::Backend::Bubblewrap); }))
        return error;
    if (needs.contains(QStringLiteral("mounts")) && runUnshared({QStringLiteral("true")}) != 0)
        return QStringLiteral("the kernel grants no mounts of our own");
    if (needs.contains(QStringLiteral("strace")) &&
        QStandardPaths::findExecutable(QStringLiteral("strace")).isEmpty())
        return QStringLiteral("strace is not installed");
    return {};
}

int needs::runInSmallTmp(const QString &tmp, int kilobytes, const QStringList &arguments)
{
    const QString script =
        QStringLiteral("mount -t tmpfs -o mode=1777,size=${1}k tmpfs \"$2\" && shift 2 && exec \"$@\"");
    return runUnshared(QStringList{QStringLiteral("sh"), QStringLiteral("-c"), script, QStringLiteral("sh"),
                                   QString::number(kilobytes), tmp, QCoreApplication::applicationFilePath()} +
                       arguments);
}

} // namespace sandbox
