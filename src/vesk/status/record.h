// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "finding.h"

#include <QJsonObject>

// A terminal record as it stands, which is all that this reader does: unlike the base layer's it repairs
// nothing, and it keeps a missing record apart from an empty one.
struct Record
{
    enum class State {
        Missing,
        Unreadable, // by this user
        Refused,    // too long, or no regular file
        Empty,
        Torn, // no JSON object
        Whole
    };

    State state = State::Missing;
    QJsonObject values; // of a whole one

    static Record read(const QString &path);

    // No value where the record does not tell.
    Joined joined() const;
    QString text(const char *key) const;
};

// What record and machine identity tell.
Findings terminalFindings(const Record &record);
