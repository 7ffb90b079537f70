// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

// A joined terminal leaves, from the panel to the reboot, and can join again.
class TestLeave : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void leaves();
    void isAStrangerAgain();

private:
    WorldRun m_world;
};

void TestLeave::leaves()
{
    QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData());
    QVERIFY2(m_world.play("leave", "leave-ok") == 0, m_world.output().constData());
    m_world.verifyOrder({
        "command   id -> exit 0",
        "hear  Button | 关闭 | \n",
        "hear  Button | 解除 | 该终端已经加入管控,是否解除管控?\n",
        "keyword=remove",
        "request POST /uim/v3/client/remove_status",
        "staged /tmp/vesk/userinfo.json with \"is_Domain\" false",
        "policy control-center-shown",
        "policy hotspot-enabled",
        "policy shortcut-keys-enabled",
        "policy launcher-displayed",
        "policy taskbar-menu-enabled",
        "policy resident-taskbar-apps-displayed",
        "policy recycle-bin-displayed",
        "policy network-tray-icon-clickable",
        "policy usb-tray-icon-clickable",
        "systemctl --global ",
        "onDomainConfig(\"remove\")",
        "com.morvek.vesk.iam Enable = false",
        "request POST /uim/v3/client/remove from",
        "{\"mac\":\"02:", // of the primary connection
        "killall -9 mmcs",
        "hear  Button | 稍后重启 | 当前终端已解除管控，重启后生效\n",
        "org.freedesktop.login1 Reboot(true)",
    });
    // Started in order, but on their own.
    for (const char *command : {"stop vesks", "disable vesks", "stop mmcs", "disable mmcs"})
        QVERIFY2(m_world.journal().contains(QByteArray("systemctl --global ") + command), command);
    QCOMPARE(m_world.journal().count("request POST"), 2);

    const QByteArray settings = m_world.content("home/.config/glib-2.0/settings/keyfile");
    for (const char *line :
         {"auto-login-visable=false", "nopasswd-login-visable=false",
          "control-center-shown=['accounts', 'network', 'update']", "control-center-hidden=['']",
          "hotspot-enabled=true", "usb-tray-icon-clickable=true"})
        QVERIFY2(settings.contains(line), (line + QByteArray("\n") + settings).constData());
}

void TestLeave::isAStrangerAgain()
{
    for (const char *file : {"clientapi_ca.crt", "MOS_Vesk.pem", ".MOS_Vesk.key"})
        QVERIFY2(!QFile::exists(m_world.path("root/etc/vesk/") + QString::fromLatin1(file)), file);
    QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData());
    QVERIFY(m_world.content("program.log").contains("first contact"));
}

QTEST_GUILESS_MAIN(TestLeave)
#include "tst_leave.moc"
