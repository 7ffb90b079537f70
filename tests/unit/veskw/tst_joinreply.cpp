// SPDX-License-Identifier: Apache-2.0
#include "joinreply.h"
#include "pemfile.h"

#include <QTest>

class TestJoinReply : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void filesAreReadable()
    {
        const auto isReadable = [](qint64 keySize, qint64 certificateSize) {
            return JoinReply{QString::fromLatin1(QByteArray(int(keySize), 'k').toBase64()),
                             QString::fromLatin1(QByteArray(int(certificateSize), 'c').toBase64()),
                             {},
                             {}}
                .hasReadableFiles();
        };
        const qint64 limit = PemFile::kMaxSize; // of the transport, which reads them
        QVERIFY(isReadable(limit, limit));
        QVERIFY(!isReadable(limit + 1, limit));
        QVERIFY(!isReadable(limit, limit + 1));
    }
};

QTEST_GUILESS_MAIN(TestJoinReply)
#include "tst_joinreply.moc"
