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

const QByteArray kRecord = R"({"is_Domain": true, "server_host": "localhost"})";

// What the enrolment client stages after a successful join.
class Credentials
{
public:
    Credentials()
        : m_ca(CertificateAuthority::create(QStringLiteral("Test CA"), nullptr))
        , terminal(*m_ca->issueClient(QStringLiteral("terminal"), nullptr))
        , other(*m_ca->issueClient(QStringLiteral("other"), nullptr))
        , ca(m_ca->certificatePem())
    {
    }

private:
    std::optional<CertificateAuthority> m_ca;

public:
    KeyPair terminal;
    KeyPair other;
    QByteArray ca;
};

const Credentials &credentials()
{
    static const Credentials made;
    return made;
}

bool replace(const QString &path, const QByteArray &content)
{
    QFile::remove(path);
    return ServiceFixture::write(path, content);
}

} // namespace

Q_DECLARE_METATYPE(Change)

// Which staged files are installed, and what a removal leaves.
class TestVeskg : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void cleanup() { m_fixture.reset(); }

    void copyConfigInstalls();
    void copyConfigRefuses_data();
    void copyConfigRefuses();
    void removeTakesAway();
    void removeNeedsARecord();
    void resultIsScripted();
    void unknownOperation();

private:
    int onDomainConfig(const char *operation) const;
    QString staging() const { return m_fixture->state().inside(QStringLiteral("/tmp/vesk/")); }
    QString installed(const char *name) const
    {
        return m_fixture->state().inside(QStringLiteral("/etc/vesk/")) + QLatin1String(name);
    }
    QStringList installedFiles() const
    {
        return QDir(installed(""))
            .entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot, QDir::Name);
    }
    void begin(const QByteArray &scenario = "{}");

    std::unique_ptr<ServiceFixture> m_fixture;
};

void TestVeskg::init()
{
    begin();
}

void TestVeskg::begin(const QByteArray &scenario)
{
    m_fixture.reset();
    m_fixture = std::make_unique<ServiceFixture>(scenario);
    QCOMPARE(m_fixture->start({QStringLiteral("veskg")}), QString());
    // What a terminal's image brings would hide what is installed, or not.
    QVERIFY(QDir(installed("")).removeRecursively() && QDir().mkpath(installed("")));
    QVERIFY(QDir().mkpath(staging()));
    QVERIFY(replace(staging() + QStringLiteral("clientapi_ca.crt"), credentials().ca));
    QVERIFY(replace(staging() + QStringLiteral("client.crt"), credentials().terminal.certificatePem));
    QVERIFY(replace(staging() + QStringLiteral("client.key"), credentials().terminal.keyPem));
    QVERIFY(replace(staging() + QStringLiteral("userinfo.json"), kRecord));
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
    QCOMPARE(onDomainConfig("join"), 0);
    QCOMPARE(onDomainConfig("copyConfig"), 0);
    QCOMPARE(ServiceFixture::read(installed("userinfo.json")), kRecord);
    QCOMPARE(ServiceFixture::read(installed("clientapi_ca.crt")), credentials().ca);
    QCOMPARE(ServiceFixture::read(installed("MOS_Vesk.pem")), credentials().terminal.certificatePem);
    QCOMPARE(ServiceFixture::read(installed(".MOS_Vesk.key")), credentials().terminal.keyPem);
    QCOMPARE(QFile::permissions(installed(".MOS_Vesk.key")) & (QFile::ReadGroup | QFile::ReadOther),
             QFile::Permissions());
    QCOMPARE(
        m_fixture->journal(),
        (QStringList{QStringLiteral("bus       com.morvek.vesk.veskg onDomainConfig(\"join\") -> 0"),
                     QStringLiteral("file      installed /etc/vesk/clientapi_ca.crt"),
                     QStringLiteral("file      installed /etc/vesk/MOS_Vesk.pem"),
                     QStringLiteral("file      installed /etc/vesk/.MOS_Vesk.key"),
                     QStringLiteral("file      installed /etc/vesk/userinfo.json"),
                     QStringLiteral("bus       com.morvek.vesk.veskg onDomainConfig(\"copyConfig\") -> 0")}));
}

void TestVeskg::copyConfigRefuses_data()
{
    QTest::addColumn<Change>("change");
    QTest::addColumn<QString>("refused");
    const auto row = [](const char *name, const Change &change, const char *refused) {
        QTest::newRow(name) << change << QStringLiteral("file      refused ") + QLatin1String(refused);
    };
    const auto with = [](const char *name, const QByteArray &content) {
        return [name, content](const QString &staging) {
            return replace(staging + QLatin1String(name), content);
        };
    };
    const auto withMode = [](const char *name, mode_t mode) {
        return [name, mode](const QString &staging) {
            return ::chmod(QFile::encodeName(staging + QLatin1String(name)).constData(), mode) == 0;
        };
    };
    row(
        "record missing",
        [](const QString &staging) { return QFile::remove(staging + QStringLiteral("userinfo.json")); },
        "/etc/vesk/userinfo.json: /tmp/vesk/userinfo.json cannot be opened: No such file or directory");
    row("record no JSON", with("userinfo.json", "{"),
        "/etc/vesk/userinfo.json: /tmp/vesk/userinfo.json is no terminal record");
    row("record without flag", with("userinfo.json", "{\"is_Domain\": 1}"),
        "/etc/vesk/userinfo.json: /tmp/vesk/userinfo.json is no terminal record");
    row("empty certificate", with("client.crt", ""),
        "/etc/vesk/MOS_Vesk.pem: /tmp/vesk/client.crt holds no certificate");
    row("CA no certificate",
        with("clientapi_ca.crt", "-----BEGIN CERTIFICATE-----\nAAAA\n-----END CERTIFICATE-----\n"),
        "/etc/vesk/clientapi_ca.crt: /tmp/vesk/clientapi_ca.crt holds no certificate");
    row("empty key", with("client.key", ""),
        "/etc/vesk/.MOS_Vesk.key: /tmp/vesk/client.key holds no private key");
    row("key of another certificate", with("client.key", credentials().other.keyPem),
        "/etc/vesk/.MOS_Vesk.key: the key belongs to another certificate");
    row("writable by others", withMode("client.key", 0622),
        "/etc/vesk/.MOS_Vesk.key: /tmp/vesk/client.key is writable by others");
    row("folder writable by others", withMode("", 0777),
        "/etc/vesk/userinfo.json: /tmp/vesk/userinfo.json lies in a folder that is writable by others");
    row(
        "link",
        [](const QString &staging) {
            return QFile::rename(staging + QStringLiteral("client.key"),
                                 staging + QStringLiteral("elsewhere")) &&
                   QFile::link(staging + QStringLiteral("elsewhere"), staging + QStringLiteral("client.key"));
        },
        "/etc/vesk/.MOS_Vesk.key: /tmp/vesk/client.key cannot be opened: Too many levels of symbolic links");
    row(
        "folder is a link",
        [](const QString &staging) {
            const QString folder = staging.chopped(1);
            return QDir().rename(folder, folder + QStringLiteral("-2")) &&
                   QFile::link(folder + QStringLiteral("-2"), folder);
        },
        "/etc/vesk/userinfo.json: /tmp/vesk/userinfo.json lies in a folder that cannot be opened: Not a "
        "directory");
    row(
        "named pipe",
        [](const QString &staging) {
            const QByteArray path = QFile::encodeName(staging + QStringLiteral("client.crt"));
            return ::unlink(path.constData()) == 0 && ::mkfifo(path.constData(), 0600) == 0;
        },
        "/etc/vesk/MOS_Vesk.pem: /tmp/vesk/client.crt is no plain file");
    row("too large", with("userinfo.json", QByteArray(1024 * 1024 + 1, ' ')),
        "/etc/vesk/userinfo.json: /tmp/vesk/userinfo.json is larger than 1048576 bytes");
    if (::getuid() == 0)
        row(
            "of another user",
            [](const QString &staging) {
                return ::chown(QFile::encodeName(staging + QStringLiteral("client.crt")).constData(), 65534,
                               65534) == 0;
            },
            "/etc/vesk/MOS_Vesk.pem: /tmp/vesk/client.crt belongs to another user");
}

// One bad file, and none is installed.
void TestVeskg::copyConfigRefuses()
{
    QFETCH(Change, change);
    QFETCH(QString, refused);
    QVERIFY(change(staging()));
    QCOMPARE(onDomainConfig("copyConfig"), -1);
    QVERIFY2(m_fixture->journal().contains(refused),
             qPrintable(m_fixture->journal().join(QLatin1Char('\n'))));
    QCOMPARE(installedFiles(), QStringList());
}

void TestVeskg::removeTakesAway()
{
    QCOMPARE(onDomainConfig("copyConfig"), 0);
    const QByteArray left = R"({"is_Domain": false})";
    QVERIFY(replace(staging() + QStringLiteral("userinfo.json"), left));
    QVERIFY(replace(installed("config.ini"), "[config]\n"));
    QCOMPARE(onDomainConfig("remove"), 0);
    QCOMPARE(installedFiles(), (QStringList{QStringLiteral("config.ini"), QStringLiteral("userinfo.json")}));
    QCOMPARE(ServiceFixture::read(installed("userinfo.json")), left);
    QVERIFY(m_fixture->journal().contains(QStringLiteral("file      removed /etc/vesk/.MOS_Vesk.key")));
    // Once more, with nothing left to take away.
    QCOMPARE(onDomainConfig("remove"), 0);
}

void TestVeskg::removeNeedsARecord()
{
    QCOMPARE(onDomainConfig("copyConfig"), 0);
    QVERIFY(QFile::remove(staging() + QStringLiteral("userinfo.json")));
    QCOMPARE(onDomainConfig("remove"), -1);
    QCOMPARE(installedFiles().size(), 4);
}

void TestVeskg::resultIsScripted()
{
    begin(
        R"({"services": {"veskg": {"result": 5, "operations": {"copyConfig": {"error": "org.example.Full"}}}}})");
    QCOMPARE(onDomainConfig("join"), 5);
    QCOMPARE(onDomainConfig("copyConfig"), -99);
    QCOMPARE(installedFiles(), QStringList());
    QCOMPARE(m_fixture->journal().last(),
             QStringLiteral(
                 "bus       com.morvek.vesk.veskg onDomainConfig(\"copyConfig\") -> error org.example.Full"));
}

void TestVeskg::unknownOperation()
{
    QCOMPARE(onDomainConfig("Join"), -1);
    QCOMPARE(onDomainConfig(""), -1);
}

QTEST_GUILESS_MAIN(TestVeskg)
#include "tst_veskg.moc"
