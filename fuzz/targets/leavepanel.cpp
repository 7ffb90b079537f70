// SPDX-License-Identifier: Apache-2.0
// Replies to the leave panel.
#include "fileconfig.h"
#include "httprequest.h"
#include "localselectwidget.h"
#include "logcapture.h"
#include "messageboxreader.h"
#include "programfiles.h"
#include "replies.h"
#include "require.h"
#include "scriptedtransport.h"
#include "serverreply.h"
#include "targets.h"
#include "wellknownpaths.h"

#include <QLineEdit>

namespace fuzz {

namespace {

const QString kPassword = QStringLiteral("Admin\"pass-7\\");

// In the dialog that may open: types an administrator. False in any other one.
bool authorise(const QDialog &dialog)
{
    const auto fields = dialog.findChildren<QLineEdit *>();
    if (fields.size() < 2)
        return false;
    fields.at(0)->setText(QStringLiteral("admin"));
    fields.at(1)->setText(kPassword);
    return true;
}

} // namespace

void leavePanel(const QByteArray &input)
{
    FileConfig *config = FileConfig::GetInstance();
    config->setIsDomain(true);
    programfiles::removeStaged();
    const QVector<Reply> replies = repliesOf(input);
    scriptedtransport::script(replies);

    const LogCapture log;
    bool authorised = false;
    bool started = false;
    whetherCloseGuard panel(nullptr, true);
    QObject::connect(&panel, &whetherCloseGuard::sigStartRemove, [&] { started = true; });
    MessageBoxReader boxes;
    boxes.whileOpen = [&](const QDialog &dialog) {
        authorised = authorise(dialog) || authorised;
    };
    panel.closeGuardCliked();
    const QString state = replies.value(0).text;
    require(authorised == (!state.isEmpty() && ServerReply(state).isJson()),
            "any JSON opens the administrator's dialog");
    const bool granted = authorised && ServerReply(replies.value(1).text).isGranted();
    require(started == granted, "the restore starts with a permission only");
    require(boxes.texts().size() == (authorised ? 2 : state.isEmpty() ? 0 : 1), "one message for each step");
    require(config->readIsDomain() != granted, "the record changes with a permission only");
    require(programfiles::exists(vesk::kTmpUserinfoPath) == granted, "nothing is staged without permission");
    require(!programfiles::stagedRecord().contains(kPassword.toUtf8()), "no password in the record");
    require(!log.text().contains(kPassword), "no password in the log");
}

void removalReply(const QByteArray &input)
{
    static auto *panel = new whetherCloseGuard(nullptr, true);
    static int removed = 0;
    static const auto connection = QObject::connect(panel, &whetherCloseGuard::sigRemove, [] { ++removed; });
    Q_UNUSED(connection)
    removed = 0;
    const Reply reply = replyOf(input);
    scriptedtransport::script({reply});
    const MessageBoxReader boxes;
    HttpRequest::GetInstance()->postQuitControl(QStringLiteral("admin"));
    require(boxes.texts().size() + removed == 1, "one message, or removed");
    require(removed == 0 || reply.status == 200, "a terminal is removed with status 200 only");
}

} // namespace fuzz
