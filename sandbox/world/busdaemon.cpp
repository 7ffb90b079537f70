// SPDX-License-Identifier: Apache-2.0
#include "busdaemon.h"

#include "data/data.h"
#include "journal/error.h"
#include "journal/smallfile.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDir>

namespace sandbox {

namespace {

constexpr int kReloadLimitMs = 20000;

} // namespace

BusDaemon::BusDaemon(QString type, QString name, const StateDirectory &state)
    : m_type(std::move(type))
    , m_name(std::move(name))
    , m_state(state)
    , m_daemon(state.at("world.log"))
    , m_monitor(state.at("world.log"))
{
}

QString BusDaemon::address() const
{
    return QStringLiteral("unix:path=") + socket();
}

void BusDaemon::start()
{
    writeActivation();
    writeConfiguration();
    QFile::remove(socket());
    m_daemon.startAndReadLine(QStringLiteral("dbus-daemon"),
                              {QStringLiteral("--config-file=") + configuration(), QStringLiteral("--nofork"),
                               QStringLiteral("--nopidfile"), QStringLiteral("--print-address=1")});
}

void BusDaemon::startRecorded()
{
    start();
    m_monitor.startAndReadLine(QStringLiteral("dbus-monitor"),
                               {QStringLiteral("--address"), address(), QStringLiteral("--profile"),
                                QStringLiteral("type='method_call'")});
    QObject::connect(&m_monitor, &QProcess::readyReadStandardOutput, [this] { recordCalls(); });
}

void BusDaemon::stop()
{
    m_daemon.end();
    m_monitor.end();
    m_monitor.disconnect();
}

// One line for each: "mc", time, serial, sender, destination, path, interface, member.
void BusDaemon::recordCalls()
{
    while (m_monitor.canReadLine()) {
        const QStringList line = QString::fromUtf8(m_monitor.readLine().trimmed()).split(QLatin1Char('\t'));
        const QString service = line.value(4);
        if (line.constFirst() == QLatin1String("mc") && service != QLatin1String("org.freedesktop.DBus"))
            m_state.journal().write(QStringLiteral("monitor"),
                                    QStringLiteral("%1 %2.%3").arg(service, line.value(6), line.value(7)));
    }
}

void BusDaemon::allowAll()
{
    m_denied.clear();
    writeConfiguration();
    const QString bus = QStringLiteral("org.freedesktop.DBus");
    const QDBusMessage reload = QDBusMessage::createMethodCall(bus, QStringLiteral("/org/freedesktop/DBus"),
                                                               bus, QStringLiteral("ReloadConfig"));
    const QDBusMessage reply =
        QDBusConnection::connectToBus(address(), m_name).call(reload, QDBus::Block, kReloadLimitMs);
    QDBusConnection::disconnectFromBus(m_name);
    if (reply.type() != QDBusMessage::ReplyMessage)
        throw Error(QStringLiteral("the %1 bus does not read its configuration: %2")
                        .arg(m_type, reply.errorMessage()));
}

void BusDaemon::writeConfiguration() const
{
    QString denials;
    for (const QString &name : m_denied)
        denials += QStringLiteral("    <deny send_destination=\"%1\"/>\n").arg(name);
    const QString text =
        QString::fromUtf8(data::read("bus.conf")).arg(m_type, address(), serviceDirectory(), denials);
    smallfile::save(configuration(), text.toUtf8());
}

void BusDaemon::writeActivation() const
{
    QDir().mkpath(serviceDirectory());
    for (const QString &name : m_failing) {
        const QString path = serviceDirectory() + QLatin1Char('/') + name + QStringLiteral(".service");
        const QString text = QStringLiteral("[D-BUS Service]\nName=%1\nExec=/bin/false\n").arg(name);
        smallfile::save(path, text.toUtf8());
    }
}

} // namespace sandbox
