// SPDX-License-Identifier: Apache-2.0
#include "buttonnamed.h"
#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "loginwidget.h"
#include "messageboxreader.h"
#include "newterminalnamewidget.h"
#include "pemfile.h"
#include "serverconfigwidget.h"
#include "settingupwidget.h"
#include "widget.h"

#include "mtk/mprogressbar.h"
#include "mtk/mtitlebar.h"

#include <QLabel>
#include <QLineEdit>
#include <QTest>

// A join gets to the success window only where the services are. Access rules do not bind the arguments of an
// explicit instantiation.
template <void (Widget::*show)()>
struct SuccessWindow
{
    friend void showSuccessWindow(Widget *window) { (window->*show)(); }
};
void showSuccessWindow(Widget *window);
template struct SuccessWindow<&Widget::createJoinSuccessWidget>;

namespace {

const QString kBack = QStringLiteral("上一步");
const QString kFinish = QStringLiteral("完成");

// "class WxH icon|plain" of each page that shows, and of the window around it.
QString look(const Widget &window)
{
    QStringList pages;
    for (const QWidget *page : window.findChildren<QWidget *>()) {
        const QString name = QString::fromLatin1(page->metaObject()->className());
        if (page->isVisible() && name.endsWith(QLatin1String("Widget")) && name != QLatin1String("QWidget"))
            pages.append(name);
    }
    const bool plain = window.findChild<Mtk::Widget::MTitlebar *>()->icon().isNull();
    return QStringLiteral("%1 %2x%3 %4")
        .arg(pages.join(QLatin1Char('+')))
        .arg(window.width())
        .arg(window.height())
        .arg(plain ? QStringLiteral("plain") : QStringLiteral("icon"));
}

const QString kServerLook = QStringLiteral("ServerConfigWidget 380x237 plain");
const QString kAccountLook = QStringLiteral("LoginWidget 380x237 icon");
const QString kAliasLook = QStringLiteral("NewTerminalNameWidget 380x237 plain");
const QString kSummaryLook = QStringLiteral("FinishSettingWidget 380x308 icon");

void grant()
{
    HttpRequest::GetInstance()->onMacheineCheck(200, QStringLiteral(R"({"code":0,"data":{"result":true}})"));
}

// Gives the summary page.
QWidget *walkToSummary(Widget &window)
{
    window.show();
    grant();
    HttpRequest::GetInstance()->onCheckAccountPwd(200, QStringLiteral("{}"));
    Q_EMIT window.findChild<NewTerminalNameWidget *>()->sig_jump_finish_setting();
    return window.findChild<FinishSettingWidget *>();
}

QStringList texts(const QWidget &page)
{
    QStringList all;
    for (const auto *label : page.findChildren<QLabel *>())
        all.append(label->text());
    return all;
}

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

    void walksForthAndBack()
    {
        Widget window(nullptr);
        window.show();
        QCOMPARE(look(window), kServerLook);
        auto *server = window.findChild<ServerConfigWidget *>();
        server->findChild<QLineEdit *>()->setText(QStringLiteral("typed"));
        grant();
        QCOMPARE(look(window), kAccountLook);
        HttpRequest::GetInstance()->onCheckAccountPwd(200, QStringLiteral(R"({"code":0})"));
        QCOMPARE(look(window), kAliasLook);
        auto *alias = window.findChild<NewTerminalNameWidget *>();
        Q_EMIT alias->sig_jump_finish_setting();
        QCOMPARE(look(window), kSummaryLook);

        buttonNamed(*window.findChild<FinishSettingWidget *>(), kBack)->click();
        QCOMPARE(look(window), kAliasLook);
        buttonNamed(*alias, kBack)->click();
        QCOMPARE(look(window), kAccountLook);
        buttonNamed(*window.findChild<LoginWidget *>(), kBack)->click();
        QCOMPARE(look(window), kServerLook);
        QCOMPARE(server->findChild<QLineEdit *>()->text(), QStringLiteral("typed"));

        buttonNamed(*server, QStringLiteral("取消"))->click();
        QVERIFY(!window.isVisible());
        window.show();

        // The second visit makes no second page and no second connection.
        grant();
        QCOMPARE(look(window), kAccountLook);
        QCOMPARE(window.findChildren<LoginWidget *>().size(), 1);
    }

    // The alias page took name and address when it was made; the summary reads them at each visit.
    void refreshesOnlyTheSummary()
    {
        Widget window(nullptr);
        const QWidget *summary = walkToSummary(window);
        buttonNamed(*summary, kBack)->click();
        FileConfig::GetInstance()->setTerminalName(QStringLiteral("renamed"));
        FileConfig::GetInstance()->setDomainHost(QStringLiteral("elsewhere"));
        auto *alias = window.findChild<NewTerminalNameWidget *>();
        QCOMPARE(alias->findChild<QLineEdit *>()->text(), QStringLiteral("t"));
        QVERIFY(texts(*alias).contains(QStringLiteral("h:1")));
        Q_EMIT alias->sig_jump_finish_setting();
        QVERIFY(texts(*summary).contains(QStringLiteral("renamed")));
        QVERIFY(texts(*summary).contains(QStringLiteral("elsewhere:1")));
    }

    // There is no bus here, so the join stops at its first service call.
    void staysOpenAfterAFailedJoin()
    {
        Widget window(nullptr);
        const QWidget *summary = walkToSummary(window);
        MessageBoxReader messages;
        messages.whileOpen = [](const QDialog &box) {
            QVERIFY(buttonNamed(box, QStringLiteral("确定")));
        };
        for (int attempt = 1; attempt <= 2; ++attempt) {
            buttonNamed(*summary, kFinish)->click();
            auto *progress = window.findChild<SettingUpWidget *>();
            QCOMPARE(look(window), QStringLiteral("SettingUpWidget 380x159 icon"));
            QCOMPARE(progress->findChild<Mtk::Widget::MProgressBar *>()->value(), 60);
            QVERIFY(!progress->findChild<QPushButton *>()->isEnabled());
            QVERIFY(!window.close());
            QTRY_COMPARE(messages.texts().size(), attempt);
            QTRY_COMPARE(look(window), kSummaryLook);
            QCOMPARE(messages.texts().last(), QStringLiteral("加域执行失败!"));
            for (const auto *button : summary->findChildren<QPushButton *>())
                QVERIFY(button->isEnabled());
        }
        // An error is no yes, even without a code.
        HttpRequest::GetInstance()->onJoinControl(500, QStringLiteral(R"({"msg":"<b>停机</b>"})"));
        QCOMPARE(messages.texts().last(), QStringLiteral("<b>停机</b>"));
        QVERIFY(!window.close());
        window.onExit();
        QVERIFY(window.isVisible());

        // The one slot that would open the window again has no connection, but keeps its behaviour.
        window.onCancelJoinControl();
        QVERIFY(window.close());
    }

    // The window system's own close is the only one; tst_join hears of no button for it.
    void takesThePlaceOfTheWindowAtTheEnd()
    {
        Widget window(nullptr);
        window.move(30, 40);
        window.show();
        grant();
        auto *password = window.findChild<LoginWidget *>()->findChildren<QLineEdit *>().last();
        password->setText(QStringLiteral("Terminal-7"));
        showSuccessWindow(&window);
        QCOMPARE(password->text(), QString());
        QVERIFY(!window.isVisible());
        QWidget *success = QApplication::topLevelAt(window.pos() + QPoint(1, 1));
        QVERIFY(success);
        QCOMPARE(success->geometry(), QRect(30, 40, 380, 140));
        QVERIFY(!success->findChild<Mtk::Widget::MTitlebar *>()->icon().isNull());
        QVERIFY(success->close());
        delete success;
    }

    // Files that nobody would read afterwards are not made.
    void readsTheReplyToTheJoin_data()
    {
        QTest::addColumn<QString>("joined");
        QTest::addColumn<int>("keySize");
        QTest::addColumn<int>("certificateSize");
        QTest::addColumn<QString>("address"); // empty: the reply is not used
        const auto row = [](const char *name, const QString &joined, const char *address, qint64 keySize = 3,
                            qint64 certificateSize = 3) {
            QTest::newRow(name) << joined << int(keySize) << int(certificateSize)
                                << QString::fromLatin1(address);
        };
        const QString host = QStringLiteral("srv");
        const qint64 limit = PemFile::kMaxSize; // of the transport, which reads them
        row("host", host, "srv|1");
        row("host and port", QStringLiteral("srv:9"), "srv|9");
        row("empty parts", QStringLiteral(":"), "|");
        row("two colons", QStringLiteral("srv:9:1"), "h|1");
        row("absent", QString(), "|1");
        row("longest files", host, "srv|1", limit, limit);
        row("key too long", host, "", limit + 1, limit);
        row("certificate too long", host, "", limit, limit + 1);
        row("host too long for the record", host.repeated(int(limit) / 3), "");
    }

    void readsTheReplyToTheJoin()
    {
        QFETCH(QString, joined);
        QFETCH(int, keySize);
        QFETCH(int, certificateSize);
        QFETCH(QString, address);
        Widget window(nullptr);
        const QWidget *summary = walkToSummary(window);
        const MessageBoxReader messages;
        buttonNamed(*summary, kFinish)->click();
        QTRY_COMPARE(messages.texts().size(), 1);
        const auto file = [](int size) {
            return QString::fromLatin1(QByteArray(size, 'k').toBase64());
        };
        HttpRequest::GetInstance()->onJoinControl(
            200, QStringLiteral(R"({"data":{"joined_domain":"%1","key":"%2","cert":"%3"}})")
                     .arg(joined, file(keySize), file(certificateSize)));
        FileConfig *config = FileConfig::GetInstance();
        QCOMPARE(config->readIsDomain(), !address.isEmpty());
        if (config->readIsDomain())
            QCOMPARE(config->readServerHost() + QLatin1Char('|') + config->readServerPort(), address);
    }
};

QTEST_MAIN(TestWidget)
#include "tst_widget.moc"
