// SPDX-License-Identifier: Apache-2.0
#include "filecontent.h"
#include "fileproxy.h"
#include "isolatedfiles.h"
#include "logcapture.h"
#include "regularfile.h"
#include "wellknownpaths.h"

#include <QMap>
#include <QTest>

#include <sys/stat.h>
#include <unistd.h>

namespace regularfile = vesk::base::regularfile;
using vesk::base::FileContent;

namespace {

const QString kPath = QStringLiteral("/tmp/odd/file");

// Puts something of this kind at `path`.
bool make(const QString &kind, const QString &path)
{
    const QByteArray name = QFile::encodeName(path);
    const QMap<QString, qint64> sizes{{QStringLiteral("plain"), 7},
                                      {QStringLiteral("full"), regularfile::kMaxSize},
                                      {QStringLiteral("huge"), regularfile::kMaxSize + 1}};
    if (!isolatedfiles::write(path, "content"))
        return false;
    if (sizes.contains(kind))
        return truncate(name.constData(), sizes.value(kind)) == 0;
    isolatedfiles::remove(path);
    if (kind == QLatin1String("directory"))
        return QDir().mkpath(path);
    if (kind == QLatin1String("pipe"))
        return mkfifo(name.constData(), S_IRUSR | S_IWUSR) == 0;
    if (kind == QLatin1String("device"))
        return QFile::link(QStringLiteral("/dev/zero"), path);
    if (kind == QLatin1String("dangling link"))
        return QFile::link(QStringLiteral("/tmp/odd/target"), path);
    return kind == QLatin1String("missing");
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
        const QString notPlain = QStringLiteral("warning: FILE is not opened: it is not a regular file");
        const QString failed = QStringLiteral("\nwarning: open file failed, file: FILE , mode: OpenMode( "
                                              "WriteOnly ) , exist: true");
        QTest::addColumn<bool>("read");
        QTest::addColumn<QString>("readLog");
        QTest::addColumn<bool>("written");
        QTest::addColumn<QString>("writeLog");

        QTest::newRow("plain") << true << "" << true << "";
        QTest::newRow("missing") << false << "" << true << "";
        QTest::newRow("dangling link") << false << "" << true << "";
        QTest::newRow("directory") << false << "" << false << failed.mid(1);
        QTest::newRow("pipe") << false << notPlain << false << notPlain + failed;
        QTest::newRow("device") << false << notPlain << false << notPlain + failed;
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
            QCOMPARE(regularfile::openToRead(file, QIODevice::ReadOnly), read);
            QTEST(linesAbout(log), "readLog");
            QCOMPARE(file.error() == QFileDevice::NoError, read);
            QCOMPARE(file.fileName(), kPath);
            if (read)
                QVERIFY(regularfile::readAll(file).startsWith("content"));
        }
        const LogCapture log;
        vesk::base::FileProxy proxy;
        QCOMPARE(proxy.open(kPath, QIODevice::WriteOnly), written);
        QTEST(linesAbout(log), "writeLog");
        if (!written)
            return;
        QCOMPARE(proxy.file.write("x"), qint64(1));
        proxy.file.close();
        QCOMPARE(isolatedfiles::read(kPath), QByteArray("x"));
    }

    // What cannot be opened counts as "nothing known" for the readers, as a failure for the writers.
    void isReportedByReadersAndWriters()
    {
        for (const char *kind : {"missing", "huge", "pipe", "device", "directory"}) {
            QVERIFY(make(QString::fromLatin1(kind), QString::fromUtf8(vesk::kUserinfoPath)));
            QVERIFY(make(QString::fromLatin1(kind), QString::fromUtf8(vesk::kMachineidPath)));
            bool ok = false;
            QVERIFY(!FileContent::isDomain(&ok) && ok);
            ok = false;
            QVERIFY(FileContent::getTerminalAlias(&ok).isNull() && ok);
            ok = false;
            QVERIFY(!FileContent::getUserInfo(&ok).isDomain && ok);
            QString host = QStringLiteral("h");
            QString port = QStringLiteral("p");
            QVERIFY(!FileContent::getHostAndPort(host, port) && host + port == QLatin1String("hp"));
            QVERIFY(!FileContent::saveDomain(true));
            QVERIFY(!vesk::base::updateUserInfo(QStringLiteral("terminal_name"), QStringLiteral("t")));
            QVERIFY(FileContent(nullptr).getMachineID(&ok, true).isEmpty() && !ok);
        }
        QVERIFY(!FileContent::saveUserInfo({}));
    }
};

QTEST_GUILESS_MAIN(TestPlainFile)
#include "tst_regularfile.moc"
