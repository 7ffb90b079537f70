// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "isolationoptions.h"

#include <QStringList>

#include <memory>

namespace sandbox {

class RunDirectory;
class View;

// The tools that give a command its own view of the file system: bubblewrap where the kernel grants
// namespaces to this user, else proot, which needs no privilege and traces the command instead. Used by
// vesk-isolate.
class Backend
{
public:
    virtual ~Backend() = default;

    // The back end asked for, or the first one that passes a trial run. Throws an Error with the reasons.
    static std::unique_ptr<Backend> choose(IsolationOptions::Backend wanted);

    // The command line that runs `stage` (a command that is visible inside) in the view. Variables that the
    // tool needs are set in this process, and descriptors that it inherits stay open in it.
    virtual QStringList commandLine(const View &view, const RunDirectory &run, const QStringList &stage) = 0;

    // Called in the child between fork and exec.
    virtual bool enter() const { return true; }

protected:
    Backend() = default;
    Q_DISABLE_COPY_MOVE(Backend)
};

// A private mount and process namespace made by bubblewrap. A mount point that the machine lacks cannot be
// made on a read-only root, so /, /etc, /usr and /usr/share are rebuilt and their entries bound one by
// one.
class Bubblewrap : public Backend
{
public:
    QStringList commandLine(const View &view, const RunDirectory &run, const QStringList &stage) override;

    static QStringList trialArguments();
};

// The same view by system call translation, for machines that grant no namespaces. It replaces paths and
// nothing more: the rest of the machine stays as writable as it is for the user.
class Proot : public Backend
{
public:
    QStringList commandLine(const View &view, const RunDirectory &run, const QStringList &stage) override;
    bool enter() const override;

    static QStringList trialArguments();
};

} // namespace sandbox
