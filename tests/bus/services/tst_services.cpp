// SPDX-License-Identifier: Apache-2.0
#include "servicefixture.h"

#include <QDBusVariant>
#include <QProcess>
#include <QtTest>

#include <memory>
#include <vector>

using namespace sandbox;

// What no walk through the program would see: calls that it never makes, and commands in each other's way.
class TestServices : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void identityRefusesNonsense_data();
    void identityRefusesNonsense();
    void unitsSurviveParallelWrites();
    void commandsRefuseOutsideOfAWorld();
};

void TestServices::identityRefusesNonsense_data()
{
    QTest::addColumn<QString>("method");
    QTest::addColumn<QVariantList>("arguments");
    const QString iam = QStringLiteral("com.morvek.vesk.iam");
    const QString set = QStringLiteral("Set");
    const QString enable = QStringLiteral("Enable");
    const QVariant yes = QVariant::fromValue(QDBusVariant(true));
    const QVariant text = QVariant::fromValue(QDBusVariant(QStringLiteral("yes")));
    QTest::newRow("text for a boolean") << set << QVariantList{iam, enable, text};
    QTest::newRow("other property") << set << QVariantList{iam, QStringLiteral("Other"), yes};
    QTest::newRow("other interface") << QStringLiteral("Get")
                                     << QVariantList{QStringLiteral("org.example.X"), enable};
}

void TestServices::identityRefusesNonsense()
{
    QFETCH(QString, method);
    QFETCH(QVariantList, arguments);
    ServiceFixture fixture(QStringLiteral("iam"));
    QCOMPARE(fixture.start(), QString());
    const QDBusMessage reply =
        fixture.call("com.morvek.vesk.iam", "/com/morvek/vesk/iam", "org.freedesktop.DBus.Properties",
                     method.toLatin1().constData(), arguments);
    QCOMPARE(reply.type(), QDBusMessage::ErrorMessage);
    QVERIFY(fixture.journal().isEmpty());
}

// The client starts four of them at once when it leaves.
void TestServices::unitsSurviveParallelWrites()
{
    const ServiceFixture fixture(QStringLiteral("iam"));
    std::vector<std::unique_ptr<QProcess>> processes;
    for (int i = 0; i < 8; ++i) {
        processes.push_back(std::make_unique<QProcess>());
        processes.back()->setProcessEnvironment(fixture.environment());
        processes.back()->start(fixture.state().commands() + QStringLiteral("/systemctl"),
                                {QStringLiteral("--global"), QStringLiteral("enable"),
                                 i % 2 == 0 ? QStringLiteral("vesks") : QStringLiteral("mmcs")});
    }
    for (const auto &process : processes)
        QVERIFY(process->waitForFinished() && process->exitCode() == 0);
    QCOMPARE(smallfile::readObject(fixture.state().units()).keys(),
             (QStringList{QStringLiteral("mmcs"), QStringLiteral("vesks")}));
}

void TestServices::commandsRefuseOutsideOfAWorld()
{
    const ServiceFixture fixture(QStringLiteral("iam"));
    QProcess process;
    process.start(fixture.state().commands() + QStringLiteral("/killall"),
                  {QStringLiteral("-9"), QStringLiteral("mmcs")});
    QVERIFY(process.waitForFinished());
    QCOMPARE(process.exitCode(), 125);
}

QTEST_GUILESS_MAIN(TestServices)
#include "tst_services.moc"
