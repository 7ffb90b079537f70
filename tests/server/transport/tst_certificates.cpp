// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"

#include <QTemporaryDir>
#include <QtTest>

#include <array>
#include <vector>

using sandbox::CertificateAuthority;

namespace {

CertificateAuthority authority(const QString &name)
{
    return *CertificateAuthority::create(name, nullptr);
}

} // namespace

// What the sandbox and the tests prove by using it is left out here.
class TstCertificates : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void keysArePrivate();
    void loadRefuses();

private:
    QTemporaryDir m_directory;

    QString path(const QString &name) const { return m_directory.filePath(name); }
};

void TstCertificates::keysArePrivate()
{
    const QString caPath = path(QStringLiteral("private.crt"));
    const QString keyPath = path(QStringLiteral("private.key"));
    QVERIFY(sandbox::smallfile::write(keyPath, "old", sandbox::FileAccess::Everyone, nullptr));
    QVERIFY(authority(QStringLiteral("Private")).save(caPath, keyPath, nullptr));
    const auto everyone = QFile::ReadGroup | QFile::ReadOther | QFile::WriteGroup | QFile::WriteOther;
    QCOMPARE(QFile::permissions(keyPath) & everyone, QFile::Permissions());
    QCOMPARE(QFile::permissions(caPath) & everyone, QFile::ReadGroup | QFile::ReadOther);
}

void TstCertificates::loadRefuses()
{
    const QString good = path(QStringLiteral("good.crt"));
    const QString goodKey = path(QStringLiteral("good.key"));
    const QString server = path(QStringLiteral("server.crt"));
    const QString serverKey = path(QStringLiteral("server.key"));
    const QString absent = path(QStringLiteral("absent"));
    QVERIFY(authority(QStringLiteral("Good")).save(good, goodKey, nullptr));
    QVERIFY(CertificateAuthority::selfSigned({QStringLiteral("localhost")}, nullptr)
                .value()
                .save(server, serverKey, nullptr));
    QVERIFY(CertificateAuthority::load(good, goodKey, nullptr).has_value());
    for (const auto &[certificate, key, refused] :
         std::vector<std::array<QString, 3>>{{absent, goodKey, absent},
                                             {good, absent, absent},
                                             {goodKey, goodKey, goodKey}, // holds no certificate
                                             {server, serverKey, server}, // is no authority's
                                             {good, serverKey, serverKey}}) {
        QString error;
        QVERIFY(!CertificateAuthority::load(certificate, key, &error).has_value());
        QVERIFY2(error.startsWith(refused + QLatin1Char(':')), qPrintable(error));
    }
}

QTEST_GUILESS_MAIN(TstCertificates)
#include "tst_certificates.moc"
