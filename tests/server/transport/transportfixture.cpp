// SPDX-License-Identifier: Apache-2.0
#include "transportfixture.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QRegularExpression>
#include <QThread>

#include <algorithm>

#include <sys/stat.h>

namespace {

constexpr int kTimeoutMs = 30 * 1000;

} // namespace

QStringList WarningLog::lines() const
{
    static const QRegularExpression level(QStringLiteral("^warning: "));
    return LogCapture::lines().filter(level).replaceInStrings(level, QString());
}

QString WarningLog::onlyLine() const
{
    const QStringList all = lines();
    return all.size() == 1 ? all.first()
                           : QStringLiteral("%1 lines: ").arg(all.size()) + all.join(QStringLiteral(" | "));
}

TransportFixture::TransportFixture()
    : ca(authority(QStringLiteral("Test CA")))
    , server(serverOf(ca))
    , caFile(file(QStringLiteral("ca.crt"), ca.certificatePem()))
{
    for (const char *name : {"https_proxy", "HTTPS_PROXY", "all_proxy", "ALL_PROXY", "no_proxy", "NO_PROXY"})
        qunsetenv(name); // the servers of these tests are on this machine
}

std::unique_ptr<HttpClientApi> TransportFixture::client() const
{
    auto made = std::make_unique<HttpClientApi>(nullptr, false);
    made->setSSLConfig(caFile, QString(), QString());
    return made;
}

QString TransportFixture::file(const QString &name, const QByteArray &contents, mode_t mode) const
{
    QFile target(path(name));
    if (!target.open(QIODevice::WriteOnly) || target.write(contents) != contents.size() ||
        ::fchmod(target.handle(), mode) != 0)
        qFatal("cannot write %s", qPrintable(target.fileName()));
    return target.fileName();
}

QStringList runningThreads(const QStringList &known)
{
    QStringList threads =
        QDir(QStringLiteral("/proc/self/task")).entryList(QDir::Dirs | QDir::NoDotAndDotDot);
    for (const QString &thread : known)
        threads.removeOne(thread);
    return threads;
}

bool haveEnded(const QStringList &threads)
{
    const QDeadlineTimer deadline(kTimeoutMs);
    const auto runs = [](const QString &thread) {
        return QFile::exists(QStringLiteral("/proc/self/task/") + thread);
    };
    while (std::any_of(threads.begin(), threads.end(), runs)) {
        if (deadline.hasExpired())
            return false;
        QThread::msleep(1);
    }
    return true;
}

TlsPeer::Script always(const QByteArray &bytes, PeerAnswer::End end)
{
    return [=](const QByteArray &) {
        return PeerAnswer{bytes, end, {}, 0};
    };
}
