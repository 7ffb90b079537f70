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

bool switchOnInTime(const QString &busAddress)
{
    QElapsedTimer timer;
    timer.start();
    bool done = false;
    while (!done && timer.elapsed() < kStartLimitMs) {
        {
            const QDBusConnection bus = QDBusConnection::connectToBus(busAddress, kConnection);
            done = switchOn(bus);
        }
        QDBusConnection::disconnectFromBus(kConnection);
        if (!done)
            QThread::msleep(kPauseMs);
    }
    return done;
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
    if (m_launcher.waitForStarted(kStartLimitMs) &&
        switchOnInTime(environment.value(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"))))
        return true;
    *error = QStringLiteral("%1 is not ready in time").arg(program);
    return false;
}

} // namespace sandbox
