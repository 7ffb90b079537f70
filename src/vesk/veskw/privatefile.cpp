// SPDX-License-Identifier: Apache-2.0
#include "privatefile.h"

#include <QFileInfo>

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

void removeUnlessPlain(const QByteArray &path)
{
    struct stat facts = {};
    if (lstat(path.constData(), &facts) == 0 && !S_ISREG(facts.st_mode) && !S_ISDIR(facts.st_mode))
        unlink(path.constData());
}

bool isPlain(int descriptor)
{
    struct stat facts = {};
    return fstat(descriptor, &facts) == 0 && S_ISREG(facts.st_mode);
}

} // namespace

bool create(QFile &file)
{
    makeWay(QFileInfo(file.fileName()).dir());

    const QByteArray path = QFile::encodeName(file.fileName());
    unlink(path.constData());
    const int descriptor =
        open(path.constData(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, S_IRUSR | S_IWUSR);
    if (descriptor < 0)
        return false;
    return file.open(descriptor, QIODevice::WriteOnly, QFileDevice::AutoCloseHandle);
}

bool replace(QFile &file, QIODevice::OpenMode mode)
{
    const QByteArray path = QFile::encodeName(file.fileName());
    removeUnlessPlain(path);
    const int descriptor = open(
        path.constData(), O_WRONLY | O_CREAT | O_TRUNC | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC, kForAllToRead);
    if (descriptor < 0)
        return false;
    if (isPlain(descriptor) && file.open(descriptor, mode, QFileDevice::AutoCloseHandle))
        return true;
    close(descriptor);
    return false;
}

void makeFolder(const QDir &parent, const QString &name)
{
    const OwnerOnly guard;
    parent.mkdir(name);
}

} // namespace privatefile
