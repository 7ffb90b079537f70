// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

// Line breaks and other control characters written as escapes (\n, \t, \x1b).
QString onOneLine(const QString &text);

// The record of what happens in a world, one line for each thing, in the order in which it happened:
//     2026-11-24 13:00:00.123 server    request GET /uim/v3/client/status?machine_id=7&keyword=join from
//     127.0.0.1
// Server, services, stand-in commands and autopilot write here, each from a process of its own. A line goes
// out in one appending write(2), so lines of many processes and threads never mix. What the program of the
// world has logged in the meantime goes ahead of each line. The journal masks nothing: who writes a line
// leaves passwords and keys out of it.
class Journal
{
public:
    // `path` is the file, made at the first line (mode 0644 less the umask); its directory must exist.
    explicit Journal(QString path);

    QString path() const { return m_path; }

    // Adds one line. `source` is one of world, server, bus, command, file, autopilot, program. `text` is put
    // on one line. May be called from any thread. A line that cannot be written is reported by a warning and
    // otherwise lost.
    void write(const QString &source, const QString &text) const;

private:
    QString m_path;
};

} // namespace sandbox
