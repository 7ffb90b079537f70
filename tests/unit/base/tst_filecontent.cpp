// SPDX-License-Identifier: Apache-2.0
#include "baseutils.h"
#include "filecontent.h"
#include "isolatedfiles.h"
#include "logcapture.h"
#include "logtext.h"
#include "wellknownpaths.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QTest>

#include <csignal>

#include <sys/resource.h>

using vesk::base::FileContent;

namespace {

const QString kRecord = QString::fromUtf8(vesk::kUserinfoPath);

QJsonObject record()
{
    return QJsonDocument::fromJson(isolatedfiles::read(kRecord)).object();
}

QString describe(const vesk::base::UserInfo &info)
{
    return QStringList{info.isDomain ? QStringLiteral("joined") : QStringLiteral("free"),
                       info.serverHost,
                       info.serverPort,
                       info.domainHost,
                       info.domainPort,
                       info.terminalName}
        .join(QLatin1Char('|'));
}

} // namespace

// The record and the machine identity at their real paths, in every state that a machine may have them in.
class TestFileContent : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init()
    {
        isolatedfiles::remove(kRecord);
        isolatedfiles::remove(QString::fromUtf8(vesk::kMachineidPath));
    }

    void readsRecord_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<QString>("info");
        QTest::addColumn<int>("found"); // by how many of three readers

        const auto row = [](const char *name, const char *content, const char *info, int found) {
            QTest::newRow(name) << QByteArray(content) << QString::fromUtf8(info) << found;
        };
        row("numbers and words as other types",
            R"({"is_Domain":"false","server_host":true,"server_port":443,"domain_host":"d",
            "domain_port":8443,"terminal_name":7})",
            "free|true|443|d|8443|7", 3);
        row("flag as a number",
            R"({"is_Domain":2,"server_host":"s","server_port":"1","domain_host":"d","domain_port":"2",
            "terminal_name":[1]})",
            "joined|s|1|d|2|", 3);
        row("no JSON", "{\"is_Domain\":tr", "free|||||", 0);
        row("without the hosts", R"({"server_port":"1","domain_port":"2","terminal_name":"t"})",
            "free||1||2|t", 1);
    }

    void readsRecord()
    {
        QFETCH(QByteArray, content);
        QVERIFY(isolatedfiles::write(kRecord, content));
        bool complete = false;
        QTEST(describe(FileContent::getUserInfo(&complete)), "info");
        QCOMPARE(isolatedfiles::read(kRecord), content);
        bool knowsDomain = false;
        FileContent::isDomain(&knowsDomain);
        QString host;
        QString port;
        QTEST(int(complete) + int(knowsDomain) + int(FileContent::getHostAndPort(host, port)), "found");
    }

    void repairsOlderRecords_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<QString>("info");
        QTest::addColumn<QString>("domain"); // of the record afterwards
        QTest::addColumn<bool>("complete");

        const auto row = [](const char *content, const char *info, const char *domain, bool complete) {
            QTest::newRow(info) << QByteArray(content) << info << domain << complete;
        };
        row(R"({"server_ip":"10.0.0.1","server_port":"9","terminal_name":"t"})", "free||9|10.0.0.1|9|t",
            "10.0.0.1:9", true);
        // The older name wins when only the flag is missing, and counts for nothing in a complete record.
        row(R"({"server_ip":"old","server_host":"s","domain_host":"d","domain_port":"2","server_port":"1",
            "terminal_name":"t"})",
            "free|s|1|old|2|t", "old:2", true);
        row(R"({"is_Domain":true,"server_ip":"old","server_host":"s","domain_host":"d","domain_port":"2",
            "server_port":"1"})",
            "joined|s|1|d|2|", "d:2", false);
    }

    void repairsOlderRecords()
    {
        QFETCH(QByteArray, content);
        QVERIFY(isolatedfiles::write(kRecord, content));
        bool complete = false;
        QTEST(describe(FileContent::getUserInfo(&complete)), "info");
        QTEST(complete, "complete");
        QTEST(record().value(QStringLiteral("domain_host")).toString() + QLatin1Char(':') +
                  record().value(QStringLiteral("domain_port")).toString(),
              "domain");
    }

    void savesTheFlag_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<bool>("saved");
        QTest::addColumn<QByteArray>("after");

        const auto row = [](const char *name, const char *content, bool saved, const char *after) {
            QTest::newRow(name) << QByteArray(content) << saved << QByteArray(after);
        };
        row("changed, other keys kept", R"({"is_Domain":false,"x":1})", true,
            "{\n    \"is_Domain\": true,\n    \"x\": 1\n}\n");
        row("the same, not written", R"({"is_Domain":true})", true, R"({"is_Domain":true})");
        row("odd type counts as false", R"({"is_Domain":"true"})", true, "{\n    \"is_Domain\": true\n}\n");
        row("key absent", R"({"x":1})", false, R"({"x":1})");
    }

    void savesTheFlag()
    {
        QFETCH(QByteArray, content);
        QVERIFY(isolatedfiles::write(kRecord, content));
        QTEST(FileContent::saveDomain(true), "saved");
        QTEST(isolatedfiles::read(kRecord), "after");
    }

    // The buffer takes what the disk does not.
    void saysThatAWriteFellShort()
    {
        QVERIFY(isolatedfiles::write(kRecord, R"({"is_Domain":false})"));
        rlimit previous = {};
        getrlimit(RLIMIT_FSIZE, &previous);
        std::signal(SIGXFSZ, SIG_IGN);
        const rlimit small = {4, previous.rlim_max};
        setrlimit(RLIMIT_FSIZE, &small);
        const bool saved = FileContent::saveDomain(true);
        setrlimit(RLIMIT_FSIZE, &previous);
        QVERIFY(!saved);
    }

    void keepsLogLinesWhole_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("logged");

        const auto row = [](const char *name, const QString &text, const QString &logged) {
            QTest::newRow(name) << text << logged;
        };
        row("harmless", QStringLiteral("终é😀\"\\%s"), QStringLiteral("终é😀\"\\%s"));
        row("line ends and tabs", QStringLiteral("a\nb\r\nc\td\ve\u0085f\u2028g\u2029h"),
            QStringLiteral("a b  c d e f g h"));
        row("controls", QStringLiteral("a\u0000b\u001bc\u007fd\u009be\u0008"),
            QStringLiteral("a\ufffdb\ufffdc\ufffdd\ufffde\ufffd"));
        row("bidirectional", QStringLiteral("\u061c\u200e\u200f\u202a\u202e\u2066\u2069."),
            QString(7, QChar(0xfffd)) + QLatin1Char('.'));
        row("halves of pairs", QString(QChar(0xd83d)) + QLatin1Char('a') + QChar(0xde00),
            QStringLiteral("\ufffda\ufffd"));
        const QString full(vesk::base::kMaxLogText, QLatin1Char('x'));
        row("as long as may be", full, full);
        row("too long", full + QLatin1Char('x'), full + QChar(0x2026));
    }

    // Seen through a line that holds such a text.
    void keepsLogLinesWhole()
    {
        QFETCH(QString, text);
        QFETCH(QString, logged);
        QString value;
        const LogCapture log;
        vesk::base::BaseUtils::getJsonObjectValue(QJsonObject(), text, value, QStringLiteral("f"));
        QCOMPARE(log.text(), QStringLiteral("warning: f can not get json key: ") + logged);
    }

    void updatesOneKey()
    {
        const QString key = QStringLiteral("terminal_name");
        for (const char *content : {"", "no JSON", "[]", R"({"terminal_name":"a","x":[1,2]})"}) {
            QVERIFY(isolatedfiles::write(kRecord, content));
            QJsonObject expected = record();
            expected.insert(key, QStringLiteral("t"));
            QVERIFY(vesk::base::updateUserInfo(key, QStringLiteral("t")));
            QCOMPARE(record(), expected);
        }
    }

    void savesAWholeRecord()
    {
        QVERIFY(isolatedfiles::write(kRecord, R"({"server_ip":"gone","x":1})"));
        vesk::base::UserInfo info;
        info.isDomain = true;
        info.serverHost = QStringLiteral("终端.example");
        QVERIFY(FileContent::saveUserInfo(info));
        QCOMPARE(record().keys().join(QLatin1Char(' ')),
                 QStringLiteral("domain_host domain_port is_Domain server_host server_port terminal_name"));
        QCOMPARE(describe(FileContent::getUserInfo(nullptr)), QStringLiteral("joined|终端.example||||"));
    }

    void readsMachineIdentity()
    {
        const QString path = QString::fromUtf8(vesk::kMachineidPath);
        FileContent content(nullptr);
        const auto read = [&](bool force) {
            bool ok = false;
            const QString id = content.getMachineID(&ok, force);
            return ok ? id : id + QStringLiteral(" failed");
        };
        QCOMPARE(read(false), QStringLiteral(" failed"));

        // White space only is no identity: the next call looks again.
        QVERIFY(isolatedfiles::write(path, " \n\t"));
        QCOMPARE(read(false), QString());
        QVERIFY(isolatedfiles::write(path, QByteArray("\n  id-1\0junk\n", 12)));
        QCOMPARE(read(false), QStringLiteral("id-1"));

        // From here on it is cached, until a caller insists.
        QVERIFY(isolatedfiles::write(path, "id-2"));
        QCOMPARE(read(false), QStringLiteral("id-1"));
        QCOMPARE(read(true), QStringLiteral("id-2"));
        isolatedfiles::remove(path);
        QCOMPARE(read(true), QStringLiteral("id-2 failed"));
        QCOMPARE(read(false), QStringLiteral("id-2"));
    }
};

QTEST_GUILESS_MAIN(TestFileContent)
#include "tst_filecontent.moc"
