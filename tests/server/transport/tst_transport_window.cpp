// SPDX-License-Identifier: Apache-2.0
#include "transportfixture.h"

#include "mtk/mapplication.h"

#include <QApplication>
#include <QCloseEvent>
#include <QPushButton>
#include <QSemaphore>
#include <QtTest>

#include <functional>

namespace {

constexpr int kTimeoutMs = 30 * 1000; // with a test that goes wrong

class Window : public QPushButton
{
public:
    std::function<void()> painted = [] {
    };

protected:
    void paintEvent(QPaintEvent *) override { painted(); }
};

} // namespace

// What the user and the program can do while a call is in progress, and what not.
class TstTransportWindow : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void cleanup();

    void windowLivesOn();
    void inputStillQueuedIsDiscarded();
    void closingIsRefused();
    void secondCallAnswersAtOnce();
    void anotherClientMayCall();
    void configurationMayBeSetMeanwhile();
    void clientMayBeDeletedMeanwhile();
    void quitTakesEffectAfterwards();
    void plainWaitProcessesNothing();

private:
    TransportFixture m_fixture;
    std::function<void()> m_meanwhile;
    QSemaphore m_reply;
    const TlsPeer m_peer{m_fixture.server, [this](const QByteArray &) {
                             return answerWhenReleased();
                         }};
    const TlsPeer m_promptPeer{m_fixture.server, always(httpReply(200, "{}"))};
    std::unique_ptr<HttpClientApi> m_client;
    std::unique_ptr<Window> m_window;

    PeerAnswer answerWhenReleased();
    // Makes a call and does `meanwhile` once the server has the request. The reply comes when that is done,
    // or when it releases `m_reply`.
    int callAnd(const std::function<void()> &meanwhile);
    int callUntilReleased(const std::function<void()> &meanwhile);
};

void TstTransportWindow::init()
{
    m_client = m_fixture.client();
    m_window = std::make_unique<Window>();
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
}

void TstTransportWindow::cleanup()
{
    QVERIFY(!qApp->property("busy").toBool());
    const QSignalSpy clicked(m_window.get(), &QPushButton::clicked);
    QTest::mouseClick(m_window.get(), Qt::LeftButton);
    QCOMPARE(clicked.count(), 1); // nothing is dead afterwards
    m_window.reset();
    m_client.reset();
}

PeerAnswer TstTransportWindow::answerWhenReleased()
{
    QMetaObject::invokeMethod(
        qApp, [this] { m_meanwhile(); }, Qt::QueuedConnection);
    m_reply.tryAcquire(1, kTimeoutMs);
    return always(httpReply(200, "{}"))({});
}

int TstTransportWindow::callAnd(const std::function<void()> &meanwhile)
{
    return callUntilReleased([&] {
        meanwhile();
        m_reply.release();
    });
}

int TstTransportWindow::callUntilReleased(const std::function<void()> &meanwhile)
{
    m_meanwhile = meanwhile;
    QString reply;
    return m_client->getRequest(reply, m_peer.url(), QString(), true);
}

void TstTransportWindow::windowLivesOn()
{
    bool painted = false;
    bool busy = false;
    QCOMPARE(callUntilReleased([&] {
                 busy = qApp->property("busy").toBool();
                 m_window->painted = [&] {
                     if (!painted)
                         m_reply.release();
                     painted = true;
                 };
                 m_window->update();
             }),
             200);
    m_window->painted = [] {
    };
    QVERIFY(busy);
    QVERIFY(painted);
}

// The user clicks while the program is too busy to see that the reply has come.
void TstTransportWindow::inputStillQueuedIsDiscarded()
{
    const QStringList before = runningThreads();
    const QSignalSpy clicked(m_window.get(), &QPushButton::clicked);
    bool ended = false;
    QCOMPARE(callUntilReleased([&] {
                 const QStringList ofTheCall = runningThreads(before);
                 m_reply.release();
                 ended = haveEnded(ofTheCall);
                 const QPointF place = m_window->rect().center();
                 for (const auto type : {QEvent::MouseButtonPress, QEvent::MouseButtonRelease})
                     QCoreApplication::postEvent(
                         m_window.get(), new QMouseEvent(type, place, Qt::LeftButton, Qt::LeftButton, {}));
             }),
             200);
    QVERIFY(ended);
    QCoreApplication::processEvents();
    QCOMPARE(clicked.count(), 0);
}

void TstTransportWindow::closingIsRefused()
{
    bool closed = true;
    QCOMPARE(callAnd([&] { closed = m_window->close(); }), 200);
    QVERIFY(!closed);
    QVERIFY(m_window->isVisible());
    QVERIFY(m_window->close());
}

void TstTransportWindow::secondCallAnswersAtOnce()
{
    const int connectionsBefore = m_promptPeer.connections();
    const WarningLog log;
    int second = -1;
    QCOMPARE(callAnd([&] {
                 QString reply;
                 second = m_client->postRequest(reply, m_promptPeer.url(), QStringLiteral("{}"), true);
             }),
             200);
    QCOMPARE(second, 0);
    QCOMPARE(m_promptPeer.connections(), connectionsBefore);
    QVERIFY2(log.onlyLine().endsWith(QStringLiteral("nothing was sent: another call is in progress")),
             qPrintable(log.onlyLine()));
    QCOMPARE(callAnd([] {}), 200);
}

void TstTransportWindow::anotherClientMayCall()
{
    const auto other = m_fixture.client();
    int inner = -1;
    bool busyAfterInner = false;
    QCOMPARE(callAnd([&] {
                 QString reply;
                 inner = other->getRequest(reply, m_promptPeer.url(), QString(), true);
                 busyAfterInner = qApp->property("busy").toBool();
             }),
             200);
    QCOMPARE(inner, 200);
    QVERIFY(busyAfterInner);
}

void TstTransportWindow::configurationMayBeSetMeanwhile()
{
    QCOMPARE(callAnd([this] { m_client->setSSLConfig(QString(), QString(), QString()); }), 200);
    QCOMPARE(callAnd([] {}), 0);
}

void TstTransportWindow::clientMayBeDeletedMeanwhile()
{
    QCOMPARE(callAnd([this] { m_client.reset(); }), 200);
}

void TstTransportWindow::quitTakesEffectAfterwards()
{
    int status = -1;
    QTimer::singleShot(0, m_window.get(), [&] { status = callAnd([] { QCoreApplication::quit(); }); });
    QTimer::singleShot(kTimeoutMs, m_window.get(), [] { QCoreApplication::exit(1); });
    QCOMPARE(QCoreApplication::exec(), 0);
    QCOMPARE(status, 200);
}

void TstTransportWindow::plainWaitProcessesNothing()
{
    bool ran = false;
    QTimer::singleShot(0, m_window.get(), [&] { ran = true; });
    QString reply;
    QCOMPARE(m_client->getRequest(reply, m_promptPeer.url(), QString(), false), 200);
    QVERIFY(!ran);
}

// Under the toolkit's application object, as in a program of the desktop.
int main(int argc, char **argv)
{
    Mtk::Widget::MApplication application(argc, argv);
    TstTransportWindow test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_transport_window.moc"
