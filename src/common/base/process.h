// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QProcess>

namespace vesk::base {

// A program that ours starts: every start goes through this class. A QProcess as such does not notice that
// fork() has failed: it takes -1 for the process ID of its child and kills that in the end, which is every
// process of the user. For a class derived from it, Qt takes another path, on which a failed fork is a failed
// start. The destructor kills what is still running. One thread may use it, the one that made it.
class Process : public QProcess
{
public:
    using QProcess::QProcess;

    // Starts `program`, which is looked up in PATH, and waits until it has ended, at most `timeoutMs` (-1:
    // without limit). False when it could not be started or is still running; complaint() then says which.
    bool run(const QString &program, const QStringList &arguments, int timeoutMs);

    // As run() without a limit, on this process's standard output and error. Its exit code, or one of the two
    // below.
    int execute(const QString &program, const QStringList &arguments);
    static constexpr int kNotStarted = -2; // complaint() says why
    static constexpr int kCrashed = -1;

    // Starts `program` on its own: it outlives this process, and nobody waits for it. False: complaint().
    bool launch(const QString &program, const QStringList &arguments);

    // One line about the last start that failed, or the wait that ended too early. Empty when there was none.
    QString complaint() const { return m_complaint; }

private:
    QString m_complaint;
};

} // namespace vesk::base
