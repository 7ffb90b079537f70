// SPDX-License-Identifier: Apache-2.0
#include "privatefile.h"

#include <QDir>
#include <QFileInfo>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace privatefile {

namespace {

void makeFolder(const QDir &folder)
{
    if (folder.exists())
        return;
    const mode_t previous = umask(S_IRWXG | S_IRWXO);
    folder.mkpath(QStringLiteral("."));
    umask(previous);
}

} // namespace

bool create(QFile &file)
{
    makeFolder(QFileInfo(file.fileName()).dir());

    const QByteArray path = QFile::encodeName(file.fileName());
    unlink(path.constData());
    const int descriptor =
        open(path.constData(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, S_IRUSR | S_IWUSR);
    if (descriptor < 0)
        return false;
    return file.open(descriptor, QIODevice::WriteOnly, QFileDevice::AutoCloseHandle);
}

} // namespace privatefile
