// SPDX-License-Identifier: Apache-2.0
#include "stagedfile.h"

#include <QFile>

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr off_t kMaxSize = 1048576;
constexpr int kFlags = O_RDONLY | O_NOFOLLOW | O_CLOEXEC;

QString openError()
{
    return QStringLiteral("cannot be opened: %1").arg(QString::fromLocal8Bit(std::strerror(errno)));
}

QString objectionTo(const struct stat &status)
{
    if (status.st_uid != ::getuid() && status.st_uid != 0)
        return QStringLiteral("belongs to another user");
    if ((status.st_mode & (S_IWGRP | S_IWOTH)) != 0)
        return QStringLiteral("is writable by others");
    return {};
}

// In a sticky directory, as the package makes it, no one can remove another user's files.
QString objectionToDirectory(int descriptor)
{
    struct stat status = {};
    if (descriptor < 0 || ::fstat(descriptor, &status) != 0)
        return openError();
    if ((status.st_mode & S_ISVTX) != 0)
        status.st_mode &= ~static_cast<mode_t>(S_IWGRP | S_IWOTH);
    return objectionTo(status);
}

QString objectionToFile(int descriptor)
{
    struct stat status = {};
    if (descriptor < 0 || ::fstat(descriptor, &status) != 0)
        return openError();
    if (!S_ISREG(status.st_mode))
        return QStringLiteral("is not a regular file");
    if (status.st_size > kMaxSize)
        return QStringLiteral("is larger than %1 bytes").arg(kMaxSize);
    if (status.st_nlink != 1)
        return QStringLiteral("has another name elsewhere");
    return objectionTo(status);
}

} // namespace

StagedFile StagedFile::read(const QString &directory, const QString &name)
{
    StagedFile staged;
    const int at = ::open(QFile::encodeName(directory).constData(), kFlags | O_DIRECTORY);
    if (const QString objection = objectionToDirectory(at); !objection.isEmpty()) {
        staged.refusal = QStringLiteral("lies in a directory that %1").arg(objection);
    } else {
        // Without O_NONBLOCK a named pipe would hold the service.
        const int descriptor = ::openat(at, QFile::encodeName(name).constData(), kFlags | O_NONBLOCK);
        staged.refusal = objectionToFile(descriptor);
        QFile file;
        if (staged.refusal.isEmpty() && file.open(descriptor, QIODevice::ReadOnly))
            staged.content = file.read(kMaxSize);
        ::close(descriptor);
    }
    ::close(at);
    return staged;
}

} // namespace sandbox
