// SPDX-License-Identifier: Apache-2.0
#include "filecontent.h"
#include "fileproxy.h"
#include "isolatedfiles.h"
#include "logcapture.h"
#include "plainfile.h"
#include "wellknownpaths.h"

#include <QTest>

#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

namespace plainfile = vesk::base::plainfile;

namespace {

const QString kPath = QStringLiteral("/tmp/odd/file");
constexpr qint64 kGigabyte = 1024LL * 1024 * 1024;

// Puts something of this kind at `path`.
bool make(const QString &kind, const QString &path)
{
    const QByteArray name = QFile::encodeName(path);
    if (!isolatedfiles::write(path, "content"))
        return false;
    if (kind == QLatin1String("full"))
        return truncate(name.constData(), plainfile::kLongest) == 0;
    if (kind == QLatin1String("huge"))
        return truncate(name.constData(), kGigabyte) == 0;
    if (kind == QLatin1String("plain"))
        return true;
    isolatedfiles::remove(path);
    if (kind == QLatin1String("folder"))
        return QDir().mkpath(path);
    if (kind == QLatin1String("pipe"))
        return mkfifo(name.constData(), S_IRUSR | S_IWUSR) == 0;
    if (kind == QLatin1String("device"))
        return QFile::link(QStringLiteral("/dev/zero"), path);
    if (kind == QLatin1String("dangling link"))
        return QFile::link(QStringLiteral("/tmp/odd/target"), path);
    return kind == QLatin1String("missing");
}

long peakMemoryKib()
{
    rusage usage = {};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

int openDescriptors()
{
    return QDir(QStringLiteral("/proc/self/fd")).entryList(QDir::NoDotAndDotDot | QDir::AllEntries).size();
}

// What a file that a test has opened, or failed to open, lets it do, and what is on the disk afterwards.
QString useAndDescribe(QFile &file)
{
    QStringList result{file.fileName(), QString::number(file.openMode()), QString::number(file.pos()),
                       QString::number(file.error()), file.errorString()};
    if (file.isReadable())
        result.append(QString::fromUtf8(file.read(3)));
    if (file.isWritable())
        result.append(QString::number(file.write("x\n")));
    file.close();
    QFile written(file.fileName());
    if (written.open(QIODevice::ReadOnly))
        result.append(QString::fromUtf8(written.read(100)) + QString::number(written.size()));
    return result.join(QLatin1Char('|'));
}

QString linesAbout(const LogCapture &log)
{
    return log.text().replace(kPath, QStringLiteral("FILE"));
}

} // namespace

// What may stand where a small text file should: nothing of it may hold the program or fill its memory.
class TestPlainFile : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init() { isolatedfiles::remove(QStringLiteral("/tmp/odd")); }

    void opens_data()
    {
        const QString notPlain = QStringLiteral("warning: FILE is not opened: it is no plain file");
        QTest::addColumn<bool>("read");
        QTest::addColumn<QString>("readLog");
        QTest::addColumn<bool>("written");
        QTest::addColumn<QString>("writeLog");

        QTest::newRow("plain") << true << "" << true << "";
        QTest::newRow("missing") << false << "" << true << "";
        QTest::newRow("dangling link") << false << "" << true << "";
        QTest::newRow("folder") << false << "" << false << "";
        QTest::newRow("pipe") << false << notPlain << false << notPlain;
        QTest::newRow("device") << false << notPlain << false << notPlain;
        QTest::newRow("full") << true << "" << true << "";
        QTest::newRow("huge") << false << "warning: FILE is not read: it is longer than 1048576 bytes" << true
                              << "";
    }

    void opens()
    {
        QFETCH(bool, read);
        QFETCH(bool, written);
        QVERIFY(make(QString::fromLatin1(QTest::currentDataTag()), kPath));
        {
            const LogCapture log;
            QFile file(kPath);
            QCOMPARE(plainfile::openToRead(file, QIODevice::ReadOnly), read);
            QCOMPARE(file.isOpen(), read);
            QTEST(linesAbout(log), "readLog");
            QCOMPARE(file.error() == QFileDevice::NoError, read);
            QCOMPARE(file.fileName(), kPath);
            if (read)
                QVERIFY(plainfile::readAll(file).startsWith("content"));
        }
        const LogCapture log;
        QFile file(kPath);
        QCOMPARE(plainfile::open(file, QIODevice::WriteOnly), written);
        QTEST(linesAbout(log), "writeLog");
        if (!written)
            return;
        QCOMPARE(file.write("x"), qint64(1));
        file.close();
        QCOMPARE(isolatedfiles::read(kPath), QByteArray("x"));
    }

    // A proxy's file is as one of QFile's own, whatever the mode; only what may stand there differs.
    void proxyKeepsEveryMode()
    {
        using Device = QIODevice;
        const int open = openDescriptors();
        for (const Device::OpenMode mode : QVector<Device::OpenMode>{
                 Device::NotOpen, Device::ReadOnly, Device::WriteOnly, Device::ReadWrite, Device::Append,
                 Device::ReadOnly | Device::Append, Device::ReadWrite | Device::Truncate,
                 Device::WriteOnly | Device::NewOnly, Device::WriteOnly | Device::ExistingOnly,
                 Device::ReadWrite | Device::ExistingOnly, Device::WriteOnly | Device::Text,
                 Device::ReadWrite | Device::Unbuffered}) {
            for (const char *kind : {"plain", "missing", "folder", "huge", "dangling link"}) {
                const auto description = QStringLiteral("%1, mode %2").arg(QLatin1String(kind)).arg(mode);
                QVERIFY(make(QString::fromLatin1(kind), kPath));
                QFile file(kPath);
                file.open(mode);
                const QString expected = useAndDescribe(file);
                isolatedfiles::remove(QStringLiteral("/tmp/odd"));
                QVERIFY(make(QString::fromLatin1(kind), kPath));
                vesk::base::FileProxy proxy;
                const bool opened = proxy.open(kPath, mode);
                QCOMPARE(proxy.file.isOpen(), opened);
                QCOMPARE(description + useAndDescribe(proxy.file), description + expected);
                isolatedfiles::remove(QStringLiteral("/tmp/odd"));
            }
            for (const char *kind : {"pipe", "device"}) {
                QVERIFY(make(QString::fromLatin1(kind), kPath));
                vesk::base::FileProxy proxy;
                QVERIFY(!proxy.open(kPath, mode));
                QVERIFY(proxy.file.error() == QFileDevice::OpenError && proxy.file.fileName() == kPath);
                QCOMPARE(proxy.file.errorString(), QStringLiteral("is not opened: it is no plain file"));
                isolatedfiles::remove(QStringLiteral("/tmp/odd"));
            }
        }
        QCOMPARE(openDescriptors(), open);
    }

    // The readers behind it, on files that would take a gigabyte or for ever.
    void sparesTheReaders()
    {
        const long before = peakMemoryKib();
        for (const char *kind : {"huge", "pipe", "device", "folder"}) {
            QVERIFY(make(QString::fromLatin1(kind), QString::fromUtf8(vesk::kUserinfoPath)));
            QVERIFY(make(QString::fromLatin1(kind), QString::fromUtf8(vesk::kMachineidPath)));
            bool ok = false;
            QVERIFY(!vesk::base::FileContent::isDomain(&ok));
            QVERIFY(ok);
            QVERIFY(vesk::base::FileContent(nullptr).getMachineID(&ok, true).isEmpty());
            QVERIFY(!ok);
            QVERIFY(!vesk::base::updateUserInfo(QStringLiteral("terminal_name"), QStringLiteral("t")));
        }
        QVERIFY(peakMemoryKib() - before < 64L * 1024);
    }
};

QTEST_GUILESS_MAIN(TestPlainFile)
#include "tst_plainfile.moc"
