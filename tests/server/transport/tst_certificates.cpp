// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"

#include <QProcess>
#include <QTemporaryDir>
#include <QtTest>

using sandbox::CertificateAuthority;

namespace {

CertificateAuthority authority(const QString &name)
{
    return *CertificateAuthority::create(name, nullptr);
}

} // namespace

class TstCertificates : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void savedAuthorityIssuesOn();
    void keysArePrivate();
    void loadRefuses_data();
    void loadRefuses();
    void factsOfACertificate();

private:
    QTemporaryDir m_folder;

    QString path(const QString &name) const { return m_folder.filePath(name); }
    bool passes(const QByteArray &certificate, const QString &caPath, const QStringList &options) const;
};

// Judged by OpenSSL's own tool.
bool TstCertificates::passes(const QByteArray &certificate, const QString &caPath,
                             const QStringList &options) const
{
    const QString file = path(QStringLiteral("judged.crt"));
    if (!sandbox::writePemFile(file, certificate, sandbox::FileAccess::Everyone, nullptr))
        return false;
    const QStringList arguments = QStringList{QStringLiteral("verify"), QStringLiteral("-x509_strict"),
                                              QStringLiteral("-CAfile"), caPath} +
                                  options + QStringList{file};
    return QProcess::execute(QStringLiteral("openssl"), arguments) == 0;
}

void TstCertificates::savedAuthorityIssuesOn()
{
    const QString caPath = path(QStringLiteral("on.crt"));
    const QString keyPath = path(QStringLiteral("on.key"));
    QVERIFY(authority(QStringLiteral("Saved")).save(caPath, keyPath, nullptr));
    const auto loaded = CertificateAuthority::load(caPath, keyPath, nullptr);
    QVERIFY(loaded.has_value());

    const auto server = loaded->issueServer(
        {QStringLiteral("uim.test"), QStringLiteral("127.0.0.1"), QStringLiteral("::1")}, nullptr);
    QVERIFY(server.has_value());
    QVERIFY(sandbox::keyFits(server->certificatePem, server->keyPem));
    const QStringList asServer{QStringLiteral("-purpose"), QStringLiteral("sslserver")};
    QVERIFY(passes(server->certificatePem, caPath,
                   asServer + QStringList{QStringLiteral("-verify_hostname"), QStringLiteral("uim.test")}));
    QVERIFY(passes(server->certificatePem, caPath,
                   asServer + QStringList{QStringLiteral("-verify_ip"), QStringLiteral("::1")}));
    QVERIFY(
        !passes(server->certificatePem, caPath,
                asServer + QStringList{QStringLiteral("-verify_hostname"), QStringLiteral("other.test")}));

    const auto client = loaded->issueClient(QStringLiteral("machine"), nullptr);
    QVERIFY(client.has_value());
    QVERIFY(
        passes(client->certificatePem, caPath, {QStringLiteral("-purpose"), QStringLiteral("sslclient")}));
    QVERIFY(!passes(client->certificatePem, caPath, asServer));
    QVERIFY(!sandbox::keyFits(client->certificatePem, server->keyPem));
}

void TstCertificates::keysArePrivate()
{
    const QString caPath = path(QStringLiteral("private.crt"));
    const QString keyPath = path(QStringLiteral("private.key"));
    QVERIFY(sandbox::writePemFile(keyPath, "old", sandbox::FileAccess::Everyone, nullptr));
    QVERIFY(authority(QStringLiteral("Private")).save(caPath, keyPath, nullptr));
    const auto everyone = QFile::ReadGroup | QFile::ReadOther | QFile::WriteGroup | QFile::WriteOther;
    QCOMPARE(QFile::permissions(keyPath) & everyone, QFile::Permissions());
    QCOMPARE(QFile::permissions(caPath) & everyone, QFile::ReadGroup | QFile::ReadOther);
}

void TstCertificates::loadRefuses_data()
{
    const auto other = CertificateAuthority::selfSigned({QStringLiteral("localhost")}, nullptr);
    const QString goodKey = path(QStringLiteral("good.key"));
    const QString good = path(QStringLiteral("good.crt"));
    QVERIFY(authority(QStringLiteral("Good")).save(good, goodKey, nullptr));
    const auto write = [this](const QString &name, const QByteArray &pem) {
        sandbox::writePemFile(path(name), pem, sandbox::FileAccess::OwnerOnly, nullptr);
        return path(name);
    };

    QTest::addColumn<QString>("certificate");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("culprit");
    const QString absent = path(QStringLiteral("absent"));
    const QString text = write(QStringLiteral("text"), "no PEM at all");
    const QString server = write(QStringLiteral("server.crt"), other->certificatePem);
    const QString otherKey = write(QStringLiteral("other.key"), other->keyPem);
    QTest::newRow("no certificate file") << absent << goodKey << absent;
    QTest::newRow("no key file") << good << absent << absent;
    QTest::newRow("damaged certificate") << text << goodKey << text;
    QTest::newRow("no authority") << server << otherKey << server;
    QTest::newRow("key of another") << good << otherKey << otherKey;
}

void TstCertificates::loadRefuses()
{
    QFETCH(QString, certificate);
    QFETCH(QString, key);
    QFETCH(QString, culprit);
    QString error;
    QVERIFY(!CertificateAuthority::load(certificate, key, &error).has_value());
    QVERIFY2(error.startsWith(culprit + QLatin1Char(':')), qPrintable(error));
}

void TstCertificates::factsOfACertificate()
{
    const auto ca = authority(QStringLiteral("Facts"));
    const auto first = ca.issueClient(QStringLiteral("机器-1"), nullptr);
    const auto second = ca.issueClient(QStringLiteral("机器-1"), nullptr);
    QVERIFY(first && second);
    QCOMPARE(sandbox::certificateCommonName(first->certificatePem), QStringLiteral("机器-1"));
    QVERIFY(sandbox::certificateSerial(first->certificatePem) !=
            sandbox::certificateSerial(second->certificatePem));
    const QByteArray digest =
        QCryptographicHash::hash(sandbox::certificateDer(first->certificatePem), QCryptographicHash::Sha256);
    QCOMPARE(sandbox::certificateFingerprint(first->certificatePem),
             QString::fromLatin1(digest.toHex(':').toUpper()));
    QVERIFY(!ca.issueClient(QString(), nullptr).has_value());
}

QTEST_GUILESS_MAIN(TstCertificates)
#include "tst_certificates.moc"
