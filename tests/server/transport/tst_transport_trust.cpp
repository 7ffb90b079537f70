// SPDX-License-Identifier: Apache-2.0
#include "pretendedowner.h"
#include "transportfixture.h"

#include <QProcess>
#include <QtTest>

#include <sys/stat.h>
#include <unistd.h>

namespace {

QStringList loadedStores; // files and directories that certificates were loaded from by name

int noteLoaded(const char *path)
{
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
Q_DECLARE_METATYPE(sandbox::KeyPair)

// The ways by which libcurl would accept a bundle of the system.
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

// Which servers are trusted, and under which files.
class TstTransportTrust : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void configurations_data();
    void configurations();
    void servers_data();
    void servers();
    void systemBundleIsNotLoaded();
    void firstContactSendsNoBody();
    void firstContactEndsWithTheFirstFile();
    void anotherCaCountsAtOnce();
    void serverRefusesTheClient();

private:
    TransportFixture m_fixture;
    const sandbox::KeyPair m_client = m_fixture.ca.issueClient(QStringLiteral("terminal-identity"));
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
    const QByteArray good = name == QStringLiteral("ca")     ? m_fixture.ca.certificatePem()
                            : name == QStringLiteral("cert") ? m_client.certificatePem
                                                             : m_client.keyPem;
    const QMap<QString, QByteArray> all{{QStringLiteral("good"), good},
                                        {QStringLiteral("half damaged"), good + damaged(good)},
                                        {QStringLiteral("damaged"), damaged(good)},
                                        {QStringLiteral("server"), m_fixture.server.certificatePem},
                                        {QStringLiteral("key"), m_fixture.server.keyPem},
                                        {QStringLiteral("text"), "no PEM at all"}};
    return kind == QStringLiteral("encrypted") ? encrypted(good) : all.value(kind);
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
    if (kind == QStringLiteral("directory"))
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
    const QString notRegular = QStringLiteral("/ca.pem is not a regular file");
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
    row("half damaged", "-", "-", noCertificate);
    row("key", "-", "-", noCertificate);
    row("link", "-", "-", link);
    row("directory", "-", "-", notRegular);
    row("pipe", "-", "-", notRegular);
    row("good:0664", "-", "-", open);
    row("good:0646", "-", "-", open);
    row("good:0644:1001", "-", "-", foreign);

    row("good", "good", "good", kAsClient);
    row("good", "good", "good:0640:0", kAsClient);
    row("good", "absent", "absent", kVerified);
    row("absent", "absent", "absent", kFirstContact);
    row("absent", "good", "absent", noCa);
    row("absent", "absent", "good", noCa);
    row("dangling link", "absent", "absent", link);
    row("absent", "dangling link", "absent", link);
    row("-", "good", "good", QStringLiteral("without a CA file"));
    row("-", "absent", "absent", QStringLiteral("without a CA file"));
    row("-", "-", "-", QStringLiteral("no CA file is configured"));
    row("good", "good", "-", alone);
    row("good", "-", "good", alone);
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
    if (ca + certificate + key != QStringLiteral("---")) // otherwise nothing was ever configured
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
        const QByteArray hash = QCryptographicHash::hash(
            sandbox::certificateDer(m_fixture.server.certificatePem), QCryptographicHash::Sha256);
        const QString fingerprint = QString::fromLatin1(hash.toHex(':').toUpper());
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

void TstTransportTrust::servers_data()
{
    QTest::addColumn<sandbox::KeyPair>("server");
    QTest::addColumn<QString>("host");
    QTest::addColumn<QString>("reason"); // empty: trusted
    const QString address = QStringLiteral("127.0.0.1");
    const auto row = [](const char *name, const sandbox::KeyPair &server, const char *reason,
                        const QString &host = QStringLiteral("localhost")) {
        QTest::newRow(name) << server << host << QString::fromLatin1(reason);
    };
    const QDateTime now = QDateTime::currentDateTimeUtc();
    const auto valid = [&](const QDateTime &from, const QDateTime &to) {
        return m_fixture.ca.issueServer({QStringLiteral("localhost")}, {from, to});
    };
    const sandbox::KeyPair forAddress = TransportFixture::serverOf(m_fixture.ca, address);
    row("name", m_fixture.server, "");
    row("address", forAddress, "", address);
    row("address only", forAddress, "localhost");
    row("wrong name", TransportFixture::serverOf(m_fixture.ca, QStringLiteral("elsewhere.test")),
        "localhost");
    row("expired", valid(now.addDays(-9), now.addSecs(-5)), "certificate has expired");
    row("not yet valid", valid(now.addDays(1), now.addDays(9)), "not yet valid");
    row("self-signed", sandbox::CertificateAuthority::selfSigned({QStringLiteral("localhost")}),
        "self-signed certificate");
    row("other issuer", TransportFixture::serverOf(m_otherCa), "unable to get local issuer certificate");
    row("issuer of the same name",
        TransportFixture::serverOf(TransportFixture::authority(QStringLiteral("Test CA"))), ".");
    row("client certificate", m_client, ".");
}

void TstTransportTrust::servers()
{
    QFETCH(sandbox::KeyPair, server);
    QFETCH(QString, host);
    QFETCH(QString, reason);
    const TlsPeer peer(server, always(httpReply(200, "{}")));
    const auto client = m_fixture.client();
    const WarningLog log;
    QString reply;
    const QString url = QStringLiteral("https://%1:%2/").arg(host).arg(peer.port());
    const int status = client->postRequest(reply, url, QStringLiteral("{\"password\":1}"), true);
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

void TstTransportTrust::systemBundleIsNotLoaded()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    const auto client = m_fixture.client();
    QString reply;
    QCOMPARE(client->getRequest(reply, peer.url(), QString(), true), 200);
    client->setSSLConfig(absent(), absent(), absent());
    QCOMPARE(client->getRequest(reply, peer.url(), QString(), true), 200);
    QCOMPARE(loadedStores, QStringList());
}

void TstTransportTrust::firstContactSendsNoBody()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")));
    const QString body = QStringLiteral("{\"password\":1}");
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(absent(), absent(), absent());
    const WarningLog log;
    QString reply;
    QCOMPARE(client.postRequest(reply, peer.url(), body, true), 0);
    QCOMPARE(client.postRequest(reply, peer.url(), QString(), true), 0);
    QCOMPARE(client.getRequest(reply, peer.url(), body, true), 0);
    QCOMPARE(peer.connections(), 0);
    QCOMPARE(log.lines().filter(QStringLiteral("only a GET without body")).size(), 3);
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

// After a call that was not verified, or was by another CA, on a connection that the server keeps open.
void TstTransportTrust::anotherCaCountsAtOnce()
{
    const auto shown = sandbox::CertificateAuthority::selfSigned({QStringLiteral("localhost")});
    const QString path = m_fixture.path(QStringLiteral("renewed.crt"));
    for (const bool isFirst : {true, false}) {
        const TlsPeer peer(isFirst ? shown : m_fixture.server,
                           always(httpReply(200, "{}"), PeerAnswer::End::KeepOpen));
        HttpClientApi client(nullptr, false);
        client.setSSLConfig(path, isFirst ? absent() : QString(), isFirst ? absent() : QString());
        QString reply;
        QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 200);
        m_fixture.file(QStringLiteral("renewed.crt"), m_otherCa.certificatePem());
        client.setSSLConfig(path, QString(), QString());
        QCOMPARE(client.getRequest(reply, peer.url(), QString(), true), 0);
        QCOMPARE(peer.requests().size(), 1);
        QCOMPARE(peer.connections(), 2);
        m_fixture.file(QStringLiteral("renewed.crt"), m_fixture.ca.certificatePem()); // for the second time
    }
}

// With TLS 1.3 the request is under way before the server says so, which then closes as it likes.
void TstTransportTrust::serverRefusesTheClient()
{
    const TlsPeer peer(m_fixture.server, always(httpReply(200, "{}")), TlsPeer::Style::ClientsOnly,
                       m_fixture.ca.certificatePem());
    const auto client = m_fixture.client();
    const WarningLog log;
    QString reply;
    QCOMPARE(client->postRequest(reply, peer.url(), QStringLiteral("{}"), true), 0);
    QCOMPARE(peer.requests().size(), 0);
    QVERIFY2(log.onlyLine().contains(QStringLiteral("sent")), qPrintable(log.onlyLine()));
}

QTEST_GUILESS_MAIN(TstTransportTrust)
#include "tst_transport_trust.moc"
