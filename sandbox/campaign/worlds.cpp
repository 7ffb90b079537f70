// SPDX-License-Identifier: Apache-2.0
#include "campaign/worlds.h"

#include "journal/error.h"
#include "world/child.h"
#include "world/world.h"
#include "world/worldfiles.h"

#include <QDir>
#include <QFileInfo>

namespace sandbox {

namespace {

constexpr int kJoinLimitMs = 120000;

// Files of a stopped world that a copy must not have.
void forgetRun(const QString &state)
{
    bool good = true;
    for (const char *entry : {"journal.log", "program.log", "program.position", "world.log", "lock"}) {
        const QString path = state + QLatin1Char('/') + QLatin1String(entry);
        good = (QFile::remove(path) || !QFileInfo::exists(path)) && good;
    }
    good = QDir(state + QStringLiteral("/screenshots")).removeRecursively() && good;
    QFile journal(state + QStringLiteral("/journal.log"));
    good = journal.open(QIODevice::WriteOnly) && good; // the sign of a world
    if (!good)
        throw Error(QStringLiteral("cannot remove the traces of the run from %1").arg(state));
}

void run(const QString &state)
{
    WorldOptions options;
    options.state = state;
    options.scenarioFile = Scenario::standardDirectory() + QStringLiteral("/join-ok.json");
    World world(options);
    world.start();
    world.stop();
}

void join(const QString &state)
{
    Child launcher({});
    launcher.setProcessChannelMode(QProcess::MergedChannels);
    launcher.start(findTool(QStringLiteral("vesk-sandbox")),
                   {QStringLiteral("--state"), state, QStringLiteral("--headless"),
                    QStringLiteral("--autopilot"), QStringLiteral("join")});
    if (!launcher.waitForFinished(kJoinLimitMs) || launcher.exitCode() != 0)
        throw Error(QStringLiteral("the join that a leave needs has failed: %1")
                        .arg(QString::fromUtf8(launcher.readAll())));
}

} // namespace

QString worlds::nameFor(const QString &journey)
{
    static const QStringList ofMembers{QStringLiteral("leave"), QStringLiteral("status")};
    return QLatin1String(ofMembers.contains(journey) ? "leave" : "join");
}

void worlds::make(const QString &name, const QString &state)
{
    if (QFileInfo::exists(state + QStringLiteral("/journal.log"))) // an earlier one
        QDir(state).removeRecursively();
    if (name == QLatin1String("leave")) {
        join(state);
        WorldFiles(StateDirectory(state), {}).writeSettings();
    } else {
        run(state);
    }
    forgetRun(state);
}

void worlds::copy(const QString &from, const QString &state)
{
    if (QFileInfo::exists(state) ||
        vesk::base::Process().execute(QStringLiteral("cp"), {QStringLiteral("-a"), from, state}) != 0)
        throw Error(QStringLiteral("cannot copy the world %1 to %2").arg(from, state));
}

} // namespace sandbox
