// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

int WorldRun::play(const char *journey, const char *scenario)
{
    constexpr int kLimitMs = 120000;
    m_journalStart = content("journal.log").size();
    QProcess process;
    process.setProcessChannelMode(QProcess::MergedChannels);
    process.start(QStringLiteral(VESK_SANDBOX),
                  {QStringLiteral("--state"), m_state.path(), QStringLiteral("--headless"),
                   QStringLiteral("--autopilot"), QString::fromLatin1(journey), QStringLiteral("--scenario"),
                   QString::fromLocal8Bit(scenario)});
    const bool ended = process.waitForFinished(kLimitMs);
    m_output = process.readAll();
    return ended ? process.exitCode() : -1;
}

QByteArray WorldRun::content(const char *relative) const
{
    QFile file(path(relative));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

void WorldRun::verifyOrder(const QList<QByteArray> &events) const
{
    const QByteArray text = journal();
    int position = 0;
    for (const QByteArray &event : events) {
        const int found = text.indexOf(event, position);
        QVERIFY2(found >= 0, (event + '\n' + text).constData());
        position = found + event.size();
    }
}
