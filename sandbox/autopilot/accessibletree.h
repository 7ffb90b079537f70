// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "element.h"

#include <QDeadlineTimer>
#include <QRect>

namespace sandbox {

/// The windows of one running program as a screen reader sees them, and the reader's hands: type, press. Walk
/// and end-to-end tests use it. It knows the accessibility protocol, but no page of any program.
///
/// Every operation throws Vanished when a widget is gone or the program does not answer in time, and a plain
/// Error when the program has ended.
class AccessibleTree
{
public:
    /// Switches the accessibility bus of this process' session on and waits until `program` (its application
    /// name) has published its tree; throws an Error when it does not do so in time, or when there is no bus.
    /// Where it runs several times, `instance` counts from 0 in the order of the starts.
    AccessibleTree(const QString &program, const QDeadlineTimer &deadline, int instance = 0);

    /// All windows that are showing, the oldest first.
    std::vector<Element> windows() const;

    /// The text of an edit. A secret one gives one "*" for each character.
    QString text(const Element &edit) const;

    /// Replaces the whole text.
    void type(const Element &edit, const QString &text) const;

    /// Presses once and waits until the program, which may be at work, has taken the press. What is asked
    /// afterwards is answered after the press, or out of what it has opened.
    void press(const Element &button, const QDeadlineTimer &deadline) const;

    /// Where the element is on the screen, in logical pixels.
    QRect extents(const Element &element) const;

    /// Whether the program still runs.
    bool isAlive() const { return m_bus.isAlive(m_program.service); }

private:
    Element read(const ObjectRef &object, quint64 states, int depth) const;
    std::vector<Element> readChildren(const ObjectRef &object, int depth) const;
    quint64 states(const ObjectRef &object) const;
    void requireAlive() const;

    AccessibleBus m_session;
    AccessibleBus m_bus;
    ObjectRef m_program;
};

} // namespace sandbox
