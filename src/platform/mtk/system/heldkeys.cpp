// SPDX-License-Identifier: Apache-2.0
#include "heldkeys.h"

#include <QKeyEvent>

namespace Mtk {

namespace {

// Input methods may swallow a release. Keyboards wait for less than this before they repeat.
constexpr ulong kForgetMs = 3000;

quint32 keyOf(const QKeyEvent &event)
{
    return event.nativeScanCode() != 0 ? event.nativeScanCode() : quint32(event.key());
}

} // namespace

bool HeldKeys::isRepeat(const QKeyEvent &event)
{
    const quint32 key = keyOf(event);
    const ulong time = event.timestamp();
    if (event.type() == QEvent::KeyPress) {
        const bool repeats = event.isAutoRepeat() || isHeld(key, time);
        m_down.insert(key, time);
        return repeats;
    }
    if (!event.isAutoRepeat() && m_down.remove(key) > 0) {
        m_released = key;
        m_releaseTime = time;
    }
    return false;
}

void HeldKeys::keepOnly(const QSet<quint32> &scanCodes)
{
    QHash<quint32, ulong> kept;
    for (auto each = m_down.cbegin(); each != m_down.cend(); ++each) {
        if (scanCodes.contains(each.key()))
            kept.insert(each.key(), 0);
    }
    m_down = kept;
}

bool HeldKeys::isHeld(quint32 key, ulong time) const
{
    const auto last = m_down.constFind(key);
    if (last != m_down.cend())
        return *last == 0 || time == 0 || time - *last < kForgetMs;
    return time != 0 && key == m_released && time == m_releaseTime;
}

} // namespace Mtk
