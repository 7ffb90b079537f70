// SPDX-License-Identifier: Apache-2.0
#include "transportfixture.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QMutex>
#include <QThread>

#include <algorithm>

#include <sys/stat.h>

namespace {

constexpr int kPatienceMs = 30 * 1000;

QMutex warningMutex;
QStringList warnings;

void collect(QtMsgType type, const QMessageLogContext &, const QString &text)
{
    const QMutexLocker locker(&warningMutex);
    if (type == QtWarningMsg)
        warnings.append(text);
}

// The servers of these tests are on this machine.
void forgetProxies()
{
    for (const char *name : {"https_proxy", "HTTPS_PROXY", "all_proxy", "ALL_PROXY", "no_proxy", "NO_PROXY"})
        qunsetenv(name);
}

template <typename T>
T orEnd(std::optional<T> value, const QString &error)
{
    if (!value)
        qFatal("%s", qPrintable(error));
    return *std::move(value);
}

} // namespace

WarningLog::WarningLog()
{
    warnings.clear();
    m_before = qInstallMessageHandler(collect);
}

WarningLog::~WarningLog()
{
    qInstallMessageHandler(m_before);
}

QStringList WarningLog::lines() const
{
    const QMutexLocker locker(&warningMutex);
    return warnings;
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
    forgetProxies();
}

QString TransportFixture::file(const QString &name, const QByteArray &contents, mode_t mode) const
{
    QFile target(path(name));
    if (!target.open(QIODevice::WriteOnly) || target.write(contents) != contents.size() ||
        ::fchmod(target.handle(), mode) != 0)
        qFatal("cannot write %s", qPrintable(target.fileName()));
    return target.fileName();
}

sandbox::CertificateAuthority TransportFixture::authority(const QString &name)
{
    QString error;
    return orEnd(sandbox::CertificateAuthority::create(name, &error), error);
}

sandbox::KeyPair TransportFixture::serverOf(const sandbox::CertificateAuthority &ca,
                                            const sandbox::Validity &validity)
{
    QString error;
    return orEnd(ca.issueServer({QStringLiteral("localhost")}, &error, validity), error);
}

sandbox::KeyPair TransportFixture::clientOf(const sandbox::CertificateAuthority &ca)
{
    QString error;
    return orEnd(ca.issueClient(QStringLiteral("terminal-identity"), &error), error);
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
    const QDeadlineTimer patience(kPatienceMs);
    const auto runs = [](const QString &thread) {
        return QFile::exists(QStringLiteral("/proc/self/task/") + thread);
    };
    while (std::any_of(threads.begin(), threads.end(), runs)) {
        if (patience.hasExpired())
            return false;
        QThread::msleep(1);
    }
    return true;
}

TlsPeer::Script always(const QByteArray &bytes, PeerAnswer::End end)
{
    return [=](const QByteArray &) {
        PeerAnswer answer;
        answer.bytes = bytes;
        answer.end = end;
        return answer;
    };
}
