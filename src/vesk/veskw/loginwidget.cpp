// SPDX-License-Identifier: Apache-2.0
#include "loginwidget.h"

#include "httprequest.h"
#include "pageparts.h"
#include "serverreply.h"

#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"
#include "mtk/msuggestbutton.h"

#include <QBoxLayout>
#include <QPushButton>

using Mtk::Widget::MLabel;
using Mtk::Widget::MLineEdit;
using Mtk::Widget::MPasswordEdit;
using Mtk::Widget::MSuggestButton;

LoginWidget::LoginWidget(QWidget *parent)
    : QWidget(parent)
{
    createInterface();
    createConnections();
}

void LoginWidget::createInterface()
{
    QFont font = pageparts::pageFont(pageparts::kHeadingWeight);
    QLabel *title = pageparts::heading(QStringLiteral("请校验域帐号密码"), font, this);
    font.setWeight(pageparts::kBodyWeight);
    // The semicolon belongs to the family's name.
    font.setFamily(QStringLiteral("Source Han Sans CN-Normal;"));

    auto *userCaption = new MLabel(this);
    userCaption->setText(QStringLiteral("域帐号:"));
    pageparts::dressCaption(userCaption, font);
    m_userEdit = new MLineEdit(this);
    pageparts::dressField(m_userEdit, userCaption->text(), font);

    auto *passwordCaption = new MLabel(this);
    passwordCaption->setText(QStringLiteral("   密     码:"));
    pageparts::dressCaption(passwordCaption, font);
    m_passwordEdit = new MPasswordEdit(this);
    pageparts::dressField(m_passwordEdit, passwordCaption->text(), font);

    auto *backButton = new QPushButton(QStringLiteral("上一步"), this);
    backButton->setFont(font);
    connect(backButton, &QPushButton::clicked, this, &LoginWidget::sigJumpServerSetting);
    m_nextButton = new MSuggestButton(this);
    m_nextButton->setText(QStringLiteral("下一步"));
    m_nextButton->setFont(font);
    m_nextButton->setEnabled(false);

    QWidget *fields = pageparts::fieldGrid(this, userCaption, m_userEdit, passwordCaption, m_passwordEdit);
    pageparts::layOutFieldPage(this, title, fields, pageparts::buttonRow(this, backButton, m_nextButton));
    pageparts::serveKeyboard(this, m_userEdit, {m_userEdit, m_passwordEdit}, m_nextButton);
}

void LoginWidget::createConnections()
{
    connect(m_userEdit, &MLineEdit::textChanged, this, &LoginWidget::onNameChanged);
    connect(m_passwordEdit, &MPasswordEdit::textChanged, this, &LoginWidget::onPwdChanged);
    connect(m_nextButton, &MSuggestButton::clicked, this, &LoginWidget::onCheckAccountPwd);
    connect(HttpRequest::GetInstance(), &HttpRequest::sigCheckAccountPwd, this, &LoginWidget::onLoginChecked);
}

QString LoginWidget::userName() const
{
    return m_userEdit != nullptr ? m_userEdit->text() : QString();
}

void LoginWidget::onNameChanged(const QString &text)
{
    pageparts::enableForTwo(m_nextButton, text, m_passwordEdit->text());
}

void LoginWidget::onPwdChanged(const QString &text)
{
    pageparts::enableForTwo(m_nextButton, text, m_userEdit->text());
}

void LoginWidget::onCheckAccountPwd()
{
    HttpRequest::GetInstance()->postCheckAccountPwd(m_userEdit->text(), m_passwordEdit->text());
}

void LoginWidget::onLoginChecked(const int &statusCode, const QString &replyText)
{
    const ServerReply reply(replyText);
    if (statusCode == 0 || !reply.isJson()) {
        showMessageBox(QString::fromLocal8Bit("网络异常，请稍后重试"));
        return;
    }
    if (statusCode == 400) {
        showMessageBox(QString::fromLocal8Bit("域地址或端口错误"));
        return;
    }
    if (statusCode == 200 && reply.code() == 0) {
        Q_EMIT sigJumpNewTerminal();
        return;
    }
    showMessageBox(reply.message());
}

void LoginWidget::showMessageBox(const QString &text)
{
    pageparts::showMessage(this, text);
}
