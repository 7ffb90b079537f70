// SPDX-License-Identifier: Apache-2.0
#include "commands.h"

#include <QProcess>

#include <cstdlib>

namespace commands {

const char kKillOlderService[] = "killall -9  mmcs";

namespace {

constexpr int kWaitMilliseconds = 30000;

void run(QProcess &process, const char *program, const QStringList &arguments)
{
    process.start(QString::fromLatin1(program), arguments, QIODevice::ReadWrite);
    process.waitForFinished(kWaitMilliseconds);
}

} // namespace

QString userIdentity()
{
    QProcess process;
    run(process, "id", {});
    return QString::fromLocal8Bit(process.readAllStandardOutput().constData());
}

void hideLoginSwitches()
{
    const QString set = QStringLiteral("set");
    const QString schema = QStringLiteral("com.morvek.mde.control-center");
    const QString off = QStringLiteral("false");
    QProcess process;
    run(process, "gsettings", {set, schema, QStringLiteral("auto-login-visable"), off});
    run(process, "gsettings", {set, schema, QStringLiteral("nopasswd-login-visable"), off});
}

void enableUserServices()
{
    // The shell takes the line apart at its semicolon. A constant text, and the result is of no use to
    // anybody.
    const int result =
        std::system("systemctl --global enable vesks;systemctl --global enable mmcs"); // NOLINT
    Q_UNUSED(result)
}

void stopUserServices()
{
    for (const char *service : {"vesks", "mmcs"}) {
        for (const char *verb : {"stop", "disable"}) {
            QProcess::startDetached(
                QStringLiteral("systemctl"),
                {QStringLiteral("--global"), QString::fromLatin1(verb), QString::fromLatin1(service)});
        }
    }
}

int killOlderService()
{
    QStringList words = QProcess::splitCommand(QString::fromLatin1(kKillOlderService));
    const QString program = words.takeFirst();
    return QProcess::execute(program, words);
}

} // namespace commands
