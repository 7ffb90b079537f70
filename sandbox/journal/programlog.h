// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QFile>
#include <QString>

#include <vector>

namespace sandbox {

// One line for the journal that comes from what the program has logged.
struct ProgramEvent
{
    QString source;
    QString text;
};

// What the program of a world has logged since the last call. The program writes its log before it
// goes on, so whoever is about to journal what the program does next takes these lines first, and the order
// is true. Looks at program.log beside the journal; while the object exists, no other takes lines. Without
// such a log there are none.
class ProgramLog
{
public:
    explicit ProgramLog(const QString &journalPath);

    // Whole lines only, each given once. After the one that tells of a staged record comes what that record
    // says.
    std::vector<ProgramEvent> takeEvents();

private:
    QByteArray takeNewLines();
    QString stagedRecord() const;

    QString m_directory;
    QFile m_position; // locked; how many bytes were taken
};

} // namespace sandbox
