// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QTemporaryDir>
#include <QtTest>

// One world that several runs of the launcher go through, headless and with the autopilot at the window.
class WorldRun
{
public:
    // scenario: a name or a file. Exit code of the launcher, -1 when it did not end; output() is what it
    // said.
    int play(const char *journey, const char *scenario);
    const QByteArray &output() const { return m_output; }

    QString path(const char *relative) const { return m_state.filePath(QString::fromLatin1(relative)); }
    QByteArray content(const char *relative) const;

    // Fails the test unless the journal holds all of these in this order. Looks at what came since the latest
    // play().
    void verifyOrder(const QList<QByteArray> &events) const;
    QByteArray journal() const { return content("journal.log").mid(m_journalStart); }

private:
    QTemporaryDir m_state;
    QByteArray m_output;
    int m_journalStart = 0;
};
