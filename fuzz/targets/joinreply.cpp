// SPDX-License-Identifier: Apache-2.0
// The reply to a join, read by the main window while the progress page stands.
#include "fileconfig.h"
#include "httprequest.h"
#include "logcapture.h"
#include "messageboxreader.h"
#include "programfiles.h"
#include "replies.h"
#include "require.h"
#include "targets.h"
#include "wellknownpaths.h"
#include "widget.h"

#include <QCoreApplication>
#include <QEventLoop>
#include <QJsonDocument>
#include <QJsonObject>
#include <QLabel>

namespace fuzz {

namespace {

constexpr int kTellingLength = 16; // a shorter text may stand in a log line by chance

Widget *makeWindow()
{
    const MessageBoxReader boxes;
    auto *window = new Widget(nullptr);
    window->onUserLogin();
    window->onNewTerminal();
    window->onFinishSetting();
    window->onOkJoinGroup(); // without a bus the call to the service fails at once
    while (boxes.texts().isEmpty())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    require(boxes.texts().size() == 1, "a join without a bus says so");
    return window;
}

// Half a surrogate pair is none, and no file in UTF-8 can hold it.
bool isText(const QString &text)
{
    const QByteArray bytes = text.toUtf8();
    return QString::fromUtf8(bytes.constData(), bytes.size()) == text;
}

void checkAccepted(const Reply &reply, const LogCapture &log)
{
    const FileConfig *config = FileConfig::GetInstance();
    require(reply.status == 200, "a join succeeds with status 200 only");
    require(programfiles::isPrivate(vesk::kTmpPrivateKeyPath), "the key is private");
    require(programfiles::isPrivate(vesk::kTmpPublicKeyPath), "the certificate is private");
    const QJsonObject record = QJsonDocument::fromJson(programfiles::stagedRecord()).object();
    require(record.value(QStringLiteral("is_Domain")).toBool(), "the staged record says joined");
    const QString host = config->readServerHost();
    require(!isText(host) || record.value(QStringLiteral("server_host")).toString() == host,
            "the staged record reads back");
    require(!config->readServerHost().contains(QLatin1Char(':')), "a host has no colon");

    const QJsonDocument told = QJsonDocument::fromJson(reply.text.toUtf8());
    const QString key = told[QLatin1String("data")][QLatin1String("key")].toString();
    require(key.size() < kTellingLength || !log.text().contains(key), "no key in the log");
}

} // namespace

void joinReply(const QByteArray &input)
{
    FileConfig *config = FileConfig::GetInstance();
    static Widget *window = makeWindow();
    config->setDomainHost(QStringLiteral("uim.example"));
    config->setServerHost(QStringLiteral("before"));
    config->setIsDomain(false);
    programfiles::removeStaged();

    const Reply reply = replyOf(input);
    const MessageBoxReader boxes;
    const LogCapture log;
    HttpRequest::GetInstance()->onJoinControl(reply.status, reply.text);
    require(boxes.texts().size() == 1, "one message: there is no identity service");
    const bool isAccepted = programfiles::exists(vesk::kTmpUserinfoPath);
    if (isAccepted)
        checkAccepted(reply, log);
    require(isAccepted || (!config->readIsDomain() && config->readServerHost() == QLatin1String("before")),
            "a refusal changes no record");
    require(programfiles::exists(vesk::kTmpPrivateKeyPath) == isAccepted &&
                programfiles::exists(vesk::kTmpPublicKeyPath) == isAccepted,
            "a refusal writes no file");
    // One for each accepted reply; they would live as long as the window.
    qDeleteAll(window->findChildren<QLabel *>(QString(), Qt::FindDirectChildrenOnly));
}

} // namespace fuzz
