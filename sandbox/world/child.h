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

    // Starts it there; throws an Error when it does not start.
    void startIn(const QProcessEnvironment &environment, const QString &program,
                 const QStringList &arguments = {});

    // Starts and waits for one whole line on standard output: the sign that the process is ready. Throws an
    // Error when it did not start, ended, or said nothing within the limit.
    QString startAndReadLine(const QString &program, const QStringList &arguments);

    // Asks it to end, insists after `graceMs`, and returns when it is gone.
    void end(int graceMs = 3000);

protected:
    void setupChildProcess() override;
};

// Path of a program of this build or installation, which lies beside the running one or, for a test, in the
// directory of programs beside it. Throws an Error when there is none.
QString findTool(const QString &name);

} // namespace sandbox
