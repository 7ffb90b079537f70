// SPDX-License-Identifier: Apache-2.0
// Replies to the pages of the wizard.
#include "fileconfig.h"
#include "httprequest.h"
#include "logcapture.h"
#include "loginwidget.h"
#include "messageboxreader.h"
#include "programfiles.h"
#include "replies.h"
#include "require.h"
#include "scriptedtransport.h"
#include "serverconfigwidget.h"
#include "targets.h"
#include "wellknownpaths.h"

#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"

namespace fuzz {

namespace {

const QString kHost = QStringLiteral("uim.example");
const QString kPort = QStringLiteral("8443");
const QString kPassword = QStringLiteral("Pass\"wort-9\\");

int jumps = 0; // to the next page, during one input

ServerConfigWidget *makeServerPage()
{
    FileConfig::GetInstance()->setDomainHost(kHost);
    FileConfig::GetInstance()->setDomainPort(kPort);
    auto *page = new ServerConfigWidget(nullptr);
    QObject::connect(page, &ServerConfigWidget::sigJumpUserLogin, [] { ++jumps; });
    return page;
}

LoginWidget *makeAccountPage()
{
    auto *page = new LoginWidget(nullptr);
    QObject::connect(page, &LoginWidget::sigJumpNewTerminal, [] { ++jumps; });
    page->findChild<Mtk::Widget::MPasswordEdit *>()->setText(kPassword);
    return page;
}

void checkServerPage(bool stored, const QVector<Reply> &replies)
{
    const FileConfig *config = FileConfig::GetInstance();
    const auto &calls = scriptedtransport::state().calls;
    require(stored == (config->readDomainHost() == kHost), "the address is kept if and only if the CA is");
    require(calls.size() == (stored ? 2 : 1), "the state is asked for if and only if the CA was taken");
    if (stored) {
        const QString ca = QString::fromUtf8(vesk::kTmpCaCertPath);
        require(replies.first().status == 200, "a CA comes with status 200");
        require(programfiles::isPrivate(vesk::kTmpCaCertPath), "the CA file is its owner's only");
        require(scriptedtransport::state().sslFiles == QStringList({ca, QString(), QString()}),
                "the fetched CA is in force");
    }
    if (jumps != 0)
        require(stored && replies.value(1).status == 200, "the wizard goes on after a good state only");
    require((config->readServerPort() == kPort) == (jumps == 1), "the port is kept when the wizard goes on");
}

} // namespace

void serverPage(const QByteArray &input)
{
    static const ServerConfigWidget *page = makeServerPage();
    Q_UNUSED(page)
    FileConfig *config = FileConfig::GetInstance();
    config->setDomainHost(QStringLiteral("before"));
    config->setDomainPort(QStringLiteral("1"));
    config->setServerPort(QStringLiteral("1"));
    programfiles::removeStaged();
    jumps = 0;

    const QVector<Reply> replies = repliesOf(input);
    scriptedtransport::script(replies);
    const MessageBoxReader boxes;
    HttpRequest::GetInstance()->getCaCert(kHost, kPort);
    require(boxes.texts().size() + jumps == 1, "one message, or the next page");
    checkServerPage(programfiles::exists(vesk::kTmpCaCertPath), replies);
}

void accountPage(const QByteArray &input)
{
    static LoginWidget *page = makeAccountPage();
    jumps = 0;
    const Reply reply = replyOf(input);
    scriptedtransport::script({reply});
    const MessageBoxReader boxes;
    const LogCapture log;
    page->onCheckAccountPwd();
    require(boxes.texts().size() + jumps == 1, "one message, or the next page");
    require(jumps == 0 || reply.status == 200, "an account is good with status 200 only");
    require(!log.text().contains(kPassword), "no password in the log");
}

} // namespace fuzz
