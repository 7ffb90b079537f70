// SPDX-License-Identifier: Apache-2.0
#include "newterminalnamewidget.h"

#include "fieldpage.h"
#include "fileconfig.h"
#include "httprequest.h"
#include "pageparts.h"

#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/msuggestbutton.h"

#include <QLineEdit>
#include <QPushButton>

using Mtk::Widget::MLabel;
using Mtk::Widget::MLineEdit;
using Mtk::Widget::MSuggestButton;

namespace {

constexpr int kAliasLength = 32;

} // namespace

NewTerminalNameWidget::NewTerminalNameWidget(QWidget *parent)
    : QWidget(parent)
{
    createConnections(createInterface());
}

QPushButton *NewTerminalNameWidget::createInterface()
{
    // Comma and semicolon belong to the family's name.
    QFont titleFont(QStringLiteral("SourceHanSansCN-Medium,SourceHanSansSC;"));
    titleFont.setPixelSize(14);
    QFont font = titleFont;
    font.setWeight(pageparts::kBodyWeight);
    font.setFamily(QStringLiteral("SourceHanSansSC-Normal"));

    FieldPage form(this, QStringLiteral("新建终端别名"), titleFont, font);
    m_addressLabel = new MLabel(this);
    form.addRow(new MLabel(this), QStringLiteral("域地址:"), m_addressLabel);
    m_addressLabel->setElideMode(Qt::ElideMiddle);
    m_addressLabel->setText(FileConfig::GetInstance()->readDomainHost() + QLatin1Char(':') +
                            FileConfig::GetInstance()->readDomainPort());
    m_aliasEdit = new MLineEdit(this);
    form.addRow(new MLabel(this), QStringLiteral("终端别名:"), m_aliasEdit);
    pageparts::setTextColor(m_aliasEdit, pageparts::kValueColor);
    m_aliasEdit->lineEdit()->setMaxLength(kAliasLength);

    form.addButtons(QStringLiteral("上一步"), QStringLiteral("下一步"));
    m_nextButton = form.rightButton();
    m_nextButton->setEnabled(false);
    return form.leftButton();
}

void NewTerminalNameWidget::createConnections(QPushButton *backButton)
{
    connect(m_aliasEdit, &MLineEdit::textChanged, this, &NewTerminalNameWidget::on_edit_changed);
    connect(backButton, &QPushButton::clicked, this, &NewTerminalNameWidget::sig_jump_login);
    connect(m_nextButton, &MSuggestButton::clicked, this, &NewTerminalNameWidget::onNext);
}

void NewTerminalNameWidget::setTerminalName(const QString &name)
{
    m_aliasEdit->setText(name);
}

void NewTerminalNameWidget::on_edit_changed(const QString &text)
{
    m_nextButton->setEnabled(!text.isEmpty());
}

void NewTerminalNameWidget::onNext()
{
    QString message;
    if (!HttpRequest::GetInstance()->checkPcName(m_aliasEdit->text(), message)) {
        showMessageBox(message);
        return;
    }
    FileConfig::GetInstance()->setTerminalName(m_aliasEdit->text());
    Q_EMIT sig_jump_finish_setting();
}

void NewTerminalNameWidget::showMessageBox(const QString &text)
{
    pageparts::showMessage(this, text);
}
