// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>
#include <QTest>

// A join from the first page to the reboot, seen from outside: what the world's journal says, in which order,
// and what the terminal has afterwards.
class TestJoin : public QObject
{
    Q_OBJECT

private:
    WorldRun m_world;

private Q_SLOTS:
    void cleanup() { m_world.noteResult(); }

    void joins() { QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData()); }

    void doesEverythingInOrder()
    {
        DEPENDS_ON(m_world, "joins");
        const QByteArray missing = m_world.firstMissing({
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
        });
        QVERIFY2(missing.isEmpty(), (missing + "\n" + m_world.journal()).constData());
        // One request each: nothing was sent twice.
        QCOMPARE(m_world.journal().count("request POST"), 2);
    }

    void leavesAJoinedTerminal()
    {
        DEPENDS_ON(m_world, "joins");
        const QJsonObject record =
            QJsonDocument::fromJson(m_world.content("root/etc/vesk/userinfo.json")).object();
        QVERIFY(record.value(QStringLiteral("is_Domain")).toBool());
        QVERIFY(!record.value(QStringLiteral("server_host")).toString().isEmpty());
        QVERIFY(record.value(QStringLiteral("server_port")) != record.value(QStringLiteral("domain_port")));

        QCOMPARE(
            QProcess::execute(QStringLiteral("openssl"),
                              {QStringLiteral("verify"), QStringLiteral("-CAfile"),
                               m_world.path("server/ca.crt"), m_world.path("root/etc/vesk/MOS_Vesk.pem")}),
            0);
        QCOMPARE(m_world.content("root/etc/vesk/clientapi_ca.crt"), m_world.content("server/ca.crt"));
        const QFileInfo key(m_world.path("root/etc/vesk/.MOS_Vesk.key"));
        QVERIFY(key.exists());
        QVERIFY(!key.permission(QFileDevice::ReadGroup) && !key.permission(QFileDevice::ReadOther));
    }

    // The server knows the machine; the terminal has lost what it had.
    void refusesToJoinTwice()
    {
        DEPENDS_ON(m_world, "joins");
        for (const char *file : {"userinfo.json", "clientapi_ca.crt", "MOS_Vesk.pem", ".MOS_Vesk.key"})
            QVERIFY(QFile::remove(m_world.path("root/etc/vesk/") + QString::fromLatin1(file)));
        QVERIFY2(m_world.play("join", "already-joined") == 0, m_world.output().constData());
        QCOMPARE(m_world.journal().count("request POST"), 0);
    }
};

QTEST_GUILESS_MAIN(TestJoin)
#include "tst_join.moc"
