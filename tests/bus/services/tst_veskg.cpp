// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"
#include "servicefixture.h"

#include <QDBusReply>
#include <QDir>
#include <QtTest>

#include <functional>

#include <sys/stat.h>
#include <unistd.h>

using namespace sandbox;

namespace {

using Change = std::function<bool(const QString &staging)>;

} // namespace

Q_DECLARE_METATYPE(Change)

// Which staged files are installed, and who may read them.
class TestVeskg : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup() { m_fixture.reset(); }

    void copyConfigInstalls();
    void copyConfigRefuses_data();
    void copyConfigRefuses();
    void removeNeedsARecord();

private:
    int onDomainConfig(const char *operation) const;
    QString staging() const { return m_fixture->state().inside(QStringLiteral("/tmp/vesk/")); }
    QDir installed() const { return {m_fixture->state().inside(QStringLiteral("/etc/vesk"))}; }
    QStringList installedFiles() const
    {
        return installed().entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot, QDir::Name);
    }

    std::unique_ptr<ServiceFixture> m_fixture;
    QByteArray m_ca;
    KeyPair m_terminal;
    KeyPair m_other;
};

void TestVeskg::initTestCase()
{
    const auto ca = CertificateAuthority::create(QStringLiteral("Test CA"));
    m_ca = ca.certificatePem();
    m_terminal = ca.issueClient(QStringLiteral("terminal"));
    m_other = ca.issueClient(QStringLiteral("other"));
}

void TestVeskg::init()
{
    m_fixture = std::make_unique<ServiceFixture>(QStringLiteral("veskg"));
    QCOMPARE(m_fixture->start(), QString());
    // What a terminal's image brings would hide what is installed, or not.
    QVERIFY(installed().removeRecursively() && QDir().mkpath(installed().path()) && QDir().mkpath(staging()));
    QVERIFY(smallfile::write(staging() + QStringLiteral("clientapi_ca.crt"), m_ca));
    QVERIFY(smallfile::write(staging() + QStringLiteral("client.crt"), m_terminal.certificatePem));
    QVERIFY(smallfile::write(staging() + QStringLiteral("client.key"), m_terminal.keyPem));
    QVERIFY(smallfile::write(staging() + QStringLiteral("userinfo.json"), R"({"is_Domain": true})"));
}

int TestVeskg::onDomainConfig(const char *operation) const
{
    const QDBusReply<int> reply =
        m_fixture->call("com.morvek.vesk.veskg", "/com/morvek/vesk/veskg", "com.morvek.vesk.veskg",
                        "onDomainConfig", {QLatin1String(operation)});
    return reply.isValid() ? reply.value() : -99;
}

void TestVeskg::copyConfigInstalls()
{
    QCOMPARE(::chmod(QFile::encodeName(staging()).constData(), 01777), 0); // as the package makes it
    QCOMPARE(onDomainConfig("copyConfig"), 0);
    const QString key = installed().filePath(QStringLiteral(".MOS_Vesk.key"));
    QCOMPARE(smallfile::read(key).value_or(""), m_terminal.keyPem);
    QCOMPARE(QFile::permissions(key) & (QFile::ReadGroup | QFile::ReadOther), QFile::Permissions());
    QCOMPARE(installedFiles().size(), 4);
}

void TestVeskg::copyConfigRefuses_data()
{
    QTest::addColumn<Change>("change");
    QTest::addColumn<QString>("refused");
    const auto row = [](const char *name, const char *refused, const Change &change) {
        QTest::newRow(name) << change << QString::fromLatin1(refused);
    };
    const auto with = [](const char *name, const QByteArray &content) {
        return [=](const QString &staging) {
            return smallfile::write(staging + QLatin1String(name), content);
        };
    };
    const auto withMode = [](const char *name, mode_t mode) {
        return [=](const QString &staging) {
            return ::chmod(QFile::encodeName(staging + QLatin1String(name)).constData(), mode) == 0;
        };
    };
    row("record without flag", "userinfo.json is no terminal record",
        with("userinfo.json", "{\"is_Domain\": 1}"));
    row("CA no certificate", "clientapi_ca.crt holds no certificate",
        with("clientapi_ca.crt", "-----BEGIN CERTIFICATE-----\nAAAA\n-----END CERTIFICATE-----\n"));
    row("empty key", "client.key holds no private key", with("client.key", ""));
    row("key of another certificate", "the key belongs to another certificate",
        with("client.key", m_other.keyPem));
    row("too large", "userinfo.json is larger than 1048576 bytes",
        with("userinfo.json", QByteArray(1024 * 1024 + 1, ' ')));
    row("writable by others", "client.key is writable by others", withMode("client.key", 0622));
    row("directory writable by others", "lies in a directory that is writable by others", withMode("", 0777));
    row("link", "cannot be opened: Too many levels of symbolic links", [](const QString &staging) {
        const QString key = staging + QStringLiteral("client.key");
        return QFile::rename(key, staging + QStringLiteral("elsewhere")) &&
               QFile::link(staging + QStringLiteral("elsewhere"), key);
    });
    row("second name", "client.key has another name elsewhere", [](const QString &staging) {
        const QByteArray key = QFile::encodeName(staging + QStringLiteral("client.key"));
        return ::link(key.constData(), (key + "-2").constData()) == 0;
    });
    row("directory is a link", "lies in a directory that cannot be opened", [](const QString &staging) {
        const QString directory = staging.chopped(1);
        return QDir().rename(directory, directory + QStringLiteral("-2")) &&
               QFile::link(directory + QStringLiteral("-2"), directory);
    });
    row("named pipe", "client.crt is not a regular file", [](const QString &staging) {
        const QByteArray path = QFile::encodeName(staging + QStringLiteral("client.crt"));
        return ::unlink(path.constData()) == 0 && ::mkfifo(path.constData(), 0600) == 0;
    });
    if (::getuid() == 0)
        row("of another user", "client.crt belongs to another user", [](const QString &staging) {
            const QByteArray path = QFile::encodeName(staging + QStringLiteral("client.crt"));
            return ::chown(path.constData(), 65534, 65534) == 0;
        });
}

// One bad file, and none is installed.
void TestVeskg::copyConfigRefuses()
{
    QFETCH(Change, change);
    QFETCH(QString, refused);
    QVERIFY(change(staging()));
    QCOMPARE(onDomainConfig("copyConfig"), -1);
    const QString journal = m_fixture->journal().join(QLatin1Char('\n'));
    QVERIFY2(journal.contains(refused), qPrintable(journal));
    QCOMPARE(installedFiles(), QStringList());
}

void TestVeskg::removeNeedsARecord()
{
    QCOMPARE(onDomainConfig("copyConfig"), 0);
    QVERIFY(QFile::remove(staging() + QStringLiteral("userinfo.json")));
    QCOMPARE(onDomainConfig("remove"), -1);
    QCOMPARE(installedFiles().size(), 4);
    QCOMPARE(onDomainConfig("Join"), -1); // no operation
}

QTEST_GUILESS_MAIN(TestVeskg)
#include "tst_veskg.moc"
