// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

#include <QDirIterator>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QTest>

// A joined terminal leaves, from the panel to the reboot, and can join again.
class TestLeave : public QObject
{
    Q_OBJECT

private:
    bool hasJoined() const
    {
        return QJsonDocument::fromJson(m_world.content("root/etc/vesk/userinfo.json"))
            .object()
            .value(QStringLiteral("is_Domain"))
            .toBool();
    }

    WorldRun m_world;

private Q_SLOTS:
    void cleanup() { m_world.noteResult(); }

    void joinsFirst() { QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData()); }

    void staysJoinedWhenTheServerRefuses()
    {
        DEPENDS_ON(m_world, "joinsFirst");
        QVERIFY2(m_world.play("leave", "leave-admin-refused") == 0, m_world.output().constData());
        QVERIFY(hasJoined());
        QVERIFY(!m_world.journal().contains("onDomainConfig"));
        QVERIFY(!QFile::exists(m_world.path("root/tmp/vesk/userinfo.json")));
    }

    // The server is not told when the identity service stays on; what was restored stays restored.
    void stopsHalfWayWithoutTheIdentityService()
    {
        DEPENDS_ON(m_world, "staysJoinedWhenTheServerRefuses");
        QVERIFY2(m_world.play("leave", "leave-iam-refuses") == 0, m_world.output().constData());
        QVERIFY(m_world.journal().contains("onDomainConfig(\"remove\")"));
        QVERIFY(!m_world.journal().contains("/uim/v3/client/remove from"));
        QVERIFY(!hasJoined());
        QVERIFY(m_world.content("program.log").contains("解域：统一认证配置失败！"));
    }

    void leaves()
    {
        DEPENDS_ON(m_world, "stopsHalfWayWithoutTheIdentityService");
        // The server still counts the terminal as joined: an administrator takes it off, and it joins anew.
        QJsonObject config = QJsonDocument::fromJson(m_world.content("server/config.json")).object();
        const QString key = QStringLiteral("known_terminals");
        QVERIFY(config.contains(key));
        config.insert(key,
                      config.value(key).isArray() ? QJsonValue(QJsonArray()) : QJsonValue(QJsonObject()));
        QFile file(m_world.path("server/config.json"));
        QVERIFY(file.open(QIODevice::WriteOnly) && file.write(QJsonDocument(config).toJson()) > 0);
        file.close();
        QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData());
        QVERIFY2(m_world.play("leave", "leave-ok") == 0, m_world.output().constData());
    }

    void doesEverythingInOrder()
    {
        DEPENDS_ON(m_world, "leaves");
        const QByteArray missing = m_world.firstMissing({
            "command   id -> exit 0",
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
            "systemctl --global ",
            "systemctl --global ",
            "systemctl --global ",
            "onDomainConfig(\"remove\")",
            "com.morvek.vesk.iam Enable = false",
            "request POST /uim/v3/client/remove from",
            "killall -9 mmcs",
            "org.freedesktop.login1 Reboot(true)",
        });
        QVERIFY2(missing.isEmpty(), (missing + "\n" + m_world.journal()).constData());
        // Started in order, but on their own.
        for (const char *command : {"stop vesks", "disable vesks", "stop mmcs", "disable mmcs"})
            QVERIFY2(m_world.journal().contains(QByteArray("systemctl --global ") + command), command);
        QCOMPARE(m_world.journal().count("request POST"), 2);
    }

    void bringsTheDesktopBack()
    {
        DEPENDS_ON(m_world, "leaves");
        const QByteArray settings = m_world.content("home/.config/glib-2.0/settings/keyfile");
        for (const char *line :
             {"auto-login-visable=false", "nopasswd-login-visable=false",
              "control-center-shown=['accounts', 'network', 'update']", "control-center-hidden=['']",
              "hotspot-enabled=true", "usb-tray-icon-clickable=true"})
            QVERIFY2(settings.contains(line), (line + QByteArray("\n") + settings).constData());
    }

    void isAStrangerAgain()
    {
        DEPENDS_ON(m_world, "leaves");
        QVERIFY(!hasJoined());
        for (const char *file : {"clientapi_ca.crt", "MOS_Vesk.pem", ".MOS_Vesk.key"})
            QVERIFY2(!QFile::exists(m_world.path("root/etc/vesk/") + QString::fromLatin1(file)), file);
        QVERIFY2(m_world.play("join", "join-ok") == 0, m_world.output().constData());
        QVERIFY(m_world.content("program.log").contains("first contact"));
    }

    // Passwords of user and administrator, after joins and leaves: only the server's own configuration holds
    // them, and the scenario that says what to type.
    void keepsSecretsToItself()
    {
        DEPENDS_ON(m_world, "isAStrangerAgain");
        int looked = 0;
        QDirIterator files(m_world.path("."), QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
        while (files.hasNext()) {
            const QString path = files.next();
            const QString name = QFileInfo(path).fileName();
            if (name == QLatin1String("config.json") || name == QLatin1String("scenario.json"))
                continue;
            QFile file(path);
            QVERIFY2(file.open(QIODevice::ReadOnly), qPrintable(path));
            const QByteArray text = file.readAll();
            for (const char *secret : {"Terminal-7", "Control-9"})
                QVERIFY2(!text.contains(secret), qPrintable(path));
            const bool isKey = name.endsWith(QLatin1String(".key"));
            QVERIFY2(isKey || !text.contains("PRIVATE KEY"), qPrintable(path));
            ++looked;
        }
        QVERIFY(looked > 20);
    }
};

QTEST_GUILESS_MAIN(TestLeave)
#include "tst_leave.moc"
