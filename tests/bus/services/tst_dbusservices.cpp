// SPDX-License-Identifier: Apache-2.0
#include "dbusservices.h"
#include "servicefixture.h"

#include <QDBusPendingReply>
#include <QDBusVirtualObject>
#include <QElapsedTimer>
#include <QThread>
#include <QtTest>

#include <atomic>

namespace {

constexpr int kLateMs = 5500; // later than what a question waits for

// The services that are called by methods in one, in a thread of its own.
class SlowService : public QDBusVirtualObject
{
public:
    explicit SlowService(const QString &bus)
        : m_connection(QDBusConnection::connectToBus(bus, QStringLiteral("slow")))
    {
        m_connection.registerVirtualObject(QStringLiteral("/"), this, QDBusConnection::SubPath);
        moveToThread(&m_thread);
        m_thread.start();
        for (const char *name :
             {"com.morvek.daemon.Network", "com.morvek.vesk.veskg", "org.freedesktop.login1"})
            m_connection.registerService(QLatin1String(name));
    }

    ~SlowService() override
    {
        QDBusConnection::disconnectFromBus(QStringLiteral("slow"));
        m_thread.quit();
        m_thread.wait();
    }

    QString introspect(const QString & /*path*/) const override { return {}; }

    bool handleMessage(const QDBusMessage &message, const QDBusConnection &connection) override
    {
        if (message.interface() == QLatin1String("org.freedesktop.DBus.Introspectable"))
            ++introspections;
        QThread::msleep(static_cast<unsigned long>(delayMs));
        return connection.send(message.createReply(QStringLiteral("[]")));
    }

    std::atomic<int> delayMs = 0;
    std::atomic<int> introspections = 0;

private:
    QThread m_thread;
    QDBusConnection m_connection;
};

} // namespace

// How long the program waits for a service, and for what.
class TestDbusServices : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase()
    {
        QCOMPARE(m_fixture.start(), QString());
        for (const char *variable : {"DBUS_SESSION_BUS_ADDRESS", "DBUS_SYSTEM_BUS_ADDRESS"})
            qputenv(variable, m_fixture.environment().value(QLatin1String(variable)).toUtf8());
        m_service = std::make_unique<SlowService>(
            m_fixture.environment().value(QStringLiteral("DBUS_SESSION_BUS_ADDRESS")));
    }

    // A service may have a great many methods, or take its time to tell them.
    void nothingIsIntrospected()
    {
        QObject parent;
        QCOMPARE(dbusservices::activeConnections(), std::optional(QStringLiteral("[]")));
        dbusservices::installStagedConfig(&parent);
        dbusservices::leaveDomain(&parent);
        dbusservices::requestReboot();
        QDBusPendingReply<QString> join = dbusservices::joinDomain(&parent, QStringLiteral("join"));
        join.waitForFinished();
        QCOMPARE(join.value(), QStringLiteral("[]"));
        QCOMPARE(m_service->introspections, 0);
    }

    // A change has as long as the bus library gives it.
    void aQuestionDoesNotWaitForLong()
    {
        m_service->delayMs = kLateMs;
        QObject parent;
        QElapsedTimer elapsed;
        elapsed.start();
        dbusservices::requestReboot();
        dbusservices::installStagedConfig(&parent);
        QVERIFY2(elapsed.restart() >= 2 * kLateMs, "a change was not waited for");
        QCOMPARE(dbusservices::activeConnections(), std::optional<QString>());
        QVERIFY2(elapsed.elapsed() < kLateMs, qPrintable(QString::number(elapsed.elapsed())));
    }

private:
    ServiceFixture m_fixture{QStringLiteral("iam")};
    std::unique_ptr<SlowService> m_service;
};

QTEST_GUILESS_MAIN(TestDbusServices)
#include "tst_dbusservices.moc"
