// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

#include <QFile>
#include <QProcess>

int WorldRun::play(const char *journey, const char *scenario)
{
    constexpr int kLimitMs = 120000;
    m_journalStart = content("journal.log").size();
    QProcess process;
    process.setProcessChannelMode(QProcess::MergedChannels);
    process.start(QStringLiteral(VESK_SANDBOX),
                  {QStringLiteral("--state"), m_state.path(), QStringLiteral("--headless"),
                   QStringLiteral("--autopilot"), QString::fromLatin1(journey), QStringLiteral("--scenario"),
                   QString::fromLatin1(scenario)});
    const bool ended = process.waitForFinished(kLimitMs);
    m_output = process.readAll();
    return ended ? process.exitCode() : -1;
}

QByteArray WorldRun::content(const char *relative) const
{
    QFile file(path(relative));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

QByteArray WorldRun::firstMissing(const QList<QByteArray> &events) const
{
    const QByteArray text = journal();
    int position = 0;
    for (const QByteArray &event : events) {
        const int found = text.indexOf(event, position);
        if (found < 0)
            return event;
        position = found + event.size();
    }
    return QByteArray();
}

void WorldRun::noteResult()
{
    if (!m_lacks && !QTest::currentTestFailed())
        m_passed.insert(QTest::currentTestFunction());
    m_lacks = false;
}

bool WorldRun::hasPassed(const char *function)
{
    m_lacks = !m_passed.contains(function);
    return !m_lacks;
}
