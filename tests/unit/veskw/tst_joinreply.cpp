// SPDX-License-Identifier: Apache-2.0
#include "joinreply.h"
#include "pemfile.h"

#include <QTest>

class TestJoinReply : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void filesAreReadable_data()
    {
        QTest::addColumn<int>("keySize"); // more than the transport reads
        QTest::addColumn<int>("certificateSize");
        QTest::addColumn<bool>("isReadable");
        QTest::newRow("as long as can be read") << 0 << 0 << true;
        QTest::newRow("key is longer") << 1 << 0 << false;
        QTest::newRow("certificate is longer") << 0 << 1 << false;
    }

    void filesAreReadable()
    {
        QFETCH(int, keySize);
        QFETCH(int, certificateSize);
        QFETCH(bool, isReadable);
        const auto base64 = [](int beyond) {
            const QByteArray content(int(PemFile::kMaxSize) + beyond, 'k');
            return QString::fromLatin1(content.toBase64());
        };
        const JoinReply reply{base64(keySize), base64(certificateSize), {}, {}};
        QCOMPARE(reply.hasReadableFiles(), isReadable);
    }
};

QTEST_GUILESS_MAIN(TestJoinReply)
#include "tst_joinreply.moc"
