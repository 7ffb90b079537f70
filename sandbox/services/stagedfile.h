// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

namespace sandbox {

// The content of a file that the client has staged, trusted only when directory and file are what the client
// makes: no link, a regular file, its owner root or the user of the session, not writable by others, of sane
// size.
struct StagedFile
{
    QByteArray content;
    QString refusal; // why the file is not trusted; empty: it is

    static StagedFile read(const QString &directory, const QString &name);
};

} // namespace sandbox
