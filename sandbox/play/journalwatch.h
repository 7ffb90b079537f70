// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFile>
#include <QObject>
#include <QTimer>

namespace sandbox {

// Reads the journal of a running world as it grows.
class JournalWatch : public QObject
{
    Q_OBJECT

public:
    explicit JournalWatch(const QString &path);

    // Everything so far.
    const QByteArray &text() const { return m_text; }
    // Reads what has come, without waiting for the timer.
    void read();

Q_SIGNALS:
    void came(const QByteArray &line);

private:
    QFile m_file;
    QByteArray m_text;
    int m_told = 0; // bytes of m_text
    QTimer m_timer;
};

} // namespace sandbox
