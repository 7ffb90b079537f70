// SPDX-License-Identifier: Apache-2.0
#include "localselectwidget.h"

#include "dbusservices.h"
#include "httprequest.h"
#include "logtext.h"
#include "pageparts.h"
#include "serverreply.h"
#include "widgets/lineeditwidget.h"

#include "mtk/mdialog.h"
#include "mtk/mframe.h"
#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/mspinner.h"
#include "mtk/msuggestbutton.h"

#include <QBoxLayout>
#include <QLineEdit>
#include <QPushButton>
#include <QStyle>

#include <QDebug>

#include <pwd.h>
#include <unistd.h>

using mcc::widgets::LineEditWidget;
using Mtk::Widget::MDialog;
using Mtk::Widget::MFrame;
using Mtk::Widget::MLabel;
using Mtk::Widget::MSpinner;
using Mtk::Widget::MSuggestButton;
using vesk::base::logText;

namespace {

// The spinner takes part in no layout, so that the label keeps the panel's middle.
constexpr QRect kSpinnerPlace(100, 0, 20, 20);

constexpr int kRowTitleWidth = 70;

// The line between the buttons, which is in the way of a button that takes the whole width.
constexpr char kSeparatorName[] = "line";

// Name of the logged-in user as the server knows it; empty when there is no record of the user.
QString loginName()
{
    const passwd *record = getpwuid(getuid());
    if (record == nullptr)
        return QString();
    return QString::fromLocal8Bit(record->pw_name).remove(QLatin1Char('@'));
}

} // namespace

whetherCloseGuard::whetherCloseGuard(QWidget *parent, bool isSudoUser)
    : QWidget(parent)
    , m_bSudoUser(isSudoUser)
{
    createInterface();
    createConnections();
}

void whetherCloseGuard::createConnections()
{
    connect(m_confirmButton, &MSuggestButton::clicked, this, &whetherCloseGuard::closeGuardCliked);
    connect(m_cancelButton, &QPushButton::clicked, this, &whetherCloseGuard::closeCliked);
    HttpRequest *server = HttpRequest::GetInstance();
    // By signature: part of the interface.
    connect(server, SIGNAL(sigQuitControl(int, QString)), this, SLOT(onQuitInfo(int, QString)));
    connect(server, &HttpRequest::sigMacheineCheck, this, &whetherCloseGuard::onMacheineCheck);
}

void whetherCloseGuard::createInterface()
{
    qDebug() << ":createInterface-----------";
    QFont font = pageparts::pageFont(pageparts::kHeadingWeight);
    setFixedSize(pageparts::kPanelSize);

    m_tipLabel = new MLabel(this);
    m_tipLabel->setFont(font);
    m_tipLabel->setAlignment(Qt::AlignCenter);
    m_spinner = new MSpinner(this);
    m_spinner->setFixedSize(kSpinnerPlace.size());
    m_spinner->hide();

    font.setWeight(pageparts::kBodyWeight);
    auto *layout = new QVBoxLayout(this);
    layout->setSpacing(0);
    layout->addWidget(m_tipLabel, 0, Qt::AlignTop | Qt::AlignCenter);
    layout->addLayout(createButtons(font));
    layout->setContentsMargins(10, 0, 10, 10);
    say(tr("该终端已经加入管控,是否解除管控?"));
}

QBoxLayout *whetherCloseGuard::createButtons(const QFont &font)
{
    m_confirmButton = new MSuggestButton(this);
    m_confirmButton->setFixedSize(pageparts::kHalfButtonSize);
    m_confirmButton->setFont(font);
    m_confirmButton->setText(tr("解除"));
    m_cancelButton = new QPushButton(this);
    m_cancelButton->setFixedSize(pageparts::kHalfButtonSize);
    m_cancelButton->setFont(font);
    m_cancelButton->setText(tr("取消"));
    for (QPushButton *button : {static_cast<QPushButton *>(m_confirmButton), m_cancelButton})
        button->setAutoDefault(true); // outside of dialogs, Enter would not press it
    auto *separator = new MFrame(this);
    separator->setFrameShape(QFrame::VLine);
    separator->setFixedSize(2, 28);
    separator->setObjectName(QLatin1String(kSeparatorName));

    auto *row = new QHBoxLayout;
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(0);
    row->addWidget(m_cancelButton);
    row->addStretch(9);
    row->addWidget(separator);
    row->addStretch(9);
    row->addWidget(m_confirmButton);
    return row;
}

void whetherCloseGuard::say(const QString &sentence)
{
    m_tipLabel->setText(sentence);
    for (QWidget *widget :
         {window(), static_cast<QWidget *>(m_confirmButton), static_cast<QWidget *>(m_cancelButton)})
        widget->setAccessibleDescription(sentence);
}

void whetherCloseGuard::waitProgressbar()
{
    m_confirmButton->setText(tr("确定"));
    m_confirmButton->setEnabled(false);
    m_confirmButton->setFixedSize(pageparts::kWideButtonSize);
    m_cancelButton->hide();
    findChild<MFrame *>(QLatin1String(kSeparatorName))->hide();
    say(tr("解除中,请稍等..."));
    m_spinner->setGeometry(kSpinnerPlace);
    m_spinner->show();
    m_spinner->start();
}

void whetherCloseGuard::removeSuccess()
{
    disconnect(m_confirmButton, &MSuggestButton::clicked, this, &whetherCloseGuard::closeGuardCliked);
    connect(m_confirmButton, &MSuggestButton::clicked, this, &whetherCloseGuard::on_reboot);
    m_spinner->hide();
    m_confirmButton->setFixedSize(pageparts::kHalfButtonSize);
    m_confirmButton->setText(tr("立即重启"));
    m_confirmButton->setEnabled(true);
    m_cancelButton->show();
    findChild<MFrame *>(QLatin1String(kSeparatorName))->show();
    say(tr("当前终端已解除管控，重启后生效"));
    m_cancelButton->setText(tr("稍后重启"));
    setFocus(); // so that no Enter of before reboots
}

void whetherCloseGuard::closeGuardCliked()
{
    qDebug() << "whetherCloseGuard::closeGuardCliked()...";
    if (m_adminNameEdit)
        return;
    if (!m_bSudoUser) {
        showMessageBox(QStringLiteral("无法解除管控,请联系系统管理员解除域管管控"));
        return;
    }

    const QString userName = loginName();
    qInfo() << "userName " << logText(userName);
    const QString state = HttpRequest::GetInstance()->getMacheineCheck(MachineRemove, userName);
    qDebug() << logText(state);
    if (state.isEmpty()) {
        qInfo() << "服务器返回结果错误";
        return;
    }
    const ServerReply reply(state);
    if (!reply.isJson()) {
        qDebug() << " data " << logText(state);
        showMessageBox(reply.message());
        return;
    }
    // What the reply says is not looked at: a refusal comes with the administrator's check.
    askForAdministrator();
}

LineEditWidget *whetherCloseGuard::createRow(const QString &title, bool isPassword)
{
    auto *row = new LineEditWidget(isPassword, nullptr);
    row->titleLabel()->setFixedWidth(kRowTitleWidth);
    row->setTitle(title);
    row->titleLabel()->setBuddy(row->edit());
    row->edit()->setClearButtonEnabled(true);
    if (!isPassword)
        row->edit()->lineEdit()->setInputMethodHints(pageparts::kAccountHints);
    row->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
    return row;
}

void whetherCloseGuard::askForAdministrator()
{
    m_adminNameEdit = createRow(tr("管理员帐号"), false);
    m_adminPwdEdit = createRow(tr("密码"), true);

    MDialog dialog(nullptr);
    dialog.setIcon(style()->standardIcon(QStyle::SP_MessageBoxWarning));
    dialog.setTitle(QStringLiteral("退出域管系统需要管理员权限"));
    dialog.addContent(m_adminNameEdit, {});
    dialog.addContent(m_adminPwdEdit, {});
    dialog.addButton(QStringLiteral("取消"), false, MDialog::ButtonNormal);
    dialog.addButton(QStringLiteral("授权"), false, MDialog::ButtonRecommended);
    connect(&dialog, &MDialog::buttonClicked, this, &whetherCloseGuard::onbuttonClicked);
    dialog.exec();
}

void whetherCloseGuard::closeCliked()
{
    Q_EMIT sigClose();
}

int whetherCloseGuard::analyseData(QByteArray *bytes)
{
    const ServerReply reply(*bytes);
    if (!reply.isJson())
        return 0;
    qDebug() << (reply.code() == 0 ? "CloseGuard succeeded!" : "CloseGuard failed!");
    return 1;
}

void whetherCloseGuard::on_reboot()
{
    dbusservices::requestReboot();
}

void whetherCloseGuard::onFinishedRemove() {}

void whetherCloseGuard::onMacheineCheck(const int &statusCode, const QString &replyText)
{
    Q_UNUSED(statusCode)
    Q_UNUSED(replyText)
}

void whetherCloseGuard::showMessageBox(const QString &text)
{
    pageparts::showMessage(this, text, tr("确定"));
}
