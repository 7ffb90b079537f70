// SPDX-License-Identifier: Apache-2.0
#include "accessiblebutton.h"

#include "inputgate.h"

#include <QAccessibleWidget>
#include <QCheckBox>
#include <QPushButton>
#include <QRegularExpression>
#include <QToolButton>

namespace Mtk {

namespace {

bool hasMenu(const QAbstractButton &button)
{
    const auto *pushButton = qobject_cast<const QPushButton *>(&button);
    return pushButton != nullptr && pushButton->menu() != nullptr;
}

QAccessible::Role roleOf(const QAbstractButton &button)
{
    if (hasMenu(button))
        return QAccessible::ButtonMenu;
    if (!button.isCheckable())
        return QAccessible::Button;
    return button.autoExclusive() ? QAccessible::RadioButton : QAccessible::CheckBox;
}

QString pressName(const QAbstractButton &button)
{
    if (hasMenu(button))
        return QAccessibleActionInterface::showMenuAction();
    return button.isCheckable() ? QAccessibleActionInterface::toggleAction()
                                : QAccessibleActionInterface::pressAction();
}

bool canPress(const QAbstractButton &button)
{
    return button.isEnabled() && InputGate::isOpen(button);
}

void press(QAbstractButton *button, int began)
{
    if (began != InputGate::busySections() || !canPress(*button))
        return;
    if (hasMenu(*button))
        static_cast<QPushButton *>(button)->showMenu();
    else
        button->click();
}

void describe(const QAbstractButton &button, QAccessible::State *state)
{
    const auto *checkBox = qobject_cast<const QCheckBox *>(&button);
    const auto *pushButton = qobject_cast<const QPushButton *>(&button);
    state->disabled = !canPress(button);
    state->checkable = button.isCheckable();
    state->checked = button.isChecked();
    state->checkStateMixed = checkBox != nullptr && checkBox->checkState() == Qt::PartiallyChecked;
    state->pressed = button.isDown();
    state->defaultButton = pushButton != nullptr && pushButton->isDefault();
    state->hasPopup = hasMenu(button);
}

class AccessibleButton : public QAccessibleWidget
{
public:
    explicit AccessibleButton(QAbstractButton *button)
        : QAccessibleWidget(button)
    {
    }

    QAccessible::Role role() const override { return roleOf(*button()); }

    QString text(QAccessible::Text kind) const override
    {
        static const QRegularExpression mnemonic(QStringLiteral("&(.)"));
        QString own = kind == QAccessible::Accelerator ? button()->shortcut().toString()
                                                       : QAccessibleWidget::text(kind);
        if (kind == QAccessible::Description && own == button()->accessibleName())
            return {}; // a tool tip that repeats the name
        if (kind != QAccessible::Name || !button()->accessibleName().isEmpty() || button()->text().isEmpty())
            return own;
        return button()->text().replace(mnemonic, QStringLiteral("\\1"));
    }

    QAccessible::State state() const override
    {
        QAccessible::State state = QAccessibleWidget::state();
        describe(*button(), &state);
        return state;
    }

    QStringList actionNames() const override
    {
        return QStringList(pressName(*button())) + QAccessibleWidget::actionNames();
    }

    // Queued, since a slot may run a dialog while the assistive technology waits for its reply.
    void doAction(const QString &name) override
    {
        if (name != pressName(*button()))
            QAccessibleWidget::doAction(name);
        else if (canPress(*button()))
            QMetaObject::invokeMethod(
                button(), [pressed = button(), began = InputGate::busySections()] { press(pressed, began); },
                Qt::QueuedConnection);
    }

    QStringList keyBindingsForAction(const QString &name) const override
    {
        const QString shortcut = button()->shortcut().toString();
        return name == pressName(*button()) && !shortcut.isEmpty() ? QStringList(shortcut) : QStringList();
    }

private:
    QAbstractButton *button() const { return static_cast<QAbstractButton *>(widget()); }
};

} // namespace

QAccessibleInterface *accessibleButton(const QString &className, QObject *object)
{
    if (className == QLatin1String("QFrame"))
        return new QAccessibleWidget(static_cast<QWidget *>(object));
    auto *button = qobject_cast<QAbstractButton *>(object);
    return button != nullptr && qobject_cast<QToolButton *>(object) == nullptr ? new AccessibleButton(button)
                                                                               : nullptr;
}

} // namespace Mtk
