// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/journal.h"

#include <optional>

namespace sandbox {

/// Tells what the autopilot does, one line for each step: on standard output, and in the journal of the world
/// when there is one.
class Logbook
{
public:
    /// `journalPath` is empty when no journal is kept.
    explicit Logbook(const QString &journalPath);

    /// `what` is one word such as "page", "type" or "press".
    void note(const QString &what, const QString &text) const;

    /// Whether a line of the journal, whoever wrote it, holds this text.
    bool has(const QString &text) const;

private:
    std::optional<Journal> m_journal;
};

} // namespace sandbox
