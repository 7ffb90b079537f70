// SPDX-License-Identifier: Apache-2.0
#include "accessibletree.h"

#include "waitfor.h"

#include <QDBusArgument>

namespace sandbox {

namespace {

// Numbers of the AT-SPI 2 protocol.
constexpr quint64 kEnabled = 1ULL << 8U;
constexpr quint64 kPressed = 1ULL << 20U;
constexpr quint64 kSensitive = 1ULL << 24U;
constexpr quint64 kShowing = 1ULL << 25U;
constexpr uint kScreenCoordinates = 0;

constexpr int kMaxDepth = 64;             // a tree deeper than this is damaged
constexpr int kActivationLimitMs = 10000; // the launcher of the bus may have to be started

const QString kAccessible = QStringLiteral("org.a11y.atspi.Accessible");
const QString kAction = QStringLiteral("org.a11y.atspi.Action");
const QString kPress = QStringLiteral("Press");
const QString kText = QStringLiteral("org.a11y.atspi.Text");

} // namespace

AccessibleTree::AccessibleTree(const QString &program, const QDeadlineTimer &deadline, int instance)
    : m_session(qEnvironmentVariable("DBUS_SESSION_BUS_ADDRESS"), kActivationLimitMs)
    , m_bus(m_session.switchOn())
{
    const QString complaint = QStringLiteral("the program %1 does not publish its accessibility tree");
    waitFor(deadline, complaint.arg(program), [&] {
        m_program = m_bus.programs(program).value(instance);
        return !m_program.service.isEmpty();
    });
}

std::vector<Element> AccessibleTree::windows() const
{
    requireAlive();
    return readChildren(m_program, 0);
}

Element AccessibleTree::read(const ObjectRef &object, quint64 states, int depth) const
{
    Element element;
    element.object = object;
    element.role = Element::Role(m_bus.call(object, kAccessible, QStringLiteral("GetRole")).toUInt());
    element.name = m_bus.name(object);
    element.description = m_bus.property(object, kAccessible, QStringLiteral("Description")).toString();
    element.pressed = (states & kPressed) != 0;
    element.enabled = (states & kEnabled) != 0 && (states & kSensitive) != 0;
    element.children = readChildren(object, depth + 1);
    return element;
}

std::vector<Element> AccessibleTree::readChildren(const ObjectRef &object, int depth) const
{
    std::vector<Element> found;
    const QList<ObjectRef> children = depth > kMaxDepth ? QList<ObjectRef>() : m_bus.children(object);
    for (const ObjectRef &child : children) {
        const quint64 childStates = states(child);
        if ((childStates & kShowing) != 0)
            found.push_back(read(child, childStates, depth));
    }
    return found;
}

quint64 AccessibleTree::states(const ObjectRef &object) const
{
    const auto words = qdbus_cast<QList<uint>>(m_bus.call(object, kAccessible, QStringLiteral("GetState")));
    return words.value(0) | (quint64(words.value(1)) << 32U);
}

QString AccessibleTree::text(const Element &edit) const
{
    if (edit.isSecret()) {
        const QVariant count = m_bus.property(edit.object, kText, QStringLiteral("CharacterCount"));
        return QString(count.toInt(), QLatin1Char('*'));
    }
    return m_bus.call(edit.object, kText, QStringLiteral("GetText"), {0, -1}).toString();
}

void AccessibleTree::type(const Element &edit, const QString &text) const
{
    const QString interface = QStringLiteral("org.a11y.atspi.EditableText");
    if (!m_bus.call(edit.object, interface, QStringLiteral("SetTextContents"), {text}).toBool())
        throw Error(QStringLiteral("the field %1 does not accept text").arg(edit.name));
}

void AccessibleTree::press(const Element &button, const QDeadlineTimer &deadline) const
{
    requireAlive();
    const int count = m_bus.property(button.object, kAction, QStringLiteral("NActions")).toInt();
    int index = 0;
    while (index < count && m_bus.call(button.object, kAction, QStringLiteral("GetName"), {index}) != kPress)
        ++index;
    if (index == count)
        throw Error(QStringLiteral("the button %1 offers no way to press it").arg(button.name));
    // What comes of it is for the caller to see: the program may end before it answers.
    m_bus.send(button.object, kAction, QStringLiteral("DoAction"), {index},
               static_cast<int>(deadline.remainingTime()));
}

QRect AccessibleTree::extents(const Element &element) const
{
    const QString interface = QStringLiteral("org.a11y.atspi.Component");
    return qdbus_cast<QRect>(
        m_bus.call(element.object, interface, QStringLiteral("GetExtents"), {kScreenCoordinates}));
}

void AccessibleTree::requireAlive() const
{
    if (!isAlive())
        throw Error(QStringLiteral("the program has ended"));
}

} // namespace sandbox
