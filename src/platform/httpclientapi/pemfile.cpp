// SPDX-License-Identifier: Apache-2.0
#include "pemfile.h"

#include <QFile>

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

PemFile refused(const QString &path, const QString &reason)
{
    return {PemFile::State::Refused, {}, path + QLatin1Char(' ') + reason, {}};
}

QString reasonToDistrust(const struct stat &info)
{
    if (!S_ISREG(info.st_mode))
        return QStringLiteral("is not a regular file");
    if (info.st_uid != 0 && info.st_uid != ::geteuid())
        return QStringLiteral("belongs to another user");
    if ((info.st_mode & (S_IWGRP | S_IWOTH)) != 0)
        return QStringLiteral("can be written by others");
    if (info.st_size > PemFile::kMaxSize)
        return QStringLiteral("is too long");
    return {};
}

// As with other programs that take keys, a key of root's may be readable by a group that root has chosen.
QString adviceFor(const QString &path, const struct stat &info)
{
    const mode_t tooOpen = info.st_uid == 0 ? S_IROTH : S_IRGRP | S_IROTH;
    if ((info.st_mode & tooOpen) == 0)
        return {};
    return QStringLiteral(
               "%1 is a key that others can read, mode 0%2; best is one of root's with a group of few "
               "and mode 0640, or of the user with mode 0600")
        .arg(path, QString::number(info.st_mode & 07777, 8));
}

PemFile readOpened(QFile &file, const QString &path, PemFile::Content content)
{
    struct stat info = {};
    if (::fstat(file.handle(), &info) != 0)
        return refused(path, QStringLiteral("cannot be examined"));
    const QString distrust = reasonToDistrust(info);
    if (!distrust.isEmpty())
        return refused(path, distrust);
    const QByteArray contents = file.read(PemFile::kMaxSize);
    if (file.error() != QFileDevice::NoError)
        return refused(path, QStringLiteral("cannot be read"));
    if (contents.isEmpty())
        return refused(path, QStringLiteral("is empty"));
    return {PemFile::State::Read,
            contents,
            {},
            content == PemFile::Content::Secret ? adviceFor(path, info) : QString()};
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
            return {State::Absent, {}, {}, {}};
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
