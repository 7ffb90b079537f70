// SPDX-License-Identifier: Apache-2.0
#include "regularfile.h"

#include "logtext.h"

#include <QFileInfo>

#include <QDebug>

#include <cerrno>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace vesk::base::regularfile {

namespace {

constexpr mode_t kForAllToRead = S_IRUSR | S_IWUSR | S_IRGRP | S_IROTH; // less the umask

// A directory is left to QFile, which refuses it by itself.
bool isRefused(const struct stat &info)
{
    return !S_ISREG(info.st_mode) && !S_ISDIR(info.st_mode);
}

// Gives `file`, which is closed, an error of ours.
class FailedFile : public QFile
{
public:
    static void refuse(QFile &file, const QString &why)
    {
        const QString path = file.fileName();
        // Only an attempt of its own sets error(): here one that fails whatever the machine holds.
        file.setFileName(QStringLiteral("/dev/null/"));
        file.open(QIODevice::ReadOnly);
        file.setFileName(path);
        (file.*&FailedFile::setErrorString)(why);
        qWarning().noquote() << logText(path) << why;
    }
};

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

// Whether nobody else has written what is in it, or can.
bool isOursAlone(const struct stat &info)
{
    return S_ISREG(info.st_mode) && info.st_uid == geteuid() && info.st_nlink == 1 &&
           (info.st_mode & (S_IWGRP | S_IWOTH)) == 0;
}

int createFile(const QByteArray &path, mode_t mode)
{
    if (unlink(path.constData()) != 0 && errno != ENOENT)
        return -1;
    return ::open(path.constData(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, mode);
}

int openEmptied(const QByteArray &path)
{
    const int descriptor = ::open(path.constData(), O_WRONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
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

bool openDescriptor(QFile &file, int descriptor, QIODevice::OpenMode mode)
{
    if (descriptor < 0) {
        qWarning().noquote() << logText(file.fileName()) << "cannot be staged:" << qt_error_string(errno);
        return false;
    }
    if (file.open(descriptor, mode, QFileDevice::AutoCloseHandle))
        return true;
    close(descriptor);
    return false;
}

} // namespace

bool open(QFile &file, QIODevice::OpenMode mode)
{
    // By name, since a QFile that is opened by descriptor has none. So it is looked at before, for the open
    // of a pipe waits, and afterwards, for who can write the directory may have changed what stands there.
    struct stat info = {};
    if (::stat(QFile::encodeName(file.fileName()).constData(), &info) != 0 || !isRefused(info)) {
        if (!file.open(mode))
            return false;
        if (::fstat(file.handle(), &info) == 0 && S_ISREG(info.st_mode))
            return true;
        file.close();
    }
    FailedFile::refuse(file, QStringLiteral("is not opened: it is not a regular file"));
    return false;
}

bool isWithinLimit(QFile &file)
{
    if (file.size() <= kMaxSize)
        return true;
    file.close();
    FailedFile::refuse(file, QStringLiteral("is not read: it is longer than %1 bytes").arg(kMaxSize));
    return false;
}

bool openToRead(QFile &file, QIODevice::OpenMode mode)
{
    return open(file, mode) && isWithinLimit(file);
}

QByteArray readAll(QFile &file)
{
    return file.read(kMaxSize);
}

bool createPrivate(QFile &file)
{
    const OwnerOnly guard;
    QFileInfo(file).dir().mkpath(QStringLiteral("."));
    return openDescriptor(file, createFile(QFile::encodeName(file.fileName()), S_IRUSR | S_IWUSR),
                          QIODevice::WriteOnly);
}

bool replace(QFile &file, QIODevice::OpenMode mode)
{
    const QByteArray path = QFile::encodeName(file.fileName());
    struct stat info = {};
    const bool isKept = lstat(path.constData(), &info) == 0 && isOursAlone(info);
    return openDescriptor(file, isKept ? openEmptied(path) : createFile(path, kForAllToRead), mode);
}

void makePrivateDirectory(const QDir &parent, const QString &name)
{
    const OwnerOnly guard;
    parent.mkdir(name);
}

} // namespace vesk::base::regularfile
