// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/row.h"

#include <QSet>
#include <QStringList>

namespace sandbox {

class World;

// Does to a running world what the actions of a row say, when the journal comes to their moment.
class RowActions
{
public:
    RowActions(World &world, QVector<Action> actions);

    static QStringList names();

    // Whether some wait for the program's window, and not for a line; performReady() is their moment.
    bool awaitWindow() const;
    void performReady();
    // To be called for each line of the journal.
    void onLine(const QByteArray &line);
    // What did not come about as it should; to be asked at the end.
    QStringList complaints() const;

private:
    void perform(const QString &name);

    World &m_world;
    QVector<Action> m_actions;
    QSet<int> m_fired;
    QStringList m_complaints;
};

} // namespace sandbox
