// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QSet>
#include <QStringList>
#include <QTemporaryDir>
#include <QTest>

// For a test function that goes on in the world that another one has left.
#define DEPENDS_ON(world, function)                                                                          \
    if (!(world).hasPassed(function))                                                                        \
    QSKIP("depends on " function "(), which has not passed")

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

    // To be called by cleanup().
    void noteResult();
    // Whether that test function of this run has; where it has not, the running one will not either.
    bool hasPassed(const char *function);

private:
    QTemporaryDir m_state;
    QByteArray m_output;
    int m_journalStart = 0;
    QSet<QByteArray> m_passed;
    bool m_lacks = false;
};
