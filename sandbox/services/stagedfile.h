// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

namespace sandbox {

// The content of a file that the client has staged, believed only when directory and file are what the client
// makes: no link, a plain file, its owner root or the user of the session, writable by nobody else, of sane
// size.
struct StagedFile
{
    QByteArray content;
    QString refusal; // why the file is not believed; empty: it is

    static StagedFile read(const QString &directory, const QString &name);
};

} // namespace sandbox
