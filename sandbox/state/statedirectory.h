// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/journal.h"
#include "scenario/scenario.h"

#include <QFile>
#include <QString>

namespace sandbox {

// Where things lie in the state directory of a world. One place for launcher, services and stand-in commands,
// which are processes of their own and know nothing of each other but this directory. Creates nothing.
class StateDirectory
{
public:
    // path: absolute.
    explicit StateDirectory(QString path)
        : m_path(std::move(path))
    {
    }

    // Names the directory in the environment of a process inside a world.
    static constexpr const char *kVariable = "VESK_SANDBOX_STATE";

    QString path() const { return m_path; }
    QString at(const char *relative) const { return m_path + QLatin1Char('/') + QLatin1String(relative); }

    Journal journal() const { return Journal(at("journal.log")); }

    // The situation that this run of the world plays.
    QString scenarioFile() const { return at("scenario.json"); }

    // root() + an absolute path is the file that the program sees at that path.
    QString root() const { return at("root"); }
    QString inside(const QString &absolute) const { return root() + absolute; }

    QString home() const { return at("home"); }
    // Sockets; the runtime directory of the session. It is elsewhere, and empty unless the world runs.
    QString run() const { return QFile::symLinkTarget(runLink()); }
    QString runLink() const { return at("run"); }
    QString commands() const { return at("commands"); }
    QString schemas() const { return at("schemas"); }
    QString programLog() const { return at("program.log"); }
    QString starts() const { return at("starts.log"); } // of processes, where strace records them
    QString calls() const { return at("calls.log"); }   // into the kernel, where strace makes one fail
    QString connections() const { return at("connections.json"); } // what the network daemon reports
    QString identityService() const { return at("iam.json"); }     // property of iam
    QString units() const { return at("units.json"); }             // per-user services

private:
    QString m_path;
};

} // namespace sandbox
