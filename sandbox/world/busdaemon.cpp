// SPDX-License-Identifier: Apache-2.0
#include "busdaemon.h"

#include <QDir>
#include <QFile>
#include <QSaveFile>

#include <csignal>

namespace sandbox {

namespace {

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

BusDaemon::BusDaemon(QString type, QString name, const StateFolder &state)
    : m_type(std::move(type))
    , m_name(std::move(name))
    , m_state(state)
    , m_daemon(state.at("world.log"))
{
}

QString BusDaemon::address() const
{
    return QStringLiteral("unix:path=") + socket();
}

bool BusDaemon::start(QString *error)
{
    if (!writeActivation() || !writeConfiguration()) {
        *error = QStringLiteral("cannot write %1").arg(configuration());
        return false;
    }
    QFile::remove(socket());
    return !m_daemon
                .startAndReadLine(QStringLiteral("dbus-daemon"),
                                  {QStringLiteral("--config-file=") + configuration(),
                                   QStringLiteral("--nofork"), QStringLiteral("--nopidfile"),
                                   QStringLiteral("--print-address=1")},
                                  error)
                .isEmpty();
}

void BusDaemon::allowAll()
{
    m_denied.clear();
    if (writeConfiguration())
        ::kill(static_cast<pid_t>(m_daemon.processId()), SIGHUP); // it reads its configuration anew
}

bool BusDaemon::writeConfiguration() const
{
    QString denials;
    for (const QString &name : m_denied)
        denials += QStringLiteral("    <deny send_destination=\"%1\"/>\n").arg(name);
    const QString text = kConfiguration.arg(m_type, address(), serviceFolder(), denials);
    QSaveFile file(configuration());
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
