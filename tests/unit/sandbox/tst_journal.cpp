// SPDX-License-Identifier: Apache-2.0
#include "journal/journal.h"

#include <QFile>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QtTest>

#include <sys/wait.h>
#include <thread>
#include <unistd.h>
#include <vector>

using sandbox::Journal;

class JournalTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void oneThingOneLine_data();
    void oneThingOneLine();
    void manyWritersNeverMix();

private:
    QStringList lines(const Journal &journal) const;

    QTemporaryDir m_folder;
};

QStringList JournalTest::lines(const Journal &journal) const
{
    QFile file(journal.path());
    if (!file.open(QIODevice::ReadOnly))
        return {};
    QStringList lines = QString::fromUtf8(file.readAll()).split(QLatin1Char('\n'));
    const bool complete = lines.takeLast().isEmpty();
    return complete ? lines : QStringList();
}

void JournalTest::oneThingOneLine_data()
{
    QTest::addColumn<QString>("source");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("expected");

    QTest::newRow("short source is padded") << QStringLiteral("bus") << QStringLiteral("Reboot(true)")
                                            << QStringLiteral("bus       Reboot(true)");
    QTest::newRow("long source") << QStringLiteral("autopilot") << QStringLiteral("press")
                                 << QStringLiteral("autopilot press");
    QTest::newRow("Chinese stays") << QStringLiteral("server") << QStringLiteral("域 \"a\\b\"")
                                   << QStringLiteral("server    域 \"a\\b\"");
    QTest::newRow("line breaks") << QStringLiteral("file") << QStringLiteral("a\nb\r\nc")
                                 << QStringLiteral("file      a\\nb\\r\\nc");
    QTest::newRow("terminal controls") << QStringLiteral("file") << QStringLiteral("a\tb\x1b[2J\x7f")
                                       << QStringLiteral("file      a\\tb\\x1b[2J\\x7f");
    QTest::newRow("unusual line breaks") << QStringLiteral("file") << QStringLiteral("a\u2028b\u0085c")
                                         << QStringLiteral("file      a\\x2028b\\x85c");
}

void JournalTest::oneThingOneLine()
{
    QFETCH(QString, source);
    QFETCH(QString, text);
    QFETCH(QString, expected);
    const Journal journal(m_folder.filePath(QLatin1String(QTest::currentDataTag())));

    journal.write(source, text);

    const QStringList written = lines(journal);
    QCOMPARE(written.size(), 1);
    static const QRegularExpression stamp(
        QStringLiteral("^\\d{4}-\\d\\d-\\d\\d \\d\\d:\\d\\d:\\d\\d\\.\\d{3} "));
    QVERIFY2(stamp.match(written.first()).hasMatch(), qPrintable(written.first()));
    QCOMPARE(written.first().mid(24), expected);
}

void JournalTest::manyWritersNeverMix()
{
    constexpr int kWriters = 4;
    constexpr int kLines = 100;
    const Journal journal(m_folder.filePath(QStringLiteral("shared")));
    const QString text(3000, QLatin1Char('x'));

    const pid_t child = ::fork();
    if (child == 0) {
        for (int line = 0; line < kLines; ++line)
            journal.write(QStringLiteral("command"), text);
        ::_exit(0);
    }
    std::vector<std::thread> writers;
    writers.reserve(kWriters);
    for (int writer = 0; writer < kWriters; ++writer) {
        writers.emplace_back([&] {
            for (int line = 0; line < kLines; ++line)
                journal.write(QStringLiteral("server"), text);
        });
    }
    for (std::thread &writer : writers)
        writer.join();
    int status = -1;
    QCOMPARE(::waitpid(child, &status, 0), child);
    QCOMPARE(status, 0);

    const QStringList written = lines(journal);
    QCOMPARE(written.size(), (kWriters + 1) * kLines);
    for (const QString &line : written)
        QVERIFY2(line.endsWith(text) && line.size() == 34 + text.size(), qPrintable(line.left(80)));
}

QTEST_GUILESS_MAIN(JournalTest)
#include "tst_journal.moc"
