// SPDX-License-Identifier: Apache-2.0
#include "logging.h"

#include <QCoreApplication>
#include <QDateTime>
#include <QFileInfo>
#include <QLoggingCategory>

#include <syslog.h>

static int s_logLevel = vesk::LevelInfo;

namespace vesk {

namespace {

struct Severity
{
    const char *name;
    int priority;
};

// A critical message ranks above a fatal one here, and "fata" is the short name that log filters know.
Severity severityOf(QtMsgType type)
{
    switch (type) {
    case QtDebugMsg:
        return {"debug", LOG_DEBUG};
    case QtWarningMsg:
        return {"warning", LOG_WARNING};
    case QtCriticalMsg:
        return {"critical", LOG_CRIT};
    case QtFatalMsg:
        return {"fata", LOG_ERR};
    case QtInfoMsg:
        break;
    }
    return {"info", LOG_INFO};
}

QByteArray shortFileName(const char *path)
{
    return QString::fromUtf8(path).split(QLatin1Char('/')).last().toUtf8();
}

} // namespace

void uOpenlog(LEVEL level)
{
    // openlog() keeps the pointer, so the text has to live as long as the log is open.
    static QByteArray identity;
    identity = QFileInfo(QCoreApplication::applicationFilePath()).fileName().toLatin1();

    QLoggingCategory::defaultCategory()->setEnabled(QtDebugMsg, level == LevelDebug);
    s_logLevel = level;
    openlog(identity.constData(), LOG_PID | LOG_CONS | LOG_PERROR, LOG_DAEMON);
    qInstallMessageHandler(uSyslogMessageHandler);
}

void uCloselog()
{
    closelog();
}

void uSyslogMessageHandler(QtMsgType type, const QMessageLogContext &context, const QString &message)
{
    const Severity severity = severityOf(type);
    if (message.isEmpty() || severity.priority > s_logLevel)
        return;

    const QByteArray time =
        QDateTime::currentDateTime().toString(QStringLiteral("yyyy-MM-dd hh:mm:ss.zzz")).toUtf8();
    syslog(severity.priority, "%s %s [ %s %s %u]  %s \n", time.constData(), severity.name,
           shortFileName(context.file).constData(), context.function, static_cast<unsigned>(context.line),
           message.toLocal8Bit().constData());
}

} // namespace vesk
