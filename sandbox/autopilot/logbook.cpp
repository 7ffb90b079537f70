// SPDX-License-Identifier: Apache-2.0
#include "logbook.h"

#include <QFile>

#include <cstdio>

namespace sandbox {

namespace {

constexpr int kWordWidth = 6; // "press" and a blank

} // namespace

Logbook::Logbook(const QString &journalPath)
{
    if (!journalPath.isEmpty())
        m_journal.emplace(journalPath);
}

void Logbook::note(const QString &what, const QString &text) const
{
    const QString line = what.leftJustified(kWordWidth) + text;
    std::puts(line.toUtf8().constData());
    std::fflush(stdout);
    if (m_journal)
        m_journal->write(QStringLiteral("autopilot"), line);
}

bool Logbook::has(const QString &text) const
{
    QFile journal(m_journal ? m_journal->path() : QString());
    return journal.open(QIODevice::ReadOnly) && journal.readAll().contains(text.toUtf8());
}

} // namespace sandbox
