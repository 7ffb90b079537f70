// SPDX-License-Identifier: Apache-2.0
#include "servicefixture.h"

#include <QDBusInterface>
#include <QDBusReply>
#include <QElapsedTimer>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QtTest>

using namespace sandbox;

namespace {

QDBusMessage askNetwork(const ServiceFixture &fixture)
{
    return fixture.call("com.morvek.daemon.Network", "/com/morvek/daemon/Network",
                        "com.morvek.daemon.Network", "GetActiveConnectionInfo", {});
}

// Each write with a proxy of its own, as the enrolment client does it.
bool setEnable(const ServiceFixture &fixture, bool value)
{
    QDBusInterface proxy(QStringLiteral("com.morvek.vesk.iam"), QStringLiteral("/com/morvek/vesk/iam"),
                         QStringLiteral("com.morvek.vesk.iam"), fixture.bus());
    return proxy.setProperty("Enable", value);
}

QVariant enable(const ServiceFixture &fixture)
{
    QDBusInterface proxy(QStringLiteral("com.morvek.vesk.iam"), QStringLiteral("/com/morvek/vesk/iam"),
                         QStringLiteral("com.morvek.vesk.iam"), fixture.bus());
    return proxy.property("Enable");
}

} // namespace

// Network daemon, identity service and login manager as their clients see them.
class TestServices : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void networkReportsOnePrimaryConnection();
    void networkIsScripted_data();
    void networkIsScripted();
    void identityKeepsItsProperty();
    void identityIsScripted_data();
    void identityIsScripted();
    void identityRefusesNonsense_data();
    void identityRefusesNonsense();
    void loginTellsTheLauncher();
    void loginRefuses();
    void serviceVanishesInTheCall();
    void nameIsTakenOnce();
};

void TestServices::networkReportsOnePrimaryConnection()
{
    ServiceFixture fixture;
    QCOMPARE(fixture.start({QStringLiteral("network")}), QString());
    const QDBusReply<QString> reply = askNetwork(fixture);
    QVERIFY2(reply.isValid(), qPrintable(reply.error().message()));
    const QJsonArray connections = QJsonDocument::fromJson(reply.value().toUtf8()).array();
    QCOMPARE(connections.size(), 1);
    const QJsonObject connection = connections.first().toObject();
    QCOMPARE(connection.value(QLatin1String("IsPrimaryConnection")), QJsonValue(true));
    const QRegularExpression mac(QStringLiteral("^02(:[0-9A-F]{2}){5}$"));
    QVERIFY(mac.match(connection.value(QLatin1String("HwAddress")).toString()).hasMatch());
    QCOMPARE(fixture.journal(), QStringList{QStringLiteral("bus       com.morvek.daemon.Network "
                                                           "GetActiveConnectionInfo() -> ") +
                                            reply.value()});
}

void TestServices::networkIsScripted_data()
{
    QTest::addColumn<QByteArray>("script");
    QTest::addColumn<QString>("reply");
    QTest::addColumn<QString>("error");
    QTest::newRow("down") << QByteArray(R"({"reply": "null"})") << QStringLiteral("null") << QString();
    QTest::newRow("error") << QByteArray(R"({"error": "org.example.Broken"})") << QString()
                           << QStringLiteral("org.example.Broken");
}

void TestServices::networkIsScripted()
{
    QFETCH(QByteArray, script);
    QFETCH(QString, reply);
    QFETCH(QString, error);
    ServiceFixture fixture("{\"services\": {\"network\": " + script + "}}");
    QCOMPARE(fixture.start({QStringLiteral("network")}), QString());
    const QDBusMessage answer = askNetwork(fixture);
    QCOMPARE(answer.errorName(), error);
    if (error.isEmpty())
        QCOMPARE(answer.arguments().value(0).toString(), reply);
}

void TestServices::identityKeepsItsProperty()
{
    ServiceFixture fixture;
    QCOMPARE(fixture.start({QStringLiteral("iam")}), QString());
    QCOMPARE(enable(fixture), QVariant(false));
    QVERIFY(setEnable(fixture, true));
    QCOMPARE(enable(fixture), QVariant(true));
    // Another process of the service finds it again.
    fixture.service(0).stop();
    QString error;
    QVERIFY2(fixture.service(0).start(fixture.state().path(), fixture.environment(), &error),
             qPrintable(error));
    QCOMPARE(enable(fixture), QVariant(true));
    QVERIFY(setEnable(fixture, false));
    QCOMPARE(fixture.journal(),
             (QStringList{QStringLiteral("bus       com.morvek.vesk.iam Enable = true"),
                          QStringLiteral("bus       com.morvek.vesk.iam Enable = false")}));
}

void TestServices::identityIsScripted_data()
{
    QTest::addColumn<QByteArray>("script");
    QTest::addColumn<QString>("line"); // of the journal; empty: none, the service is not reached
    QTest::newRow("refuses") << QByteArray(R"({"error": "org.freedesktop.DBus.Error.AccessDenied"})")
                             << QStringLiteral("bus       com.morvek.vesk.iam Enable = true refused");
    QTest::newRow("no introspection") << QByteArray(R"({"introspect": false})") << QString();
}

void TestServices::identityIsScripted()
{
    QFETCH(QByteArray, script);
    QFETCH(QString, line);
    ServiceFixture fixture("{\"services\": {\"iam\": " + script + "}}");
    QCOMPARE(fixture.start({QStringLiteral("iam")}), QString());
    const QByteArray before = ServiceFixture::read(fixture.state().identityService());
    QVERIFY(!setEnable(fixture, true));
    QCOMPARE(fixture.journal(), line.isEmpty() ? QStringList() : QStringList{line});
    QCOMPARE(ServiceFixture::read(fixture.state().identityService()), before);
}

void TestServices::identityRefusesNonsense_data()
{
    QTest::addColumn<QString>("method");
    QTest::addColumn<QVariantList>("arguments");
    const QString iam = QStringLiteral("com.morvek.vesk.iam");
    const auto boxed = [](const QVariant &value) {
        return QVariant::fromValue(QDBusVariant(value));
    };
    QTest::newRow("text for a boolean")
        << QStringLiteral("Set") << QVariantList{iam, QStringLiteral("Enable"), boxed(QStringLiteral("yes"))};
    QTest::newRow("other property") << QStringLiteral("Set")
                                    << QVariantList{iam, QStringLiteral("Other"), boxed(true)};
    QTest::newRow("other interface") << QStringLiteral("Get")
                                     << QVariantList{QStringLiteral("org.example.X"),
                                                     QStringLiteral("Enable")};
}

void TestServices::identityRefusesNonsense()
{
    QFETCH(QString, method);
    QFETCH(QVariantList, arguments);
    ServiceFixture fixture;
    QCOMPARE(fixture.start({QStringLiteral("iam")}), QString());
    const QDBusMessage reply =
        fixture.call("com.morvek.vesk.iam", "/com/morvek/vesk/iam", "org.freedesktop.DBus.Properties",
                     method.toLatin1().constData(), arguments);
    QCOMPARE(reply.type(), QDBusMessage::ErrorMessage);
    QVERIFY(fixture.journal().isEmpty());
}

void TestServices::loginTellsTheLauncher()
{
    ServiceFixture fixture;
    QCOMPARE(fixture.start({QStringLiteral("login")}), QString());
    QSignalSpy asked(&fixture.service(0), &ServiceProcess::rebootAsked);
    const QDBusMessage reply = fixture.call("org.freedesktop.login1", "/org/freedesktop/login1",
                                            "org.freedesktop.login1.Manager", "Reboot", {true});
    QCOMPARE(reply.type(), QDBusMessage::ReplyMessage);
    QVERIFY(!asked.isEmpty() || asked.wait());
    QCOMPARE(fixture.journal(), QStringList{QStringLiteral("bus       org.freedesktop.login1 Reboot(true)")});
}

void TestServices::loginRefuses()
{
    ServiceFixture fixture(R"({"services": {"login": {"error": "org.example.NotNow"}}})");
    QCOMPARE(fixture.start({QStringLiteral("login")}), QString());
    QSignalSpy asked(&fixture.service(0), &ServiceProcess::rebootAsked);
    const QDBusMessage reply = fixture.call("org.freedesktop.login1", "/org/freedesktop/login1",
                                            "org.freedesktop.login1.Manager", "Reboot", {true});
    QCOMPARE(reply.errorName(), QStringLiteral("org.example.NotNow"));
    QVERIFY(!asked.wait(300));
}

void TestServices::serviceVanishesInTheCall()
{
    ServiceFixture fixture(R"({"services": {"veskg": {"delay_ms": 200, "vanish": true}}})");
    QCOMPARE(fixture.start({QStringLiteral("veskg")}), QString());
    QSignalSpy ended(&fixture.service(0), &ServiceProcess::ended);
    QElapsedTimer timer;
    timer.start();
    const QDBusMessage reply =
        fixture.call("com.morvek.vesk.veskg", "/com/morvek/vesk/veskg", "com.morvek.vesk.veskg",
                     "onDomainConfig", {QStringLiteral("join")});
    QCOMPARE(reply.type(), QDBusMessage::ErrorMessage);
    QVERIFY(timer.elapsed() >= 200 && timer.elapsed() < 10000);
    QVERIFY(!ended.isEmpty() || ended.wait());
    QCOMPARE(fixture.journal(),
             (QStringList{QStringLiteral("bus       com.morvek.vesk.veskg: \"join\" is held for 200 ms"),
                          QStringLiteral("bus       com.morvek.vesk.veskg onDomainConfig(\"join\") "
                                         "-> no reply, the service ends")}));
}

void TestServices::nameIsTakenOnce()
{
    ServiceFixture fixture;
    QVERIFY(fixture.start({QStringLiteral("iam"), QStringLiteral("iam")})
                .startsWith(QLatin1String("service iam: ")));
}

QTEST_GUILESS_MAIN(TestServices)
#include "tst_services.moc"
