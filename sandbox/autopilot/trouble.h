// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

#include <exception>

namespace sandbox {

/// Why a walk cannot go on, in one line for the person who started it. Thrown by every part of the autopilot
/// and caught in its main function or in a test; never thrown out of a slot or an event handler.
class Trouble : public std::exception
{
public:
    explicit Trouble(const QString &text)
        : m_text(text)
        , m_bytes(text.toUtf8())
    {
    }

    const QString &text() const { return m_text; }
    const char *what() const noexcept override { return m_bytes.constData(); }

private:
    QString m_text;
    QByteArray m_bytes;
};

/// An object of the program did not answer: it is gone, or the program is busy. Whoever waits looks again.
class Vanished : public Trouble
{
public:
    using Trouble::Trouble;
};

} // namespace sandbox
