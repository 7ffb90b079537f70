// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// One file of the TLS configuration as it was found. Read only when it can be trusted: a regular file of
// root or of the user, not writable by others. A secret one that others can read is read too, with advice.
struct PemFile
{
    enum class State { NotNamed, Absent, Read, Refused };
    enum class Content { Public, Secret };

    static constexpr qint64 kMaxSize = 1024LL * 1024; // in bytes; what is longer is refused

    State state = State::NotNamed;
    QByteArray contents;
    QString reason; // of the refusal, with the path
    QString advice; // about a mode that lets others read a secret; empty: none needed

    static PemFile read(const QString &path, Content content);

    bool isAbsent() const { return state == State::Absent || state == State::NotNamed; }
};
