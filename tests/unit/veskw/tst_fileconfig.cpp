// SPDX-License-Identifier: Apache-2.0
#include "fileconfig.h"
#include "isolatedfiles.h"
#include "logcapture.h"
#include "pretendedowner.h"

#include <QTest>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

const QString kRecord = QStringLiteral("/etc/vesk/userinfo.json");
const QString kStaged = QStringLiteral("/tmp/vesk/userinfo.json");

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
        QFile hostName(QStringLiteral("/etc/hostname")); // a mount point, so it is not replaced
        QVERIFY(hostName.open(QIODevice::WriteOnly | QIODevice::Truncate));
        hostName.write(" a \nb\n\n终");
    }

    void loadsRecord_data()
    {
        QTest::addColumn<QByteArray>("content");
        QTest::addColumn<QString>("fields");
        QTest::addColumn<QString>("log");

        const auto row = [](const char *name, const char *content, const char *fields, const char *log) {
            QTest::newRow(name) << QByteArray(content) << QString::fromUtf8(fields) << QString::fromUtf8(log);
        };
        row("whole", R"({"is_Domain":true,"server_host":"s","server_port":"1","domain_host":"d",
            "domain_port":"2","terminal_name":"t","server_ip":"old"})",
            "joined|s|1|d|2|t", "");
        row("other types are empty here",
            R"({"is_Domain":1,"server_host":true,"server_port":443,"domain_host":"d"})", "free|||d||", "");
        row("no JSON", "{", "free|||||", "info: userinfo.json Json error");
        row("array", "[true]", "free|||||", "");
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
        for (const char *reason : {" not found userinfo.json", "fail to open file userinfo.json !"}) {
            const LogCapture log;
            FileConfig config(nullptr);
            QCOMPARE(describe(config), QStringLiteral("free||||| a b终"));
            QCOMPARE(log.text(), QStringLiteral("info: ") + QLatin1String(reason));
            QVERIFY(isolatedfiles::writeDirectory(kRecord)); // for the second time
        }
    }

    void buildsUrls_data()
    {
        QTest::addColumn<QString>("host");
        QTest::addColumn<QString>("port");
        QTest::addColumn<QString>("url");

        const auto row = [](const char *host, const char *port, const char *url) {
            QTest::newRow(url) << QString::fromUtf8(host) << QString::fromUtf8(port)
                               << QString::fromUtf8(url);
        };
        row("uim.example", "8443", "https://uim.example:8443/a/b");
        row("::1", "1", "https://[::1]:1/a/b");
        row("h", "", "https://h:0/a/b");
        row("h", "x", "https://h:0/a/b");
        row("h", "65536", "");
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

    // For all to read in a directory of its own, whatever the umask.
    void stagesRecord()
    {
        FileConfig config(nullptr);
        config.setDomainHost(QStringLiteral("域.example"));
        config.setDomainPort(QStringLiteral("8443"));
        config.setIsDomain(true);
        const mode_t previous = umask(0);
        config.writeServerConfig();
        umask(previous);
        QCOMPARE(
            isolatedfiles::read(kStaged),
            QByteArray("{\n    \"domain_host\": \"域.example\",\n    \"domain_port\": \"8443\",\n"
                       "    \"is_Domain\": true,\n    \"server_host\": \"\",\n    \"server_port\": \"\",\n"
                       "    \"terminal_name\": \" a b终\"\n}\n"));
        QCOMPARE(modeOf(QStringLiteral("/tmp/vesk")), mode_t(0700));
        QCOMPARE(modeOf(kStaged), mode_t(0644));
        QVERIFY(!QFile::exists(kRecord));
    }

    // Nothing is written into files that others have written or can write.
    void stagesAmongOthers_data()
    {
        QTest::addColumn<uint>("owner");
        QTest::addColumn<uint>("mode");
        QTest::addColumn<bool>("kept");

        QTest::newRow("the user's own") << PretendedOwner::kUser << 0600U << true;
        QTest::newRow("another user's") << 1001U << 0666U << false;
        QTest::newRow("root's") << 0U << 0644U << false;
        QTest::newRow("of two names") << PretendedOwner::kUser << 0644U << false;
        QTest::newRow("symbolic link") << PretendedOwner::kUser << 0644U << false;
        QTest::newRow("writable by the group") << PretendedOwner::kUser << 0664U << false;
        QTest::newRow("writable by all") << PretendedOwner::kUser << 0646U << false;
    }

    void stagesAmongOthers()
    {
        QFETCH(uint, owner);
        QFETCH(uint, mode);
        const QByteArray path = QFile::encodeName(kStaged);
        const QString other = QStringLiteral("/tmp/vesk/other");
        const QByteArray content(500, 'b'); // longer than a record
        QVERIFY(isolatedfiles::write(other, content));
        QCOMPARE(chmod(QFile::encodeName(other).constData(), mode), 0);
        const QByteArray tag = QTest::currentDataTag();
        const auto make = tag == "symbolic link" ? symlink : link;
        QCOMPARE(make(QFile::encodeName(other).constData(), path.constData()), 0);
        if (tag != "symbolic link" && tag != "of two names")
            QVERIFY(QFile::remove(other));
        const PretendedOwner pretence;
        PretendedOwner::giveTo(path.toStdString(), owner);
        // Held open, so that its number is not given to another file.
        const int before = open(path.constData(), O_PATH | O_NOFOLLOW | O_CLOEXEC);
        const ino_t inode = infoOf(kStaged).st_ino;

        FileConfig(nullptr).writeServerConfig();
        const bool kept = infoOf(kStaged).st_ino == inode;
        close(before);
        QTEST(kept, "kept");
        QVERIFY(isolatedfiles::read(kStaged).endsWith("}\n"));
        QCOMPARE(modeOf(kStaged), kept ? mode_t(mode) : mode_t(0644));
        if (QFile::exists(other))
            QCOMPARE(isolatedfiles::read(other), content);
    }

    void savesCertificates_data()
    {
        QTest::addColumn<QString>("before");
        for (const char *before : {"nothing", "a file", "a link"})
            QTest::newRow(before) << QString::fromLatin1(before);
    }

    void savesCertificates()
    {
        QFETCH(QString, before);
        const QString path = QStringLiteral("/tmp/vesk/client.key");
        const QString target = QStringLiteral("/tmp/victim");
        isolatedfiles::remove(target);
        if (before == QLatin1String("a file"))
            QVERIFY(isolatedfiles::write(path, "longer than the key"));
        const bool isLink = before == QLatin1String("a link");
        if (isLink) {
            QVERIFY(isolatedfiles::write(target, "victim"));
            QVERIFY(QDir().mkpath(QStringLiteral("/tmp/vesk")) && QFile::link(target, path));
        }

        const mode_t previous = umask(0);
        FileConfig(nullptr).saveCert(QStringLiteral("a2V5\n"), path);
        umask(previous);
        QCOMPARE(isolatedfiles::read(path), QByteArray("key"));
        QCOMPARE(modeOf(path), mode_t(0600));
        if (before == QLatin1String("nothing"))
            QCOMPARE(modeOf(QStringLiteral("/tmp/vesk")), mode_t(0700));
        QCOMPARE(isolatedfiles::read(target), isLink ? QByteArray("victim") : QByteArray());
    }
};

QTEST_GUILESS_MAIN(TestFileConfig)
#include "tst_fileconfig.moc"
