// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QHash>
#include <QSet>

class QKeyEvent;

namespace Mtk {

// Which keys are down, as key events tell, so that the repeats of a key that is held are known from presses.
// Their own flag does not suffice: what platform plugins take for a repeat depends on what else is queued.
// Keys are known by their native scan codes.
class HeldKeys
{
public:
    // Takes note of a press or release, of which each must be told once. True for a press that nobody made:
    // of a key that is down, or that was released at the very same time. A key of which nothing was heard for
    // longer than any keyboard waits counts as released.
    bool isRepeat(const QKeyEvent &event);

    bool isEmpty() const { return m_down.isEmpty(); }
    // To be called when releases may have gone elsewhere: forgets all keys but these.
    void keepOnly(const QSet<quint32> &scanCodes);

private:
    bool isHeld(quint32 key, ulong time) const;

    QHash<quint32, ulong> m_down; // to the time of the last press in ms; 0 if that is not known
    quint32 m_released = 0;       // the last one that was
    ulong m_releaseTime = 0;
};

} // namespace Mtk
