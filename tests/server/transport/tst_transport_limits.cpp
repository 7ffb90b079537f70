// SPDX-License-Identifier: Apache-2.0
#include "slowworld.h"
#include "transportfixture.h"

#include <QtTest>

#include <boost/asio.hpp>

#include <atomic>
#include <chrono>
#include <list>

namespace {

using boost::asio::ip::tcp;

constexpr int kAtOnce = 0; // seconds of a clock that is put on
constexpr int kReach = 10;
constexpr int kReplyTimer = 60;
constexpr int kTickMs = 100;
constexpr int kFlowTicks = 3; // until a flood is in full flow
constexpr int kSlack = 8;     // for a machine that has much else to do

std::atomic<bool> isFlooding = false;

// Rounded: libcurl's clock cuts parts of a millisecond off, so that its limits may end that much early.
int seconds(std::chrono::steady_clock::duration time)
{
    return static_cast<int>(std::chrono::round<std::chrono::seconds>(time).count());
}

// A port on loopback whose queue of connections is full, so that the next one gets no answer.
class FullPort
{
public:
    FullPort();
    quint16 port() const { return m_listener.local_endpoint().port(); }

private:
    boost::asio::io_context m_io;
    tcp::acceptor m_listener{m_io, tcp::v4()};
    std::list<tcp::socket> m_waiting;
};

FullPort::FullPort()
{
    m_listener.bind({boost::asio::ip::address_v4::loopback(), 0});
    m_listener.listen(0);
    for (int i = 0; i < 4; ++i)
        m_waiting.emplace_back(m_io).async_connect(m_listener.local_endpoint(),
                                                   [](const boost::system::error_code & /*error*/) {});
}

} // namespace

// How long a call lasts at most, and what it says then.
class TstTransportLimits : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void limits_data();
    void limits();
    void floods_data();
    void floods();
    void abandonedNameIsNotUsedLater();
    void replyTimerIsKeptWithinBounds();

private:
    TransportFixture m_fixture;
    const TlsPeer m_mute{m_fixture.server, always({}, PeerAnswer::End::KeepOpen), TlsPeer::Style::PlainText};
    const TlsPeer m_peer{m_fixture.server, answerSlowly};
    const TlsPeer m_flood{m_fixture.server, flood};
    const TlsPeer m_proxy{m_fixture.server, flood, TlsPeer::Style::PlainText};
    const FullPort m_full;

    static PeerAnswer answerSlowly(const QByteArray &request);
    static PeerAnswer flood(const QByteArray &request);
    std::unique_ptr<HttpClientApi> client() const;
};

PeerAnswer TstTransportLimits::answerSlowly(const QByteArray &request)
{
    slowworld::letTimePass(true);
    if (request.startsWith("GET /drip"))
        return {"HTTP/1.1 200 OK\r\nContent-Length: 100000\r\n\r\n", PeerAnswer::End::KeepOpen, "x", 50};
    return {{}, PeerAnswer::End::KeepOpen, {}, 0};
}

std::unique_ptr<HttpClientApi> TstTransportLimits::client() const
{
    auto made = m_fixture.client();
    made->setReplyTimer(1);
    return made;
}

void TstTransportLimits::limits_data()
{
    QTest::addColumn<QString>("url");
    QTest::addColumn<int>("limit");
    QTest::addColumn<QString>("warning");
    const auto row = [](const char *name, const QString &url, int limit, const char *warning) {
        QTest::newRow(name) << url << limit << QString::fromLatin1(warning);
    };
    const QString closed = QStringLiteral("https://127.0.0.1:1/"); // no server has this port
    const QString full = QStringLiteral("https://127.0.0.1:%1/").arg(m_full.port());
    row("unknown name", QStringLiteral("https://unknown.test/"), kAtOnce,
        ": nothing was sent: .*resolve.*unknown.test");
    row("name that hangs", QStringLiteral("https://hangs.test/"), kReach,
        ": nothing was sent: Resolving timed out");
    row("closed port", closed, kAtOnce, ": nothing was sent: .*connect");
    row("address that does not answer", full, kReach, ": nothing was sent: .*imed? ?out");
    row("no TLS", QStringLiteral("https://127.0.0.1:%1/").arg(m_mute.port()), kReach,
        ": nothing was sent: .*timeout");
    row("no reply", m_peer.url(QStringLiteral("/silent")), kReplyTimer,
        ": sent, outcome unknown: .*timed out");
    row("slow drip", m_peer.url(QStringLiteral("/drip")), kReplyTimer, "unusable: .*timed out");
}

void TstTransportLimits::limits()
{
    QFETCH(QString, url);
    QFETCH(int, limit);
    QFETCH(QString, warning);
    const WarningLog log;
    QString reply = QStringLiteral("old");
    slowworld::letTimePass(limit == kReach); // the reply timer's: once the server has the request
    const auto start = std::chrono::steady_clock::now();
    QCOMPARE(client()->getRequest(reply, url, QString(), true), 0);
    const int taken = seconds(std::chrono::steady_clock::now() - start);
    slowworld::letTimePass(false);
    QCOMPARE(reply, QString());
    QVERIFY2(taken >= limit && taken <= limit + kSlack, qPrintable(QString::number(taken)));
    QVERIFY2(QRegularExpression(warning).match(log.onlyLine()).hasMatch(), qPrintable(log.onlyLine()));
}

PeerAnswer TstTransportLimits::flood(const QByteArray &request)
{
    using Flood = PeerAnswer::Flood;
    isFlooding = true;
    const QByteArray head = "HTTP/1.1 407 Text\r\nProxy-Authenticate: Basic realm=x\r\n";
    if (request.startsWith("GET /tickets"))
        return {{}, PeerAnswer::End::KeepOpen, {}, 0, Flood::Tickets};
    const QByteArray start = "HTTP/1.1 200 OK\r\nContent-Length: 9\r\n\r\n{";
    if (request.startsWith("GET /late-tickets"))
        return {start, PeerAnswer::End::KeepOpen, {}, 0, Flood::Tickets};
    if (request.startsWith("GET /keys"))
        return {{}, PeerAnswer::End::KeepOpen, {}, 0, Flood::KeyUpdates};
    if (request.startsWith("CONNECT header"))
        return {head, PeerAnswer::End::KeepOpen, QByteArray("X: y\r\n").repeated(4096)};
    if (request.startsWith("CONNECT body"))
        return {head + "Content-Length: 999999999999\r\n\r\n", PeerAnswer::End::KeepOpen,
                QByteArray(64 * 1024, 'x')};
    // To a client's hello, in records of TLS 1.2 with a thousand messages each.
    const QByteArray helloRequests = QByteArray("\0\0\0\0", 4).repeated(1000);
    return {{}, PeerAnswer::End::KeepOpen, QByteArray("\x16\x03\x03\x0f\xa0", 5) + helloRequests};
}

void TstTransportLimits::floods_data()
{
    QTest::addColumn<QString>("url");
    QTest::addColumn<int>("limit");
    QTest::addColumn<bool>("proxy");
    QTest::addColumn<QString>("warning");
    const auto row = [](const char *name, const QString &url, int limit, bool proxy, const char *warning) {
        QTest::newRow(name) << url << limit << proxy << QString::fromLatin1(warning);
    };
    row("tickets", m_flood.url(QStringLiteral("/tickets")), kReplyTimer, false,
        ": sent, outcome unknown: (Operation )?timed out");
    row("tickets in the reply", m_flood.url(QStringLiteral("/late-tickets")), kReplyTimer, false,
        ": answered with status 200, reply unusable: (Operation )?timed out");
    row("key updates", m_flood.url(QStringLiteral("/keys")), kReplyTimer, false,
        ": sent, outcome unknown: (Operation )?timed out");
    row("requests for a handshake", QStringLiteral("https://localhost:%1/").arg(m_proxy.port()), kReach,
        false, ": nothing was sent: (SSL connection timeout|timed out)");
    row("proxy's refusal", QStringLiteral("https://body.test/"), kReach, true,
        ": nothing was sent: (Proxy CONNECT aborted due to timeout|timed out)");
    row("proxy's header", QStringLiteral("https://header.test/"), kReach, true,
        ": nothing was sent: (Proxy CONNECT aborted due to timeout|timed out)");
}

// What never ends keeps libraries busy that look at their limits only between two steps.
void TstTransportLimits::floods()
{
    QFETCH(QString, url);
    QFETCH(int, limit);
    QFETCH(bool, proxy);
    QFETCH(QString, warning);
    const WarningLog log;
    if (proxy)
        qputenv("https_proxy", "http://127.0.0.1:" + QByteArray::number(m_proxy.port()));
    const auto start = std::chrono::steady_clock::now();
    isFlooding = false;
    int ticks = 0;
    QTimer ticker;
    connect(&ticker, &QTimer::timeout, this, [&] {
        if (isFlooding && ++ticks == kFlowTicks)
            slowworld::skip(limit);
    });
    ticker.start(kTickMs);
    QString reply;
    QCOMPARE(client()->getRequest(reply, url, QString(), true), 0);
    qunsetenv("https_proxy");
    const int taken = seconds(std::chrono::steady_clock::now() - start);
    QVERIFY2(taken >= limit && taken <= limit + kSlack, qPrintable(QString::number(taken)));
    QVERIFY2(QRegularExpression(warning).match(log.onlyLine()).hasMatch(), qPrintable(log.onlyLine()));
}

void TstTransportLimits::abandonedNameIsNotUsedLater()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    const QString url = QStringLiteral("https://hangs.test:%1/").arg(peer.port());
    const QStringList before = runningThreads();
    slowworld::letTimePass(true);
    QString reply;
    QCOMPARE(client()->getRequest(reply, url, QString(), true), 0);
    slowworld::letTimePass(false);
    const QStringList abandoned = runningThreads(before);
    QCOMPARE(abandoned.size(), 1);
    slowworld::resolveAtOnce();
    QVERIFY(haveEnded(abandoned));
    QCOMPARE(peer.connections(), 0);
}

void TstTransportLimits::replyTimerIsKeptWithinBounds()
{
    HttpClientApi client(nullptr, false);
    for (const int minutes : {0, -1, 61}) {
        const WarningLog log;
        client.setReplyTimer(minutes);
        QVERIFY2(log.onlyLine().contains(QStringLiteral("it stays 2")), qPrintable(log.onlyLine()));
    }
    const WarningLog log;
    client.setReplyTimer(60);
    QCOMPARE(log.lines(), QStringList());
}

QTEST_GUILESS_MAIN(TstTransportLimits)
#include "tst_transport_limits.moc"
