// SPDX-License-Identifier: Apache-2.0
#include "play/needs.h"

#include "isolation/backend.h"

#include <QFile>
#include <QStandardPaths>

#include <cerrno>
#include <cstring>

#include <sched.h>
#include <sys/mount.h>
#include <sys/wait.h>
#include <unistd.h>

namespace sandbox {

namespace {

const QString kRoot = QStringLiteral("root");
const QString kIsolation = QStringLiteral("isolation");
const QString kMounts = QStringLiteral("mounts");
const QString kStrace = QStringLiteral("strace");

bool write(const char *path, const QByteArray &text)
{
    QFile file(QString::fromLatin1(path));
    return file.open(QIODevice::WriteOnly | QIODevice::Unbuffered) && file.write(text) == text.size();
}

// As root, or in a user namespace in which we stay who we are.
bool leaveMounts()
{
    const uid_t user = ::getuid();
    const gid_t group = ::getgid();
    if (user == 0) {
        if (::unshare(CLONE_NEWNS) != 0)
            return false;
    } else if (::unshare(CLONE_NEWUSER | CLONE_NEWNS) != 0 || !write("/proc/self/setgroups", "deny") ||
               !write("/proc/self/uid_map",
                      QByteArray::number(user) + ' ' + QByteArray::number(user) + " 1") ||
               !write("/proc/self/gid_map",
                      QByteArray::number(group) + ' ' + QByteArray::number(group) + " 1")) {
        return false;
    }
    return ::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0;
}

// In a process that ends at once.
bool canLeaveMounts()
{
    const pid_t child = ::fork();
    if (child == 0)
        ::_exit(leaveMounts() ? 0 : 1);
    int status = 1;
    return child > 0 && ::waitpid(child, &status, 0) == child && status == 0;
}

} // namespace

QString needs::lacking(const QStringList &needs)
{
    QString error;
    if (needs.contains(kRoot) && ::getuid() != 0)
        return QStringLiteral("only root can make files of another user");
    if (needs.contains(kIsolation) && !Backend::choose(IsolationOptions::Backend::Bubblewrap, &error))
        return error;
    if (needs.contains(kMounts) && !canLeaveMounts())
        return QStringLiteral("the kernel grants no mounts of our own");
    if (needs.contains(kStrace) && QStandardPaths::findExecutable(kStrace).isEmpty())
        return QStringLiteral("strace is not installed");
    return {};
}

bool needs::enterSmallTmp(const QString &tmp, int kilobytes, QString *error)
{
    const QByteArray options = "mode=1777,size=" + QByteArray::number(kilobytes) + 'k';
    if (leaveMounts() &&
        ::mount("tmpfs", QFile::encodeName(tmp).constData(), "tmpfs", 0, options.constData()) == 0)
        return true;
    *error = QStringLiteral("cannot mount at %1: %2").arg(tmp, QString::fromLocal8Bit(std::strerror(errno)));
    return false;
}

} // namespace sandbox
