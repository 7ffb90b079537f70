// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QProcess>
#include <QTemporaryDir>

/// A virtual display and a session bus of the test's own, both set in the environment of this process and
/// ended with the object; ready for a program that is to be read.
class Desk
{
public:
    Desk();
    ~Desk();
    Desk(const Desk &) = delete;
    Desk &operator=(const Desk &) = delete;

    /// For sockets: the path is short, since the name of a socket has at most 108 bytes.
    QString folder() const { return m_folder.path(); }

    /// Starts a server that tells where it listens in the first line of its output, and gives that line.
    static QString startServer(QProcess &server, const QString &program, const QStringList &arguments);

private:
    QTemporaryDir m_folder;
    QProcess m_display;
    QProcess m_bus;
};
