// SPDX-License-Identifier: Apache-2.0
#include "boxreader.h"
#include "fileconfig.h"
#include "httprequest.h"
#include "isolatedfiles.h"
#include "localselectwidget.h"
#include "widget.h"

#include "mtk/mspinner.h"
#include "mtk/mtitlebar.h"

#include <QLabel>
#include <QMetaMethod>
#include <QPushButton>
#include <QSignalSpy>
#include <QTest>

namespace {

const QString kNoRights = QStringLiteral("无法解除管控,请联系系统管理员解除域管管控");

QPushButton *confirmButton(const QWidget &panel)
{
    return panel.findChildren<QPushButton *>().at(0);
}

QPushButton *cancelButton(const QWidget &panel)
{
    return panel.findChildren<QPushButton *>().at(1);
}

// What a user sees of the panel.
QString look(const whetherCloseGuard &panel)
{
    const QPushButton *confirm = confirmButton(panel);
    const QPushButton *cancel = cancelButton(panel);
    QStringList parts{panel.findChild<QLabel *>()->text(),
                      QStringLiteral("%1 %2%3")
                          .arg(confirm->text())
                          .arg(confirm->width())
                          .arg(confirm->isEnabled() ? QString() : QStringLiteral(" off"))};
    if (cancel->isVisible())
        parts.append(cancel->text());
    if (panel.findChild<Mtk::Widget::MSpinner *>()->isVisible())
        parts.append(QStringLiteral("spinner"));
    return parts.join(QLatin1Char('|'));
}

const QString kOffer = QStringLiteral("该终端已经加入管控,是否解除管控?|解除 170|取消");
const QString kRemoved = QStringLiteral("当前终端已解除管控，重启后生效|立即重启 170|稍后重启");

} // namespace

// The leave panel and the main window around it. The server and the buses are not there; replies come in
// through the slots of the server client.
class TestLeavePanel : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase()
    {
        qputenv("PATH", "/nonexistent"); // no command of the machine is to be found
        FileConfig::GetInstance()->setIsDomain(true);
    }

    void declaresItsInterfaceInOrder()
    {
        QStringList names;
        const QMetaObject &meta = whetherCloseGuard::staticMetaObject;
        for (int i = meta.methodOffset(); i < meta.methodCount(); ++i)
            names.append(QString::fromLatin1(meta.method(i).methodSignature()));
        QCOMPARE(names.join(QLatin1Char(' ')),
                 QStringLiteral("sigClose() sigCancelgroupFinished() sigRemove(int,QString) sigStartRemove() "
                                "closeGuardCliked() closeCliked() analyseData(QByteArray*) on_reboot() "
                                "onQuitInfo(int,QString) onFinishedRemove() onMacheineCheck(int,QString) "
                                "onbuttonClicked(int,QString)"));
    }

    void opensOnAJoinedTerminal()
    {
        Widget window(nullptr);
        window.show();
        QCOMPARE(window.size(), QSize(380, 140));
        const auto *panel = window.findChild<whetherCloseGuard *>();
        QCOMPARE(panel->pos(), QPoint(0, 0));
        QCOMPARE(look(*panel), kOffer);
        QVERIFY(!window.findChild<Mtk::Widget::MTitlebar *>()->icon().isNull());
        cancelButton(*panel)->click();
        QVERIFY(!window.isVisible());
    }

    void refusesAUserWithoutRights()
    {
        whetherCloseGuard panel(nullptr, false);
        panel.show();
        const QSignalSpy asked(HttpRequest::GetInstance(), &HttpRequest::sigMacheineCheck);
        const BoxReader boxes;
        confirmButton(panel)->click();
        QCOMPARE(boxes.texts(), QStringList{kNoRights});
        QCOMPARE(asked.count(), 0);
    }

    // An empty state reply is silent: no server is there.
    void saysNothingWithoutAStateReply()
    {
        whetherCloseGuard panel(nullptr, true);
        panel.show();
        const BoxReader boxes;
        confirmButton(panel)->click();
        QVERIFY(boxes.texts().isEmpty());
        QCOMPARE(look(panel), kOffer);
    }

    void judgesTheRemovalReply_data()
    {
        QTest::addColumn<int>("status");
        QTest::addColumn<QString>("reply");
        QTest::addColumn<QString>("box"); // null: removed

        const QString network = QStringLiteral("网络异常，请稍后重试");
        QTest::newRow("no answer") << 0 << "" << network;
        QTest::newRow("status before a good body") << 500 << R"({"data":{"result":true}})" << network;
        QTest::newRow("no JSON") << 200 << "x"
                                 << "";
        QTest::newRow("code") << 200 << R"({"code":5,"msg":"忙","data":{"result":true}})"
                              << "忙";
        QTest::newRow("result false") << 200 << R"({"code":0,"msg":"否","data":{"result":false}})"
                                      << "否";
        QTest::newRow("result absent") << 200 << "{}"
                                       << "";
        QTest::newRow("yes") << 200 << R"({"data":{"result":true}})" << QString();
    }

    void judgesTheRemovalReply()
    {
        QFETCH(int, status);
        QFETCH(QString, reply);
        QFETCH(QString, box);
        whetherCloseGuard panel(nullptr, true);
        panel.show();
        const QSignalSpy removed(&panel, &whetherCloseGuard::sigRemove);
        const BoxReader boxes;
        HttpRequest::GetInstance()->onQuitControl(status, reply);
        QCOMPARE(boxes.texts(), box.isNull() ? QStringList() : QStringList{box});
        QCOMPARE(removed.count(), box.isNull() ? 1 : 0);
        QCOMPARE(look(panel), kOffer);
    }

    void followsARemoval()
    {
        Widget window(nullptr);
        window.show();
        auto *panel = window.findChild<whetherCloseGuard *>();
        Q_EMIT panel->sigStartRemove();
        QVERIFY(!window.close());
        Q_EMIT panel->sigClose();
        QVERIFY(window.isVisible());

        HttpRequest::GetInstance()->onQuitControl(200, QStringLiteral(R"({"data":{"result":true}})"));
        QCOMPARE(look(*panel), kRemoved);
        // The confirm button reboots now and asks the server no more; later closes.
        const QSignalSpy asked(HttpRequest::GetInstance(), &HttpRequest::sigMacheineCheck);
        confirmButton(*panel)->click();
        QCOMPARE(asked.count(), 0);
        cancelButton(*panel)->click();
        QVERIFY(!window.isVisible());
    }

    void keepsTheDormantSlot_data()
    {
        QTest::addColumn<QByteArray>("data");
        QTest::addColumn<int>("result");

        QTest::newRow("success") << QByteArray(R"({"code":0})") << 1;
        QTest::newRow("failure") << QByteArray(R"({"code":3})") << 1;
        QTest::newRow("no JSON") << QByteArray("x") << 0;
        QTest::newRow("goes on behind NUL") << QByteArray("{}\0x", 4) << 0;
        QTest::newRow("no UTF-8") << QByteArray("{\"msg\":\"\xff\"}") << 0;
    }

    void keepsTheDormantSlot()
    {
        QFETCH(QByteArray, data);
        whetherCloseGuard panel(nullptr, true);
        QTEST(panel.analyseData(&data), "result");
    }

    // The start decision from a server's answer has no caller, but keeps its behaviour. "id" names no vesk
    // here.
    void decidesByAServersAnswer()
    {
        Widget window(nullptr);
        window.show();
        const BoxReader boxes;
        const auto parse = [&window](int state, int code, const QString &message) {
            return QMetaObject::invokeMethod(&window, "onTerminalParse",
                                             Q_ARG(ERequestState, ERequestState(state)), Q_ARG(int, code),
                                             Q_ARG(QString, message));
        };
        QVERIFY(parse(1, 500, QStringLiteral("x")));
        QVERIFY(parse(0, 200, QStringLiteral("joined")));
        QVERIFY(window.isVisible() && boxes.texts().isEmpty());
        QVERIFY(parse(0, 500, QStringLiteral("停机")));
        QCOMPARE(boxes.texts(), QStringList{QStringLiteral("停机")});
        QVERIFY(!window.isVisible());
    }
};

QTEST_MAIN(TestLeavePanel)
#include "tst_leavepanel.moc"
