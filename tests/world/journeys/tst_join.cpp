// SPDX-License-Identifier: Apache-2.0
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>
#include <QTemporaryDir>
#include <QTest>

// A join from the first page to the reboot, seen from outside: what the world's journal says, in which order,
// and what the terminal has afterwards.
class TestJoin : public QObject
{
    Q_OBJECT

private:
    static QByteArray read(const QString &path)
    {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    // Exit code and output of a command; -1 when it did not end.
    static int run(const QString &program, const QStringList &arguments, QByteArray *output)
    {
        QProcess process;
        process.setProcessChannelMode(QProcess::MergedChannels);
        process.start(program, arguments);
        const bool ended = process.waitForFinished(120000);
        *output = process.readAll();
        return ended ? process.exitCode() : -1;
    }

    int runSandbox(const QStringList &arguments, QByteArray *output) const
    {
        return run(QStringLiteral(VESK_SANDBOX),
                   QStringList{QStringLiteral("--state"), m_state.path(), QStringLiteral("--headless")} +
                       arguments,
                   output);
    }

    QString inState(const char *path) const { return m_state.filePath(QString::fromLatin1(path)); }

    QTemporaryDir m_state;

private Q_SLOTS:
    void joins()
    {
        QByteArray output;
        const int exitCode = runSandbox({QStringLiteral("--autopilot"), QStringLiteral("join")}, &output);
        QVERIFY2(exitCode == 0, output.constData());
    }

    void doesEverythingInOrder()
    {
        const QByteArray journal = read(inState("journal.log"));
        int position = 0;
        for (const char *event : {
                 "com.morvek.daemon.Network GetActiveConnectionInfo()",
                 "request GET /apiauth/v1/client/ca_cert",
                 "keyword=join",
                 "request POST /uim/v3/client/auth",
                 "request GET /uim/v3/client/config?key=pc_name_rules",
                 "gsettings set com.morvek.mde.control-center auto-login-visable false",
                 "gsettings set com.morvek.mde.control-center nopasswd-login-visable false",
                 "onDomainConfig(\"join\")",
                 "systemctl --global enable vesks",
                 "systemctl --global enable mmcs",
                 "request POST /uim/v3/client/join",
                 "installed /etc/vesk/userinfo.json",
                 "onDomainConfig(\"copyConfig\")",
                 "com.morvek.vesk.iam Enable = true",
                 "org.freedesktop.login1 Reboot(true)",
             }) {
            const int found = journal.indexOf(event, position);
            QVERIFY2(found >= 0,
                     qPrintable(QStringLiteral("not there, or too early: %1\n%2")
                                    .arg(QString::fromLatin1(event), QString::fromUtf8(journal))));
            position = found;
        }
        // One request each: nothing was sent twice.
        QCOMPARE(journal.count("request POST"), 2);
    }

    void leavesAJoinedTerminal()
    {
        const QJsonObject record =
            QJsonDocument::fromJson(read(inState("root/etc/vesk/userinfo.json"))).object();
        QVERIFY(record.value(QStringLiteral("is_Domain")).toBool());
        QVERIFY(!record.value(QStringLiteral("server_host")).toString().isEmpty());
        QVERIFY(record.value(QStringLiteral("server_port")) != record.value(QStringLiteral("domain_port")));

        QByteArray output;
        QVERIFY2(run(QStringLiteral("openssl"),
                     {QStringLiteral("verify"), QStringLiteral("-CAfile"), inState("server/ca.crt"),
                      inState("root/etc/vesk/MOS_Vesk.pem")},
                     &output) == 0,
                 output.constData());
        QCOMPARE(read(inState("root/etc/vesk/clientapi_ca.crt")), read(inState("server/ca.crt")));
        const QFileInfo key(inState("root/etc/vesk/.MOS_Vesk.key"));
        QVERIFY(key.exists());
        QVERIFY(!key.permission(QFileDevice::ReadGroup) && !key.permission(QFileDevice::ReadOther));
    }

    void keepsThePasswordToItself()
    {
        for (const char *path : {"journal.log", "program.log"}) {
            const QByteArray text = read(inState(path));
            QVERIFY2(!text.isEmpty(), path);
            QVERIFY2(!text.contains("Terminal-7"), path);
            QVERIFY2(!text.contains("PRIVATE KEY"), path);
        }
    }

    void refusesToJoinTwice()
    {
        // The server knows the machine; the terminal has lost its record.
        QVERIFY(QFile::remove(inState("root/etc/vesk/userinfo.json")));
        QVERIFY(QFile::remove(inState("root/etc/vesk/clientapi_ca.crt")));
        QVERIFY(QFile::remove(inState("root/etc/vesk/MOS_Vesk.pem")));
        QVERIFY(QFile::remove(inState("root/etc/vesk/.MOS_Vesk.key")));
        QByteArray output;
        const int exitCode = runSandbox({QStringLiteral("--scenario"), QStringLiteral("already-joined"),
                                         QStringLiteral("--autopilot"), QStringLiteral("join")},
                                        &output);
        QVERIFY2(exitCode == 0, output.constData());
        QVERIFY(output.contains("终端已加域,请联系管理员从服务器移除终端重新加域!"));
    }
};

QTEST_GUILESS_MAIN(TestJoin)
#include "tst_join.moc"
