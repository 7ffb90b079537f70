// SPDX-License-Identifier: Apache-2.0
#include "loginwidget.h"

#include "fieldpage.h"
#include "httprequest.h"
#include "pageparts.h"
#include "serverreply.h"

#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"
#include "mtk/msuggestbutton.h"

#include <QLineEdit>
#include <QPushButton>

using Mtk::Widget::MLabel;
using Mtk::Widget::MLineEdit;
using Mtk::Widget::MPasswordEdit;
using Mtk::Widget::MSuggestButton;

LoginWidget::LoginWidget(QWidget *parent)
    : QWidget(parent)
{
    createConnections(createInterface());
}

QPushButton *LoginWidget::createInterface()
{
    QFont font = pageparts::pageFont(pageparts::kBodyWeight);
    // The semicolon belongs to the family's name.
    font.setFamily(QStringLiteral("Source Han Sans CN-Normal;"));

    FieldPage form(this, QStringLiteral("请校验域帐号密码"), pageparts::pageFont(pageparts::kHeadingWeight),
                   font);
    m_userEdit = new MLineEdit(this);
    form.addRow(new MLabel(this), QStringLiteral("域帐号:"), m_userEdit);
    m_userEdit->lineEdit()->setInputMethodHints(pageparts::kAccountHints);
    m_passwordEdit = new MPasswordEdit(this);
    form.addRow(new MLabel(this), QStringLiteral("   密     码:"), m_passwordEdit);

    form.addButtons(QStringLiteral("上一步"), QStringLiteral("下一步"));
    m_nextButton = form.rightButton();
    m_nextButton->setEnabled(false);
    return form.leftButton();
}

void LoginWidget::createConnections(QPushButton *backButton)
{
    connect(m_userEdit, &MLineEdit::textChanged, this, &LoginWidget::onNameChanged);
    connect(m_passwordEdit, &MPasswordEdit::textChanged, this, &LoginWidget::onPwdChanged);
    connect(backButton, &QPushButton::clicked, this, &LoginWidget::sigJumpServerSetting);
    connect(m_nextButton, &MSuggestButton::clicked, this, &LoginWidget::onCheckAccountPwd);
    connect(HttpRequest::GetInstance(), &HttpRequest::sigCheckAccountPwd, this, &LoginWidget::onLoginChecked);
}

QString LoginWidget::userName() const
{
    return m_userEdit != nullptr ? m_userEdit->text() : QString();
}

void LoginWidget::forgetPassword()
{
    m_passwordEdit->setText(QString());
}

void LoginWidget::onNameChanged(const QString &text)
{
    enableForTwo(m_nextButton, text, m_passwordEdit->text());
}

void LoginWidget::onPwdChanged(const QString &text)
{
    enableForTwo(m_nextButton, text, m_userEdit->text());
}

void LoginWidget::onCheckAccountPwd()
{
    HttpRequest::GetInstance()->postCheckAccountPwd(m_userEdit->text(), m_passwordEdit->text());
}

void LoginWidget::onLoginChecked(const int &statusCode, const QString &replyText)
{
    const ServerReply reply(replyText);
    if (const auto failure = reply.failure(statusCode, "网络异常，请稍后重试", "域地址或端口错误"))
        showMessageBox(*failure);
    else
        Q_EMIT sigJumpNewTerminal();
}

void LoginWidget::showMessageBox(const QString &text)
{
    pageparts::showMessage(this, text);
}
