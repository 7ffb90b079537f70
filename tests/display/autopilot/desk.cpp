// SPDX-License-Identifier: Apache-2.0
#include "desk.h"

#include "announcement.h"

namespace {

constexpr int kPatience = 10000; // milliseconds for a server to start or to end

QStringList words(const char *line)
{
    return QString::fromLatin1(line).split(QLatin1Char(' '));
}

void stop(QProcess &server)
{
    server.terminate();
    if (!server.waitForFinished(kPatience)) {
        server.kill();
        server.waitForFinished();
    }
}

} // namespace

Desk::Desk()
    : m_folder(QStringLiteral("/tmp/desk-XXXXXX"))
{
    qputenv("XDG_RUNTIME_DIR", folder().toUtf8());
    qputenv("QT_QPA_PLATFORM", "xcb");
    const QString display = startServer(m_display, QStringLiteral("Xvfb"),
                                        words("-displayfd 1 -noreset -nolisten tcp -screen 0 1000x800x24"));
    qputenv("DISPLAY", QByteArray(":") + display.toLatin1());
    const QString address = QStringLiteral("--address=unix:dir=") + folder();
    const QString bus = startServer(m_bus, QStringLiteral("dbus-daemon"),
                                    words("--session --nofork --print-address") << address);
    qputenv("DBUS_SESSION_BUS_ADDRESS", bus.toUtf8());
    sandbox::announceReader();
}

Desk::~Desk()
{
    stop(m_bus);
    stop(m_display);
}

QString Desk::startServer(QProcess &server, const QString &program, const QStringList &arguments)
{
    server.setStandardErrorFile(QProcess::nullDevice());
    server.start(program, arguments);
    while (!server.canReadLine() && server.waitForReadyRead(kPatience)) {
    }
    return QString::fromLocal8Bit(server.readLine()).trimmed();
}
