// SPDX-License-Identifier: Apache-2.0
#include "buttonnamed.h"
#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "loginwidget.h"
#include "messageboxreader.h"
#include "newterminalnamewidget.h"
#include "serverconfigwidget.h"

#include <QAccessible>
#include <QLabel>
#include <QLineEdit>
#include <QSignalSpy>
#include <QTest>

namespace {

QLineEdit *edit(const QWidget &page, int index)
{
    return page.findChildren<QLineEdit *>().at(index);
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
        QTest::newRow("nothing known") << QString() << QString() << false << false;
        QTest::newRow("host known") << QStringLiteral("h") << QString() << true << true;
        QTest::newRow("port known") << QString() << QStringLiteral("1") << true << false;
        QTest::newRow("both known") << QStringLiteral("h") << QStringLiteral("1") << true << true;
    }

    void offersNextOnTheServerPage()
    {
        QFETCH(QString, host);
        QFETCH(QString, port);
        FileConfig::GetInstance()->setDomainHost(host);
        FileConfig::GetInstance()->setDomainPort(port);
        ServerConfigWidget page(nullptr);
        const QAbstractButton *next = buttonNamed(page, kNext);
        QTEST(next->isEnabled(), "atStart");
        // An edit that leaves the other field empty changes nothing; an empty field takes the offer back.
        edit(page, 0)->setText(QStringLiteral("x"));
        if (host.isEmpty())
            edit(page, 0)->clear();
        QTEST(next->isEnabled(), "afterEdit");
        edit(page, 0)->setText(QStringLiteral("x"));
        edit(page, 1)->setText(QStringLiteral("2"));
        QVERIFY(next->isEnabled());
        edit(page, 1)->clear();
        QVERIFY(!next->isEnabled());
    }

    // No server is there, so a pressed Next shows in a message box.
    void servesTheKeyboardOnTheServerPage()
    {
        ServerConfigWidget page(nullptr);
        page.show();
        const MessageBoxReader messages;
        edit(page, 1)->clear();
        edit(page, 0)->setText(QStringLiteral("127.0.0.1"));
        QTest::keyClick(edit(page, 0), Qt::Key_Return);
        QVERIFY(messages.texts().isEmpty());
        QTest::keyClicks(edit(page, 1), QStringLiteral("8a4-4 3"));
        QCOMPARE(edit(page, 1)->text(), QStringLiteral("8443"));
        edit(page, 1)->setText(QStringLiteral("1"));
        QTest::keyClick(edit(page, 1), Qt::Key_Return);
        QCOMPARE(messages.texts(), QStringList{QStringLiteral("域地址或端口错误，请重新输入。")});
    }

    // A yes counts only with its status, its code and its type.
    void takesNothingElseForAYes()
    {
        const ServerConfigWidget server(nullptr);
        const LoginWidget account(nullptr);
        const MessageBoxReader messages;
        const QSignalSpy toAccount(&server, &ServerConfigWidget::sigJumpUserLogin);
        const QSignalSpy toAlias(&account, &LoginWidget::sigJumpNewTerminal);
        HttpRequest *client = HttpRequest::GetInstance();
        client->onCaCert(302, QStringLiteral(R"({"code":0,"msg":"已迁移"})"));
        client->onCheckAccountPwd(401, QStringLiteral(R"({"code":0,"msg":"密码错误"})"));
        client->onMacheineCheck(200, QStringLiteral(R"({"code":1,"data":{"result":true}})"));
        client->onMacheineCheck(200, QStringLiteral(R"({"code":0,"data":{"result":"true"}})"));
        client->onMacheineCheck(200, QStringLiteral(R"({"code":"-500000"})"));
        const QString joined = QStringLiteral("终端已加域,请联系管理员从服务器移除终端重新加域!");
        QCOMPARE(messages.texts(),
                 QStringList({QStringLiteral("已迁移"), QStringLiteral("密码错误"), joined, joined, joined}));
        QCOMPARE(toAccount.count() + toAlias.count(), 0);

        // The port that was typed stands in for the one that the join will name.
        edit(server, 1)->setText(QStringLiteral("77"));
        client->onMacheineCheck(200, QStringLiteral(R"({"data":{"result":true}})"));
        QCOMPARE(toAccount.count(), 1);
        QCOMPARE(FileConfig::GetInstance()->readServerPort(), QStringLiteral("77"));
    }

    void offersNextOnTheAccountPage()
    {
        LoginWidget page(nullptr);
        const QAbstractButton *next = buttonNamed(page, kNext);
        QVERIFY(!next->isEnabled());
        edit(page, 0)->setText(QStringLiteral("u"));
        QVERIFY(!next->isEnabled());
        edit(page, 1)->setText(QStringLiteral(" "));
        QVERIFY(next->isEnabled());
        QCOMPARE(page.userName(), QStringLiteral("u"));
        QCOMPARE(edit(page, 1)->echoMode(), QLineEdit::Password);
        page.show();
        const QWidget *above = page.findChildren<QLabel *>().first();
        QCOMPARE(edit(page, 0)->mapTo(&page, QPoint()).y() - above->geometry().bottom(), 13); // 10 of margin
        edit(page, 0)->clear();
        QVERIFY(!next->isEnabled());
    }

    void limitsTheAlias()
    {
        NewTerminalNameWidget page(nullptr);
        const QAbstractButton *next = buttonNamed(page, kNext);
        QVERIFY(!next->isEnabled());
        page.setTerminalName(QString(40, QLatin1Char('a')));
        QCOMPARE(edit(page, 0)->text().size(), 32);
        QVERIFY(next->isEnabled());
        page.setTerminalName(QString());
        QVERIFY(!next->isEnabled());
    }

    void startsOneJoinForTwoPresses()
    {
        FinishSettingWidget page(nullptr);
        page.show();
        const QSignalSpy starts(&page, &FinishSettingWidget::sigJoinGroup);
        for (int press = 0; press < 2; ++press)
            QTest::keyClick(buttonNamed(page, QStringLiteral("完成")), Qt::Key_Return);
        QCOMPARE(starts.count(), 1);
        QVERIFY(!buttonNamed(page, QStringLiteral("上一步"))->isEnabled());
    }

    // A screen reader finds the caption of each field, and names the field without what lines captions up; a
    // keyboard on the screen knows what is typed there.
    void captionsItsFields()
    {
        QWidget pages;
        new ServerConfigWidget(&pages);
        new LoginWidget(&pages);
        new NewTerminalNameWidget(&pages);
        const Qt::InputMethodHints asWritten = Qt::ImhNoAutoUppercase | Qt::ImhNoPredictiveText;
        QStringList names;
        for (QLabel *caption : pages.findChildren<QLabel *>()) {
            for (const auto &tie :
                 QAccessible::queryAccessibleInterface(caption)->relations(QAccessible::Labelled))
                names.append(tie.first->text(QAccessible::Name));
        }
        QVector<Qt::InputMethodHints> hints;
        for (const QLineEdit *field : pages.findChildren<QLineEdit *>()) {
            hints.append(field->inputMethodHints() & ~(Qt::ImhHiddenText | Qt::ImhSensitiveData));
        }
        QCOMPARE(names.join(QLatin1Char(' ')), QStringLiteral("域地址 端口 域帐号 密码 终端别名"));
        QCOMPARE(hints,
                 QVector<Qt::InputMethodHints>(
                     {asWritten | Qt::ImhUrlCharactersOnly, Qt::ImhDigitsOnly, asWritten, asWritten, {}}));
    }
};

QTEST_MAIN(TestPages)
#include "tst_pages.moc"
