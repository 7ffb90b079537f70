// SPDX-License-Identifier: Apache-2.0
#include "busdaemon.h"

#include <QDir>
#include <QFile>
#include <QSaveFile>

#include <csignal>

namespace sandbox {

namespace {

// Longest path in a sockaddr_un, its closing zero left out.
constexpr int kLongestSocketPath = 107;

const QString kConfiguration =
    QStringLiteral("<!DOCTYPE busconfig PUBLIC \"-//freedesktop//DTD D-Bus Bus Configuration 1.0//EN\"\n"
                   "  \"http://www.freedesktop.org/standards/dbus/1.0/busconfig.dtd\">\n"
                   "<busconfig>\n"
                   "  <type>%1</type>\n"
                   "  <listen>%2</listen>\n"
                   "  <auth>EXTERNAL</auth>\n"
                   "  <servicedir>%3</servicedir>\n"
                   "  <policy context=\"default\">\n"
                   "    <allow send_destination=\"*\" eavesdrop=\"true\"/>\n"
                   "    <allow eavesdrop=\"true\"/>\n"
                   "    <allow own=\"*\"/>\n"
                   "%4"
                   "  </policy>\n"
                   "</busconfig>\n");

} // namespace

BusDaemon::BusDaemon(QString type, QString socket, const QString &errorLog)
    : m_type(std::move(type))
    , m_socket(std::move(socket))
    , m_daemon(errorLog)
{
}

QString BusDaemon::address() const
{
    // The characters that an address may hold as they are.
    return QStringLiteral("unix:path=") +
           QString::fromLatin1(QFile::encodeName(m_socket).toPercentEncoding("/", ".~"));
}

bool BusDaemon::start(QString *error)
{
    if (QFile::encodeName(m_socket).size() > kLongestSocketPath) {
        *error =
            QStringLiteral("%1 is too long for the path of a socket (%2 bytes): take a state folder nearer "
                           "to the root")
                .arg(m_socket)
                .arg(kLongestSocketPath);
        return false;
    }
    const QString configuration = m_socket + QStringLiteral(".conf");
    if (!writeActivation() || !writeConfiguration(configuration)) {
        *error = QStringLiteral("cannot write %1").arg(configuration);
        return false;
    }
    QFile::remove(m_socket);
    return !m_daemon
                .startAndReadLine(QStringLiteral("dbus-daemon"),
                                  {QStringLiteral("--config-file=") + configuration,
                                   QStringLiteral("--nofork"), QStringLiteral("--nopidfile"),
                                   QStringLiteral("--print-address=1")},
                                  error)
                .isEmpty();
}

void BusDaemon::allowAll()
{
    m_denied.clear();
    if (writeConfiguration(m_socket + QStringLiteral(".conf")))
        ::kill(static_cast<pid_t>(m_daemon.processId()), SIGHUP); // it reads its configuration anew
}

bool BusDaemon::writeConfiguration(const QString &path) const
{
    QString denials;
    for (const QString &name : m_denied)
        denials += QStringLiteral("    <deny send_destination=\"%1\"/>\n").arg(name);
    const QString text =
        kConfiguration.arg(m_type, address().toHtmlEscaped(), serviceFolder().toHtmlEscaped(), denials);
    QSaveFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(text.toUtf8()) > 0 && file.commit();
}

bool BusDaemon::writeActivation() const
{
    bool good = QDir().mkpath(serviceFolder());
    for (const QString &name : m_failing) {
        QFile file(serviceFolder() + QLatin1Char('/') + name + QStringLiteral(".service"));
        good =
            good && file.open(QIODevice::WriteOnly) &&
            file.write(QStringLiteral("[D-BUS Service]\nName=%1\nExec=/bin/false\n").arg(name).toUtf8()) > 0;
    }
    return good;
}

} // namespace sandbox
