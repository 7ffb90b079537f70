// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QList>
#include <QObject>
#include <QSet>
#include <QStringList>
#include <QTimer>

namespace sandbox {

// Looks for passwords and private keys where they do not belong, as they are, percent-encoded or in Base64:
// in arguments and environment of every process that this one has started, sampled while the world runs, and
// afterwards in the world's files. One of these may tell of every start of a process, in the words of strace;
// what is too short-lived for a sample shows there.
class SecretWatch : public QObject
{
    Q_OBJECT

public:
    // state: directory of the world. passwords: what is typed in the row.
    SecretWatch(QString state, QStringList passwords);

    // Looks through the files of the world; only those that are meant to hold a secret may.
    QStringList leaks();

private:
    void sample();
    // "password", "key"
    QStringList secretsIn(const QByteArray &text) const;

    QString m_state;
    QList<QByteArray> m_passwords; // in each of their forms
    QStringList m_leaks;
    QSet<QByteArray> m_seen; // process and arguments of what was looked at
    QTimer m_timer;
};

} // namespace sandbox
