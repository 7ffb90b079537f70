// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QStringList>
#include <QTemporaryDir>

// One world that several runs of the launcher go through, headless and with the autopilot at the window.
class WorldRun
{
public:
    // Exit code of the launcher, -1 when it did not end; output() is what it said.
    int play(const char *journey, const char *scenario);
    const QByteArray &output() const { return m_output; }

    QString path(const char *relative) const { return m_state.filePath(QString::fromLatin1(relative)); }
    QByteArray content(const char *relative) const;

    // The first of `events` that the journal does not hold, or holds before the one ahead of it; an empty
    // text when all are there in order. Looks at what came since the latest play().
    QByteArray firstMissing(const QList<QByteArray> &events) const;
    QByteArray journal() const { return content("journal.log").mid(m_journalStart); }

private:
    QTemporaryDir m_state;
    QByteArray m_output;
    int m_journalStart = 0;
};
