// SPDX-License-Identifier: Apache-2.0
#include "plainfile.h"

#include "logtext.h"

#include <QDebug>

#include <sys/stat.h>

namespace vesk {
namespace base {
namespace plainfile {

namespace {

// A folder is left to QFile, which refuses it by itself.
bool isOdd(const struct stat &info)
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

} // namespace

bool open(QFile &file, QIODevice::OpenMode mode)
{
    // By name, since a QFile that is opened by descriptor has none. So it is looked at before, for the open
    // of a pipe waits, and afterwards, for who can write the folder may have changed what stands there.
    struct stat info = {};
    if (::stat(QFile::encodeName(file.fileName()).constData(), &info) != 0 || !isOdd(info)) {
        if (!file.open(mode))
            return false;
        if (::fstat(file.handle(), &info) == 0 && S_ISREG(info.st_mode))
            return true;
        file.close();
    }
    FailedFile::refuse(file, QStringLiteral("is not opened: it is no plain file"));
    return false;
}

bool isWithinLimit(QFile &file)
{
    if (file.size() <= kLongest)
        return true;
    file.close();
    FailedFile::refuse(file, QStringLiteral("is not read: it is longer than %1 bytes").arg(kLongest));
    return false;
}

bool openToRead(QFile &file, QIODevice::OpenMode mode)
{
    return open(file, mode) && isWithinLimit(file);
}

QByteArray readAll(QFile &file)
{
    return file.read(kLongest);
}

bool isReadable(const QString &path)
{
    QFile file(path);
    return openToRead(file, QIODevice::ReadOnly);
}

} // namespace plainfile
} // namespace base
} // namespace vesk
