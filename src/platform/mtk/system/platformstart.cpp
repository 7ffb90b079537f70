// SPDX-License-Identifier: Apache-2.0
#include "platformstart.h"

#include <QByteArray>
#include <QString>
#include <QVector>
#include <QtGlobal>

#include <unistd.h>

namespace Mtk {

namespace {

struct HeldMessage
{
    QtMsgType type;
    QByteArray category;
    QString text;
};

QtMessageHandler previousHandler = nullptr;

QVector<HeldMessage> &held()
{
    static QVector<HeldMessage> messages;
    return messages;
}

QString whyNoDisplay(const QString &fatalText)
{
    const bool named = qEnvironmentVariableIsSet("DISPLAY") || qEnvironmentVariableIsSet("WAYLAND_DISPLAY") ||
                       qEnvironmentVariableIsSet("QT_QPA_PLATFORM");
    if (!named)
        return QStringLiteral("neither DISPLAY nor WAYLAND_DISPLAY is set");
    return (held().isEmpty() ? fatalText : held().constFirst().text).simplified();
}

[[noreturn]] void endWithoutDisplay(const QString &fatalText)
{
    const QString line =
        QStringLiteral("No display can be used: %1. Start the program in a graphical session.")
            .arg(whyNoDisplay(fatalText));
    previousHandler(QtCriticalMsg, QMessageLogContext(), line);
    // The application object is only half constructed, so no destructor may run.
    _exit(1);
}

void watch(QtMsgType type, const QMessageLogContext &context, const QString &text)
{
    if (type == QtFatalMsg)
        endWithoutDisplay(text);
    if (qstrncmp(context.category, "qt.qpa.", 7) == 0)
        held().append({type, context.category, text});
    else
        previousHandler(type, context, text);
}

} // namespace

void PlatformStart::begin()
{
    previousHandler = qInstallMessageHandler(watch);
}

void PlatformStart::finish()
{
    qInstallMessageHandler(previousHandler);
    for (const HeldMessage &message : qAsConst(held()))
        previousHandler(message.type, {nullptr, 0, nullptr, message.category.constData()}, message.text);
    held().clear();
}

} // namespace Mtk
