// SPDX-License-Identifier: Apache-2.0
#include "instanceclaim.h"

#include <QDir>
#include <QFile>
#include <QUrl>
#include <QVector>

#include <cerrno>

#include <fcntl.h>
#include <pwd.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Mtk::InstanceClaim {

namespace {

struct Place
{
    QByteArray path;
    bool create = false; // when it is missing
    int flags = 0;       // further ones for open(2)
};

// Every start tries the same places in the same order, whatever its environment lacks. Qt creates the third
// one itself where there is no XDG_RUNTIME_DIR, so it is created here too: otherwise a first start would pass
// over it, and a second one that finds it would not meet the first.
QVector<Place> places()
{
    QVector<Place> result;
    const QByteArray session = qgetenv("XDG_RUNTIME_DIR");
    if (session.startsWith('/'))
        result.append(Place{session});
    result.append(Place{"/run/user/" + QByteArray::number(geteuid())});
    if (const passwd *user = getpwuid(geteuid()))
        result.append(Place{QByteArray("/tmp/runtime-").append(user->pw_name), true, O_NOFOLLOW});
    result.append(Place{QFile::encodeName(QDir::homePath() + QStringLiteral("/.cache")), true});
    return result;
}

// A descriptor of the directory if it belongs to the user and is not writable by others, otherwise -1.
int openPlace(const Place &place)
{
    if (place.create)
        mkdir(place.path.constData(), S_IRWXU);
    const int directory =
        open(place.path.constData(), O_RDONLY | O_DIRECTORY | O_NONBLOCK | O_CLOEXEC | place.flags);
    struct stat info = {};
    if (directory >= 0 && fstat(directory, &info) == 0 && info.st_uid == geteuid() &&
        (info.st_mode & (S_IWGRP | S_IWOTH)) == 0)
        return directory;
    if (directory >= 0)
        close(directory);
    return -1;
}

int openFile(const Place &place, const QByteArray &name)
{
    const int directory = openPlace(place);
    if (directory < 0)
        return -1;
    const int file = openat(directory, name.constData(),
                            O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK, S_IRUSR | S_IWUSR);
    close(directory);
    return file;
}

QByteArray fileName(const QString &key)
{
    // Encoded, so that no key can name a file elsewhere.
    return QUrl::toPercentEncoding(key) + ".instance";
}

int lock(int descriptor)
{
    int result = 0;
    do {
        result = flock(descriptor, LOCK_EX | LOCK_NB);
    } while (result != 0 && errno == EINTR);
    return result;
}

} // namespace

Claim take(const QString &key)
{
    for (const Place &place : places()) {
        const int descriptor = openFile(place, fileName(key));
        if (descriptor < 0)
            continue;
        if (lock(descriptor) == 0)
            return {Answer::Granted, descriptor};
        const int reason = errno;
        close(descriptor);
        if (reason == EWOULDBLOCK)
            return {Answer::Taken};
        // No locks there, as on some network file systems.
    }
    return {Answer::Unavailable};
}

} // namespace Mtk::InstanceClaim
