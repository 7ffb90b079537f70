// SPDX-License-Identifier: Apache-2.0
#include "buttonnamed.h"
#include "fileconfig.h"
#include "httprequest.h"
#include "localselectwidget.h"
#include "logcapture.h"
#include "messageboxreader.h"
#include "widget.h"

#include "mtk/mspinner.h"
#include "mtk/mtitlebar.h"

#include <QLabel>
#include <QSignalSpy>
#include <QTest>

#include <pwd.h>

// In this program everybody has a name that the server knows without its "@".
extern "C" passwd *getpwuid(uid_t /*id*/)
{
    static char name[] = "wang@li@";
    static passwd record{name, nullptr, 0, 0, nullptr, nullptr, nullptr};
    return &record;
}

namespace {

// What a user sees of the panel, and hears, where that differs.
QString look(const whetherCloseGuard &panel)
{
    const QList<QPushButton *> buttons = panel.findChildren<QPushButton *>();
    const QPushButton *confirm = buttons.first();
    QStringList said{panel.findChild<QLabel *>()->text(), panel.window()->accessibleDescription()};
    for (const QPushButton *button : buttons)
        said.append(button->accessibleDescription());
    said.removeDuplicates();
    QStringList parts{said.join(QLatin1String(" / ")),
                      QStringLiteral("%1 %2").arg(confirm->text()).arg(confirm->width())};
    if (!confirm->isEnabled())
        parts.append(QStringLiteral("off"));
    if (buttons.last()->isVisible())
        parts.append(buttons.last()->text());
    if (panel.findChild<Mtk::Widget::MSpinner *>()->isVisible())
        parts.append(QStringLiteral("spinner"));
    return parts.join(QLatin1Char('|'));
}

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

    void opensOnAJoinedTerminal()
    {
        Widget window(nullptr);
        window.show();
        QCOMPARE(window.size(), QSize(380, 140));
        const auto *panel = window.findChild<whetherCloseGuard *>();
        QCOMPARE(panel->pos(), QPoint(0, 0));
        QCOMPARE(look(*panel), QStringLiteral("该终端已经加入管控,是否解除管控?|解除 170|取消"));
        QVERIFY(!window.findChild<Mtk::Widget::MTitlebar *>()->icon().isNull());
        buttonNamed(*panel, QStringLiteral("取消"))->click();
        QVERIFY(!window.isVisible());
    }

    void asksForTheUserWithoutTheAt()
    {
        whetherCloseGuard panel(nullptr, true);
        const LogCapture log;
        buttonNamed(panel, QStringLiteral("解除"))->click(); // no server is configured
        QVERIFY(log.lines().contains(QStringLiteral("info: userName  \"wangli\"")));
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
        QCOMPARE(look(*panel), QStringLiteral("当前终端已解除管控，重启后生效|立即重启 170|稍后重启"));
        // The confirm button reboots now and asks the server no more; later closes.
        const QSignalSpy asked(HttpRequest::GetInstance(), &HttpRequest::sigMacheineCheck);
        buttonNamed(*panel, QStringLiteral("立即重启"))->click();
        QCOMPARE(asked.count(), 0);
        buttonNamed(*panel, QStringLiteral("稍后重启"))->click();
        QVERIFY(!window.isVisible());
    }

    // The start decision from a server's answer has no caller, but keeps its behaviour. "id" names no vesk
    // here.
    void decidesByAServersAnswer()
    {
        Widget window(nullptr);
        window.show();
        const MessageBoxReader messages;
        window.onTerminalParse(ERequestState(1), 500, QStringLiteral("x"));
        window.onTerminalParse(RequestTerminalState, 200, QStringLiteral("joined"));
        QVERIFY(window.isVisible() && messages.texts().isEmpty());
        window.onTerminalParse(RequestTerminalState, 500, QStringLiteral("停机"));
        QCOMPARE(messages.texts(), QStringList{QStringLiteral("停机")});
        QVERIFY(!window.isVisible());
    }
};

QTEST_MAIN(TestLeavePanel)
#include "tst_leavepanel.moc"
