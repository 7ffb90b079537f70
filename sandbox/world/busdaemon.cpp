// SPDX-License-Identifier: Apache-2.0
#include "busdaemon.h"

#include "journal/smallfile.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDir>
#include <QFile>

namespace sandbox {

namespace {

constexpr int kReloadLimitMs = 20000;

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
    if (!writeActivation(error) || !writeConfiguration(error))
        return false;
    QFile::remove(socket());
    return !m_daemon
                .startAndReadLine(QStringLiteral("dbus-daemon"),
                                  {QStringLiteral("--config-file=") + configuration(),
                                   QStringLiteral("--nofork"), QStringLiteral("--nopidfile"),
                                   QStringLiteral("--print-address=1")},
                                  error)
                .isEmpty();
}

bool BusDaemon::allowAll(QString *error)
{
    m_denied.clear();
    if (!writeConfiguration(error))
        return false;
    const QString bus = QStringLiteral("org.freedesktop.DBus");
    const QDBusMessage reload = QDBusMessage::createMethodCall(bus, QStringLiteral("/org/freedesktop/DBus"),
                                                               bus, QStringLiteral("ReloadConfig"));
    const QDBusMessage reply =
        QDBusConnection::connectToBus(address(), m_name).call(reload, QDBus::Block, kReloadLimitMs);
    QDBusConnection::disconnectFromBus(m_name);
    if (reply.type() == QDBusMessage::ReplyMessage)
        return true;
    *error =
        QStringLiteral("the %1 bus does not read its configuration: %2").arg(m_type, reply.errorMessage());
    return false;
}

bool BusDaemon::writeConfiguration(QString *error) const
{
    QString denials;
    for (const QString &name : m_denied)
        denials += QStringLiteral("    <deny send_destination=\"%1\"/>\n").arg(name);
    const QString text = kConfiguration.arg(m_type, address(), serviceFolder(), denials);
    return smallfile::write(configuration(), text.toUtf8(), FileAccess::Everyone, error);
}

bool BusDaemon::writeActivation(QString *error) const
{
    bool good = QDir().mkpath(serviceFolder());
    for (const QString &name : m_failing) {
        const QString text = QStringLiteral("[D-BUS Service]\nName=%1\nExec=/bin/false\n").arg(name);
        good =
            good && smallfile::write(serviceFolder() + QLatin1Char('/') + name + QStringLiteral(".service"),
                                     text.toUtf8(), FileAccess::Everyone, error);
    }
    return good;
}

} // namespace sandbox
