// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QAccessible>
#include <QDBusVirtualObject>
#include <QHash>
#include <QPointer>
#include <QSet>

namespace Mtk {

// Stands before Qt's bridge on the accessibility bus. The bridge reads the arguments of a call without asking
// whether there are any, so one call without them would end the program. Calls whose arguments are not those
// that the bridge itself announces are answered with an error; the bridge sees all others. Takes its place
// when assistive technology comes.
class AccessibleCalls : public QDBusVirtualObject, private QAccessible::ActivationObserver
{
    Q_OBJECT

public:
    AccessibleCalls();
    ~AccessibleCalls() override;

    QString introspect(const QString &path) const override;
    bool handleMessage(const QDBusMessage &message, const QDBusConnection &connection) override;

private:
    void accessibilityActiveChanged(bool isActive) override;
    void takePlace();
    bool isSound(const QDBusMessage &message);
    void learn(const QString &path);

    QPointer<QDBusVirtualObject> m_bridge;
    QSet<QString> m_interfaces;           // that are known
    QHash<QString, QString> m_signatures; // of the arguments, by interface and member
};

} // namespace Mtk
