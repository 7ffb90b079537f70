// SPDX-License-Identifier: Apache-2.0
#include "accessibletree.h"

#include "patience.h"

#include <QDBusArgument>

#include <optional>

namespace sandbox {

namespace {

// Numbers of the AT-SPI 2 protocol.
enum AtspiRole : uint {
    RoleDialog = 16,
    RoleLabel = 29,
    RolePasswordText = 40,
    RolePushButton = 43,
    RoleText = 61,
    RoleEntry = 79
};
enum AtspiState : unsigned { StateEnabled = 8, StatePressed = 20, StateSensitive = 24, StateShowing = 25 };
constexpr uint kScreenCoordinates = 0;

constexpr int kDeepest = 64; // a tree deeper than this is damaged

const QString kAccessible = QStringLiteral("org.a11y.atspi.Accessible");
const QString kAction = QStringLiteral("org.a11y.atspi.Action");
const QString kComponent = QStringLiteral("org.a11y.atspi.Component");
const QString kEditableText = QStringLiteral("org.a11y.atspi.EditableText");
const QString kText = QStringLiteral("org.a11y.atspi.Text");

bool has(quint64 states, AtspiState state)
{
    return (states & (quint64(1) << state)) != 0;
}

Element::Role roleOf(uint number)
{
    switch (number) {
    case RoleDialog:
        return Element::Role::Dialog;
    case RoleLabel:
        return Element::Role::Label;
    case RolePushButton:
        return Element::Role::Button;
    case RoleText:
    case RoleEntry:
    case RolePasswordText:
        return Element::Role::Edit;
    default:
        return Element::Role::Other;
    }
}

// Where "Press" stands in the list of actions, or nothing.
std::optional<int> pressIndex(const QDBusArgument &actions)
{
    std::optional<int> found;
    actions.beginArray();
    for (int index = 0; !actions.atEnd(); ++index) {
        QString name, description, keys;
        actions.beginStructure();
        actions >> name >> description >> keys;
        actions.endStructure();
        if (name == QLatin1String("Press"))
            found = index;
    }
    actions.endArray();
    return found;
}

} // namespace

AccessibleTree::AccessibleTree(const QString &program, const QDeadlineTimer &deadline, int instance)
    : m_program(findProgram(program, deadline, instance))
{
}

ObjectRef AccessibleTree::findProgram(const QString &program, const QDeadlineTimer &deadline,
                                      int instance) const
{
    QStringList seen;
    const auto complaint = [&] {
        return QStringLiteral("the program does not publish its accessibility tree: looked for %1, found %2")
            .arg(program, seen.isEmpty() ? QStringLiteral("nothing") : seen.join(QStringLiteral(", ")));
    };
    const auto found = waitFor(deadline, complaint, [&]() -> std::optional<ObjectRef> {
        seen.clear();
        for (const ObjectRef &each : m_bus.applications()) {
            seen.append(m_bus.property(each, kAccessible, QStringLiteral("Name")).toString());
            if (seen.count(program) > instance)
                return each;
        }
        return std::nullopt;
    });
    return *found;
}

std::vector<Element> AccessibleTree::windows() const
{
    mustBeAlive();
    return readChildren(m_program, 0);
}

Element AccessibleTree::read(const ObjectRef &object, quint64 states, int depth) const
{
    const uint role = m_bus.call(object, kAccessible, QStringLiteral("GetRole")).first().toUInt();
    Element element;
    element.object = object;
    element.role = roleOf(role);
    element.name = m_bus.property(object, kAccessible, QStringLiteral("Name")).toString();
    element.pressed = has(states, StatePressed);
    element.enabled = has(states, StateEnabled) && has(states, StateSensitive);
    element.secret = role == RolePasswordText;
    element.children = readChildren(object, depth + 1);
    return element;
}

std::vector<Element> AccessibleTree::readChildren(const ObjectRef &object, int depth) const
{
    std::vector<Element> found;
    if (depth > kDeepest)
        return found;
    for (const ObjectRef &child : m_bus.children(object)) {
        const quint64 childStates = states(child);
        if (has(childStates, StateShowing))
            found.push_back(read(child, childStates, depth));
    }
    return found;
}

quint64 AccessibleTree::states(const ObjectRef &object) const
{
    const auto words =
        qdbus_cast<QList<uint>>(m_bus.call(object, kAccessible, QStringLiteral("GetState")).first());
    return words.value(0) | (quint64(words.value(1)) << 32U);
}

QString AccessibleTree::text(const Element &edit) const
{
    if (edit.secret) {
        const QVariant count = m_bus.property(edit.object, kText, QStringLiteral("CharacterCount"));
        return QString(count.toInt(), QLatin1Char('*'));
    }
    return m_bus.call(edit.object, kText, QStringLiteral("GetText"), {0, -1}).first().toString();
}

void AccessibleTree::type(const Element &edit, const QString &text) const
{
    if (!m_bus.call(edit.object, kEditableText, QStringLiteral("SetTextContents"), {text}).first().toBool())
        throw Trouble(QStringLiteral("the field %1 takes no text").arg(edit.name));
}

void AccessibleTree::press(const Element &button, const QDeadlineTimer &deadline) const
{
    mustBeAlive();
    const auto actions =
        m_bus.call(button.object, kAction, QStringLiteral("GetActions")).first().value<QDBusArgument>();
    const std::optional<int> index = pressIndex(actions);
    if (!index)
        throw Trouble(QStringLiteral("the button %1 offers no way to press it").arg(button.name));
    m_bus.deliver(button.object, kAction, QStringLiteral("DoAction"), {*index}, deadline);
}

QRect AccessibleTree::extents(const Element &element) const
{
    const auto reply =
        m_bus.call(element.object, kComponent, QStringLiteral("GetExtents"), {kScreenCoordinates})
            .first()
            .value<QDBusArgument>();
    int x = 0, y = 0, width = 0, height = 0;
    reply.beginStructure();
    reply >> x >> y >> width >> height;
    reply.endStructure();
    return {x, y, width, height};
}

bool AccessibleTree::isAlive() const
{
    return m_bus.isAlive(m_program.service);
}

void AccessibleTree::mustBeAlive() const
{
    if (!isAlive())
        throw Trouble(QStringLiteral("the program has ended"));
}

} // namespace sandbox
