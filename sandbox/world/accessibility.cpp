// SPDX-License-Identifier: Apache-2.0
#include "accessibility.h"

#include "isolation/guard.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusVariant>
#include <QElapsedTimer>
#include <QFileInfo>
#include <QThread>

namespace sandbox {

namespace {

constexpr int kStartLimitMs = 15000;
constexpr int kPauseMs = 50;
const QString kConnection = QStringLiteral("vesk-sandbox-accessibility");

QString launcher()
{
    for (const char *path :
         {"/usr/libexec/at-spi-bus-launcher", "/usr/lib/at-spi2-core/at-spi-bus-launcher"}) {
        if (QFileInfo(QLatin1String(path)).isExecutable())
            return QLatin1String(path);
    }
    return {};
}

// Fails as long as the launcher does not own its name.
bool switchOn(const QDBusConnection &bus)
{
    QDBusMessage request = QDBusMessage::createMethodCall(
        QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus"),
        QStringLiteral("org.freedesktop.DBus.Properties"), QStringLiteral("Set"));
    request.setArguments({QStringLiteral("org.a11y.Status"), QStringLiteral("IsEnabled"),
                          QVariant::fromValue(QDBusVariant(true))});
    return bus.call(request, QDBus::Block, kStartLimitMs).type() == QDBusMessage::ReplyMessage;
}

QString addressOf(const QDBusConnection &bus)
{
    const QDBusMessage request =
        QDBusMessage::createMethodCall(QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus"),
                                       QStringLiteral("org.a11y.Bus"), QStringLiteral("GetAddress"));
    return bus.call(request, QDBus::Block, kStartLimitMs).arguments().value(0).toString();
}

// The address of the accessibility bus; empty when it cannot be had in time.
QString switchOnInTime(const QString &busAddress)
{
    QElapsedTimer timer;
    timer.start();
    QString address;
    while (address.isEmpty() && timer.elapsed() < kStartLimitMs) {
        {
            const QDBusConnection bus = QDBusConnection::connectToBus(busAddress, kConnection);
            if (switchOn(bus))
                address = addressOf(bus);
        }
        QDBusConnection::disconnectFromBus(kConnection);
        if (address.isEmpty())
            QThread::msleep(kPauseMs);
    }
    return address;
}

} // namespace

void GuardedChild::setupChildProcess()
{
    leaveGuardBehind();
}

bool Accessibility::start(const QProcessEnvironment &environment, QString *error)
{
    const QString program = launcher();
    if (program.isEmpty()) {
        *error = QStringLiteral("at-spi-bus-launcher is not installed");
        return false;
    }
    m_launcher.setProcessEnvironment(environment);
    m_launcher.start(program, {QStringLiteral("--launch-immediately")});
    if (m_launcher.waitForStarted(kStartLimitMs))
        m_address = switchOnInTime(environment.value(QStringLiteral("DBUS_SESSION_BUS_ADDRESS")));
    if (!m_address.isEmpty())
        return true;
    *error = QStringLiteral("%1 is not ready in time").arg(program);
    return false;
}

} // namespace sandbox
