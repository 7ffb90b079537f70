// SPDX-License-Identifier: Apache-2.0
#include "serverconfigwidget.h"

#include "dbusservices.h"
#include "fieldpage.h"
#include "fileconfig.h"
#include "httprequest.h"
#include "logtext.h"
#include "pageparts.h"
#include "serverreply.h"
#include "wellknownpaths.h"

#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/msuggestbutton.h"

#include <QLineEdit>
#include <QPushButton>
#include <QRegExpValidator>

#include <QDebug>

using Mtk::Widget::MLabel;
using Mtk::Widget::MLineEdit;
using Mtk::Widget::MSuggestButton;
using vesk::base::logText;

namespace {

// The server's code for "no more terminals".
constexpr int kTerminalLimitCode = -500000;

} // namespace

ServerConfigWidget::ServerConfigWidget(QWidget *parent)
    : QWidget(parent)
{
    createConnections(createInterface());
}

QPushButton *ServerConfigWidget::createInterface()
{
    const QString host = FileConfig::GetInstance()->readDomainHost();
    const QString port = FileConfig::GetInstance()->readDomainPort();

    FieldPage form(this, QStringLiteral("服务器配置"), pageparts::pageFont(pageparts::kHeadingWeight),
                   pageparts::pageFont(pageparts::kBodyWeight));
    m_hostEdit = new MLineEdit(this);
    form.addRow(new QLabel(this), QStringLiteral("域地址:"), m_hostEdit, Qt::AlignRight);
    m_hostEdit->lineEdit()->setInputMethodHints(Qt::ImhUrlCharactersOnly | Qt::ImhNoAutoUppercase |
                                                Qt::ImhNoPredictiveText);
    m_hostEdit->setText(host);
    m_portEdit = new MLineEdit(this);
    form.addRow(new MLabel(this), QStringLiteral("端     口:"), m_portEdit, Qt::AlignRight);
    m_portEdit->lineEdit()->setValidator(new QRegExpValidator(QRegExp(QStringLiteral("[0-9]+$")), this));
    m_portEdit->lineEdit()->setInputMethodHints(Qt::ImhDigitsOnly);
    m_portEdit->setText(port);

    form.addButtons(QStringLiteral("取消"), QStringLiteral("下一步"));
    m_nextButton = form.rightButton();
    // One known value is enough here; once the user edits, both fields have to hold something.
    m_nextButton->setEnabled(!host.isEmpty() || !port.isEmpty());
    return form.leftButton();
}

void ServerConfigWidget::createConnections(QPushButton *cancelButton)
{
    connect(m_hostEdit, &MLineEdit::textChanged, this, &ServerConfigWidget::onIpv4Changed);
    connect(m_portEdit, &MLineEdit::textChanged, this, &ServerConfigWidget::onTextChanged);
    connect(m_nextButton, &MSuggestButton::clicked, this, &ServerConfigWidget::onJumpLocal);
    connect(cancelButton, &QPushButton::clicked, this, &ServerConfigWidget::sigCancelSetting);
    HttpRequest *server = HttpRequest::GetInstance();
    connect(server, &HttpRequest::sigCaCert, this, &ServerConfigWidget::onServerChecked);
    connect(server, &HttpRequest::sigMacheineCheck, this, &ServerConfigWidget::onMacheineCheck);
}

void ServerConfigWidget::onIpv4Changed(const QString &text)
{
    enableForTwo(m_nextButton, text, m_portEdit->text());
}

void ServerConfigWidget::onTextChanged(const QString &text)
{
    enableForTwo(m_nextButton, text, m_hostEdit->text());
}

void ServerConfigWidget::onJumpLocal()
{
    m_host = m_hostEdit->text();
    m_port = m_portEdit->text();

    // A daemon that does not answer does not stop the way to the server.
    const QString connections = dbusservices::activeConnections().value_or(QString());
    qInfo() << "com.morvek.daemon.Network---reply----:" << logText(connections);
    if (connections == QLatin1String("null")) {
        showMessageBox(QStringLiteral("网络异常，请稍后重试"));
        return;
    }
    HttpRequest::GetInstance()->getCaCert(m_host, m_port);
}

void ServerConfigWidget::onServerChecked(const int &statusCode, const QString &strData)
{
    const ServerReply reply(strData);
    if (const auto failure = reply.failure(statusCode, "域地址或端口错误，请重新输入。")) {
        showMessageBox(*failure);
        return;
    }

    qInfo() << "获取CA证书";
    FileConfig *config = FileConfig::GetInstance();
    config->setDomainHost(m_hostEdit->text());
    config->setDomainPort(m_portEdit->text());
    const QString caPath = QString::fromUtf8(vesk::kTmpCaCertPath);
    config->saveCert(reply.data().value(QStringLiteral("ca_cert")).toString(), caPath);
    HttpRequest::GetInstance()->setSSLConfig(caPath, QString(), QString());
    HttpRequest::GetInstance()->getMacheineCheck(MachineJoin, QString());
}

void ServerConfigWidget::onMacheineCheck(const int &statusCode, const QString &replyText)
{
    if (statusCode != 200) {
        showMessageBox(QString::fromLocal8Bit("网络异常，请稍后重试"));
        return;
    }
    const ServerReply reply(replyText);
    if (!reply.isJson()) {
        qInfo() << "server data" << logText(replyText);
        showMessageBox(QString::fromLocal8Bit("服务器返回数据错误"));
        return;
    }
    if (reply.isGranted()) {
        FileConfig::GetInstance()->setDomainHost(m_hostEdit->text());
        // The server port stands in until the join reply names the real one.
        FileConfig::GetInstance()->setServerPort(m_portEdit->text());
        Q_EMIT sigJumpUserLogin();
        return;
    }
    if (reply.rawCode() == QJsonValue(kTerminalLimitCode))
        showMessageBox(QString::fromLocal8Bit("终端数量到达上限!"));
    else
        showMessageBox(QString::fromLocal8Bit("终端已加域,请联系管理员从服务器移除终端重新加域!"));
}

void ServerConfigWidget::showMessageBox(QString text)
{
    pageparts::showMessage(this, text);
}
