// SPDX-License-Identifier: Apache-2.0
#include "filecontent.h"
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
        QTest::newRow("pipe") << false << notPlain << false << "";
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
            QCOMPARE(plainfile::open(file, QIODevice::ReadOnly), read);
            QCOMPARE(file.isOpen(), read);
            QTEST(linesAbout(log), "readLog");
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
