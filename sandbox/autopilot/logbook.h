// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/journal.h"
#include "journal/smallfile.h"

#include <cstdio>

namespace sandbox {

/// Tells what the autopilot does, one line for each step: on standard output, and in the journal of the world
/// when there is one (its path is not empty).
struct Logbook
{
    Journal journal;

    /// `what` is one word such as "page", "type" or "press".
    void note(const QString &what, const QString &text) const
    {
        const QString line = what.leftJustified(5) + QLatin1Char(' ') + text;
        std::puts(line.toUtf8().constData());
        std::fflush(stdout);
        if (!journal.path().isEmpty())
            journal.write(QStringLiteral("autopilot"), line);
    }

    /// Whether a line of the journal, whoever wrote it, holds this text.
    bool has(const QString &text) const
    {
        return smallfile::read(journal.path()).value_or(QByteArray()).contains(text.toUtf8());
    }
};

} // namespace sandbox
