// SPDX-License-Identifier: Apache-2.0
#include "journal/journal.h"

#include <QFile>
#include <QTemporaryDir>
#include <QtTest>

#include <sys/wait.h>
#include <unistd.h>

using sandbox::Journal;

class JournalTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    // What a server or a service was told cannot pass for lines of the journal, or work a terminal.
    void oneThingOneLine()
    {
        const QTemporaryDir directory;
        const Journal journal(directory.filePath(QStringLiteral("journal")));
        journal.write(QStringLiteral("file"), QStringLiteral("a\nb\r\nc\x1b[2J\x7f\u2028\u0085 \"域\""));
        QFile file(journal.path());
        QVERIFY(file.open(QIODevice::ReadOnly));
        QCOMPARE(QString::fromUtf8(file.readAll().mid(24)),
                 QStringLiteral("file      a\\nb\\r\\nc\\x1b[2J\\x7f\\x2028\\x85 \"域\"\n"));
    }

    void processesNeverMix()
    {
        constexpr int kLines = 200;
        const QTemporaryDir directory;
        const Journal journal(directory.filePath(QStringLiteral("journal")));
        const QString text(3000, QLatin1Char('x'));
        const pid_t child = ::fork();
        for (int line = 0; line < kLines; ++line)
            journal.write(QStringLiteral("command"), text);
        if (child == 0)
            ::_exit(0);
        int status = -1;
        QCOMPARE(::waitpid(child, &status, 0), child);
        QFile file(journal.path());
        QVERIFY(file.open(QIODevice::ReadOnly));
        int lines = 0;
        for (; !file.atEnd(); ++lines)
            QCOMPARE(file.readLine().size(), 35 + text.size());
        QCOMPARE(lines, 2 * kLines);
    }
};

QTEST_GUILESS_MAIN(JournalTest)
#include "tst_journal.moc"
