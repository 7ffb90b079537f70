// SPDX-License-Identifier: Apache-2.0
#include "privatefile.h"

#include "logtext.h"

#include <QFileInfo>

#include <QDebug>

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace privatefile {

namespace {

constexpr mode_t kForAllToRead = S_IRUSR | S_IWUSR | S_IRGRP | S_IROTH; // less the umask

// While it lives, what is made is its owner's alone.
class OwnerOnly
{
public:
    OwnerOnly()
        : m_previous(umask(S_IRWXG | S_IRWXO))
    {
    }
    ~OwnerOnly() { umask(m_previous); }
    Q_DISABLE_COPY_MOVE(OwnerOnly)

private:
    mode_t m_previous;
};

void makeWay(const QDir &folder)
{
    const OwnerOnly guard;
    if (!folder.exists())
        folder.mkpath(QStringLiteral("."));
}

// Whether nobody else has written what is in it, or can.
bool isOursAlone(const struct stat &info)
{
    return S_ISREG(info.st_mode) && info.st_uid == geteuid() && info.st_nlink == 1 &&
           (info.st_mode & (S_IWGRP | S_IWOTH)) == 0;
}

int makeAnew(const QByteArray &path, mode_t mode)
{
    if (unlink(path.constData()) != 0 && errno != ENOENT)
        return -1;
    return open(path.constData(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, mode);
}

int openEmptied(const QByteArray &path)
{
    const int descriptor = open(path.constData(), O_WRONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
    if (descriptor < 0)
        return -1;
    // Somebody may have put another file there since it was looked at.
    struct stat info = {};
    if (fstat(descriptor, &info) == 0 && isOursAlone(info) && ftruncate(descriptor, 0) == 0)
        return descriptor;
    close(descriptor);
    errno = EPERM;
    return -1;
}

bool take(QFile &file, int descriptor, QIODevice::OpenMode mode)
{
    if (descriptor < 0) {
        const QString reason = QString::fromLocal8Bit(std::strerror(errno));
        qWarning().noquote() << vesk::base::logText(file.fileName()) << "cannot be staged:" << reason;
        return false;
    }
    if (file.open(descriptor, mode, QFileDevice::AutoCloseHandle))
        return true;
    close(descriptor);
    return false;
}

} // namespace

bool create(QFile &file)
{
    makeWay(QFileInfo(file.fileName()).dir());
    return take(file, makeAnew(QFile::encodeName(file.fileName()), S_IRUSR | S_IWUSR), QIODevice::WriteOnly);
}

bool replace(QFile &file, QIODevice::OpenMode mode)
{
    const QByteArray path = QFile::encodeName(file.fileName());
    struct stat info = {};
    const bool isKept = lstat(path.constData(), &info) == 0 && isOursAlone(info);
    return take(file, isKept ? openEmptied(path) : makeAnew(path, kForAllToRead), mode);
}

void makeFolder(const QDir &parent, const QString &name)
{
    const OwnerOnly guard;
    parent.mkdir(name);
}

} // namespace privatefile
