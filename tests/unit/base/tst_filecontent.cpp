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
using vesk::base::UserInfo;

namespace {

QString recordPath()
{
    return QString::fromUtf8(vesk::kUserinfoPath);
}

QJsonObject record()
{
    return QJsonDocument::fromJson(isolatedfiles::read(recordPath())).object();
}

QString describe(const UserInfo &info)
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
        isolatedfiles::remove(recordPath());
        isolatedfiles::remove(QString::fromUtf8(vesk::kMachineidPath));
    }

    void readsRecord_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<QString>("info");
        QTest::addColumn<bool>("complete");
        QTest::addColumn<bool>("knowsDomain");
        QTest::addColumn<bool>("knowsServer");
        QTest::addColumn<int>("warnings");

        QTest::newRow("whole") << QByteArray(R"({"is_Domain":true,"server_host":"s","server_port":"1",
            "domain_host":"d","domain_port":"2","terminal_name":"t"})")
                               << "joined|s|1|d|2|t" << true << true << true << 0;
        QTest::newRow("numbers and words as other types")
            << QByteArray(R"({"is_Domain":"false","server_host":true,"server_port":443,
            "domain_host":"d","domain_port":8443,"terminal_name":7})")
            << "free|true|443|d|8443|7" << true << true << true << 0;
        QTest::newRow("flag as a number") << QByteArray(R"({"is_Domain":2,"server_host":"s","server_port":"1",
            "domain_host":"d","domain_port":"2","terminal_name":[1]})")
                                          << "joined|s|1|d|2|" << true << true << true << 0;
        QTest::newRow("no JSON") << QByteArray("{\"is_Domain\":tr") << "free|||||" << false << false << false
                                 << 8;
        QTest::newRow("empty") << QByteArray() << "free|||||" << false << false << false << 8;
        QTest::newRow("array") << QByteArray("[1]") << "free|||||" << false << false << false << 8;
        QTest::newRow("without the hosts")
            << QByteArray(R"({"server_port":"1","domain_port":"2","terminal_name":"t"})") << "free||1||2|t"
            << true << false << false << 4;
    }

    void readsRecord()
    {
        QFETCH(QByteArray, content);
        QVERIFY(isolatedfiles::write(recordPath(), content));
        bool complete = false;
        {
            const LogCapture log;
            QTEST(describe(FileContent::getUserInfo(&complete)), "info");
            QTEST(
                int(log.lines().filter(QStringLiteral("warning: getUserInfo can not get json key:")).size()),
                "warnings");
        }
        QTEST(complete, "complete");
        QCOMPARE(isolatedfiles::read(recordPath()), content);

        bool knowsDomain = false;
        FileContent::isDomain(&knowsDomain);
        QTEST(knowsDomain, "knowsDomain");
        QString host = QStringLiteral("untouched");
        QString port = host;
        QTEST(FileContent::getHostAndPort(host, port), "knowsServer");
    }

    // A record that cannot be opened counts as "nothing known" for the readers, as a failure for the writers.
    void reportsUnreadableRecord()
    {
        for (const bool isFolder : {false, true}) {
            if (isFolder)
                QVERIFY(isolatedfiles::writeFolder(recordPath()));
            bool ok = false;
            QVERIFY(!FileContent::isDomain(&ok));
            QVERIFY(ok);
            ok = false;
            QVERIFY(FileContent::getTerminalAlias(&ok).isNull());
            QVERIFY(ok);
            ok = false;
            QCOMPARE(describe(FileContent::getUserInfo(&ok)), QStringLiteral("free|||||"));
            QVERIFY(ok);
            QVERIFY(!FileContent::isDomain(nullptr));

            QString host = QStringLiteral("h");
            QString port = QStringLiteral("p");
            QVERIFY(!FileContent::getHostAndPort(host, port));
            QCOMPARE(host + port, QStringLiteral("hp"));
            QVERIFY(!FileContent::saveDomain(true));
            QVERIFY(!vesk::base::updateUserInfo(QStringLiteral("terminal_name"), QStringLiteral("t")));
        }
        QVERIFY(!FileContent::saveUserInfo({}));
    }

    void saysWhyAnOpenFailed()
    {
        const LogCapture log;
        FileContent::isDomain(nullptr);
        QCOMPARE(log.lines().size(), 2);
        QVERIFY(log.lines().at(0).startsWith(QLatin1String("warning: open file failed, file:")));
        QVERIFY(log.lines().at(0).contains(recordPath()));
        QVERIFY(log.lines().at(0).endsWith(QLatin1String("false")));
        QCOMPARE(log.lines().at(1), QStringLiteral("warning: isDomain open file failed!"));
    }

    void repairsOlderRecords_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<QString>("info");
        QTest::addColumn<QByteArray>("repaired");
        QTest::addColumn<bool>("complete");

        QTest::newRow("legacy host and one port")
            << QByteArray(R"({"server_ip":"10.0.0.1","server_port":"9","terminal_name":"t"})")
            << "free||9|10.0.0.1|9|t"
            << QByteArray(R"({"domain_host":"10.0.0.1","domain_port":"9","server_ip":"10.0.0.1",
            "server_port":"9","terminal_name":"t"})")
            << true;
        QTest::newRow("legacy host wins when only the flag is missing")
            << QByteArray(R"({"server_ip":"old","server_host":"s","domain_host":"d","domain_port":"2",
            "server_port":"1","terminal_name":"t"})")
            << "free|s|1|old|2|t"
            << QByteArray(R"({"server_ip":"old","server_host":"s","domain_host":"old","domain_port":"2",
            "server_port":"1","terminal_name":"t"})")
            << true;
        QTest::newRow("legacy host ignored in a complete record")
            << QByteArray(R"({"is_Domain":true,"server_ip":"old","server_host":"s","domain_host":"d",
            "domain_port":"2","server_port":"1"})")
            << "joined|s|1|d|2|"
            << QByteArray(R"({"is_Domain":true,"server_ip":"old","server_host":"s","domain_host":"d",
            "domain_port":"2","server_port":"1"})")
            << false;
    }

    void repairsOlderRecords()
    {
        QFETCH(QByteArray, content);
        QFETCH(QByteArray, repaired);
        QVERIFY(isolatedfiles::write(recordPath(), content));
        bool complete = false;
        QTEST(describe(FileContent::getUserInfo(&complete)), "info");
        QTEST(complete, "complete");
        QCOMPARE(record(), QJsonDocument::fromJson(repaired).object());
    }

    void savesTheFlag_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<bool>("saved");
        QTest::addColumn<QByteArray>("after");

        QTest::newRow("changed, other keys kept")
            << QByteArray(R"({"is_Domain":false,"x":1})") << true
            << QByteArray("{\n    \"is_Domain\": true,\n    \"x\": 1\n}\n");
        QTest::newRow("the same, not written")
            << QByteArray(R"({"is_Domain":true})") << true << QByteArray(R"({"is_Domain":true})");
        QTest::newRow("odd type counts as false")
            << QByteArray(R"({"is_Domain":"true"})") << true << QByteArray("{\n    \"is_Domain\": true\n}\n");
        QTest::newRow("key absent") << QByteArray(R"({"x":1})") << false << QByteArray(R"({"x":1})");
        QTest::newRow("no JSON") << QByteArray("garbage") << false << QByteArray("garbage");
    }

    void savesTheFlag()
    {
        QFETCH(QByteArray, content);
        QVERIFY(isolatedfiles::write(recordPath(), content));
        QTEST(FileContent::saveDomain(true), "saved");
        QTEST(isolatedfiles::read(recordPath()), "after");
    }

    // The buffer takes what the disk does not.
    void saysThatAWriteFellShort()
    {
        QVERIFY(isolatedfiles::write(recordPath(), R"({"is_Domain":false})"));
        rlimit previous = {};
        getrlimit(RLIMIT_FSIZE, &previous);
        const rlimit small = {4, previous.rlim_max};
        const auto handler = std::signal(SIGXFSZ, SIG_IGN);
        setrlimit(RLIMIT_FSIZE, &small);
        const bool saved = FileContent::saveDomain(true);
        setrlimit(RLIMIT_FSIZE, &previous);
        std::signal(SIGXFSZ, handler);
        QVERIFY(!saved);
    }

    void keepsLogLinesWhole_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("logged");

        QTest::newRow("harmless") << QStringLiteral("终端 é 😀 \"\\%s") << QStringLiteral("终端 é 😀 \"\\%s");
        QTest::newRow("line ends and tabs")
            << QStringLiteral("a\nb\r\nc\td\ve\u0085f\u2028g\u2029h") << QStringLiteral("a b  c d e f g h");
        QTest::newRow("controls") << QStringLiteral("a\u0000b\u001bc\u007fd\u009be\u0008")
                                  << QStringLiteral("a\ufffdb\ufffdc\ufffdd\ufffde\ufffd");
        QTest::newRow("bidirectional") << QStringLiteral("\u061c\u200e\u200f\u202a\u202e\u2066\u2069.")
                                       << QString(7, QChar(0xfffd)) + QLatin1Char('.');
        QTest::newRow("halves of pairs")
            << QString(QChar(0xd83d)) + QLatin1Char('a') + QChar(0xde00) << QStringLiteral("\ufffda\ufffd");
        const QString full(vesk::base::kMaxLogText, QLatin1Char('x'));
        QTest::newRow("as long as may be") << full << full;
        QTest::newRow("too long") << full + QLatin1Char('x') << full + QChar(0x2026);
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
        for (const QByteArray &content : {QByteArray(), QByteArray("no JSON"), QByteArray("[]")}) {
            QVERIFY(isolatedfiles::write(recordPath(), content));
            QVERIFY(vesk::base::updateUserInfo(key, QStringLiteral("t")));
            QCOMPARE(record(), (QJsonObject{{key, QStringLiteral("t")}}));
        }
        QVERIFY(isolatedfiles::write(recordPath(), R"({"terminal_name":"a","x":[1,2]})"));
        QVERIFY(vesk::base::updateUserInfo(key, QStringLiteral("b")));
        QCOMPARE(record().value(key).toString(), QStringLiteral("b"));
        QVERIFY(record().contains(QStringLiteral("x")));
    }

    void savesAWholeRecord()
    {
        QVERIFY(isolatedfiles::write(recordPath(), R"({"server_ip":"gone","x":1})"));
        UserInfo info;
        info.isDomain = true;
        info.serverHost = QStringLiteral("终端.example");
        QVERIFY(FileContent::saveUserInfo(info));
        QCOMPARE(record().keys().join(QLatin1Char(' ')),
                 QStringLiteral("domain_host domain_port is_Domain server_host server_port terminal_name"));
        bool complete = false;
        QCOMPARE(describe(FileContent::getUserInfo(&complete)), QStringLiteral("joined|终端.example||||"));
        QVERIFY(complete);
    }

    void readsMachineIdentity()
    {
        const QString path = QString::fromUtf8(vesk::kMachineidPath);
        FileContent content(nullptr);
        bool ok = true;
        QVERIFY(content.getMachineID(&ok, false).isEmpty());
        QVERIFY(!ok);

        // White space only is no identity: the next call looks again.
        QVERIFY(isolatedfiles::write(path, " \n\t"));
        QVERIFY(content.getMachineID(&ok, false).isEmpty());
        QVERIFY(ok);
        QVERIFY(isolatedfiles::write(path, QByteArray("\n  id-1\0junk\n", 12)));
        QCOMPARE(content.getMachineID(nullptr, false), QStringLiteral("id-1"));

        // From here on it is cached, until a caller insists.
        QVERIFY(isolatedfiles::write(path, "id-2"));
        QCOMPARE(content.getMachineID(&ok, false), QStringLiteral("id-1"));
        QCOMPARE(content.getMachineID(&ok, true), QStringLiteral("id-2"));
        isolatedfiles::remove(path);
        QCOMPARE(content.getMachineID(&ok, true), QStringLiteral("id-2"));
        QVERIFY(!ok);
        QCOMPARE(content.getMachineID(&ok, false), QStringLiteral("id-2"));
        QVERIFY(ok);
    }
};

QTEST_GUILESS_MAIN(TestFileContent)
#include "tst_filecontent.moc"
