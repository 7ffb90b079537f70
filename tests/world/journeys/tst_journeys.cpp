// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

// A join and a leave as a person plays them by hand: what a screen reader hears, the screenshots, and how
// what the terminal has afterwards fits together.
class TestJourneys : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void joins();
    void leaves();

private:
    WorldRun m_world;
};

void TestJourneys::joins()
{
    qputenv("QT_FONT_DPI", "144"); // which shows in the screenshots
    QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData());
    QVERIFY(m_world.journal().contains("hear  Text | 端口 | \n"));
    QVERIFY(m_world.output().contains("hear  Window | 维斯克平台 | 终端已成功加入域管,重启电脑生效\n"
                                      "hear  Label | 终端已成功加入域管,重启电脑生效 | \n"
                                      "hear  Button | 立即重启 | 终端已成功加入域管,重启电脑生效\n"
                                      "press 立即重启\n"));
    QCOMPARE(QProcess::execute(QStringLiteral("openssl"),
                               {QStringLiteral("verify"), QStringLiteral("-CAfile"),
                                m_world.path("server/ca.crt"), m_world.path("root/etc/vesk/MOS_Vesk.pem")}),
             0);
    QList<QByteArray> seen;
    for (const char *page : {"1-server", "2-account", "3-alias", "4-summary", "6-success"}) {
        const QByteArray image = m_world.content(("screenshots/" + QByteArray(page) + ".png").constData());
        QVERIFY2(image.mid(16, 4) == QByteArray("\0\0\2\x3a", 4), page); // width, 380 by 1.5
        QVERIFY2(!seen.contains(image), page);
        seen.append(image);
    }
}

void TestJourneys::leaves()
{
    QVERIFY2(m_world.play("leave", "leave-ok") == 0, m_world.output().constData());
    m_world.verifyOrder({
        "hear  Button | 关闭 | \n",
        "hear  Button | 解除 | 该终端已经加入管控,是否解除管控?\n",
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
        "hear  Button | 稍后重启 | 当前终端已解除管控，重启后生效\n",
    });
}

QTEST_GUILESS_MAIN(TestJourneys)
#include "tst_journeys.moc"
