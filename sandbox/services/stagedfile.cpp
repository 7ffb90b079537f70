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

constexpr off_t kLargest = 1048576;

StagedFile refused(const QString &reason)
{
    return {{}, reason};
}

QString lastError()
{
    return QStringLiteral("cannot be opened: %1").arg(QString::fromLocal8Bit(std::strerror(errno)));
}

class Descriptor
{
public:
    explicit Descriptor(int number)
        : m_number(number)
    {
    }
    ~Descriptor()
    {
        if (m_number >= 0)
            ::close(m_number);
    }
    Q_DISABLE_COPY_MOVE(Descriptor)
    int number() const { return m_number; }
    bool isOpen() const { return m_number >= 0; }

private:
    int m_number;
};

QString objectionTo(const struct stat &status)
{
    if (status.st_uid != ::getuid() && status.st_uid != 0)
        return QStringLiteral("belongs to another user");
    if ((status.st_mode & (S_IWGRP | S_IWOTH)) != 0)
        return QStringLiteral("is writable by others");
    return {};
}

// In a sticky folder, as the package makes it, nobody can take another user's files away.
QString objectionToFolder(struct stat status)
{
    if ((status.st_mode & S_ISVTX) != 0)
        status.st_mode &= ~static_cast<mode_t>(S_IWGRP | S_IWOTH);
    return objectionTo(status);
}

QString objectionToFile(const struct stat &status)
{
    if (!S_ISREG(status.st_mode))
        return QStringLiteral("is no plain file");
    if (status.st_size > kLargest)
        return QStringLiteral("is larger than %1 bytes").arg(kLargest);
    if (status.st_nlink != 1)
        return QStringLiteral("has another name elsewhere");
    return objectionTo(status);
}

StagedFile readWhole(int descriptor)
{
    QFile file;
    if (!file.open(descriptor, QIODevice::ReadOnly))
        return refused(file.errorString());
    return {file.read(kLargest), {}};
}

} // namespace

StagedFile StagedFile::read(const QString &folder, const QString &name)
{
    struct stat status = {};
    const Descriptor at(
        ::open(QFile::encodeName(folder).constData(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    if (!at.isOpen() || ::fstat(at.number(), &status) != 0)
        return refused(QStringLiteral("lies in a folder that %1").arg(lastError()));
    if (const QString objection = objectionToFolder(status); !objection.isEmpty())
        return refused(QStringLiteral("lies in a folder that %1").arg(objection));
    // Without O_NONBLOCK a named pipe would hold the service.
    const Descriptor file(::openat(at.number(), QFile::encodeName(name).constData(),
                                   O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    if (!file.isOpen() || ::fstat(file.number(), &status) != 0)
        return refused(lastError());
    if (const QString objection = objectionToFile(status); !objection.isEmpty())
        return refused(objection);
    return readWhole(file.number());
}

} // namespace sandbox
