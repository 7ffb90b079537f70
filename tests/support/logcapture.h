// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QStringList>
#include <QtGlobal>

// Collects what is logged during its lifetime, each line as "level: message".
class LogCapture
{
public:
    LogCapture()
    {
        s_lines.clear();
        m_previous = qInstallMessageHandler(collect);
    }
    ~LogCapture() { qInstallMessageHandler(m_previous); }
    Q_DISABLE_COPY_MOVE(LogCapture)

    QStringList lines() const { return s_lines; }
    QString text() const { return s_lines.join(QLatin1Char('\n')); }

private:
    static void collect(QtMsgType type, const QMessageLogContext &, const QString &message)
    {
        static const char *const levels[] = {"debug", "warning", "critical", "fatal", "info"};
        s_lines.append(QLatin1String(levels[type]) + QLatin1String(": ") + message);
    }

    static inline QStringList s_lines;
    QtMessageHandler m_previous = nullptr;
};
