// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QMessageLogContext>
#include <QString>

namespace vesk {

// Priorities of the system log, from syslog(3).
enum LEVEL {
    LevelEmergency = 0,
    LevelAlert = 1,
    LevelCritical = 2,
    LevelError = 3,
    LevelWarning = 4,
    LevelNotice = 5,
    LevelInfo = 6,
    LevelDebug = 7,
};

// Sends all of Qt's messages to the system log, facility "daemon", with a copy on standard error. A message
// is written when its priority number is at most `level`. Called once, as the first thing in main().
void uOpenlog(LEVEL level);

// Closes the connection to the system log. The program itself leaves that to the end of the process.
void uCloselog();

// The handler that uOpenlog() installs: one line for each message, with time, level, file, function and line.
void uSyslogMessageHandler(QtMsgType type, const QMessageLogContext &context, const QString &message);

} // namespace vesk
