// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>

// A path as this user finds it, without following a link.
struct FileAccess
{
    enum class Presence { Absent, Unreadable, Readable };

    Presence presence = Presence::Absent;
    bool isDirectory = false;
    uint ownerId = 0;
    uint mode = 0; // permission bits
    QString owner; // names, or numbers where there are none
    QString group;

    static FileAccess of(const QString &path);

    bool isAbsent() const { return presence == Presence::Absent; }
    bool isReadable() const { return presence == Presence::Readable; }
    QString modeText() const { return QStringLiteral("0%1").arg(mode, 3, 8, QLatin1Char('0')); }
    // Path, owner, group and mode; of a file of which nothing is known the path only.
    QJsonObject toJson(const QString &path) const;
    QString toText(const QString &path) const;
};
