// SPDX-License-Identifier: Apache-2.0
#include "newterminalnamewidget.h"

#include "fileconfig.h"
#include "httprequest.h"
#include "pageparts.h"

#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/msuggestbutton.h"

#include <QBoxLayout>
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
    createInterface();
    createConnections();
    m_addressLabel->setText(FileConfig::GetInstance()->readDomainHost() + QLatin1Char(':') +
                            FileConfig::GetInstance()->readDomainPort());
}

void NewTerminalNameWidget::createInterface()
{
    QFont font;
    // Comma and semicolon belong to the family's name.
    font.setFamily(QStringLiteral("SourceHanSansCN-Medium,SourceHanSansSC;"));
    font.setPixelSize(14);
    QLabel *title = pageparts::heading(QStringLiteral("新建终端别名"), font, this);
    font.setWeight(pageparts::kBodyWeight);
    font.setFamily(QStringLiteral("SourceHanSansSC-Normal"));

    auto *addressCaption = new MLabel(this);
    addressCaption->setText(QStringLiteral("域地址:"));
    pageparts::dressCaption(addressCaption, font);
    m_addressLabel = new MLabel(this);
    m_addressLabel->setFixedSize(pageparts::kFieldSize);
    m_addressLabel->setFont(font);
    m_addressLabel->setTextFormat(Qt::PlainText);
    pageparts::setTextColour(m_addressLabel, pageparts::kValueColour);

    auto *aliasCaption = new MLabel(this);
    aliasCaption->setText(QStringLiteral("终端别名:"));
    pageparts::dressCaption(aliasCaption, font);
    m_aliasEdit = new MLineEdit(this);
    pageparts::dressField(m_aliasEdit, aliasCaption->text(), font);
    pageparts::setTextColour(m_aliasEdit, pageparts::kValueColour);
    m_aliasEdit->lineEdit()->setMaxLength(kAliasLength);

    auto *backButton = new QPushButton(QStringLiteral("上一步"), this);
    backButton->setFont(font);
    connect(backButton, &QPushButton::clicked, this, &NewTerminalNameWidget::sig_jump_login);
    m_nextButton = new MSuggestButton(this);
    m_nextButton->setText(QStringLiteral("下一步"));
    m_nextButton->setFont(font);
    m_nextButton->setEnabled(false);

    QWidget *fields = pageparts::fieldGrid(this, addressCaption, m_addressLabel, aliasCaption, m_aliasEdit);
    pageparts::layOutFieldPage(this, title, fields, pageparts::buttonRow(this, backButton, m_nextButton));
    pageparts::serveKeyboard(this, m_aliasEdit, {m_aliasEdit}, m_nextButton);
}

void NewTerminalNameWidget::createConnections()
{
    connect(m_aliasEdit, &MLineEdit::textChanged, this, &NewTerminalNameWidget::on_edit_changed);
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
