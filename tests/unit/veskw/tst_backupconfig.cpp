// SPDX-License-Identifier: Apache-2.0
#include "backupconfig.h"
#include "isolatedfiles.h"
#include "logcapture.h"

#include <QTest>

class TestBackupConfig : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void readsList_data();
    void readsList();
};

// A stream that is refused holds a harmless list with "a" here: a file that was read would tell it.
void TestBackupConfig::readsList_data()
{
    QTest::addColumn<QByteArray>("value");
    QTest::addColumn<QStringList>("list");
    const auto row = [](const char *value, const QStringList &list = {}) {
        QTest::newRow(value) << QByteArray(value) << list;
    };
    const QString a = QStringLiteral("a");
    row("a, b", {a, QStringLiteral("b")});
    row("@Invalid()");
    row("@@Variant", {QStringLiteral("@Variant")});
    row("@String(a), @Size(1 2)", {a, QString()});
    row(R"(\x663e\x793a, a)", {QStringLiteral("显示"), a});
#define STREAM R"(\0\0\0\xb\0\0\0\x1\0\0\0\x2\0\x61))"
    row("@Variant(" STREAM);
    row("a, @Variant(" STREAM);
    row(R"(@DateTime(\0\0\0\xb\0\0\0\0\x1\0\0\0\x2\0\x61))");
    row(R"(\x40Variant()" STREAM);
    row(R"(\x10040Variant()" STREAM);
    row(R"(\100\126ari\141nt()" STREAM);
    row("\"@Vari\"  \"ant(\"" STREAM);
    row("@Vari\\qant(" STREAM);
    row("@Vari\\\n\\\r\nant(" STREAM);
#undef STREAM
}

void TestBackupConfig::readsList()
{
    QFETCH(QByteArray, value);
    QFETCH(QStringList, list);
    // With the mark of UTF-8 the settings class leaves out another one at the start of each part of a value.
    static int length = 0; // settings are read again only when the file looks changed: when it is longer, too
    const QString path = QStringLiteral("/etc/vesk/config.ini");
    for (const QByteArray &mark : {QByteArray(), QByteArray("\xef\xbb\xbf")}) {
        QByteArray marked = value;
        if (!mark.isEmpty())
            marked.replace("ant(", "\"\"" + mark + "ant(");
        const LogCapture log;
        const QByteArray padding(length += 100, ';');
        QVERIFY(
            isolatedfiles::write(path, mark + padding + "\n[config]\nControlCenterList=" + marked + '\n'));
        QCOMPARE(backupconfig::controlCenterList(), list);
        const bool isRefused = value.contains(R"(\xb)");
        QCOMPARE(log.text(),
                 isRefused ? QStringLiteral("warning: %1 is not read: it holds a serialized object").arg(path)
                           : QString());
    }
}

QTEST_GUILESS_MAIN(TestBackupConfig)
#include "tst_backupconfig.moc"
