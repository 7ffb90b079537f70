// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

// A join from the first page to the reboot, seen from outside: what the world's journal says, in which order,
// and what the terminal has afterwards.
class TestJoin : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void joins();
    void refusesToJoinTwice();

private:
    WorldRun m_world;
};

void TestJoin::joins()
{
    qputenv("QT_FONT_DPI", "144"); // which shows in the screenshots
    QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData());
    m_world.verifyOrder({
        "hear  Text | 端口 | \n",
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
        "request POST /uim/v3/client/join from 127.0.0.1 {\"mac\":\"02:", // of the primary connection
        "installed /etc/vesk/userinfo.json",
        "onDomainConfig(\"copyConfig\")",
        "com.morvek.vesk.iam Enable = true",
        "org.freedesktop.login1 Reboot(true)",
    });
    QCOMPARE(m_world.journal().count("request POST"), 2); // nothing was sent twice
    QVERIFY(m_world.output().contains("hear  Window | 维斯克平台 | 终端已成功加入域管,重启电脑生效\n"
                                      "hear  Label | 终端已成功加入域管,重启电脑生效 | \n"
                                      "hear  Button | 立即重启 | 终端已成功加入域管,重启电脑生效\n"
                                      "press 立即重启\n"));

    const QJsonObject record =
        QJsonDocument::fromJson(m_world.content("root/etc/vesk/userinfo.json")).object();
    QVERIFY(record.value(QStringLiteral("is_Domain")).toBool());
    QVERIFY(!record.value(QStringLiteral("server_host")).toString().isEmpty());
    QVERIFY(record.value(QStringLiteral("server_port")) != record.value(QStringLiteral("domain_port")));
    QCOMPARE(QProcess::execute(QStringLiteral("openssl"),
                               {QStringLiteral("verify"), QStringLiteral("-CAfile"),
                                m_world.path("server/ca.crt"), m_world.path("root/etc/vesk/MOS_Vesk.pem")}),
             0);
    QCOMPARE(m_world.content("root/etc/vesk/clientapi_ca.crt"), m_world.content("server/ca.crt"));
    const QFileInfo key(m_world.path("root/etc/vesk/.MOS_Vesk.key"));
    QVERIFY(key.exists() && !(key.permissions() & (QFile::ReadGroup | QFile::ReadOther)));

    QList<QByteArray> seen;
    for (const char *page : {"1-server", "2-account", "3-alias", "4-summary", "6-success"}) {
        const QByteArray image = m_world.content(("screenshots/" + QByteArray(page) + ".png").constData());
        QVERIFY2(image.mid(16, 4) == QByteArray("\0\0\2\x3a", 4), page); // width, 380 by 1.5
        QVERIFY2(!seen.contains(image), page);
        seen.append(image);
    }
}

// The server knows the machine; the terminal has lost what it had.
void TestJoin::refusesToJoinTwice()
{
    for (const char *file : {"userinfo.json", "clientapi_ca.crt", "MOS_Vesk.pem", ".MOS_Vesk.key"})
        QVERIFY(QFile::remove(m_world.path("root/etc/vesk/") + QString::fromLatin1(file)));
    QVERIFY2(m_world.play("join", "already-joined") == 0, m_world.output().constData());
    QCOMPARE(m_world.journal().count("request POST"), 0);
}

QTEST_GUILESS_MAIN(TestJoin)
#include "tst_join.moc"
