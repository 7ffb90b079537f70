// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "process.h"
#include <QCoreApplication>
#include <QDeadlineTimer>

namespace sandbox {

// Serves events until the condition holds; false after the limit.
template <typename Condition>
bool serveUntil(int limitMs, Condition condition)
{
    const QDeadlineTimer limit(limitMs);
    while (!condition() && !limit.hasExpired())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    return condition();
}

// A process of a world. It never outlives the process that started it, however that one ends: the kernel
// kills it. Start it from the main thread. Its standard error goes to `errorLog`.
class Child : public vesk::base::Process
{
    Q_OBJECT

public:
    explicit Child(const QString &errorLog, QObject *parent = nullptr);
    ~Child() override;

    // Starts it there. False with one line in `error`.
    bool startIn(const QProcessEnvironment &environment, const QString &program, const QStringList &arguments,
                 QString *error);

    // Starts and waits for one whole line on standard output: the sign that the process is ready. A null
    // result: it did not start, ended or said nothing within the limit, and `error` says which.
    QString startAndReadLine(const QString &program, const QStringList &arguments, QString *error);

    // Asks it to end, insists after `graceMs`, and returns when it is gone.
    void end(int graceMs = 3000);

protected:
    void setupChildProcess() override;
};

// Path of a program of this build or installation, which lies beside the running one or, for a test, in the
// directory of programs beside it. Null with one line in `error` when there is none.
QString findTool(const QString &name, QString *error);

} // namespace sandbox
