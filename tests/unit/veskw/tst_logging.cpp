// SPDX-License-Identifier: Apache-2.0
#include "logging.h"

#include <QLoggingCategory>
#include <QRegularExpression>
#include <QTemporaryFile>
#include <QTest>

#include <unistd.h>

// What the system log receives, read from the copy on standard error.
class TestLogging : public QObject
{
    Q_OBJECT

private:
    static QString written(vesk::LEVEL level, QtMsgType type, const QMessageLogContext &context,
                           const QString &message)
    {
        QTemporaryFile copy;
        copy.open();
        const int standardError = dup(STDERR_FILENO);
        dup2(copy.handle(), STDERR_FILENO);
        vesk::uOpenlog(level);
        qInstallMessageHandler(nullptr);
        vesk::uSyslogMessageHandler(type, context, message);
        vesk::uCloselog();
        dup2(standardError, STDERR_FILENO);
        close(standardError);
        copy.seek(0);
        return QString::fromUtf8(copy.readAll());
    }

private Q_SLOTS:
    void writesOneLine_data()
    {
        QTest::addColumn<int>("type");
        QTest::addColumn<int>("level");
        QTest::addColumn<QString>("message");
        QTest::addColumn<QString>("tail"); // behind the time; empty: nothing is written

        const auto row = [](const char *name, QtMsgType type, int level, const QString &message,
                            const QString &tail) {
            QTest::newRow(name) << int(type) << level << message << tail;
        };
        const auto text = QStringLiteral("100%s \u001b终\u202e"); // to the letter
        const QString tail = QStringLiteral(" [ c.cpp void f() 12]  ") + text + QLatin1Char(' ');
        row("debug", QtDebugMsg, 7, text, QStringLiteral("debug") + tail);
        row("info", QtInfoMsg, 7, text, QStringLiteral("info") + tail);
        row("warning", QtWarningMsg, 4, text, QStringLiteral("warning") + tail);
        row("critical", QtCriticalMsg, 2, text, QStringLiteral("critical") + tail);
        row("fatal is fata", QtFatalMsg, 3, text, QStringLiteral("fata") + tail);
        row("critical ranks above fatal", QtFatalMsg, 2, text, QString());
        row("below the threshold", QtWarningMsg, 3, text, QString());
        row("empty", QtCriticalMsg, 7, QString(), QString());
    }

    void writesOneLine()
    {
        QFETCH(int, type);
        QFETCH(int, level);
        QFETCH(QString, message);
        QFETCH(QString, tail);
        const QMessageLogContext context("/a/b/c.cpp", 12, "void f()", "default");
        const QString line = written(vesk::LEVEL(level), QtMsgType(type), context, message);
        if (tail.isEmpty()) {
            QVERIFY2(line.isEmpty(), qUtf8Printable(line));
            return;
        }
        static const QRegularExpression time(
            QStringLiteral("\\d{4}-\\d\\d-\\d\\d \\d\\d:\\d\\d:\\d\\d\\.\\d{3} "));
        QVERIFY2(line.contains(time), qUtf8Printable(line));
        QVERIFY2(line.endsWith(tail + QLatin1Char('\n')), qUtf8Printable(line));
        QCOMPARE(line.count(QLatin1Char('\n')), 1);
    }

    void standsAMessageWithoutContext()
    {
        const QString line = written(vesk::LevelDebug, QtInfoMsg, QMessageLogContext(), QStringLiteral("x"));
        QVERIFY2(line.contains(QStringLiteral("info [  (null) 0]  x ")), qUtf8Printable(line));
    }

    void switchesDebugMessagesWithTheLevel()
    {
        for (const vesk::LEVEL level : {vesk::LevelInfo, vesk::LevelDebug}) {
            vesk::uOpenlog(level);
            QCOMPARE(QLoggingCategory::defaultCategory()->isDebugEnabled(), level == vesk::LevelDebug);
        }
        qInstallMessageHandler(nullptr);
    }
};

QTEST_GUILESS_MAIN(TestLogging)
#include "tst_logging.moc"
