// SPDX-License-Identifier: Apache-2.0
#include "servicefixture.h"

#include <QProcess>
#include <QtTest>

#include <memory>
#include <vector>

using namespace sandbox;

// What no walk through the program would see for sure: commands in each other's way.
class TestServices : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void unitsSurviveParallelWrites();
};

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

QTEST_GUILESS_MAIN(TestServices)
#include "tst_services.moc"
