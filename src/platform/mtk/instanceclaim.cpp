// SPDX-License-Identifier: Apache-2.0
#include "instanceclaim.h"

#include <QFile>
#include <QStandardPaths>
#include <QUrl>

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace Mtk {
namespace InstanceClaim {

namespace {

Claim unavailable(const QString &what)
{
    return {Answer::Unavailable, -1,
            what + QStringLiteral(": ") + QString::fromLocal8Bit(std::strerror(errno))};
}

QString fileName(const QString &key)
{
    // Encoded, so that no key can name a file elsewhere.
    return QString::fromLatin1(QUrl::toPercentEncoding(key)) + QStringLiteral(".instance");
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
    // Of the user alone, whether the session has made it or it lies below the temporary folder.
    const QString folder = QStandardPaths::writableLocation(QStandardPaths::RuntimeLocation);
    if (folder.isEmpty())
        return {Answer::Unavailable, -1, QStringLiteral("there is no runtime folder")};
    const QString path = folder + QLatin1Char('/') + fileName(key);
    const int descriptor =
        open(QFile::encodeName(path).constData(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600);
    if (descriptor < 0)
        return unavailable(path);
    if (lock(descriptor) == 0)
        return {Answer::Granted, descriptor, {}};
    Claim answer = errno == EWOULDBLOCK ? Claim{Answer::Taken, -1, {}} : unavailable(path);
    close(descriptor);
    return answer;
}

} // namespace InstanceClaim
} // namespace Mtk
