// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "play/syscallfault.h"
#include "play/viewfiles.h"

#include <QJsonArray>
#include <QSet>
#include <QStringList>
#include <QVector>

namespace sandbox {

class World;

// Does to a running world what the actions of a scenario say, when the journal comes to their moment. A call
// that the world holds goes on once all that has its moment before it has been done; where an action ends the
// program, once all is done; where a scenario has the action "release", that alone lets it go on.
// A call into the kernel that is to fail is joined at its moment like an action.
class Actions
{
public:
    // actions: as the schema has them. fault: lives longer than this. before: the files of the world before
    // the program; what the actions do to them is done to it as well. Null: they are not compared.
    Actions(World &world, const QJsonArray &actions, SyscallFault &fault, ViewFiles *before);

    // Whether some wait for the program's window, and not for a line; performReady() is their moment.
    bool awaitWindow() const;
    void performReady();
    // To be called for each line of the journal.
    void onLine(const QByteArray &line);
    // What did not come about as it should; to be asked at the end.
    QStringList complaints() const;

private:
    struct Action
    {
        QString on; // part of a line of the journal; empty: when the program starts
        QString what;
    };

    void performDue(const QByteArray &line);
    void releaseDue();
    bool does(const QStringList &names) const;
    void perform(const QString &name);

    World &m_world;
    SyscallFault &m_fault;
    ViewFiles *m_before;
    QVector<Action> m_actions;
    QSet<int> m_fired;
    int m_held = 0;              // calls that wait
    QVector<QByteArray> m_lines; // to come; an action may serve events, and with them the journal
    bool m_performs = false;
    QStringList m_complaints;
};

} // namespace sandbox
