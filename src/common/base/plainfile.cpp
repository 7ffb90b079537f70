// SPDX-License-Identifier: Apache-2.0
#include "plainfile.h"

#include <QDebug>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace vesk {
namespace base {
namespace plainfile {

namespace {

constexpr mode_t kUsualMode = S_IRUSR | S_IWUSR | S_IRGRP | S_IWGRP | S_IROTH | S_IWOTH; // less the umask

int openDescriptor(const QFile &file, bool isRead)
{
    const QByteArray path = QFile::encodeName(file.fileName());
    const int direction = isRead ? O_RDONLY : O_WRONLY | O_CREAT;
    return ::open(path.constData(), direction | O_NONBLOCK | O_NOCTTY | O_CLOEXEC, kUsualMode);
}

// A folder needs no words: no program can read or write one.
bool isFit(int descriptor, bool isRead, const QString &path)
{
    struct stat facts = {};
    if (::fstat(descriptor, &facts) != 0 || S_ISDIR(facts.st_mode))
        return false;
    if (!S_ISREG(facts.st_mode)) {
        qWarning().noquote() << path << "is not opened: it is no plain file";
        return false;
    }
    if (isRead && facts.st_size > kLongest) {
        qWarning().noquote() << path << "is not read: it is longer than" << kLongest << "bytes";
        return false;
    }
    return true;
}

} // namespace

bool open(QFile &file, QIODevice::OpenMode mode)
{
    const bool isRead = !mode.testFlag(QIODevice::WriteOnly);
    const int descriptor = openDescriptor(file, isRead);
    if (descriptor < 0)
        return false;
    if (isFit(descriptor, isRead, file.fileName()) && (isRead || ::ftruncate(descriptor, 0) == 0) &&
        file.open(descriptor, mode, QFileDevice::AutoCloseHandle))
        return true;
    ::close(descriptor);
    return false;
}

QByteArray readAll(QFile &file)
{
    return file.read(kLongest);
}

bool isReadable(const QString &path)
{
    QFile file(path);
    return open(file, QIODevice::ReadOnly);
}

} // namespace plainfile
} // namespace base
} // namespace vesk
