// SPDX-License-Identifier: Apache-2.0
#include "boxreader.h"
#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "loginwidget.h"
#include "newterminalnamewidget.h"
#include "serverconfigwidget.h"
#include "settingupwidget.h"

#include <QLabel>
#include <QLineEdit>
#include <QSignalSpy>
#include <QTest>

namespace {

QList<QLineEdit *> editsOf(const QWidget &page)
{
    return page.findChildren<QLineEdit *>();
}

QPushButton *buttonOf(const QWidget &page, const QString &text)
{
    for (auto *button : page.findChildren<QPushButton *>()) {
        if (button->text() == text)
            return button;
    }
    return nullptr;
}

const QString kNext = QStringLiteral("下一步");

} // namespace

class TestPages : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void offersNextOnTheServerPage_data()
    {
        QTest::addColumn<QString>("host");
        QTest::addColumn<QString>("port");
        QTest::addColumn<bool>("atStart");
        QTest::addColumn<bool>("afterEdit"); // of the host, to the same length

        QTest::newRow("nothing known") << ""
                                       << "" << false << false;
        QTest::newRow("host known") << "h"
                                    << "" << true << true;
        QTest::newRow("port known") << ""
                                    << "1" << true << false;
        QTest::newRow("both known") << "h"
                                    << "1" << true << true;
    }

    void offersNextOnTheServerPage()
    {
        QFETCH(QString, host);
        QFETCH(QString, port);
        FileConfig::GetInstance()->setDomainHost(host);
        FileConfig::GetInstance()->setDomainPort(port);
        ServerConfigWidget page(nullptr);
        const QPushButton *next = buttonOf(page, kNext);
        QTEST(next->isEnabled(), "atStart");
        // An edit that leaves the other field empty changes nothing; an empty field takes the offer back.
        editsOf(page).at(0)->setText(host.isEmpty() ? QString() : QStringLiteral("x"));
        if (host.isEmpty()) {
            editsOf(page).at(0)->setText(QStringLiteral("x"));
            editsOf(page).at(0)->clear();
        }
        QTEST(next->isEnabled(), "afterEdit");
        editsOf(page).at(0)->setText(QStringLiteral("x"));
        editsOf(page).at(1)->setText(QStringLiteral("2"));
        QVERIFY(next->isEnabled());
        editsOf(page).at(1)->clear();
        QVERIFY(!next->isEnabled());
    }

    void takesDigitsForAPort()
    {
        ServerConfigWidget page(nullptr);
        page.show();
        QLineEdit *port = editsOf(page).at(1);
        port->clear();
        QTest::keyClicks(port, QStringLiteral("8a4-4 3"));
        QCOMPARE(port->text(), QStringLiteral("8443"));
    }

    // No server is there, so a pressed Next shows in a box.
    void pressesNextOnEnter()
    {
        ServerConfigWidget page(nullptr);
        page.show();
        QLineEdit *host = editsOf(page).at(0);
        QLineEdit *port = editsOf(page).at(1);
        const BoxReader boxes;
        port->clear();
        host->setText(QStringLiteral("127.0.0.1"));
        QTest::keyClick(host, Qt::Key_Return);
        QVERIFY(boxes.texts().isEmpty());
        port->setText(QStringLiteral("1"));
        QTest::keyClick(port, Qt::Key_Return);
        QCOMPARE(boxes.texts(), QStringList{QStringLiteral("域地址或端口错误，请重新输入。")});
        QTest::keyClick(buttonOf(page, kNext), Qt::Key_Return);
        QCOMPARE(boxes.texts().size(), 2);
    }

    void judgesTheCaReply_data()
    {
        QTest::addColumn<int>("status");
        QTest::addColumn<QString>("reply");
        QTest::addColumn<QString>("box");

        const QString wrongAddress = QStringLiteral("域地址或端口错误，请重新输入。");
        QTest::newRow("no answer") << 0 << R"({"code":0})" << wrongAddress;
        QTest::newRow("no JSON") << 200 << "" << wrongAddress;
        QTest::newRow("HTML error") << 500 << "<html>" << wrongAddress;
        QTest::newRow("JSON error") << 500 << R"({"msg":"停机"})"
                                    << "停机";
        QTest::newRow("redirect") << 302 << R"({"code":0})"
                                  << "";
        QTest::newRow("refused") << 200 << R"({"code":1,"msg":"拒绝"})"
                                 << "拒绝";
        // Accepted: the status check follows, and no server is there to answer it.
        QTest::newRow("accepted") << 200 << "{}"
                                  << "网络异常，请稍后重试";
    }

    void judgesTheCaReply()
    {
        QFETCH(int, status);
        QFETCH(QString, reply);
        FileConfig::GetInstance()->setDomainHost(QStringLiteral("127.0.0.1"));
        ServerConfigWidget page(nullptr);
        const BoxReader boxes;
        HttpRequest::GetInstance()->onCaCert(status, reply);
        QFETCH(QString, box);
        QCOMPARE(boxes.texts(), QStringList{box});
    }

    void judgesTheStatusReply_data()
    {
        QTest::addColumn<int>("status");
        QTest::addColumn<QString>("reply");
        QTest::addColumn<QString>("box"); // null: the wizard goes on

        const QString joined = QStringLiteral("终端已加域,请联系管理员从服务器移除终端重新加域!");
        QTest::newRow("no answer") << 0 << ""
                                   << "网络异常，请稍后重试";
        QTest::newRow("error with JSON") << 500 << R"({"code":0,"data":{"result":true}})"
                                         << "网络异常，请稍后重试";
        QTest::newRow("no JSON") << 200 << "x"
                                 << "服务器返回数据错误";
        QTest::newRow("yes") << 200 << R"({"code":0,"data":{"result":true}})" << QString();
        QTest::newRow("yes without code") << 200 << R"({"data":{"result":true}})" << QString();
        QTest::newRow("limit") << 200 << R"({"code":-500000,"msg":"x"})"
                               << "终端数量到达上限!";
        QTest::newRow("limit as text") << 200 << R"({"code":"-500000"})" << joined;
        QTest::newRow("no") << 200 << R"({"code":0,"data":{"result":false}})" << joined;
        QTest::newRow("yes as text") << 200 << R"({"code":0,"data":{"result":"true"}})" << joined;
        QTest::newRow("other code") << 200 << R"({"code":1,"data":{"result":true},"msg":"x"})" << joined;
        QTest::newRow("array") << 200 << "[]" << joined;
    }

    void judgesTheStatusReply()
    {
        QFETCH(int, status);
        QFETCH(QString, reply);
        QFETCH(QString, box);
        ServerConfigWidget page(nullptr);
        editsOf(page).at(0)->setText(QStringLiteral("typed"));
        editsOf(page).at(1)->setText(QStringLiteral("77"));
        FileConfig::GetInstance()->setServerPort(QString());
        const BoxReader boxes;
        const QSignalSpy onward(&page, &ServerConfigWidget::sigJumpUserLogin);
        HttpRequest::GetInstance()->onMacheineCheck(status, reply);
        QCOMPARE(boxes.texts(), box.isNull() ? QStringList() : QStringList{box});
        QCOMPARE(onward.count(), box.isNull() ? 1 : 0);
        QCOMPARE(FileConfig::GetInstance()->readServerPort(),
                 box.isNull() ? QStringLiteral("77") : QString());
    }

    void judgesTheAccountReply_data()
    {
        QTest::addColumn<int>("status");
        QTest::addColumn<QString>("reply");
        QTest::addColumn<QString>("box"); // null: the wizard goes on

        QTest::newRow("no answer") << 0 << "{}"
                                   << "网络异常，请稍后重试";
        QTest::newRow("no JSON before the status") << 400 << "x"
                                                   << "网络异常，请稍后重试";
        QTest::newRow("HTML error") << 500 << "<html>"
                                    << "网络异常，请稍后重试";
        QTest::newRow("bad request") << 400 << R"({"msg":"x"})"
                                     << "域地址或端口错误";
        QTest::newRow("not allowed") << 401 << R"({"code":0,"msg":"密码错误"})"
                                     << "密码错误";
        QTest::newRow("refused") << 200 << R"({"code":3,"msg":"锁定"})"
                                 << "锁定";
        QTest::newRow("yes") << 200 << R"({"code":0})" << QString();
        QTest::newRow("empty object") << 200 << "{}" << QString();
    }

    void judgesTheAccountReply()
    {
        QFETCH(int, status);
        QFETCH(QString, reply);
        QFETCH(QString, box);
        LoginWidget page(nullptr);
        const BoxReader boxes;
        const QSignalSpy onward(&page, &LoginWidget::sigJumpNewTerminal);
        HttpRequest::GetInstance()->onCheckAccountPwd(status, reply);
        QCOMPARE(boxes.texts(), box.isNull() ? QStringList() : QStringList{box});
        QCOMPARE(onward.count(), box.isNull() ? 1 : 0);
    }

    void offersNextOnTheAccountPage()
    {
        LoginWidget page(nullptr);
        const QPushButton *next = buttonOf(page, kNext);
        QLineEdit *user = editsOf(page).at(0);
        QLineEdit *password = editsOf(page).at(1);
        QVERIFY(!next->isEnabled());
        user->setText(QStringLiteral("u"));
        QVERIFY(!next->isEnabled());
        password->setText(QStringLiteral(" "));
        QVERIFY(next->isEnabled());
        QCOMPARE(page.userName(), QStringLiteral("u"));
        QCOMPARE(password->echoMode(), QLineEdit::Password);
        user->clear();
        QVERIFY(!next->isEnabled());
    }

    void limitsTheAlias()
    {
        NewTerminalNameWidget page(nullptr);
        const QPushButton *next = buttonOf(page, kNext);
        QVERIFY(!next->isEnabled());
        page.setTerminalName(QString(40, QLatin1Char('a')));
        QCOMPARE(editsOf(page).at(0)->text().size(), 32);
        QVERIFY(next->isEnabled());
        page.setTerminalName(QString());
        QVERIFY(!next->isEnabled());
    }

    void startsOneJoinForADoubleClick()
    {
        FinishSettingWidget page(nullptr);
        const QSignalSpy starts(&page, &FinishSettingWidget::sigJoinGroup);
        QPushButton *finish = buttonOf(page, QStringLiteral("完成"));
        finish->click();
        finish->click();
        QCOMPARE(starts.count(), 1);
        QVERIFY(!buttonOf(page, QStringLiteral("上一步"))->isEnabled());
    }

    // A screen reader hears the caption of each field, without what only lines the captions up.
    void namesItsFields()
    {
        const ServerConfigWidget server(nullptr);
        const LoginWidget account(nullptr);
        const NewTerminalNameWidget alias(nullptr);
        QStringList names;
        for (const QWidget *page :
             {static_cast<const QWidget *>(&server), static_cast<const QWidget *>(&account),
              static_cast<const QWidget *>(&alias)}) {
            for (const QLineEdit *edit : editsOf(*page))
                names.append(edit->accessibleName());
        }
        QCOMPARE(names.join(QLatin1Char(' ')), QStringLiteral("域地址 端口 域帐号 密码 终端别名"));
    }

    // The cancel button of the progress page is dead on purpose; its slot keeps its behaviour.
    void keepsTheDeadCancelButton()
    {
        SettingUpWidget page(nullptr);
        const QSignalSpy cancels(&page, &SettingUpWidget::sigCancelSetting);
        page.findChild<QPushButton *>()->click();
        QCOMPARE(cancels.count(), 0);
        page.onCancelSetting();
        QCOMPARE(cancels.count(), 1);
        QCOMPARE(page.findChild<QLabel *>()->text(), QStringLiteral("取消配置中..."));
        page.restoreUI();
        QCOMPARE(page.findChild<QLabel *>()->text(), QStringLiteral("配置中，请稍后"));
    }
};

QTEST_MAIN(TestPages)
#include "tst_pages.moc"
