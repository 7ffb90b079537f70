// SPDX-License-Identifier: Apache-2.0
#include "boxreader.h"
#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "localselectwidget.h"
#include "loginwidget.h"
#include "newterminalnamewidget.h"
#include "serverconfigwidget.h"
#include "settingupwidget.h"
#include "widget.h"

#include "mtk/mprogressbar.h"
#include "mtk/mtitlebar.h"

#include <QLabel>
#include <QLineEdit>
#include <QMetaMethod>
#include <QTest>
#include <QTranslator>

namespace {

// "class WxH icon|plain" of the page that shows, and of the window around it.
QString look(const Widget &window)
{
    const QWidget *page = nullptr;
    for (const QWidget *candidate : window.findChildren<QWidget *>()) {
        const bool isPage = candidate->inherits("ServerConfigWidget") || candidate->inherits("LoginWidget") ||
                            candidate->inherits("NewTerminalNameWidget") ||
                            candidate->inherits("FinishSettingWidget") ||
                            candidate->inherits("SettingUpWidget");
        if (isPage && candidate->isVisible()) {
            if (page != nullptr)
                return QStringLiteral("two pages at once");
            page = candidate;
        }
    }
    if (page == nullptr)
        return QStringLiteral("no page");
    const auto *titlebar = window.findChild<Mtk::Widget::MTitlebar *>();
    return QStringLiteral("%1 %2x%3 %4")
        .arg(QString::fromLatin1(page->metaObject()->className()))
        .arg(window.width())
        .arg(window.height())
        .arg(titlebar->icon().isNull() ? QStringLiteral("plain") : QStringLiteral("icon"));
}

const QString kServerLook = QStringLiteral("ServerConfigWidget 380x237 plain");
const QString kAccountLook = QStringLiteral("LoginWidget 380x237 icon");
const QString kAliasLook = QStringLiteral("NewTerminalNameWidget 380x237 plain");
const QString kSummaryLook = QStringLiteral("FinishSettingWidget 380x308 icon");

void grant()
{
    HttpRequest::GetInstance()->onMacheineCheck(200, QStringLiteral(R"({"code":0,"data":{"result":true}})"));
}

void walkToSummary(Widget &window)
{
    window.show();
    grant();
    HttpRequest::GetInstance()->onCheckAccountPwd(200, QStringLiteral("{}"));
    Q_EMIT window.findChild<NewTerminalNameWidget *>()->sig_jump_finish_setting();
}

void click(const QWidget *page, const QString &text)
{
    for (auto *button : page->findChildren<QPushButton *>()) {
        if (button->text() == text)
            button->click();
    }
}

// Shows in which context a button's text was translated.
class ContextTranslator : public QTranslator
{
public:
    bool isEmpty() const override { return false; }
    QString translate(const char *context, const char *text, const char *, int) const override
    {
        return QLatin1String(text) == QLatin1String("确定") ? QString::fromUtf8(context) : QString();
    }
};

} // namespace

// The main window as the controller of the wizard. Replies come in through the slots of HttpRequest, as from
// a server.
class TestWidget : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    // No command of the machine is to be found.
    void initTestCase() { qputenv("PATH", "/nonexistent"); }

    void init()
    {
        FileConfig *config = FileConfig::GetInstance();
        config->setDomainHost(QStringLiteral("h"));
        config->setDomainPort(QStringLiteral("1"));
        config->setTerminalName(QStringLiteral("t"));
        config->setIsDomain(false);
    }

    // Callers reach slots by name and order.
    void declaresItsSlotsInOrder()
    {
        QStringList names;
        const QMetaObject &meta = Widget::staticMetaObject;
        for (int i = meta.methodOffset(); i < meta.methodCount(); ++i)
            names.append(QString::fromLatin1(meta.method(i).methodSignature()));
        QCOMPARE(names.join(QLatin1Char(' ')),
                 QStringLiteral(
                     "onServerSetting() onUserLogin() onNewTerminal() onFinishSetting() onOkJoinGroup() "
                     "onCancelFinishSetting() onLocalSetting() onLoginSetting() onCancelSetting() onExit() "
                     "onCancelJoinControl() onTerminalParse(ERequestState,int,QString) "
                     "onRemoveFromControl(int,QString) onStartRemove() "
                     "onCallFinishedSlot(QDBusPendingCallWatcher*)"));
    }

    void walksForthAndBack()
    {
        Widget window(nullptr);
        window.show();
        QCOMPARE(look(window), kServerLook);
        window.findChild<ServerConfigWidget *>()->findChild<QLineEdit *>()->setText(QStringLiteral("typed"));
        grant();
        QCOMPARE(look(window), kAccountLook);
        HttpRequest::GetInstance()->onCheckAccountPwd(200, QStringLiteral(R"({"code":0})"));
        QCOMPARE(look(window), kAliasLook);
        QVERIFY(window.findChild<NewTerminalNameWidget *>()->isAncestorOf(window.focusWidget()));
        Q_EMIT window.findChild<NewTerminalNameWidget *>()->sig_jump_finish_setting();
        QCOMPARE(look(window), kSummaryLook);

        const QString back = QStringLiteral("上一步");
        click(window.findChild<FinishSettingWidget *>(), back);
        QCOMPARE(look(window), kAliasLook);
        click(window.findChild<NewTerminalNameWidget *>(), back);
        QCOMPARE(look(window), kAccountLook);
        click(window.findChild<LoginWidget *>(), back);
        QCOMPARE(look(window), kServerLook);
        QCOMPARE(window.findChild<ServerConfigWidget *>()->findChild<QLineEdit *>()->text(),
                 QStringLiteral("typed"));

        // The second visit makes no second page and no second connection.
        grant();
        QCOMPARE(look(window), kAccountLook);
        QCOMPARE(window.findChildren<LoginWidget *>().size(), 1);
    }

    // The alias page took name and address when it was made; the summary reads them at each visit.
    void refreshesOnlyTheSummary()
    {
        Widget window(nullptr);
        walkToSummary(window);
        auto *summary = window.findChild<FinishSettingWidget *>();
        click(summary, QStringLiteral("上一步"));
        FileConfig::GetInstance()->setTerminalName(QStringLiteral("renamed"));
        FileConfig::GetInstance()->setDomainHost(QStringLiteral("elsewhere"));
        auto *alias = window.findChild<NewTerminalNameWidget *>();
        QCOMPARE(alias->findChild<QLineEdit *>()->text(), QStringLiteral("t"));
        const auto texts = [](const QWidget *page) {
            QStringList all;
            for (const auto *label : page->findChildren<QLabel *>())
                all.append(label->text());
            return all;
        };
        QVERIFY(texts(alias).contains(QStringLiteral("h:1")));
        Q_EMIT alias->sig_jump_finish_setting();
        QVERIFY(texts(summary).contains(QStringLiteral("renamed")));
        QVERIFY(texts(summary).contains(QStringLiteral("elsewhere:1")));
    }

    void closesBeforeAJoin()
    {
        Widget window(nullptr);
        window.show();
        QVERIFY(window.close());
        window.show();
        click(window.findChild<ServerConfigWidget *>(), QStringLiteral("取消"));
        QVERIFY(!window.isVisible());
    }

    // There is no bus here, so the join stops at its first service call.
    void staysOpenAfterAFailedJoin()
    {
        Widget window(nullptr);
        walkToSummary(window);
        auto *summary = window.findChild<FinishSettingWidget *>();
        const BoxReader boxes;
        for (int attempt = 1; attempt <= 2; ++attempt) {
            click(summary, QStringLiteral("完成"));
            auto *progress = window.findChild<SettingUpWidget *>();
            QCOMPARE(look(window), QStringLiteral("SettingUpWidget 380x159 icon"));
            QCOMPARE(progress->findChild<Mtk::Widget::MProgressBar *>()->value(), 60);
            QVERIFY(!progress->findChild<QPushButton *>()->isEnabled());
            QVERIFY(!window.close());
            QTRY_COMPARE(boxes.texts().size(), attempt);
            QTRY_COMPARE(look(window), kSummaryLook);
            QCOMPARE(boxes.texts().last(), QStringLiteral("加域执行失败!"));
            for (const auto *button : summary->findChildren<QPushButton *>())
                QVERIFY(button->isEnabled());
        }
        QVERIFY(!window.close());
        window.onExit();
        QVERIFY(window.isVisible());

        // The one slot that would open the window again has no connection, but keeps its behaviour.
        window.onCancelJoinControl();
        QVERIFY(window.close());
    }

    void judgesTheJoinReply_data()
    {
        QTest::addColumn<int>("status");
        QTest::addColumn<QString>("reply");
        QTest::addColumn<QString>("box");

        const QString notDone = QStringLiteral("域管服务配置失败，请重试");
        QTest::newRow("no answer") << 0 << "" << notDone;
        QTest::newRow("no JSON before the status") << 400 << "" << notDone;
        QTest::newRow("HTML") << 200 << "<html>" << notDone;
        QTest::newRow("known machine") << 400 << "{}"
                                       << "服务器已有此机器,请联系管理员。";
        QTest::newRow("refused") << 200 << R"({"code":7,"msg":"不行"})"
                                 << "不行";
        QTest::newRow("markup is text") << 500 << R"({"msg":"<b>x</b>"})"
                                        << "<b>x</b>";
        QTest::newRow("no words") << 503 << "[]"
                                  << "";
        // Accepted, but the identity service is not there.
        QTest::newRow("accepted") << 200 << "{}"
                                  << "域管服务配置失败,请重试";
    }

    void judgesTheJoinReply()
    {
        QFETCH(int, status);
        QFETCH(QString, reply);
        Widget window(nullptr);
        walkToSummary(window);
        const BoxReader boxes;
        click(window.findChild<FinishSettingWidget *>(), QStringLiteral("完成"));
        QTRY_COMPARE(boxes.texts().size(), 1);
        HttpRequest::GetInstance()->onJoinControl(status, reply);
        QCOMPARE(boxes.texts().size(), 2);
        QTEST(boxes.texts().last(), "box");
        QCOMPARE(look(window), kSummaryLook);
    }

    // Boxes of the main window and of the leave panel have a button that can be translated.
    void translatesTheButtonOfItsBoxes()
    {
        ContextTranslator translator;
        QVERIFY(QCoreApplication::installTranslator(&translator));
        Widget window(nullptr);
        walkToSummary(window);
        QStringList buttons;
        BoxReader boxes;
        boxes.whileOpen = [&buttons] {
            buttons.append(QApplication::activeModalWidget()->findChild<QPushButton *>()->text());
        };
        click(window.findChild<FinishSettingWidget *>(), QStringLiteral("完成"));
        QTRY_COMPARE(boxes.texts().size(), 1);
        QVERIFY(QMetaObject::invokeMethod(&window, "onTerminalParse", Q_ARG(ERequestState, ERequestState(0)),
                                          Q_ARG(int, 500), Q_ARG(QString, QStringLiteral("x"))));
        whetherCloseGuard(nullptr, false).closeGuardCliked();
        QCOMPARE(buttons, (QStringList{QStringLiteral("Widget"), QStringLiteral("Widget"),
                                       QStringLiteral("whetherCloseGuard")}));
        QCoreApplication::removeTranslator(&translator);
    }

    void takesTheServerAddressFromTheReply_data()
    {
        QTest::addColumn<QString>("joined");
        QTest::addColumn<QString>("address");

        QTest::newRow("host") << "srv"
                              << "srv|1";
        QTest::newRow("host and port") << "srv:9"
                                       << "srv|9";
        QTest::newRow("empty parts") << ":"
                                     << "|";
        QTest::newRow("two colons") << "srv:9:1"
                                    << "h|1";
        QTest::newRow("absent") << ""
                                << "|1";
    }

    void takesTheServerAddressFromTheReply()
    {
        QFETCH(QString, joined);
        Widget window(nullptr);
        walkToSummary(window);
        const BoxReader boxes;
        click(window.findChild<FinishSettingWidget *>(), QStringLiteral("完成"));
        QTRY_COMPARE(boxes.texts().size(), 1);
        HttpRequest::GetInstance()->onJoinControl(
            200, QStringLiteral(R"({"data":{"joined_domain":"%1","key":"a2V5"}})").arg(joined));
        FileConfig *config = FileConfig::GetInstance();
        QTEST(config->readServerHost() + QLatin1Char('|') + config->readServerPort(), "address");
        QVERIFY(config->readIsDomain());
    }
};

QTEST_MAIN(TestWidget)
#include "tst_widget.moc"
