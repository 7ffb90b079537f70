// SPDX-License-Identifier: Apache-2.0
#include "pretendedowner.h"
#include "transportfixture.h"

#include <QMutex>
#include <QProcess>
#include <QtTest>

#include <sys/stat.h>
#include <unistd.h>

namespace {

QMutex loadedMutex;
QStringList loadedStores; // files and folders that certificates were loaded from by name

int noteLoaded(const char *path)
{
    const QMutexLocker locker(&loadedMutex);
    loadedStores.append(QString::fromLocal8Bit(path));
    return 1;
}

const QString kVerified = QStringLiteral("verified");
const QString kAsClient = QStringLiteral("verified, with client certificate");
const QString kFirstContact = QStringLiteral("first contact");
const QString kReadable = QStringLiteral("/key.pem is a key that others can read, mode ");

QByteArray damaged(QByteArray pem)
{
    return pem.replace(pem.size() / 2, 8, "--------");
}

} // namespace

// The doors by which libcurl would let a bundle of the system in.
extern "C" {
Q_DECL_EXPORT int X509_STORE_load_file(void *, const char *path)
{
    return noteLoaded(path);
}
Q_DECL_EXPORT int X509_STORE_load_path(void *, const char *path)
{
    return noteLoaded(path);
}
}

// Which servers are believed, and under which files.
class TstTransportTrust : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void configurations_data();
    void configurations();
    void nothingIsConfigured();
    void servers_data();
    void servers();
    void addressIsVerifiedToo();
    void systemBundleIsNotLoaded();
    void firstContactSendsNoBody_data();
    void firstContactSendsNoBody();
    void firstContactEndsWithTheFirstFile();
    void connectionIsNotCarriedOver();
    void samePathWithNewContents();
    void laterAttemptAtAnotherServer();
    void serverRefusesTheClient();

private:
    TransportFixture m_fixture;
    const sandbox::KeyPair m_client = TransportFixture::clientOf(m_fixture.ca);
    const sandbox::CertificateAuthority m_otherCa = TransportFixture::authority(QStringLiteral("Other CA"));

    QString absent() const { return m_fixture.path(QStringLiteral("absent")); }
    QByteArray encrypted(const QByteArray &keyPem) const;
    QByteArray contents(const QString &name, const QString &kind) const;
    QString place(const QString &name, const QString &description) const;
};

QByteArray TstTransportTrust::encrypted(const QByteArray &keyPem) const
{
    const QString plain = m_fixture.file(QStringLiteral("plain.key"), keyPem, 0600);
    QProcess tool;
    tool.start(QStringLiteral("openssl"),
               {QStringLiteral("pkey"), QStringLiteral("-aes128"), QStringLiteral("-in"), plain,
                QStringLiteral("-passout"), QStringLiteral("pass:word")});
    tool.waitForFinished();
    return tool.readAllStandardOutput();
}

QByteArray TstTransportTrust::contents(const QString &name, const QString &kind) const
{
    QByteArray good = name == QStringLiteral("ca")     ? m_fixture.ca.certificatePem()
                      : name == QStringLiteral("cert") ? m_client.certificatePem
                                                       : m_client.keyPem;
    if (kind == QStringLiteral("good"))
        return good;
    if (kind == QStringLiteral("damaged"))
        return damaged(good);
    if (kind == QStringLiteral("half damaged"))
        return good + damaged(good);
    if (kind == QStringLiteral("server"))
        return m_fixture.server.certificatePem;
    if (kind == QStringLiteral("key"))
        return m_fixture.server.keyPem;
    if (kind == QStringLiteral("encrypted"))
        return encrypted(good);
    return kind == QStringLiteral("text") ? "no PEM at all" : "";
}

// Makes the file of a table's description, "kind[:mode[:owner]]", and returns what to name in the
// configuration.
QString TstTransportTrust::place(const QString &name, const QString &description) const
{
    const QStringList parts = description.split(QLatin1Char(':'));
    const QString &kind = parts.first();
    QString path = m_fixture.path(name + QStringLiteral(".pem"));
    const QByteArray local = QFile::encodeName(path);
    ::rmdir(local.constData());
    QFile::remove(path);
    if (kind == QStringLiteral("-"))
        return {};
    if (kind == QStringLiteral("absent"))
        return path;
    if (kind == QStringLiteral("link"))
        return QFile::link(m_fixture.caFile, path) ? path : QString();
    if (kind == QStringLiteral("dangling link"))
        return QFile::link(absent(), path) ? path : QString();
    if (kind == QStringLiteral("folder"))
        return ::mkdir(local.constData(), 0700) == 0 ? path : QString();
    if (kind == QStringLiteral("pipe"))
        return ::mkfifo(local.constData(), 0600) == 0 ? path : QString();

    const mode_t usual = name == QStringLiteral("key") ? 0600 : 0644;
    const mode_t mode = parts.size() > 1 ? parts.at(1).toUInt(nullptr, 8) : usual;
    m_fixture.file(name + QStringLiteral(".pem"), contents(name, kind), mode);
    if (parts.size() > 2)
        PretendedOwner::giveTo(local.toStdString(), parts.at(2).toUInt());
    return path;
}

void TstTransportTrust::configurations_data()
{
    QTest::addColumn<QString>("ca");
    QTest::addColumn<QString>("certificate");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("outcome"); // one of three, or what the refusal or the advice says
    const auto row = [](const char *ca, const char *certificate, const char *key, const QString &outcome) {
        const QByteArray name = QByteArray(ca) + ", " + certificate + ", " + key;
        QTest::newRow(name.constData()) << QString::fromLatin1(ca) << QString::fromLatin1(certificate)
                                        << QString::fromLatin1(key) << outcome;
    };
    const QString noCa = QStringLiteral("CA file .*/ca.pem does not exist");
    const QString noCertificate = QStringLiteral("CA file .*/ca.pem: holds no certificate");
    const QString link = QStringLiteral(".pem is a symbolic link");
    const QString noPlainFile = QStringLiteral("/ca.pem is no plain file");
    const QString open = QStringLiteral(".pem can be written by others");
    const QString foreign = QStringLiteral(".pem belongs to another user");
    const QString readable = kReadable + QStringLiteral("0%1; best is .*0640.*0600$");
    const QString half = QStringLiteral(".pem does not exist, though");
    const QString noPair =
        QStringLiteral("client certificate .*/cert.pem: damaged, or its key does not belong");
    const QString alone = QStringLiteral("only used together");

    row("good", "-", "-", kVerified);
    row("good:0644:0", "-", "-", kVerified);
    row("server", "-", "-", kVerified);
    row("absent", "-", "-", noCa);
    row("empty", "-", "-", QStringLiteral("/ca.pem is empty"));
    row("text", "-", "-", noCertificate);
    row("damaged", "-", "-", noCertificate);
    row("half damaged", "-", "-", noCertificate);
    row("key", "-", "-", noCertificate);
    row("link", "-", "-", link);
    row("dangling link", "-", "-", link);
    row("folder", "-", "-", noPlainFile);
    row("pipe", "-", "-", noPlainFile);
    row("good:0664", "-", "-", open);
    row("good:0646", "-", "-", open);
    row("good:0644:1001", "-", "-", foreign);

    row("good", "good", "good", kAsClient);
    row("good", "good", "good:0640:0", kAsClient);
    row("good", "absent", "absent", kVerified);
    row("absent", "absent", "absent", kFirstContact);
    row("absent", "good", "good", noCa);
    row("absent", "good", "absent", noCa);
    row("absent", "absent", "good", noCa);
    row("empty", "absent", "absent", QStringLiteral("/ca.pem is empty"));
    row("dangling link", "absent", "absent", link);
    row("absent", "dangling link", "absent", link);
    row("-", "good", "good", QStringLiteral("without a CA file"));
    row("-", "absent", "absent", QStringLiteral("without a CA file"));
    row("-", "-", "-", QStringLiteral("no CA file is configured"));
    row("good", "good", "-", alone);
    row("good", "-", "good", alone);
    row("absent", "absent", "-", alone);
    row("good", "good", "absent", QStringLiteral("/key") + half);
    row("good", "absent", "good", QStringLiteral("/cert") + half);
    row("good", "good", "good:0640", readable.arg(640));
    row("good", "good", "good:0644", readable.arg(644));
    row("good", "good", "good:0644:0", readable.arg(644));
    row("good", "good", "good:0604:0", readable.arg(604));
    row("good", "good", "good:0660:0", open);
    row("good", "good", "good:0602", open);
    row("good", "good", "good:0600:1001", foreign);
    row("good", "good:0666", "good", open);
    row("good", "text", "good", noPair);
    row("good", "good", "damaged", noPair);
    row("good", "good", "key", noPair); // of another certificate
    row("good", "good", "encrypted", noPair);
}

void TstTransportTrust::configurations()
{
    QFETCH(QString, ca);
    QFETCH(QString, certificate);
    QFETCH(QString, key);
    QFETCH(QString, outcome);
    const PretendedOwner pretended;
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")), TlsPeer::Style::Tls,
                       m_fixture.ca.certificatePem());
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(place(QStringLiteral("ca"), ca), place(QStringLiteral("cert"), certificate),
                        place(QStringLiteral("key"), key));
    const WarningLog log;
    QString reply;
    const int status = client.getRequest(reply, peer.url(), QString(), true);

    const bool advised = outcome.startsWith(kReadable);
    const bool asClient = outcome == kAsClient || advised;
    const bool made = outcome == kVerified || outcome == kFirstContact || asClient;
    QCOMPARE(status, made ? 200 : 0);
    QCOMPARE(peer.connections(), made ? 1 : 0);
    QCOMPARE(peer.record().clientName, asClient ? QStringLiteral("terminal-identity") : QString());
    if (advised) // at the first call only
        QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 200);
    const QString call = QStringLiteral("GET https://localhost:%1/: ").arg(peer.port());
    if (outcome == kFirstContact) {
        const QString fingerprint = sandbox::certificateFingerprint(m_fixture.server.certificatePem);
        QVERIFY2(log.onlyLine().startsWith(call) && log.onlyLine().endsWith(fingerprint),
                 qPrintable(log.onlyLine()));
    } else if (made && !advised) {
        QCOMPARE(log.lines(), QStringList());
    } else {
        const QString stage = advised ? QString() : QStringLiteral("nothing was sent: ");
        const QRegularExpression line(QLatin1Char('^') + call + stage + QStringLiteral(".*") + outcome);
        QVERIFY2(line.match(log.onlyLine()).hasMatch(), qPrintable(log.onlyLine()));
    }
}

void TstTransportTrust::nothingIsConfigured()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    HttpClientApi client(nullptr, false);
    const WarningLog log;
    QString reply;
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 0);
    QCOMPARE(peer.connections(), 0);
    QVERIFY2(log.onlyLine().contains(QStringLiteral("nothing was sent")), qPrintable(log.onlyLine()));
}

void TstTransportTrust::servers_data()
{
    QTest::addColumn<QByteArray>("certificate");
    QTest::addColumn<QByteArray>("key");
    QTest::addColumn<QString>("reason"); // empty: believed
    const auto row = [](const char *name, const sandbox::KeyPair &server, const char *reason) {
        QTest::newRow(name) << server.certificatePem << server.keyPem << QString::fromLatin1(reason);
    };
    const QStringList localhost{QStringLiteral("localhost")};
    const QDateTime now = QDateTime::currentDateTimeUtc();
    const sandbox::CertificateAuthority &ca = m_fixture.ca;
    row("good", m_fixture.server, "");
    row("wrong name", *ca.issueServer({QStringLiteral("elsewhere.test")}, nullptr), "localhost");
    row("name in the subject only",
        *ca.issueServer({QStringLiteral("elsewhere.test"), QStringLiteral("10.1.1.1")}, nullptr),
        "localhost");
    row("expired", TransportFixture::serverOf(ca, {now.addDays(-9), now.addSecs(-5)}),
        "certificate has expired");
    row("not yet valid", TransportFixture::serverOf(ca, {now.addDays(1), now.addDays(9)}), "not yet valid");
    row("self-signed", *sandbox::CertificateAuthority::selfSigned(localhost, nullptr),
        "self-signed certificate");
    row("other issuer", TransportFixture::serverOf(m_otherCa), "unable to get local issuer certificate");
    row("issuer of the same name",
        TransportFixture::serverOf(TransportFixture::authority(QStringLiteral("Test CA"))), ".");
    row("client certificate", m_client, ".");
}

void TstTransportTrust::servers()
{
    QFETCH(QByteArray, certificate);
    QFETCH(QByteArray, key);
    QFETCH(QString, reason);
    const TlsPeer peer({certificate, key}, always(httpReply(200, "{}")));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(m_fixture.caFile, QString(), QString());
    const WarningLog log;
    QString reply;
    const int status = client.postRequest(reply, peer.url(), QStringLiteral("{\"password\":1}"), true);
    if (reason.isEmpty()) {
        QCOMPARE(status, 200);
        return;
    }
    QCOMPARE(status, 0);
    QCOMPARE(peer.requests().size(), 0);
    const QRegularExpression refusal(
        QStringLiteral(": nothing was sent: the server's certificate does not pass under CA file %1: .*%2")
            .arg(QRegularExpression::escape(m_fixture.caFile), reason));
    QVERIFY2(refusal.match(log.onlyLine()).hasMatch(), qPrintable(log.onlyLine()));
}

void TstTransportTrust::addressIsVerifiedToo()
{
    const auto server = m_fixture.ca.issueServer({QStringLiteral("127.0.0.1")}, nullptr);
    const TlsPeer peer(*server, always(httpReply(200, "{}")));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(m_fixture.caFile, QString(), QString());
    QString reply;
    const QString byAddress = QStringLiteral("https://127.0.0.1:%1/").arg(peer.port());
    QCOMPARE(client.getRequest(reply, byAddress, QString(), true), 200);
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 0);
}

void TstTransportTrust::systemBundleIsNotLoaded()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(m_fixture.caFile, QString(), QString());
    QString reply;
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 200);
    client.setSSLConfig(absent(), absent(), absent());
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 200);
    QCOMPARE(loadedStores, QStringList());
}

void TstTransportTrust::firstContactSendsNoBody_data()
{
    QTest::addColumn<bool>("post");
    QTest::addColumn<QString>("body");
    QTest::newRow("POST") << true << "{\"password\":1}";
    QTest::newRow("POST without body") << true << "";
    QTest::newRow("GET with body") << false << "{\"password\":1}";
}

void TstTransportTrust::firstContactSendsNoBody()
{
    QFETCH(bool, post);
    QFETCH(QString, body);
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(absent(), absent(), absent());
    const WarningLog log;
    QString reply;
    QCOMPARE(post ? client.postRequest(reply, peer.url(), body, true)
                  : client.getRequest(reply, peer.url(), body, true),
             0);
    QCOMPARE(peer.connections(), 0);
    QVERIFY2(log.onlyLine().contains(QStringLiteral("only a GET without body")), qPrintable(log.onlyLine()));
}

void TstTransportTrust::firstContactEndsWithTheFirstFile()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    const QString key = place(QStringLiteral("key"), QStringLiteral("absent"));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(absent(), absent(), key);
    QString reply;
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 200);
    place(QStringLiteral("key"), QStringLiteral("good"));
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 0);
    QCOMPARE(peer.connections(), 1);
}

// The server shows a certificate that nobody vouches for, hands out a CA of its own and keeps the connection
// open.
void TstTransportTrust::connectionIsNotCarriedOver()
{
    const auto shown = sandbox::CertificateAuthority::selfSigned({QStringLiteral("localhost")}, nullptr);
    const TlsPeer peer(*shown, always(httpReply(200, m_otherCa.certificatePem()), PeerAnswer::End::KeepOpen));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(absent(), absent(), absent());
    QString ca;
    QCOMPARE(client.getRequest(ca, peer.url(), QString(), true), 200);

    client.setSSLConfig(m_fixture.file(QStringLiteral("stored.crt"), ca.toUtf8()), QString(), QString());
    QString reply;
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 0);
    QCOMPARE(peer.requests().size(), 1);
    QCOMPARE(peer.connections(), 2);
}

void TstTransportTrust::samePathWithNewContents()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}"), PeerAnswer::End::KeepOpen));
    const QString name = QStringLiteral("renewed.crt");
    HttpClientApi client(nullptr, false);
    QString reply;
    client.setSSLConfig(m_fixture.file(name, m_fixture.ca.certificatePem()), QString(), QString());
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 200);
    client.setSSLConfig(m_fixture.file(name, m_otherCa.certificatePem()), QString(), QString());
    QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 0);
    QCOMPARE(peer.requests().size(), 1);
}

void TstTransportTrust::laterAttemptAtAnotherServer()
{
    const TlsPeer first(m_fixture.server, always(httpReply(200, m_fixture.ca.certificatePem())));
    const TlsPeer second(TransportFixture::serverOf(m_otherCa), always(httpReply(200, "{}")));
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(absent(), absent(), absent());
    QString ca;
    QCOMPARE(client.getRequest(ca, first.url(), QString(), true), 200);
    const QString stored = m_fixture.file(QStringLiteral("stored.crt"), ca.toUtf8());
    client.setSSLConfig(stored, QString(), QString());

    const WarningLog log;
    QString reply;
    QCOMPARE(client.getRequest(reply, second.url(), QString(), true), 0);
    QCOMPARE(second.requests().size(), 0);
    QVERIFY2(log.onlyLine().contains(QStringLiteral("does not pass under CA file ") + stored),
             qPrintable(log.onlyLine()));
    QCOMPARE(client.getRequest(reply, first.url(), QString(), true), 200);
}

// With TLS 1.3 the request is under way before the server says so, which then closes as it likes.
void TstTransportTrust::serverRefusesTheClient()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")), TlsPeer::Style::ClientsOnly,
                       m_fixture.ca.certificatePem());
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(m_fixture.caFile, QString(), QString());
    const WarningLog log;
    QString reply;
    QCOMPARE(client.postRequest(reply, peer.url(), QStringLiteral("{}"), true), 0);
    QCOMPARE(peer.requests().size(), 0);
    QVERIFY2(log.onlyLine().contains(QStringLiteral("sent")), qPrintable(log.onlyLine()));
}

QTEST_GUILESS_MAIN(TstTransportTrust)
#include "tst_transport_trust.moc"
