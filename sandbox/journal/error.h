// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <stdexcept>

namespace sandbox {

// Why something cannot go on, in one line for the person who started it. Caught where that line is told, in
// a main function or a test, never thrown out of a slot or an event handler.
class Error : public std::runtime_error
{
public:
    explicit Error(const QString &text)
        : std::runtime_error(text.toStdString())
    {
    }

    QString text() const { return QString::fromUtf8(what()); }
};

// False with the line in `error` when `work` throws one.
template <typename Work>
bool attempt(QString *error, const Work &work)
{
    try {
        work();
        return true;
    } catch (const Error &failure) {
        *error = failure.text();
        return false;
    }
}

} // namespace sandbox
