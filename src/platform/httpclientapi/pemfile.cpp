// SPDX-License-Identifier: Apache-2.0
#include "pemfile.h"

#include <QFile>

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr qint64 kLongestFile = 1024LL * 1024;

PemFile refused(const QString &path, const QString &reason)
{
    return {PemFile::State::Refused, {}, path + QLatin1Char(' ') + reason};
}

// Modes that a file must not have. As with other programs that take keys, a key of root's may be readable by
// a group that root has chosen.
mode_t forbiddenMode(const struct stat &facts, PemFile::Content content)
{
    if (content == PemFile::Content::Public)
        return S_IWGRP | S_IWOTH;
    return facts.st_uid == 0 ? S_IWGRP | S_IXGRP | S_IRWXO : S_IRWXG | S_IRWXO;
}

QString reasonToDoubt(const struct stat &facts, PemFile::Content content)
{
    if (!S_ISREG(facts.st_mode))
        return QStringLiteral("is no plain file");
    if (facts.st_uid != 0 && facts.st_uid != ::geteuid())
        return QStringLiteral("belongs to another user");
    if ((facts.st_mode & (S_IWGRP | S_IWOTH)) != 0)
        return QStringLiteral("can be written by others");
    if ((facts.st_mode & forbiddenMode(facts, content)) != 0)
        return QStringLiteral("is a key that others can read");
    if (facts.st_size > kLongestFile)
        return QStringLiteral("is too long");
    return {};
}

PemFile readOpened(QFile &file, const QString &path, PemFile::Content content)
{
    struct stat facts = {};
    if (::fstat(file.handle(), &facts) != 0)
        return refused(path, QStringLiteral("cannot be examined"));
    const QString doubt = reasonToDoubt(facts, content);
    if (!doubt.isEmpty())
        return refused(path, doubt);
    const QByteArray contents = file.read(kLongestFile);
    if (file.error() != QFileDevice::NoError)
        return refused(path, QStringLiteral("cannot be read"));
    if (contents.isEmpty())
        return refused(path, QStringLiteral("is empty"));
    return {PemFile::State::Read, contents, {}};
}

} // namespace

PemFile PemFile::read(const QString &path, Content content)
{
    if (path.isEmpty())
        return {};
    // Not blocking: a pipe under this name must not stop the program.
    const int descriptor =
        ::open(QFile::encodeName(path).constData(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
    if (descriptor < 0) {
        const int error = errno;
        if (error == ENOENT || error == ENOTDIR)
            return {State::Absent, {}, {}};
        if (error == ELOOP)
            return refused(path, QStringLiteral("is a symbolic link"));
        return refused(path,
                       QStringLiteral("cannot be opened: ") + QString::fromLocal8Bit(std::strerror(error)));
    }
    QFile file;
    if (!file.open(descriptor, QIODevice::ReadOnly, QFileDevice::AutoCloseHandle)) {
        ::close(descriptor);
        return refused(path, QStringLiteral("cannot be read"));
    }
    return readOpened(file, path, content);
}
