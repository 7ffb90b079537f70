// SPDX-License-Identifier: Apache-2.0
#include "fileconfig.h"
#include "isolatedfiles.h"
#include "logcapture.h"
#include "pretendedowner.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QTest>

#include <sys/stat.h>
#include <unistd.h>

namespace {

const QString kRecord = QStringLiteral("/etc/vesk/userinfo.json");
const QString kStaged = QStringLiteral("/tmp/vesk/userinfo.json");
const QString kHostName = QStringLiteral("/etc/hostname");

// Unlike isolatedfiles::write, keeps the file: it is a mount point.
bool rewriteHostName(const QByteArray &content)
{
    QFile file(kHostName);
    return file.open(QIODevice::WriteOnly | QIODevice::Truncate) && file.write(content) == content.size();
}

QString describe(FileConfig &config)
{
    return QStringList{config.readIsDomain() ? QStringLiteral("joined") : QStringLiteral("free"),
                       config.readServerHost(),
                       config.readServerPort(),
                       config.readDomainHost(),
                       config.readDomainPort(),
                       config.readTerminalName()}
        .join(QLatin1Char('|'));
}

struct stat infoOf(const QString &path)
{
    struct stat info = {};
    lstat(QFile::encodeName(path).constData(), &info);
    return info;
}

mode_t modeOf(const QString &path)
{
    return infoOf(path).st_mode & 07777U;
}

} // namespace

class TestFileConfig : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init()
    {
        qunsetenv("TMPDIR"); // the staged record belongs below /tmp, which is the test's own
        isolatedfiles::remove(kRecord);
        isolatedfiles::remove(QStringLiteral("/tmp/vesk"));
        QVERIFY(rewriteHostName("host-1\n"));
    }

    void loadsRecord_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<QString>("fields");
        QTest::addColumn<QString>("log");

        QTest::newRow("whole") << QByteArray(R"({"is_Domain":true,"server_host":"s","server_port":"1",
            "domain_host":"d","domain_port":"2","terminal_name":"t"})")
                               << "joined|s|1|d|2|t"
                               << "";
        QTest::newRow("other types are empty here")
            << QByteArray(R"({"is_Domain":1,"server_host":true,"server_port":443,"domain_host":"d"})")
            << "free|||d||"
            << "";
        QTest::newRow("legacy host is not read") << QByteArray(R"({"server_ip":"old"})") << "free|||||"
                                                 << "";
        QTest::newRow("empty") << QByteArray("") << "free|||||"
                               << "info: userinfo.json Json error";
        QTest::newRow("no JSON") << QByteArray("{") << "free|||||"
                                 << "info: userinfo.json Json error";
        QTest::newRow("array") << QByteArray("[true]") << "free|||||"
                               << "";
    }

    void loadsRecord()
    {
        QFETCH(QByteArray, content);
        QVERIFY(isolatedfiles::write(kRecord, content));
        const LogCapture log;
        FileConfig config(nullptr);
        QTEST(describe(config), "fields");
        QTEST(log.text(), "log");
    }

    void fallsBackToHostName()
    {
        {
            const LogCapture log;
            FileConfig missing(nullptr);
            QCOMPARE(describe(missing), QStringLiteral("free|||||host-1"));
            QCOMPARE(log.text(), QStringLiteral("info:  not found userinfo.json"));
        }
        QVERIFY(isolatedfiles::writeFolder(kRecord));
        const LogCapture log;
        FileConfig unreadable(nullptr);
        QCOMPARE(describe(unreadable), QStringLiteral("free|||||host-1"));
        QCOMPARE(log.text(), QStringLiteral("info: fail to open file userinfo.json !"));
    }

    void readsHostName()
    {
        QVERIFY(rewriteHostName(" a \nb\n\n终"));
        QCOMPARE(FileConfig(nullptr).readHostName(), QStringLiteral(" a b终"));
    }

    void buildsUrls_data()
    {
        QTest::addColumn<QString>("host");
        QTest::addColumn<QString>("port");
        QTest::addColumn<QString>("url");

        QTest::newRow("name") << "uim.example"
                              << "8443"
                              << "https://uim.example:8443/a/b";
        QTest::newRow("address") << "::1"
                                 << "1"
                                 << "https://[::1]:1/a/b";
        QTest::newRow("no port") << "h"
                                 << ""
                                 << "https://h:0/a/b";
        QTest::newRow("port of letters") << "h"
                                         << "x"
                                         << "https://h:0/a/b";
        QTest::newRow("port beyond TCP") << "h"
                                         << "65536"
                                         << "";
    }

    void buildsUrls()
    {
        QFETCH(QString, host);
        QFETCH(QString, port);
        FileConfig config(nullptr);
        config.setDomainHost(host);
        config.setDomainPort(port);
        QTEST(config.getDomainUrl(QStringLiteral("/a/b")).url(), "url");
        QVERIFY(config.getServerUrl(QStringLiteral("/a/b")).host().isEmpty());
        config.setServerHost(host);
        config.setServerPort(port);
        QTEST(config.getServerUrl(QStringLiteral("/a/b")).url(), "url");
    }

    void stagesRecord()
    {
        FileConfig config(nullptr);
        config.setDomainHost(QStringLiteral("域.example"));
        config.setDomainPort(QStringLiteral("8443"));
        config.setIsDomain(true);
        for (const QByteArray &before : {QByteArray(), QByteArray(500, 'x')}) {
            if (!before.isEmpty())
                QVERIFY(isolatedfiles::write(kStaged, before));
            const LogCapture log;
            config.writeServerConfig();
            QCOMPARE(
                log.lines(),
                (QStringList{QStringLiteral("debug: FileConfig::writeServerInfo---strConfig: ") + kStaged,
                             QStringLiteral("debug: write json success")}));
        }
        QCOMPARE(
            isolatedfiles::read(kStaged),
            QByteArray("{\n    \"domain_host\": \"域.example\",\n    \"domain_port\": \"8443\",\n"
                       "    \"is_Domain\": true,\n    \"server_host\": \"\",\n    \"server_port\": \"\",\n"
                       "    \"terminal_name\": \"host-1\"\n}\n"));
        QVERIFY(!QFile::exists(kRecord));

        // A path that cannot be opened is logged, and what stands there stays.
        QVERIFY(isolatedfiles::writeFolder(kStaged));
        const LogCapture log;
        config.writeServerConfig();
        QCOMPARE(
            log.lines().mid(1),
            (QStringList{QStringLiteral("warning: /tmp/vesk/userinfo.json cannot be staged: Is a directory"),
                         QStringLiteral("info: file open error")}));
        QVERIFY(QFileInfo(kStaged).isDir());
    }

    // What anybody else has written, or can, is not written into.
    void stagesAmongOthers_data()
    {
        QTest::addColumn<uint>("owner");
        QTest::addColumn<uint>("mode");
        QTest::addColumn<bool>("linked");
        QTest::addColumn<bool>("kept");

        QTest::newRow("the user's own") << PretendedOwner::kUser << 0600U << false << true;
        QTest::newRow("another user's") << 1001U << 0666U << false << false;
        QTest::newRow("root's") << 0U << 0644U << false << false;
        QTest::newRow("of two names") << PretendedOwner::kUser << 0644U << true << false;
        QTest::newRow("writable by the group") << PretendedOwner::kUser << 0664U << false << false;
        QTest::newRow("writable by all") << PretendedOwner::kUser << 0646U << false << false;
    }

    void stagesAmongOthers()
    {
        QFETCH(uint, owner);
        QFETCH(uint, mode);
        QFETCH(bool, linked);
        const QByteArray path = QFile::encodeName(kStaged);
        const QByteArray otherName = "/tmp/other-name";
        QVERIFY(isolatedfiles::write(kStaged, "before"));
        QCOMPARE(chmod(path.constData(), mode), 0);
        unlink(otherName.constData());
        QVERIFY(!linked || link(path.constData(), otherName.constData()) == 0);
        const PretendedOwner pretence;
        PretendedOwner::giveTo(path.toStdString(), owner);
        // Held open, so that its number is not given to another file.
        QFile before(kStaged);
        QVERIFY(before.open(QIODevice::ReadOnly));
        const ino_t inode = infoOf(kStaged).st_ino;

        const LogCapture log;
        FileConfig(nullptr).writeServerConfig();
        QVERIFY2(!log.text().contains(QStringLiteral("warning")), qUtf8Printable(log.text()));
        QTEST(infoOf(kStaged).st_ino == inode, "kept");
        QVERIFY(isolatedfiles::read(kStaged).startsWith('{'));
        QCOMPARE(modeOf(kStaged), infoOf(kStaged).st_ino == inode ? mode_t(mode) : mode_t(0644));
        if (linked)
            QCOMPARE(isolatedfiles::read(QString::fromUtf8(otherName)), QByteArray("before"));
    }

    // Whatever the umask, and whoever has put a link there.
    void keepsOthersOutOfTheStagedRecord()
    {
        const QString target = QStringLiteral("/tmp/victim");
        QVERIFY(isolatedfiles::write(target, "victim"));
        FileConfig config(nullptr);
        const mode_t previous = umask(0);
        config.writeServerConfig();
        QCOMPARE(modeOf(QStringLiteral("/tmp/vesk")), mode_t(0700));
        QCOMPARE(modeOf(kStaged), mode_t(0644));
        isolatedfiles::remove(kStaged);
        QVERIFY(QFile::link(target, kStaged));
        config.writeServerConfig();
        umask(previous);
        QVERIFY(!QFileInfo(kStaged).isSymLink());
        QCOMPARE(isolatedfiles::read(target), QByteArray("victim"));
        isolatedfiles::remove(target);
    }

    void savesCertificates_data()
    {
        QTest::addColumn<QString>("before");
        QTest::addColumn<QString>("encoded");
        QTest::addColumn<QByteArray>("content");

        QTest::newRow("new") << ""
                             << "a2V5\n"
                             << QByteArray("key");
        QTest::newRow("empty") << ""
                               << "" << QByteArray();
        QTest::newRow("replaces a readable file") << "file"
                                                  << "a2V5" << QByteArray("key");
        QTest::newRow("replaces a link") << "link"
                                         << "a2V5" << QByteArray("key");
        QTest::newRow("replaces a dangling link") << "dangling"
                                                  << "a2V5" << QByteArray("key");
    }

    void savesCertificates()
    {
        QFETCH(QString, before);
        QFETCH(QString, encoded);
        const QString path = QStringLiteral("/tmp/vesk/client.key");
        const QString target = QStringLiteral("/tmp/victim");
        isolatedfiles::remove(target);
        if (before == QLatin1String("file"))
            QVERIFY(isolatedfiles::write(path, "longer than the key"));
        if (before == QLatin1String("link"))
            QVERIFY(isolatedfiles::write(target, "victim"));
        if (before == QLatin1String("link") || before == QLatin1String("dangling")) {
            QVERIFY(QDir().mkpath(QStringLiteral("/tmp/vesk")));
            QVERIFY(QFile::link(target, path));
        }

        const mode_t previous = umask(0);
        FileConfig(nullptr).saveCert(encoded, path);
        umask(previous);
        QTEST(isolatedfiles::read(path), "content");
        QCOMPARE(modeOf(path), mode_t(0600));
        if (before.isEmpty())
            QCOMPARE(modeOf(QStringLiteral("/tmp/vesk")), mode_t(0700));
        QCOMPARE(isolatedfiles::read(target),
                 before == QLatin1String("link") ? QByteArray("victim") : QByteArray());
    }

    void saysThatACertificateCannotBeSaved()
    {
        const QString path = QStringLiteral("/tmp/vesk/client.key");
        QVERIFY(isolatedfiles::write(path + QStringLiteral("/x"), "in the way"));
        const LogCapture log;
        FileConfig(nullptr).saveCert(QStringLiteral("a2V5"), path);
        QCOMPARE(
            log.lines().mid(1),
            (QStringList{QStringLiteral("warning: /tmp/vesk/client.key cannot be staged: Is a directory"),
                         QStringLiteral("info: writeCERT open error! ")}));
        QCOMPARE(isolatedfiles::read(path + QStringLiteral("/x")), QByteArray("in the way"));
    }
};

QTEST_GUILESS_MAIN(TestFileConfig)
#include "tst_fileconfig.moc"
