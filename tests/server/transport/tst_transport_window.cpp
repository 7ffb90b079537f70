// SPDX-License-Identifier: Apache-2.0
#include "transportfixture.h"

#include <QApplication>
#include <QCloseEvent>
#include <QLineEdit>
#include <QPushButton>
#include <QShortcut>
#include <QVBoxLayout>
#include <QtTest>

#include <algorithm>
#include <functional>
#include <thread>

namespace {

constexpr int kReplyDelayMs = 400;

// A window with a button and a field that notes what reaches it.
class Window : public QWidget
{
public:
    Window();

    QPushButton button{QStringLiteral("Next")};
    QLineEdit field;
    QShortcut shortcut{QKeySequence(Qt::CTRL + Qt::Key_N), this};
    int clicks = 0;
    int shortcuts = 0;
    int paints = 0;

protected:
    void paintEvent(QPaintEvent *) override { ++paints; }
};

Window::Window()
{
    auto *layout = new QVBoxLayout(this);
    layout->addWidget(&button);
    layout->addWidget(&field);
    QObject::connect(&button, &QPushButton::clicked, this, [this] { ++clicks; });
    QObject::connect(&shortcut, &QShortcut::activated, this, [this] { ++shortcuts; });
}

TlsPeer::Script late(int delayMs)
{
    return [=](const QByteArray &) {
        PeerAnswer answer;
        answer.bytes = httpReply(200, "{}");
        answer.delayMs = delayMs;
        return answer;
    };
}

} // namespace

// What the user and the program can do while a call is out, and what not.
class TstTransportWindow : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void cleanup();

    void windowLivesOn();
    void inputIsDiscarded();
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
    const TlsPeer m_peer{m_fixture.server, late(kReplyDelayMs)};
    std::unique_ptr<HttpClientApi> m_client;
    std::unique_ptr<Window> m_window;

    // Makes a call and does `meanwhile` in the middle of it.
    int callAnd(const std::function<void()> &meanwhile);
    void useEverything();
};

void TstTransportWindow::init()
{
    m_client = std::make_unique<HttpClientApi>(nullptr, false);
    m_client->setSSLConfig(m_fixture.caFile, QString(), QString());
    m_window = std::make_unique<Window>();
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    QApplication::setActiveWindow(m_window.get()); // there may be no window manager
    m_window->field.setFocus();
}

void TstTransportWindow::cleanup()
{
    QVERIFY(!qApp->property("busy").toBool());
    m_window.reset();
    m_client.reset();
}

int TstTransportWindow::callAnd(const std::function<void()> &meanwhile)
{
    QTimer::singleShot(kReplyDelayMs / 4, m_window.get(), meanwhile);
    QString reply;
    return m_client->getRequest(reply, m_peer.url(), QString(), true);
}

void TstTransportWindow::useEverything()
{
    QTest::mouseClick(&m_window->button, Qt::LeftButton);
    QTest::mouseClick(m_window->windowHandle(), Qt::LeftButton, Qt::NoModifier,
                      m_window->button.geometry().center());
    QTest::keyClick(&m_window->button, Qt::Key_Space);
    QTest::keyClicks(&m_window->field, QStringLiteral("abc"));
    QTest::keyClick(m_window->windowHandle(), Qt::Key_N, Qt::ControlModifier);
}

void TstTransportWindow::windowLivesOn()
{
    int paintsBefore = 0;
    int paintsAfter = 0;
    bool busy = false;
    QCOMPARE(callAnd([&] {
                 busy = qApp->property("busy").toBool();
                 paintsBefore = m_window->paints;
                 m_window->update();
                 QTimer::singleShot(kReplyDelayMs / 4, m_window.get(),
                                    [&] { paintsAfter = m_window->paints; });
             }),
             200);
    QVERIFY(busy);
    QVERIFY(paintsAfter > paintsBefore);
}

void TstTransportWindow::inputIsDiscarded()
{
    QCOMPARE(callAnd([this] { useEverything(); }), 200);
    QTest::qWait(50);
    QCOMPARE(m_window->clicks, 0);
    QCOMPARE(m_window->shortcuts, 0);
    QCOMPARE(m_window->field.text(), QString());
    QVERIFY(!m_window->button.isDown());

    useEverything(); // the same is taken once the call has ended
    QCOMPARE(m_window->clicks, 3);
    QCOMPARE(m_window->shortcuts, 1);
    QCOMPARE(m_window->field.text(), QStringLiteral("abc"));
}

// The user clicks while the program is too busy to see that the reply has come.
void TstTransportWindow::inputStillQueuedIsDiscarded()
{
    QCOMPARE(callAnd([this] {
                 QTest::qSleep(2 * kReplyDelayMs);
                 const QPointF place = m_window->button.rect().center();
                 for (const auto type : {QEvent::MouseButtonPress, QEvent::MouseButtonRelease})
                     QCoreApplication::postEvent(
                         &m_window->button, new QMouseEvent(type, place, Qt::LeftButton, Qt::LeftButton, {}));
             }),
             200);
    QTest::qWait(50);
    QCOMPARE(m_window->clicks, 0);
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
    const int requestsBefore = m_peer.requests().size();
    const WarningLog log;
    int second = -1;
    QElapsedTimer timer;
    qint64 taken = kReplyDelayMs;
    QCOMPARE(callAnd([&] {
                 QString reply;
                 timer.start();
                 second = m_client->postRequest(reply, m_peer.url(), QStringLiteral("{}"), true);
                 taken = timer.elapsed();
             }),
             200);
    QCOMPARE(second, 0);
    QVERIFY(taken < kReplyDelayMs / 2);
    QCOMPARE(m_peer.requests().size(), requestsBefore + 1);
    QVERIFY2(log.onlyLine().endsWith(QStringLiteral("nothing was sent: another call is out")),
             qPrintable(log.onlyLine()));
    QCOMPARE(callAnd([] {}), 200);
}

void TstTransportWindow::anotherClientMayCall()
{
    HttpClientApi other(nullptr, false);
    other.setSSLConfig(m_fixture.caFile, QString(), QString());
    int inner = -1;
    bool busyAfterInner = false;
    QCOMPARE(callAnd([&] {
                 QString reply;
                 inner = other.getRequest(reply, m_peer.url(), QString(), true);
                 busyAfterInner = qApp->property("busy").toBool();
                 useEverything();
             }),
             200);
    QCOMPARE(inner, 200);
    QVERIFY(busyAfterInner);
    QCOMPARE(m_window->clicks, 0);
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
    QElapsedTimer timer;
    timer.start();
    QTimer::singleShot(20 * kReplyDelayMs, m_window.get(), [] { QCoreApplication::exit(1); });
    QCOMPARE(QCoreApplication::exec(), 0);
    QCOMPARE(status, 200);
}

void TstTransportWindow::plainWaitProcessesNothing()
{
    bool ran = false;
    QTimer::singleShot(0, m_window.get(), [&] { ran = true; });
    QString reply;
    QCOMPARE(m_client->getRequest(reply, m_peer.url(), QString(), false), 200);
    QVERIFY(!ran);
}

QTEST_MAIN(TstTransportWindow)
#include "tst_transport_window.moc"
